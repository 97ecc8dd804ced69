// Pictures in PNG form, by libpng.
#include "apps/common/pngcodec.h"

#include "apps/common/failure.h"
#include "apps/common/jumpguard.h"

#include <png.h>
#include <zlib.h>

#include <algorithm>
#include <cstring>
#include <new>

namespace App {

namespace {

// Filtered photos have runs but hardly anything that repeats: the sample photos come out within 0.6
// per cent of the size that zlib's default search gives, in a sixth of its time.
constexpr int kCompressionStrategy = Z_RLE;

void OnError(png_structp png, png_const_charp message) {
    static_cast<JumpGuard *>(png_get_error_ptr(png))->leave(message);
}

void OnWarning(png_structp, png_const_charp) {
    // What libpng can read past is no reason to refuse a photo.
}

/// A read struct with its info struct, and the bytes it reads.
struct Reader {
    explicit Reader(std::vector<unsigned char> const &fileBytes) : bytes(fileBytes) {
        png = png_create_read_struct(PNG_LIBPNG_VER_STRING, &guard, OnError, OnWarning);
        info = png ? png_create_info_struct(png) : nullptr;
        if (!info)
            throw std::bad_alloc();
    }
    ~Reader() { png_destroy_read_struct(&png, &info, nullptr); }
    Reader(Reader const &) = delete;
    Reader &operator=(Reader const &) = delete;

    static void Read(png_structp png, png_bytep target, std::size_t count) {
        auto &self = *static_cast<Reader *>(png_get_io_ptr(png));
        if (count > self.bytes.size() - self.position)
            png_error(png, "the file is cut off");
        std::memcpy(target, self.bytes.data() + self.position, count);
        self.position += count;
    }

    /// Runs a step of libpng. @throws Failure when it fails
    template<class Step>
    void run(Step const &step) {
        if (!Guarded(guard, step))
            throw Failure("damaged PNG: " + guard.message);
    }

    std::vector<unsigned char> const &bytes;
    std::size_t position = 0;
    JumpGuard guard;
    png_structp png = nullptr;
    png_infop info = nullptr;
};

/// A write struct with its info struct, and the bytes it has written.
struct Writer {
    Writer() {
        png = png_create_write_struct(PNG_LIBPNG_VER_STRING, &guard, OnError, OnWarning);
        info = png ? png_create_info_struct(png) : nullptr;
        if (!info)
            throw std::bad_alloc();
    }
    ~Writer() { png_destroy_write_struct(&png, &info); }
    Writer(Writer const &) = delete;
    Writer &operator=(Writer const &) = delete;

    static void Write(png_structp png, png_bytep data, std::size_t count) {
        auto &self = *static_cast<Writer *>(png_get_io_ptr(png));
        bool stored = true;
        try {
            self.bytes.insert(self.bytes.end(), data, data + count);
        } catch (std::bad_alloc const &) {
            stored = false;
        }
        if (!stored)
            png_error(png, "not enough memory");
    }

    std::vector<unsigned char> bytes;
    JumpGuard guard;
    png_structp png = nullptr;
    png_infop info = nullptr;
};

std::size_t BigEndian32(unsigned char const *bytes) {
    return std::size_t{bytes[0]} << 24 | std::size_t{bytes[1]} << 16 | std::size_t{bytes[2]} << 8 |
           std::size_t{bytes[3]};
}

/// Checks the size in the header, where it has a fixed place, before libpng judges it in its own
/// words and before memory is taken.
void RequireUsableSize(std::vector<unsigned char> const &bytes, SizeLimit limit) {
    constexpr std::size_t kWidthOffset = 16;
    constexpr std::size_t kHeightOffset = 20;
    constexpr std::size_t kHeaderEnd = 33;
    if (bytes.size() < kHeaderEnd)
        throw Failure("damaged PNG: the file is cut off");
    if (std::memcmp(bytes.data() + 12, "IHDR", 4) != 0)
        return;
    std::size_t const width = BigEndian32(bytes.data() + kWidthOffset);
    std::size_t const height = BigEndian32(bytes.data() + kHeightOffset);
    limit.require(width, height);
    // A byte of deflate's gives 1032 at most: a file that is shorter need not be given memory. No
    // picture has fewer bits a pixel than its depth says.
    constexpr std::size_t kDepthOffset = 24;
    constexpr std::size_t kMostInflated = 1032;
    if (width * height / 8 * bytes[kDepthOffset] / kMostInflated > bytes.size())
        throw Failure("damaged PNG: the file is cut off");
}

std::vector<png_bytep> Rows(Image &image) {
    std::vector<png_bytep> rows(image.height);
    for (std::size_t y = 0; y < image.height; ++y)
        rows[y] = image.row(y);
    return rows;
}

} // namespace

bool IsPng(std::vector<unsigned char> const &bytes) {
    return bytes.size() >= kPngSignatureBytes &&
           png_sig_cmp(bytes.data(), 0, kPngSignatureBytes) == 0;
}

Image DecodePng(std::vector<unsigned char> const &bytes, SizeLimit limit) {
    RequireUsableSize(bytes, limit);
    Reader reader(bytes);
    png_structp const png = reader.png;
    png_infop const info = reader.info;
    reader.run([&] {
        png_set_read_fn(png, &reader, Reader::Read);
        png_read_info(png, info);
        png_set_expand(png); // palettes, fewer than 8 bits, colour keys
        png_set_swap(png);   // 16 bits come with the high byte first
        png_set_interlace_handling(png);
        png_read_update_info(png, info);
    });
    Image image({png_get_image_width(png, info), png_get_image_height(png, info),
                 png_get_channels(png, info), png_get_bit_depth(png, info)});
    std::vector<png_bytep> rows = Rows(image);
    reader.run([&] {
        png_read_image(png, rows.data());
        png_read_end(png, nullptr);
    });
    return image;
}

std::vector<unsigned char> EncodePng(Image const &image) {
    static constexpr int kColourTypes[] = {PNG_COLOR_TYPE_GRAY, PNG_COLOR_TYPE_GRAY_ALPHA,
                                           PNG_COLOR_TYPE_RGB, PNG_COLOR_TYPE_RGB_ALPHA};
    Writer writer;
    png_structp const png = writer.png;
    png_infop const info = writer.info;
    bool const written = Guarded(writer.guard, [&] {
        png_set_write_fn(png, &writer, Writer::Write, nullptr);
        png_set_compression_strategy(png, kCompressionStrategy);
        png_set_IHDR(png, info, static_cast<png_uint_32>(image.width),
                     static_cast<png_uint_32>(image.height), static_cast<int>(image.bitsPerChannel),
                     kColourTypes[image.channels - 1], PNG_INTERLACE_NONE,
                     PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
        png_write_info(png, info);
        if (image.bitsPerChannel == 16)
            png_set_swap(png);
        for (std::size_t y = 0; y < image.height; ++y)
            png_write_row(png, image.row(y));
        png_write_end(png, info);
    });
    if (!written)
        throw Failure("cannot be encoded: " + writer.guard.message);
    return std::move(writer.bytes);
}

} // namespace App
