// Picture files of kinds that the programs read but do not write.
#include "tests/apps/common/foreignfiles.h"

#include <cstdio> // jpeglib.h needs it

#include <jpeglib.h>
#include <png.h>

#include <cstdlib>

namespace apps_test {

namespace {

void Append(png_structp png, png_bytep data, std::size_t count) {
    auto &bytes = *static_cast<Bytes *>(png_get_io_ptr(png));
    bytes.insert(bytes.end(), data, data + count);
}

struct PngHeader {
    unsigned int width, height;
    int bits, colourType;
    int interlace = PNG_INTERLACE_NONE;
};

/// Writes rows whose samples a function gives; `prepare` adds chunks before them.
template<class Prepare, class Sample>
Bytes WritePng(PngHeader const &header, unsigned int channels, Prepare const &prepare,
               Sample const &sample) {
    Bytes bytes;
    png_structp png = png_create_write_struct(PNG_LIBPNG_VER_STRING, nullptr, nullptr, nullptr);
    png_infop info = png_create_info_struct(png);
    png_set_write_fn(png, &bytes, Append, nullptr);
    png_set_IHDR(png, info, header.width, header.height, header.bits, header.colourType,
                 header.interlace, PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
    prepare(png, info);
    png_write_info(png, info);
    png_set_packing(png);
    Bytes samples(std::size_t{header.width} * header.height * channels);
    std::vector<png_bytep> rows;
    for (unsigned int y = 0; y < header.height; ++y) {
        rows.push_back(samples.data() + std::size_t{y} * header.width * channels);
        for (unsigned int x = 0; x < header.width; ++x)
            for (unsigned int c = 0; c < channels; ++c)
                rows[y][x * channels + c] = static_cast<unsigned char>(sample(x, y, c));
    }
    png_write_image(png, rows.data());
    png_write_end(png, info);
    png_destroy_write_struct(&png, &info);
    return bytes;
}

void Nothing(png_structp, png_infop) {}

} // namespace

Bytes PalettePng(bool transparent) {
    auto const prepare = [transparent](png_structp png, png_infop info) {
        png_color palette[4];
        for (int i = 0; i < 4; ++i)
            palette[i] = {static_cast<png_byte>(60 * i), static_cast<png_byte>(255 - 60 * i), 7};
        png_set_PLTE(png, info, palette, 4);
        png_byte const alphas[2] = {255, 128};
        if (transparent)
            png_set_tRNS(png, info, alphas, 2, nullptr);
    };
    return WritePng({5, 3, 2, PNG_COLOR_TYPE_PALETTE}, 1, prepare,
                    [](unsigned int x, unsigned int y, unsigned int) { return (x + y) % 4; });
}

Bytes LowDepthPng(int bits) {
    return WritePng(
        {5, 3, bits, PNG_COLOR_TYPE_GRAY}, 1, Nothing,
        [bits](unsigned int x, unsigned int y, unsigned int) { return (x + y) % (1u << bits); });
}

Bytes InterlacedPng() {
    return WritePng({9, 7, 8, PNG_COLOR_TYPE_RGB, PNG_INTERLACE_ADAM7}, 3, Nothing,
                    [](unsigned int x, unsigned int y, unsigned int c) {
                        return c == 0 ? 20 * x : c == 1 ? 30 * y : x + y;
                    });
}

Bytes ColourKeyPng() {
    auto const prepare = [](png_structp png, png_infop info) {
        png_color_16 key = {};
        key.gray = 2;
        png_set_tRNS(png, info, nullptr, 0, &key);
    };
    return WritePng({4, 1, 8, PNG_COLOR_TYPE_GRAY}, 1, prepare,
                    [](unsigned int x, unsigned int, unsigned int) { return x; });
}

Bytes Jpeg(JpegKind kind) {
    jpeg_error_mgr errors;
    jpeg_compress_struct codec = {};
    codec.err = jpeg_std_error(&errors);
    jpeg_create_compress(&codec);
    unsigned char *buffer = nullptr;
    unsigned long size = 0;
    jpeg_mem_dest(&codec, &buffer, &size);
    codec.image_width = 33;
    codec.image_height = 17;
    codec.input_components = kind == JpegKind::Grey ? 1 : kind == JpegKind::YCbCr ? 3 : 4;
    codec.in_color_space = kind == JpegKind::Grey    ? JCS_GRAYSCALE
                           : kind == JpegKind::YCbCr ? JCS_RGB
                                                     : JCS_CMYK;
    jpeg_set_defaults(&codec);
    jpeg_start_compress(&codec, TRUE);
    Bytes row(132);
    for (unsigned int y = 0; y < 17; ++y) {
        for (unsigned int i = 0; i < row.size(); ++i)
            row[i] = static_cast<unsigned char>(i + 8 * y);
        JSAMPROW scanline = row.data();
        jpeg_write_scanlines(&codec, &scanline, 1);
    }
    jpeg_finish_compress(&codec);
    jpeg_destroy_compress(&codec);
    Bytes const bytes(buffer, buffer + size);
    std::free(buffer);
    return bytes;
}

Bytes JpegHeld(unsigned int orientation, bool bigEndian) {
    auto const value = static_cast<unsigned char>(orientation);
    Bytes const little = {'E',  'x', 'i', 'f', 0, 0, 'I', 'I', 42,    0, 8, 0, 0, 0, 1, 0,
                          0x12, 1,   3,   0,   1, 0, 0,   0,   value, 0, 0, 0, 0, 0, 0, 0};
    Bytes const big = {'E', 'x',  'i', 'f', 0, 0, 'M', 'M', 0, 42,    0, 0, 0, 8, 0, 1,
                       1,   0x12, 0,   3,   0, 0, 0,   1,   0, value, 0, 0, 0, 0, 0, 0};
    Bytes const &exif = bigEndian ? big : little;
    Bytes jpeg = Jpeg(JpegKind::YCbCr);
    Bytes segment = {0xFF, 0xE1, 0, static_cast<unsigned char>(exif.size() + 2)};
    segment.insert(segment.end(), exif.begin(), exif.end());
    jpeg.insert(jpeg.begin() + 2, segment.begin(), segment.end());
    return jpeg;
}

} // namespace apps_test
