// The weights of a Gaussian blur.
#pragma once

#include <cstddef>
#include <vector>

namespace Develop {

/// Pixels that a Gaussian reaches to each side: three standard deviations, rounded up.
std::size_t GaussianReach(double sigma);

/// The weights of the taps 0 to `GaussianReach(sigma)`. Those of negative taps are the same; over
/// all taps the weights add up to 1.
/// @param sigma standard deviation in pixels
std::vector<float> GaussianWeights(double sigma);

} // namespace Develop
