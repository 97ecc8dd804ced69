// Numbers that people write.
#include "apps/common/number.h"

#include <cmath>
#include <cstdlib>

namespace App {

std::optional<double> ParseNumber(std::string const &text) {
    char *end = nullptr;
    double const value = std::strtod(text.c_str(), &end);
    if (text.empty() || end != text.c_str() + text.size() || !std::isfinite(value))
        return std::nullopt;
    return value;
}

} // namespace App
