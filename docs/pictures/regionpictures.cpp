// Makes the pictures of the guide's chapter on regions, and checks that what they show is true.
//
// region_pictures PHOTO FOLDER [--check]: writes them to FOLDER, or compares them with what is
// there.
#include "docs/pictures/canvas.h"

#include "oru/core/math/region_2d/boundingregion.h"

#include <algorithm>
#include <functional>
#include <iostream>
#include <stdexcept>

using guide::Canvas;
using guide::Colour;
using guide::Mixed;
using guide::Point;
using ORU::BoundingRect;

namespace {

Colour const kWhite{255, 255, 255};
Colour const kBlue{40, 110, 230};
Colour const kOrange{240, 140, 20};
Colour const kGreen{20, 160, 70};
Colour const kMagenta{220, 40, 160};

constexpr int kBlurRadius = 24;
constexpr int kGap = 12; ///< between the panels of a picture

/// The sums of the (2 * kBlurRadius + 1)^2 pixels around each pixel, border pixels repeated
/// outside.
class BlurSums {
public:
    explicit BlurSums(Canvas const &source) : width_(source.width()) {
        int const height = source.height();
        std::vector<Sum> const rows = along(width_, height, [&](int x, int y) {
            Colour const &pixel = source.at(x, y);
            return Sum{pixel[0], pixel[1], pixel[2]};
        });
        std::vector<Sum> const columns =
            along(height, width_, [&](int y, int x) { return rows[guide::Index(x, y, width_)]; });
        sums_.resize(columns.size());
        for (int y = 0; y < height; ++y)
            for (int x = 0; x < width_; ++x)
                sums_[guide::Index(x, y, width_)] = columns[guide::Index(y, x, height)];
    }

    using Sum = std::array<int, 3>;

    Sum const &at(int x, int y) const { return sums_[guide::Index(x, y, width_)]; }

    Colour colour(int x, int y) const {
        int const count = (2 * kBlurRadius + 1) * (2 * kBlurRadius + 1);
        Colour result;
        for (std::size_t i = 0; i < 3; ++i)
            result[i] = static_cast<std::uint8_t>((at(x, y)[i] + count / 2) / count);
        return result;
    }

private:
    /// Blurs along the first coordinate of `value(position, line)`; the result is stored line by
    /// line.
    template<class Value>
    static std::vector<Sum> along(int length, int lines, Value value) {
        std::vector<Sum> result;
        for (int line = 0; line < lines; ++line) {
            Sum sum{};
            auto const add = [&](int position, int sign) {
                Sum const v = value(std::clamp(position, 0, length - 1), line);
                for (std::size_t i = 0; i < 3; ++i)
                    sum[i] += sign * v[i];
            };
            for (int position = -kBlurRadius; position < kBlurRadius; ++position)
                add(position, 1);
            for (int position = 0; position < length; ++position) {
                add(position + kBlurRadius, 1);
                result.push_back(sum);
                add(position - kBlurRadius, -1);
            }
        }
        return result;
    }

