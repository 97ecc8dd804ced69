// Rows of pixels on their way from thread to thread.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/bandplan.h"

#include <cstddef>
#include <vector>

namespace Develop {

/// Whole rows of a picture, without gaps. A band is used again and again: its memory is kept.
class Band {
public:
    /// Makes room for rows of a picture; what they hold is left over from before.
    void hold(Rows const &rows, App::Shape const &picture) {
        rows_ = rows;
        rowBytes_ = picture.rowBytes();
        bytesPerPixel_ = picture.bytesPerPixel();
        if (pixels_.size() < rows.count() * rowBytes_)
            pixels_.resize(rows.count() * rowBytes_);
    }

    Rows const &rows() const { return rows_; }
    std::size_t rowBytes() const { return rowBytes_; }

    /// A row that is held, by its number in the picture.
    unsigned char *row(std::size_t y) { return pixels_.data() + (y - rows_.first) * rowBytes_; }
    unsigned char const *row(std::size_t y) const {
        return pixels_.data() + (y - rows_.first) * rowBytes_;
    }

    /// The first pixel of an area of the picture whose rows are held.
    unsigned char *at(ORU::IntegerRect const &area) {
        return row(static_cast<std::size_t>(area.offset().y)) +
               static_cast<std::size_t>(area.offset().x) * bytesPerPixel_;
    }
    unsigned char const *at(ORU::IntegerRect const &area) const {
        return row(static_cast<std::size_t>(area.offset().y)) +
               static_cast<std::size_t>(area.offset().x) * bytesPerPixel_;
    }

private:
    Rows rows_;
    std::size_t rowBytes_ = 0;
    std::size_t bytesPerPixel_ = 0;
    std::vector<unsigned char> pixels_;
};

} // namespace Develop
