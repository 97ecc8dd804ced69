// Times two ways to do the same against each other.
#pragma once

#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <vector>

namespace oru_bench {

inline double Median(std::vector<double> values) {
    if (values.empty())
        return 0;
    auto const middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::nth_element(values.begin(), middle, values.end());
    return *middle;
}

/// Seconds that a call of `work` takes.
template<class Work>
double Seconds(Work work) {
    auto const start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

/// Collects the times of a baseline and of the library, measured in turns so that both meet the
/// same noise of the machine, and reports medians: `base_ns` and `oru_ns` for one call, `added_ns`
/// between them and their `ratio`. Use it in a benchmark with manual time.
class Comparison {
public:
    /// @param calls calls in each measurement
    explicit Comparison(benchmark::State &state, int calls = 1) : state_(state), calls_(calls) {}

    ~Comparison() {
        report("base_ns", base_);
        report("oru_ns", library_);
        report("added_ns", added_);
        report("ratio", ratio_);
    }

    Comparison(Comparison const &) = delete;
    Comparison &operator=(Comparison const &) = delete;

    /// @param base, library seconds that all calls of this turn took
    void add(double base, double library) {
        double const toNanoseconds = 1e9 / calls_;
        base_.push_back(base * toNanoseconds);
        library_.push_back(library * toNanoseconds);
        added_.push_back((library - base) * toNanoseconds);
        ratio_.push_back(library / base);
        state_.SetIterationTime(library);
    }

private:
    void report(char const *name, std::vector<double> const &values) {
        state_.counters[name] = benchmark::Counter(Median(values), benchmark::Counter::kAvgThreads);
    }

    benchmark::State &state_;
    int calls_;
    std::vector<double> base_, library_, added_, ratio_;
};

/// Compares two calls, each made `calls` times in a turn.
template<class Base, class Library>
void Compare(benchmark::State &state, int calls, Base base, Library library) {
    auto const repeat = [calls](auto const &call) {
        return Seconds([&] {
            for (int i = 0; i < calls; ++i)
                call();
        });
    };
    Comparison comparison(state, calls);
    while (state.KeepRunning()) {
        double const baseSeconds = repeat(base);
        comparison.add(baseSeconds, repeat(library));
    }
}

} // namespace oru_bench
