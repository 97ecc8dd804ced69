// Time spent in the stages of developing.
#include "apps/develop/stopwatch.h"

#include <cstdio>

namespace Develop {

std::string Milliseconds(double milliseconds) {
    char text[32];
    std::snprintf(text, sizeof text, "%.1f ms", milliseconds);
    return text;
}

} // namespace Develop
