// A region that is no rectangle.
#pragma once

#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/memory/orumemory.h"

#include <stdexcept>
#include <utility>

namespace oru_test {

using Vec = ambra::lumo::TVec2<float>;

/// A triangle, or what is left of one when its corners lie on a line. Exact for coordinates whose
/// products a float holds. Only dilation and erosion change it, and those only note their operand.
class Triangle : public ORU::BoundingRegionBase {
public:
    Triangle() = default;
    explicit Triangle(std::vector<Vec> corners) : corners_(std::move(corners)) {}

    Triangle *clone() const override { return ORU_NEW Triangle(*this); }
    bool isEmpty() const override { return corners_.empty(); }
    bool contains(Vec const &p) const override {
        if (!boundingRect().contains(p))
            return false;
        bool isLeft = false;
        bool isRight = false;
        for (std::size_t i = 0; i < 3; ++i) {
            Vec const &a = corners_[i];
            Vec const &b = corners_[(i + 1) % 3];
            float const side = (b.x - a.x) * (p.y - a.y) - (b.y - a.y) * (p.x - a.x);
            isLeft = isLeft || side > 0;
            isRight = isRight || side < 0;
        }
        return !(isLeft && isRight);
    }
    bool contains(BoundingRegionBase const &region) const override {
        for (Vec const &p : region.convexHull())
            if (!contains(p))
                return false;
        return true;
    }
    void dilate(BoundingRegionBase const &region) override { dilatedBy_ = region.boundingRect(); }
    void erode(ORU::BoundingRect const &r) override { erodedBy_ = r; }
    std::vector<Vec> convexHull() const override { return corners_; }
    ORU::BoundingRect boundingRect() const override {
        ORU::BoundingRect bounds;
        for (Vec const &corner : corners_)
            bounds.include(corner);
        return bounds;
    }
    std::string toString() const override { return "Triangle"; }

    void makeNowhere() override { Fail(); }
    void makeEverywhere() override { Fail(); }
    void include(BoundingRegionBase const &) override { Fail(); }
    void include(Vec const &) override { Fail(); }
    void intersect(BoundingRegionBase const &) override { Fail(); }
    void subtract(BoundingRegionBase const &) override { Fail(); }
    void translate(Vec const &) override { Fail(); }

    ORU::BoundingRect dilatedBy_;
    ORU::BoundingRect erodedBy_;

private:
    [[noreturn]] static void Fail() { throw std::logic_error("an operand must not change"); }

    std::vector<Vec> corners_;
};

} // namespace oru_test
