// What the examples share: their arguments and their failures.
#pragma once

#include "oru/core/exceptions/exceptionbase.h"

#include <algorithm>
#include <exception>
#include <iostream>
#include <string>
#include <type_traits>
#include <vector>

namespace example {

/// The arguments of a command line.
using Arguments = std::vector<std::string>;

/// Runs `work`, which takes the arguments or nothing, and prints what it throws.
/// @param usage the names of the arguments, such as "FILE [FOLDER]"; those in brackets may be
/// missing
/// @return the program's exit code
template<class Work>
int Run(int argc, char **argv, std::string const &usage, Work work) {
    auto const count = [&usage](char c) { return std::count(usage.begin(), usage.end(), c); };
    auto const most = usage.empty() ? 0 : count(' ') + 1;
    auto const least = most - count('[');
    Arguments const arguments(argv + std::min(argc, 1), argv + argc);
    if (argc - 1 < least || argc - 1 > most) {
        std::cerr << "usage: " << argv[0] << (usage.empty() ? "" : " ") << usage << '\n';
        return 2;
    }
    try {
        if constexpr (std::is_invocable_v<Work>)
            work();
        else
            work(arguments);
        return 0;
    } catch (ORU::ExceptionBase const &e) {
        std::cerr << e << '\n'; // with source position, message and notes
    } catch (std::exception const &e) {
        std::cerr << e.what() << '\n';
    }
    return 1;
}

} // namespace example
