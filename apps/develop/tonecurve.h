// How the codes of a channel and linear light correspond.
#pragma once

#include <array>
#include <vector>

namespace Develop {

/// A curve as files store it: a function of ICC.1:2022, 10.18, or a table.
struct StoredCurve {
    unsigned int function = 0;          ///< 0 to 4
    std::array<double, 7> parameters{}; ///< g, a, b, c, d, e, f as far as the function has them
    std::vector<double> table;          ///< light at even steps of the code; empty for a function

    /// The light of a code from 0 to 1.
    double light(double code) const;
};

bool operator==(StoredCurve const &a, StoredCurve const &b);

/// The curve of IEC 61966-2-1.
StoredCurve SrgbCurve();

/// A code is light to the power of 1 / gamma.
StoredCurve PowerCurve(double gamma);

/// How the codes of one channel and linear light correspond: increasing, from 0 to 0 and from 1 to
/// 1.
class ToneCurve {
public:
    /// Takes a stored curve as it is, but for small departures: where it does not begin at 0 or end
    /// at 1 it is scaled, and where rounding of its numbers left it flat it rises by less than
    /// their last bit.
    /// @param bits of the codes: 8 or 16, which have to differ in light
    /// @throws Failure when it is no curve of this kind
    ToneCurve(StoredCurve const &stored, unsigned int bits);

    /// The light of a code from 0 to 1.
    double decode(double code) const;

    /// Whether codes are light.
    bool isLinear() const;

    /// Light for every code of `bits` bits.
    std::vector<float> lights(unsigned int bits) const;

    /// The light at which rounding to codes of `bits` bits goes from one to the next: the nearest
    /// code of a light is the number of thresholds that it reaches.
    std::vector<float> thresholds(unsigned int bits) const;

    StoredCurve const &stored() const { return stored_; }

private:
    StoredCurve stored_;
    double offset_;
    double scale_;
    std::vector<double> repaired_; ///< light at even steps, in place of the stored curve; or empty
};

} // namespace Develop
