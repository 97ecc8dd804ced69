// Pictures in PNG form, read row by row, by libpng.
#include "apps/common/pngreader.h"

#include "apps/common/jumpguard.h"

#include <png.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <new>

namespace App {

namespace {

constexpr std::size_t kSignatureBytes = 8;

void OnError(png_structp png, png_const_charp message) {
    static_cast<JumpGuard *>(png_get_error_ptr(png))->leave(message);
}

void OnWarning(png_structp, png_const_charp) {
    // What libpng can read past is no reason to refuse a photo.
}

std::size_t BigEndian32(unsigned char const *bytes) {
    return std::size_t{bytes[0]} << 24 | std::size_t{bytes[1]} << 16 | std::size_t{bytes[2]} << 8 |
           std::size_t{bytes[3]};
}

/// Checks the size in the header, where it has a fixed place, before libpng judges it in its own
/// words and before memory is taken.
void RequireUsableSize(Source &source) {
    constexpr std::size_t kWidthOffset = 16;
    constexpr std::size_t kHeightOffset = 20;
    std::array<unsigned char, 33> header;
    if (source.read(0, header.data(), header.size()) < header.size())
        throw Failure("damaged PNG: the file is cut off");
    if (std::memcmp(header.data() + 12, "IHDR", 4) != 0)
        return;
    std::size_t const width = BigEndian32(header.data() + kWidthOffset);
    std::size_t const height = BigEndian32(header.data() + kHeightOffset);
    RequirePixels(width, height);
    // A byte of deflate's gives 1032 at most: a file that is shorter need not be given memory. No
    // picture has fewer bits a pixel than its depth says.
    constexpr std::size_t kDepthOffset = 24;
    constexpr std::size_t kMostInflated = 1032;
    if (width * height / 8 * header[kDepthOffset] / kMostInflated > source.size())
        throw Failure("damaged PNG: the file is cut off");
}

class PngReader : public PictureReader {
public:
    explicit PngReader(std::unique_ptr<Source> source) : source_(std::move(source)) {
        RequireUsableSize(*source_);
        png_ = png_create_read_struct(PNG_LIBPNG_VER_STRING, &guard_, OnError, OnWarning);
        info_ = png_ ? png_create_info_struct(png_) : nullptr;
        if (!info_)
            throw std::bad_alloc();
        run([&] {
            png_set_user_limits(png_, PNG_UINT_31_MAX, PNG_UINT_31_MAX);
            png_set_read_fn(png_, this, Read);
            png_read_info(png_, info_);
            png_set_expand(png_); // palettes, fewer than 8 bits, colour keys
            png_set_swap(png_);   // 16 bits come with the high byte first
            png_set_interlace_handling(png_);
            png_read_update_info(png_, info_);
        });
        head_.kind = FileKind::Png;
        head_.width = png_get_image_width(png_, info_);
        head_.height = png_get_image_height(png_, info_);
        head_.channels = png_get_channels(png_, info_);
        head_.bitsPerChannel = png_get_bit_depth(png_, info_);
        isInterlaced_ = png_get_interlace_type(png_, info_) != PNG_INTERLACE_NONE;
    }
    ~PngReader() override { png_destroy_read_struct(&png_, &info_, nullptr); }

    std::string wholeReason() const override { return isInterlaced_ ? "interlaced PNG" : ""; }

    void read(unsigned char *rows, std::size_t count) override {
        if (isInterlaced_) {
            if (whole_.pixels.empty())
                readWhole();
            std::copy_n(whole_.row(y_), count * head_.rowBytes(), rows);
        } else {
            run([&] {
                for (std::size_t i = 0; i < count; ++i)
                    png_read_row(png_, rows + i * head_.rowBytes(), nullptr);
                if (y_ + count == head_.height)
                    png_read_end(png_, nullptr);
            });
        }
        y_ += count;
    }

private:
    static void Read(png_structp png, png_bytep target, std::size_t count) {
        auto &self = *static_cast<PngReader *>(png_get_io_ptr(png));
        std::size_t got = 0;
        bool const isRead =
            self.guard_.keep([&] { got = self.source_->read(self.position_, target, count); });
        if (!isRead || got < count)
            png_error(png, "the file is cut off");
        self.position_ += count;
    }

    /// Runs a step of libpng. @throws Failure when it fails
    template<class Step>
    void run(Step const &step) {
        if (!Guarded(guard_, step))
            fail();
    }

    [[noreturn]] void fail() {
        png_destroy_read_struct(&png_, &info_, nullptr);
        guard_.raise("damaged PNG: ");
    }

    void readWhole() {
        whole_ = Image(head_);
        std::vector<png_bytep> rows(head_.height);
        for (std::size_t y = 0; y < head_.height; ++y)
            rows[y] = whole_.row(y);
        run([&] {
            png_read_image(png_, rows.data());
            png_read_end(png_, nullptr);
        });
    }

    std::unique_ptr<Source> source_;
    std::uint64_t position_ = 0;
    JumpGuard guard_;
    png_structp png_ = nullptr;
    png_infop info_ = nullptr;
    bool isInterlaced_ = false;
    Image whole_; ///< when interlaced
    std::size_t y_ = 0;
};

} // namespace

bool IsPng(Bytes const &beginning) {
    return beginning.size() >= kSignatureBytes &&
           png_sig_cmp(beginning.data(), 0, kSignatureBytes) == 0;
}

std::unique_ptr<PictureReader> OpenPng(std::unique_ptr<Source> source) {
    return std::make_unique<PngReader>(std::move(source));
}

} // namespace App
