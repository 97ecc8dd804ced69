// How fast the work goes, and how long the rest of it takes.
#include "apps/develop/pace.h"

#include <cmath>
#include <cstdio>

namespace Develop {

namespace {

constexpr std::size_t kPhotos = 20;

/// Such as ", 12 s left"; empty when nothing is left.
std::string Left(double seconds) {
    double const whole = std::ceil(seconds);
    if (whole < 1)
        return std::string();
    return ", " + (whole < 60 ? std::to_string(static_cast<int>(whole)) + " s" : Duration(whole)) +
           " left";
}

} // namespace

std::string Duration(double seconds) {
    char text[64];
    long long const whole = static_cast<long long>(seconds);
    if (seconds < 1)
        std::snprintf(text, sizeof text, "%.1f ms", seconds * 1000);
    else if (seconds < 60)
        std::snprintf(text, sizeof text, "%.1f s", seconds);
    else if (seconds < 3600)
        std::snprintf(text, sizeof text, "%lld min %lld s", whole / 60, whole % 60);
    else
        std::snprintf(text, sizeof text, "%lld h %lld min", whole / 3600, whole / 60 % 60);
    return text;
}

void Pace::add(double now) {
    ends_.push_back(now);
    if (ends_.size() > kPhotos + 1)
        ends_.pop_front();
}

std::string Pace::text(std::size_t left) const {
    double const time = ends_.back() - ends_.front();
    if (ends_.size() < 2 || time <= 0)
        return std::string();
    double const each = time / static_cast<double>(ends_.size() - 1);
    char rate[64];
    std::snprintf(rate, sizeof rate, "%.*f photos a minute", each > 6 ? 1 : 0, 60 / each);
    return rate + Left(each * static_cast<double>(left));
}

std::string Pace::textOfOne(double share, double now) const {
    double const time = now - ends_.front();
    return std::to_string(static_cast<int>(share * 100)) + " %" + Left(time / share - time);
}

} // namespace Develop
