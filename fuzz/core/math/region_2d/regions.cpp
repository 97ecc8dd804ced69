// Bounding regions against a bitmap.
#include "fuzz/harness.h"

#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/math/region_2d/boundingregion.h"

#include <array>

#include <fuzzer/FuzzedDataProvider.h>

namespace {

using ORU::BoundingRect;
using ORU::BoundingRegion;
using Vec = ambra::lumo::TVec2<float>;

/// The points of a square from -16 to 16, in each coordinate a bit for every whole number and one
/// for what lies between it and the next.
class Bitmap {
public:
    Bitmap() = default;
    explicit Bitmap(BoundingRect const &rect) {
        if (rect.isEmpty())
            return;
        int const left = Index(rect.minimum().x), right = Index(rect.maximum().x);
        for (int y = Index(rect.minimum().y); y <= Index(rect.maximum().y); ++y)
            rows_[Row(y)] = (~std::uint64_t{0} >> (63 - right)) & (~std::uint64_t{0} << left);
    }

    /// The smallest closed rectangle around it with whole bounds.
    BoundingRect bounds() const {
        BoundingRect rect;
        for (int y = 0; y < kSize; ++y)
            for (int x = 0; x < kSize; ++x)
                if (rows_[Row(y)] >> x & 1) {
                    rect.include(Vec(Floor(x), Floor(y)));
                    rect.include(Vec(Floor(x + 1), Floor(y + 1)));
                }
        return rect;
    }

    bool contains(int x, int y) const { return rows_[Row(2 * y + kZero)] >> (2 * x + kZero) & 1; }

    template<class Operation>
    Bitmap combined(Bitmap const &other, Operation operation) const {
        Bitmap result;
        for (std::size_t y = 0; y < rows_.size(); ++y)
            result.rows_[y] = operation(rows_[y], other.rows_[y]);
        return result;
    }
    Bitmap united(Bitmap const &other) const {
        return combined(other, [](auto a, auto b) { return a | b; });
    }
    Bitmap intersected(Bitmap const &other) const {
        return combined(other, [](auto a, auto b) { return a & b; });
    }
    Bitmap without(Bitmap const &other) const {
        return combined(other, [](auto a, auto b) { return a & ~b; });
    }

    /// All sums of a point of this and one of `other`.
    Bitmap dilated(Bitmap const &other) const {
        Bitmap sum;
        other.forEach([&](int x, int y) { sum = sum.united(moved(x, y)); });
        return sum;
    }

    /// All points whose sum with every point of `other` is in this.
    Bitmap eroded(Bitmap const &other) const {
        Bitmap rest(BoundingRect(Vec(-16, -16), Vec(15, 15)));
        other.forEach([&](int x, int y) { rest = rest.intersected(moved(-x, -y)); });
        return rest;
    }

    /// Moved by halves. What leaves the square is lost.
    Bitmap moved(int x, int y) const {
        Bitmap result;
        for (int row = 0; row < kSize; ++row)
            if (row - y >= 0 && row - y < kSize) {
                std::uint64_t const bits = rows_[Row(row - y)];
                result.rows_[Row(row)] = x < 0 ? bits >> -x : bits << x;
            }
        return result;
    }

private:
    static constexpr int kSize = 64, kZero = 32; ///< index of the coordinate 0

    static std::size_t Row(int y) { return static_cast<std::size_t>(y); }
    static int Index(float coordinate) { return 2 * static_cast<int>(coordinate) + kZero; }
    static float Floor(int index) { return static_cast<float>(index / 2 - kZero / 2); }

    template<class Visitor>
    void forEach(Visitor visit) const {
        for (int y = 0; y < kSize; ++y)
            for (int x = 0; x < kSize; ++x)
                if (rows_[Row(y)] >> x & 1)
                    visit(x - kZero, y - kZero);
    }

