// Pictures that come upright, however they are stored.
#include "apps/common/uprightreader.h"

#include "apps/common/scratch.h"

#include <algorithm>
#include <cstring>
#include <initializer_list>
#include <utility>

namespace App {

namespace {

bool IsOneOf(Orientation orientation, std::initializer_list<Orientation> set) {
    return std::find(set.begin(), set.end(), orientation) != set.end();
}

/// Copies pixels of a fixed size, `from` and `to` being as many pixels apart as their steps say.
template<std::size_t PixelBytes>
void CopyPixels(unsigned char const *from, std::ptrdiff_t fromStep, unsigned char *to,
                std::size_t count) {
    for (std::size_t i = 0; i < count; ++i) {
        std::memcpy(to, from, PixelBytes);
        from += fromStep;
        to += PixelBytes;
    }
}

using PixelCopier = void (*)(unsigned char const *, std::ptrdiff_t, unsigned char *, std::size_t);

PixelCopier CopierOf(Shape const &shape) {
    switch (shape.bytesPerPixel()) {
    case 1:
        return CopyPixels<1>;
    case 2:
        return CopyPixels<2>;
    case 3:
        return CopyPixels<3>;
    case 4:
        return CopyPixels<4>;
    case 6:
        return CopyPixels<6>;
    case 8:
        return CopyPixels<8>;
    case 12:
        return CopyPixels<12>;
    default:
        return CopyPixels<16>;
    }
}

/// Puts the stored picture aside in lines, in the order in which they were stored, of which the
/// rows of the upright picture can be made band by band. A line is a row; of a turned picture it is
/// a column of as many rows as were in memory at once.
class UprightReader : public PictureReader {
public:
    UprightReader(std::unique_ptr<PictureReader> stored, Orientation orientation)
        : stored_(std::move(stored)), shape_(stored_->head()), copy_(CopierOf(shape_)),
          isTurned_(IsTurned(orientation)), isMirrored_(IsOneOf(orientation, {2, 3, 7, 8})),
          isUpsideDown_(IsOneOf(orientation, {3, 4, 6, 7})) {
        head_ = stored_->head();
        if (isTurned_) {
            std::swap(head_.width, head_.height);
            if (head_.metadata.resolution)
                std::swap(head_.metadata.resolution->x, head_.metadata.resolution->y);
            if (head_.sampling)
                std::swap(head_.sampling->horizontal, head_.sampling->vertical);
        }
    }

    std::string wholeReason() const override { return stored_->wholeReason(); }

    void read(unsigned char *rows, std::size_t count) override {
        bool const isInOrder = !isTurned_ && !isUpsideDown_;
        if (isInOrder) {
            stored_->read(rows, count);
            for (std::size_t i = 0; i < count; ++i)
                mirror(rows + i * head_.rowBytes());
            return;
        }
        if (!scratch_)
            putAside();
        while (count > 0) {
            if (bandRow_ == bandRows_)
                loadBand();
            std::size_t const part = std::min(count, bandRows_ - bandRow_);
            std::copy_n(band_.data() + bandRow_ * head_.rowBytes(), part * head_.rowBytes(), rows);
            rows += part * head_.rowBytes();
            bandRow_ += part;
            count -= part;
        }
    }

private:
    static std::size_t RowsAtOnce(Shape const &shape) {
        constexpr std::size_t kBandBytes = 8 << 20;
        return std::clamp<std::size_t>(kBandBytes / shape.rowBytes(), 1, shape.height);
    }

    void mirror(unsigned char *row) {
        std::size_t const bytes = shape_.bytesPerPixel();
        line_.assign(row, row + shape_.rowBytes());
        copy_(line_.data() + (shape_.width - 1) * bytes, -static_cast<std::ptrdiff_t>(bytes), row,
              shape_.width);
    }

