// Splits a text into words.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace ORU {

/// Appends the words of `text`, the runs of characters without any of `separators`, to `words`.
inline void Tokenize(std::string const &text, char const *separators,
                     std::vector<std::string> &words) {
    std::size_t begin = text.find_first_not_of(separators);
    while (begin != std::string::npos) {
        std::size_t const end = text.find_first_of(separators, begin);
        words.push_back(text.substr(begin, end - begin));
        begin = text.find_first_not_of(separators, end);
    }
}

} // namespace ORU
