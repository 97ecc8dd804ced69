// How fast the work goes, and how long the rest of it takes.
#pragma once

#include <cstddef>
#include <deque>
#include <string>

namespace Develop {

/// Such as "340.5 ms", "12.3 s", "4 min 5 s", "3 h 12 min".
std::string Duration(double seconds);

/// The pace of the last photos. Earlier ones do not count: the first waits for what the others
/// share, and a folder may go from small photos to large ones.
class Pace {
public:
    /// @param now seconds on any clock, when the first photo begins
    explicit Pace(double now) : ends_{now} {}

    /// Counts a photo that is done.
    void add(double now);

    /// Such as "38.5 photos a minute, 4 min 5 s left"; empty before the first photo.
    /// @param left how many photos are not done yet
    std::string text(std::size_t left) const;

    /// As `text`, when there is only one photo and a share of it is done.
    std::string textOfOne(double share, double now) const;

private:
    std::deque<double> ends_; ///< of the last photos, with that of the one before them
};

} // namespace Develop