    std::array<std::uint64_t, kSize> rows_ = {};
};

/// A region with its bitmap. Both are kept within a window that no operation leaves by more than
/// the bitmap has room for, and an empty rectangle's bounds, which are not in the bitmap, are
/// forgotten.
class Pair {
public:
    template<class Operation>
    void change(Operation operation, Bitmap const &expected) {
        operation(region_);
        BoundingRect const window(Vec(-8, -8), Vec(8, 8));
        region_.intersect(window);
        bitmap_ = Bitmap(expected.intersected(Bitmap(window)).bounds());
        if (region_.isEmpty())
            region_.makeNowhere();
        BoundingRect const bounds = bitmap_.bounds();
        HOLDS(region_.isEmpty() == bounds.isEmpty());
        HOLDS(region_.boundingRect() == bounds);
        for (int y = -9; y <= 9; ++y)
            for (int x = -9; x <= 9; ++x)
                HOLDS(bitmap_.contains(x, y) ==
                      region_.contains(Vec(static_cast<float>(x), static_cast<float>(y))));
    }

    BoundingRegion const &region() const { return region_; }
    Bitmap const &bitmap() const { return bitmap_; }

private:
    BoundingRegion region_;
    Bitmap bitmap_;
};

/// A rectangle of whole numbers from -4 to 4, empty now and then.
BoundingRect ConsumeRect(FuzzedDataProvider &input) {
    auto const number = [&input] {
        return static_cast<float>(input.ConsumeIntegralInRange(-4, 4));
    };
    Vec const a(number(), number()), b(number(), number());
    return input.ConsumeIntegralInRange(0, 7) == 0 ? BoundingRect() : BoundingRect(a, b);
}

/// One operation with a rectangle, or with a region that holds one.
void Change(Pair &pair, int operation, BoundingRect const &rect,
            ORU::BoundingRegionBase const &operand) {
    Bitmap const bitmap(rect), before = pair.bitmap();
    BoundingRegion const old = pair.region();
    HOLDS(rect.isEmpty() || old.contains(rect) == (bitmap.without(before).bounds().isEmpty()));
    float const width = rect.isEmpty() ? 0 : rect.width(),
                height = rect.isEmpty() ? 0 : rect.height();
    Vec const margin(width, height);
    Bitmap const square(BoundingRect(Vec(-width, -height), margin));
    switch (operation) {
    case 0:
        return pair.change([&](auto &region) { region.include(operand); }, before.united(bitmap));
    case 1:
        return pair.change([&](auto &region) { region.intersect(operand); },
                           before.intersected(bitmap));
    case 2:
        if (rect.area() > 0) // lines cut off lines only, and sometimes
            pair.change([&](auto &region) { region.subtract(operand); }, before.without(bitmap));
        return;
    case 3:
        return pair.change([&](auto &region) { region.dilate(operand); }, before.dilated(bitmap));
    case 4:
        return pair.change([&](auto &region) { region.erode(rect); }, before.eroded(bitmap));
    case 5:
        return pair.change([&](auto &region) { region.translate(margin); },
                           before.moved(static_cast<int>(2 * width), static_cast<int>(2 * height)));
    case 6:
        return pair.change([&](auto &region) { region.inset(margin); }, before.eroded(square));
    default:
        return pair.change([&](auto &region) { region.include(margin); },
                           before.united(Bitmap(BoundingRect(margin, margin))));
    }
}

} // namespace

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    FuzzedDataProvider input(data, size);
    Pair pair;
    for (int step = 0; step < 12 && input.remaining_bytes() > 0; ++step) {
        BoundingRect const rect = ConsumeRect(input);
        BoundingRegion handle;
        handle.include(rect);
        auto const &operand =
            input.ConsumeBool() ? static_cast<ORU::BoundingRegionBase const &>(rect) : handle;
        Change(pair, input.ConsumeIntegralInRange(0, 7), rect, operand);
    }
    return 0;
}
