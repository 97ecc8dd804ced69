// A picture in memory to draw the guide's pictures on, and its PNG files.
#include "docs/pictures/canvas.h"

#include <png.h>

#include <cmath>
#include <cstring>
#include <stdexcept>

namespace guide {

namespace {

png_image NewImage() {
    png_image image;
    std::memset(&image, 0, sizeof image);
    image.version = PNG_IMAGE_VERSION;
    return image;
}

} // namespace

Canvas::Canvas(int width, int height, Colour const &colour)
    : width_(width), height_(height),
      pixels_(static_cast<std::size_t>(width) * static_cast<std::size_t>(height), colour) {}

Canvas Canvas::Read(std::string const &path) {
    png_image image = NewImage();
    if (!png_image_begin_read_from_file(&image, path.c_str()))
        throw std::runtime_error(path + ": " + image.message);
    image.format = PNG_FORMAT_RGB;
    Canvas canvas(static_cast<int>(image.width), static_cast<int>(image.height), Colour{});
    if (!png_image_finish_read(&image, nullptr, canvas.pixels_.data(), 0, nullptr))
        throw std::runtime_error(path + ": " + image.message);
    return canvas;
}

void Canvas::write(std::string const &path) const {
    png_image image = NewImage();
    image.width = static_cast<png_uint_32>(width_);
    image.height = static_cast<png_uint_32>(height_);
    image.format = PNG_FORMAT_RGB;
    if (!png_image_write_to_file(&image, path.c_str(), 0, pixels_.data(), 0, nullptr))
        throw std::runtime_error(path + ": " + image.message);
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
            if (region.contains(Point(static_cast<float>(x) + 0.5f, static_cast<float>(y) + 0.5f)))
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
            if (inside.contains(Point(static_cast<float>(x) + 0.5f, static_cast<float>(y) + 0.5f)))
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