    void putAside() {
        auto scratch = MakeScratch(std::uint64_t{shape_.rowBytes()} * shape_.height);
        std::size_t const bytes = shape_.bytesPerPixel();
        storedRows_ = RowsAtOnce(shape_);
        Bytes rows(storedRows_ * shape_.rowBytes());
        Bytes columns(isTurned_ ? rows.size() : 0);
        for (std::size_t y = 0; y < shape_.height; y += storedRows_) {
            std::size_t const count = std::min(storedRows_, shape_.height - y);
            stored_->read(rows.data(), count);
            for (std::size_t i = 0; i < count && !isTurned_ && isMirrored_; ++i)
                mirror(rows.data() + i * shape_.rowBytes());
            // The lower rows come first in the rows of a picture that is turned to the right.
            auto const step = static_cast<std::ptrdiff_t>(shape_.rowBytes());
            unsigned char const *const first =
                rows.data() + (isUpsideDown_ ? (count - 1) * shape_.rowBytes() : 0);
            for (std::size_t x = 0; x < shape_.width && isTurned_; ++x)
                copy_(first + x * bytes, isUpsideDown_ ? -step : step,
                      columns.data() + x * count * bytes, count);
            scratch->write(std::uint64_t{y} * shape_.rowBytes(),
                           isTurned_ ? columns.data() : rows.data(), count * shape_.rowBytes());
        }
        scratch_ = std::move(scratch);
        bandRow_ = bandRows_ = 0;
    }

    /// Makes the next rows of the upright picture.
    void loadBand() {
        bandRows_ = std::min(RowsAtOnce(head_), head_.height - y_);
        band_.resize(bandRows_ * head_.rowBytes());
        // The first and the last line come from where the picture's side was.
        bool const isBackwards = isTurned_ ? isMirrored_ : isUpsideDown_;
        std::size_t const line = isBackwards ? head_.height - y_ - bandRows_ : y_;
        if (isTurned_) {
            for (std::size_t y = 0; y < shape_.height; y += storedRows_)
                loadColumns(y, line, isBackwards);
        } else {
            scratch_->read(std::uint64_t{line} * head_.rowBytes(), band_.data(), band_.size());
            for (std::size_t i = 0; i < bandRows_ / 2 && isBackwards; ++i)
                std::swap_ranges(band_.begin() + offset(i), band_.begin() + offset(i + 1),
                                 band_.begin() + offset(bandRows_ - 1 - i));
        }
        y_ += bandRows_;
        bandRow_ = 0;
    }

    std::ptrdiff_t offset(std::size_t row) const {
        return static_cast<std::ptrdiff_t>(row * head_.rowBytes());
    }

    /// Fills the band's columns that the stored rows from `y` on are.
    void loadColumns(std::size_t y, std::size_t firstLine, bool isBackwards) {
        std::size_t const count = std::min(storedRows_, shape_.height - y);
        std::size_t const lineBytes = count * shape_.bytesPerPixel();
        line_.resize(bandRows_ * lineBytes);
        scratch_->read(std::uint64_t{y} * shape_.rowBytes() + firstLine * lineBytes, line_.data(),
                       line_.size());
        std::size_t const column = isUpsideDown_ ? shape_.height - y - count : y;
        for (std::size_t i = 0; i < bandRows_; ++i)
            std::copy_n(line_.data() + (isBackwards ? bandRows_ - 1 - i : i) * lineBytes, lineBytes,
                        band_.data() + i * head_.rowBytes() + column * shape_.bytesPerPixel());
    }

    std::unique_ptr<PictureReader> stored_;
    Shape shape_; ///< as stored
    PixelCopier copy_;
    bool isTurned_;
    bool isMirrored_;
    bool isUpsideDown_;

    std::unique_ptr<Scratch> scratch_;
    std::size_t storedRows_ = 0; ///< that were put aside at once
    Bytes line_;
    Bytes band_; ///< rows of the upright picture
    std::size_t bandRows_ = 0;
    std::size_t bandRow_ = 0; ///< the next of them
    std::size_t y_ = 0;       ///< of the row after the band
};

} // namespace

std::unique_ptr<PictureReader> Upright(std::unique_ptr<PictureReader> stored,
                                       Orientation orientation) {
    if (orientation == kUpright)
        return stored;
    return std::make_unique<UprightReader>(std::move(stored), orientation);
}

} // namespace App
