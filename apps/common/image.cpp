// A picture in memory.
#include "apps/common/image.h"

#include "apps/common/failure.h"

namespace App {

namespace {

std::string Measures(std::size_t width, std::size_t height) {
    return std::to_string(width) + " x " + std::to_string(height);
}

} // namespace

std::string Shape::description() const {
    static char const *const kKinds[] = {"no channels", "grey", "grey and alpha", "RGB", "RGBA"};
    return Measures(width, height) + ", " + kKinds[channels] + ", " +
           std::to_string(bitsPerChannel) + (bitsPerChannel == 32 ? " bit float" : " bit");
}

bool operator==(Shape const &a, Shape const &b) {
    return a.width == b.width && a.height == b.height && a.channels == b.channels &&
           a.bitsPerChannel == b.bitsPerChannel;
}

void RequirePixels(std::size_t width, std::size_t height) {
    if (width == 0 || height == 0)
        throw Failure("has no pixels (" + Measures(width, height) + ")");
}

void SizeLimit::require(std::size_t width, std::size_t height) const {
    if (width > side || height > side)
        throw Failure(Measures(width, height) + " pixels are more than the GPU takes (" +
                      Measures(side, side) + ")");
}

} // namespace App
