// Values as a text.
#pragma once

#include <sstream>
#include <string>

namespace oru_test {

/// The texts of several values make that of all.
template<class... Values>
std::string TextOf(Values... values) {
    std::ostringstream text;
    ((text << values << ' '), ...);
    return text.str();
}

} // namespace oru_test