    int width_;
    std::vector<Sum> sums_;
};

/// A picture with a disc made brighter.
Canvas Brightened(Canvas picture, Point const &centre, float radius) {
    for (int y = 0; y < picture.height(); ++y)
        for (int x = 0; x < picture.width(); ++x) {
            Point const p = guide::PixelCentre(x, y);
            float const dx = p.x - centre.x;
            float const dy = p.y - centre.y;
            if (dx * dx + dy * dy < radius * radius)
                picture.at(x, y) = Mixed(picture.at(x, y), kWhite, 0.4f);
        }
    return picture;
}

/// The blur of a picture, in magenta where it is not that of the picture before the edit.
/// @param changed receives the pixels that are not
Canvas Blurred(Canvas const &before, Canvas const &edited, BoundingRect &changed) {
    BlurSums const sumsBefore(before);
    BlurSums const sumsAfter(edited);
    Canvas blurred = edited;
    for (int y = 0; y < blurred.height(); ++y)
        for (int x = 0; x < blurred.width(); ++x) {
            blurred.at(x, y) = sumsAfter.colour(x, y);
            if (sumsBefore.at(x, y) == sumsAfter.at(x, y))
                continue;
            blurred.at(x, y) = Mixed(blurred.at(x, y), kMagenta, 0.35f);
            auto const left = static_cast<float>(x);
            auto const top = static_cast<float>(y);
            changed.include(BoundingRect(Point(left, top), Point(left + 1, top + 1)));
        }
    return blurred;
}

/// A picture faded outside a rectangle.
Canvas FadedAround(BoundingRect const &rect, Canvas picture) {
    for (int y = 0; y < picture.height(); ++y)
        for (int x = 0; x < picture.width(); ++x)
            if (!rect.contains(guide::PixelCentre(x, y)))
                picture.at(x, y) = Mixed(picture.at(x, y), kWhite, 0.7f);
    return picture;
}

/// A photo with a disc made brighter, blurred: what the edit changes, and what must be read.
Canvas FilterPicture(Canvas const &photo) {
    constexpr int kSide = 300;
    BoundingRect const frame(Point(0, 0), Point(kSide, kSide));
    auto const widened = [&frame](BoundingRect rect) {
        rect.outset(Point(kBlurRadius, kBlurRadius));
        rect.intersect(frame);
        return rect;
    };
    Point const centre(226, 104);
    float const radius = 52;
    BoundingRect changed(centre, centre);
    changed.outset(Point(radius, radius));
    BoundingRect const compute = widened(changed);
    BoundingRect const read = widened(compute);

    Canvas const before = photo.part(100, 0, kSide, kSide);
    Canvas const edited = Brightened(before, centre, radius);
    BoundingRect exact;
    Canvas panels[] = {edited, Blurred(before, edited, exact), FadedAround(read, edited)};
    if (exact != compute)
        throw std::runtime_error("the blur changed " + exact.toString() + "instead of " +
                                 compute.toString());
    panels[0].outline(changed, kBlue, 2);
    panels[1].outline(changed, kBlue, 2);
    panels[1].outline(compute, kOrange, 2);
    panels[2].outline(compute, kOrange, 2);
    panels[2].outline(read, kGreen, 2);
    Canvas picture(3 * kSide + 2 * kGap, kSide, kWhite);
    for (int i = 0; i < 3; ++i)
        picture.paste(panels[i], i * (kSide + kGap), 0);
    return picture;
}

/// An operation on a blue and an orange rectangle, with its green result.
struct Operation {
    BoundingRect a;
    BoundingRect b;
    BoundingRect drawnB; ///< where `b` is drawn, for a footprint
    std::function<void(BoundingRect &a, BoundingRect const &b)> apply;
};

BoundingRect Rect(float minX, float minY, float maxX, float maxY) {
    return BoundingRect(Point(minX, minY), Point(maxX, maxY));
}

Canvas OperationsPicture() {
    BoundingRect const footprint = Rect(-16, -10, 30, 22);
    auto const drawn = [&](float x, float y) {
        BoundingRect moved = footprint;
        moved.translate(Point(x, y));
        return moved;
    };
    BoundingRect const small = Rect(70, 45, 180, 115);
    BoundingRect const large = Rect(30, 25, 220, 135);
    BoundingRect const wide = Rect(20, 20, 150, 90);
    BoundingRect const other = Rect(100, 60, 230, 140);
    Operation const operations[] = {
        {wide, other, other, [](auto &a, auto const &b) { a.include(b); }},
        {wide, other, other, [](auto &a, auto const &b) { a.intersect(b); }},
        {large, Rect(150, 15, 235, 145), Rect(150, 15, 235, 145),
         [](auto &a, auto const &b) { a.subtract(b); }},
        {large, other, other, [](auto &a, auto const &b) { a.subtract(b); }},
        {small, footprint, drawn(180, 115), [](auto &a, auto const &b) { a.dilate(b); }},
        {large, footprint, drawn(190, 113), [](auto &a, auto const &b) { a.erode(b); }},
    };
    constexpr int kPanelWidth = 250;
    constexpr int kPanelHeight = 160;
    Canvas picture(3 * kPanelWidth + 2 * kGap, 2 * kPanelHeight + kGap, kWhite);
    int i = 0;
    for (Operation const &operation : operations) {
        Canvas panel(kPanelWidth, kPanelHeight, Colour{244, 244, 246});
        BoundingRect result = operation.a;
        operation.apply(result, operation.b);
        panel.fill(operation.a, kBlue, 0.3f);
        panel.fill(operation.drawnB, kOrange, 0.3f);
        panel.outline(operation.a, kBlue, 2);
        panel.outline(operation.drawnB, kOrange, 2);
        panel.outline(result, kGreen, 4);
        picture.paste(panel, i % 3 * (kPanelWidth + kGap), i / 3 * (kPanelHeight + kGap));
        ++i;
    }
    return picture;
}

void WriteOrCheck(Canvas const &picture, std::string const &path, bool checks) {
    if (!checks)
        picture.write(path);
    else if (!(Canvas::Read(path) == picture))
        throw std::runtime_error(path + " is not what the library draws; make it anew");
}

} // namespace

int main(int argc, char **argv) {
    bool const checks = argc == 4 && argv[3] == std::string("--check");
    if (argc != 3 && !checks) {
        std::cerr << "usage: region_pictures PHOTO FOLDER [--check]\n";
        return 2;
    }
    try {
        std::string const folder = argv[2];
        WriteOrCheck(FilterPicture(Canvas::Read(argv[1])), folder + "/regions-filter.png", checks);
        WriteOrCheck(OperationsPicture(), folder + "/regions-operations.png", checks);
    } catch (std::exception const &failure) {
        std::cerr << failure.what() << "\n";
        return 1;
    }
    return 0;
}
