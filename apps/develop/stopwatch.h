// Time spent in the stages of developing.
#pragma once

#include <chrono>
#include <string>

namespace Develop {

class Stopwatch {
public:
    double milliseconds() const {
        std::chrono::duration<double, std::milli> const elapsed = Clock::now() - start_;
        return elapsed.count();
    }

private:
    using Clock = std::chrono::steady_clock;
    Clock::time_point start_ = Clock::now();
};

/// Adds the time of a scope to a sum.
class TimedScope {
public:
    explicit TimedScope(double &milliseconds) : milliseconds_(milliseconds) {}
    ~TimedScope() { milliseconds_ += stopwatch_.milliseconds(); }
    TimedScope(TimedScope const &) = delete;
    TimedScope &operator=(TimedScope const &) = delete;

private:
    double &milliseconds_;
    Stopwatch stopwatch_;
};

/// Such as "12.3 ms".
std::string Milliseconds(double milliseconds);

} // namespace Develop
