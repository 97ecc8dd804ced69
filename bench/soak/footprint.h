// What a process holds of the machine.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace Soak {

/// How many handles this process has open.
struct Handles {
    std::size_t kernel = 0;
    std::size_t windows = 0; ///< all objects of USER where the system counts them
    std::size_t gdi = 0;

    static Handles Now();

    /// Whether none of the counts is above another's.
    bool isWithin(Handles const &other) const;
};

/// Such as "handles 31 to 31, windows 2 to 2, GDI objects 24 to 24".
std::string Change(Handles const &before, Handles const &after);

/// How the working set grows from step to step, once caches and heaps have taken their size.
class Growth {
public:
    /// The steps to take when a number of them is to count: half as many go before.
    static std::size_t StepsFor(std::size_t counted) { return counted + counted / 2; }

    /// After each step.
    void measure();

    /// Whether the last step was the one before those that count.
    bool isWarm(std::size_t counted) const { return sizes_.size() == counted / 2 + 1; }

    /// Bytes that each step adds, after the first third: the slope of the line through the
    /// measurements with the least squares.
    double bytesPerStep() const;

    /// Below some number of steps the slope says more of the heap than of leaks.
    bool isLongEnough() const { return sizes_.size() >= 600; }

    /// How a slope is judged, for people: such as "at most 4096".
    std::string limit(double bytes) const;

    /// Working set at the end.
    double megabytes() const;

private:
    std::vector<double> sizes_;
};

} // namespace Soak
