// Command lines of develop.
#include "fuzz/harness.h"

#include "apps/develop/options.h"

#include <iostream>

namespace {

/// The arguments, which a bar separates in an input.
std::vector<std::string> Arguments(std::string const &text) {
    std::vector<std::string> arguments;
    for (std::size_t begin = 0; begin <= text.size();) {
        std::size_t const end = std::min(text.find('|', begin), text.size());
        arguments.push_back(text.substr(begin, end - begin));
        begin = end + 1;
    }
    return arguments;
}

bool IsWithin(double value, double least, double most) {
    return value >= least && value <= most; // false for a NaN
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int *, char ***) {
    // What is printed is not looked at.
    std::cout.setstate(std::ios::failbit);
    std::cerr.setstate(std::ios::failbit);
    return 0;
}

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    int exitCode = -1;
    auto const options = Develop::ParseOptions(Arguments(fuzz::Text(data, size)), exitCode);
    if (!options) {
        HOLDS(exitCode == 0 || exitCode == 2);
        return 0;
    }
    HOLDS(exitCode == -1 && !(options->inputs.empty() && options->list.empty()));
    HOLDS(IsWithin(options->exposure, -100, 100));
    HOLDS(IsWithin(options->sharpening.amount, 0, 100));
    HOLDS(IsWithin(options->sharpening.sigma, 0.3, 20));
    HOLDS(IsWithin(options->quality, 1, 100));
    return 0;
}
