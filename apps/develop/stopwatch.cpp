// Time spent in the stages of developing.
#include "apps/develop/stopwatch.h"

#include "oru/oru_ogl/extensionator/glcall.h"

#include <cstdio>

namespace Develop {

std::string Milliseconds(double milliseconds) {
    char text[32];
    std::snprintf(text, sizeof text, "%.1f ms", milliseconds);
    return text;
}

void StageTimes::end(std::string const &name, Stopwatch const &stopwatch) {
    if (waitForGpu_)
        ORU_GL0(Finish);
    stages_.emplace_back(name, stopwatch.milliseconds());
}

double StageTimes::total() const {
    double sum = 0;
    for (auto const &stage : stages_)
        sum += stage.second;
    return sum;
}

std::string StageTimes::text() const {
    std::string text;
    for (auto const &[name, time] : stages_)
        text += (text.empty() ? "" : ", ") + name + " " + Milliseconds(time);
    return text;
}

} // namespace Develop
