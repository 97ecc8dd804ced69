// Time spent in the stages of developing.
#pragma once

#include <chrono>
#include <string>
#include <utility>
#include <vector>

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

/// Such as "12.3 ms".
std::string Milliseconds(double milliseconds);

/// The times of named stages, in their order.
class StageTimes {
public:
    /// @param waitForGpu whether a stage ends only when the GPU has done its work, so that its
    ///        time is its own; costs some time
    explicit StageTimes(bool waitForGpu) : waitForGpu_(waitForGpu) {}

    /// Runs a stage and keeps its time.
    template<class Stage>
    auto measure(std::string const &name, Stage const &stage) {
        Stopwatch const stopwatch;
        if constexpr (std::is_void_v<decltype(stage())>) {
            stage();
            end(name, stopwatch);
        } else {
            auto result = stage();
            end(name, stopwatch);
            return result;
        }
    }

    /// Milliseconds of all stages.
    double total() const;

    /// Such as "decode 12.3 ms, upload 1.5 ms".
    std::string text() const;

private:
    void end(std::string const &name, Stopwatch const &stopwatch);

    bool waitForGpu_;
    std::vector<std::pair<std::string, double>> stages_;
};

} // namespace Develop
