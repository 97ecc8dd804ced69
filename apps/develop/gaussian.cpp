// The weights of a Gaussian blur.
#include "apps/develop/gaussian.h"

#include <cmath>

namespace Develop {

std::size_t GaussianReach(double sigma) {
    return static_cast<std::size_t>(std::ceil(3 * sigma));
}

std::vector<float> GaussianWeights(double sigma) {
    std::vector<double> exact(GaussianReach(sigma) + 1);
    double sum = 0;
    for (std::size_t tap = 0; tap < exact.size(); ++tap) {
        double const distance = static_cast<double>(tap) / sigma;
        exact[tap] = std::exp(-distance * distance / 2);
        sum += (tap == 0 ? 1 : 2) * exact[tap];
    }
    std::vector<float> weights;
    weights.reserve(exact.size());
    for (double const weight : exact)
        weights.push_back(static_cast<float>(weight / sum));
    return weights;
}

} // namespace Develop
