// A picture in memory to draw the guide's pictures on, and its PNG files.
#include "docs/pictures/canvas.h"

#include "apps/common/failure.h"
#include "apps/common/imagefile.h"

#include <cmath>
#include <cstring>
#include <stdexcept>

namespace guide {

namespace {

constexpr std::size_t kMaxSide = 10000; ///< of a picture that is read

/// Runs a piece of work on a file; what fails is told with the file's name.
template<class Work>
void WithFile(std::string const &path, Work work) {
    try {
        work();
    } catch (App::Failure const &failure) {
        throw std::runtime_error(path + ": " + failure.what());
    }
}

} // namespace

Canvas::Canvas(int width, int height, Colour const &colour)
    : width_(width), height_(height),
      pixels_(static_cast<std::size_t>(width) * static_cast<std::size_t>(height), colour) {}

Canvas Canvas::Read(std::string const &path) {
    App::Image image;
    WithFile(path, [&] {
        image = App::ReadImage(path, {kMaxSide});
        if (image.channels != 3 || image.bitsPerChannel != 8)
            throw App::Failure("is " + image.description() + ", not RGB, 8 bit");
    });
    Canvas canvas(static_cast<int>(image.width), static_cast<int>(image.height), Colour{});
    std::memcpy(canvas.pixels_.data(), image.pixels.data(), image.pixels.size());
    return canvas;
}

void Canvas::write(std::string const &path) const {
    App::Image image({static_cast<std::size_t>(width_), static_cast<std::size_t>(height_), 3, 8});
    std::memcpy(image.pixels.data(), pixels_.data(), image.pixels.size());
    WithFile(path, [&] { App::WriteImage(path, image); });
}

Canvas Canvas::part(int x, int y, int width, int height) const {
    Canvas result(width, height, Colour{});
    for (int row = 0; row < height; ++row)
        for (int column = 0; column < width; ++column)
            result.at(column, row) = at(x + column, y + row);
    return result;
}

void Canvas::paste(Canvas const &source, int x, int y) {
    for (int row = 0; row < source.height_; ++row)
        for (int column = 0; column < source.width_; ++column)
            at(x + column, y + row) = source.at(column, row);
}

void Canvas::fill(ORU::BoundingRegionBase const &region, Colour const &colour, float share) {
    for (int y = 0; y < height_; ++y)
        for (int x = 0; x < width_; ++x)
            if (region.contains(PixelCentre(x, y)))
                at(x, y) = Mixed(at(x, y), colour, share);
}

void Canvas::outline(ORU::BoundingRect const &rect, Colour const &colour, int thickness) {
    auto const width = static_cast<float>(thickness);
    ORU::BoundingRect inside = rect;
    inside.inset(Point(width, width));
    Canvas before = *this;
    fill(rect, colour, 1);
    for (int y = 0; y < height_; ++y)
        for (int x = 0; x < width_; ++x)
            if (inside.contains(PixelCentre(x, y)))
                at(x, y) = before.at(x, y);
}

Colour Mixed(Colour const &pixel, Colour const &colour, float share) {
    Colour mixed;
    for (std::size_t i = 0; i < 3; ++i) {
        float const value =
            static_cast<float>(pixel[i]) * (1 - share) + static_cast<float>(colour[i]) * share;
        mixed[i] = static_cast<std::uint8_t>(std::lround(value));
    }
    return mixed;
}

} // namespace guide
