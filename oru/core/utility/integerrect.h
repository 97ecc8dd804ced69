// A rectangle of whole pixels.
#pragma once

#include "oru/core/math/tvec2.h"
#include "oru/core/utility/export.h"
#include "oru/core/utility/size2.h"

#include <iosfwd>
#include <string>

namespace ORU {

/// A rectangle by the offset of its top-left corner and its size, in pixels; empty when its width
/// or its height is 0.
class ORU_API IntegerRect {
public:
    /// The empty rectangle at (0, 0).
    IntegerRect() = default;
    /// At `offset`, which may be negative, `size` pixels large.
    IntegerRect(ambra::lumo::TVec2<int> const &offset, size2 const &size)
        : offset_(offset), size_(size) {}

    ambra::lumo::TVec2<int> offset() const { return offset_; }     ///< of the top-left corner
    size2 size() const { return size_; }                           ///< (width, height)
    std::size_t width() const { return size_[0]; }                 ///< pixels
    std::size_t height() const { return size_[1]; }                ///< pixels
    bool isEmpty() const { return width() == 0 || height() == 0; } ///< whether a side is 0

    /// Moves the rectangle; its size stays.
    void setOffset(ambra::lumo::TVec2<int> const &offset) { offset_ = offset; }
    /// Changes the size; the top-left corner stays.
    void setSize(size2 const &size) { size_ = size; }

    /// Moves the rectangle by `d` pixels.
    void translate(ambra::lumo::TVec2<int> const &d);

    /// "Empty", or the offset and the size, such as `[o=(10 20), s=(640, 480)]`.
    std::string toString() const;

private:
    ambra::lumo::TVec2<int> offset_;
    size2 size_;
};

/// Whether offset and size are equal.
ORU_API bool operator==(IntegerRect const &a, IntegerRect const &b);
/// Not `==`.
ORU_API bool operator!=(IntegerRect const &a, IntegerRect const &b);

/// Writes `toString()`.
ORU_API std::ostream &operator<<(std::ostream &os, IntegerRect const &rect);

} // namespace ORU
