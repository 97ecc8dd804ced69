// Image transfer: what goes into a texture comes out again, the whole image, for every internal
// format, client layout and kind of texture.
#include "texturekinds.h"

#include "oru/core/utility/boundary.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <numeric>
#include <random>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

/// What a texel of a base format keeps of a colour, as glGetTexImage gives it back for GL_RGBA.
std::array<float, 4> Kept(std::string const &format, std::array<float, 4> const &c) {
    auto const begins = [&](char const *prefix) { return format.rfind(prefix, 15) == 15; };
    if (begins("ALPHA"))
        return {0, 0, 0, c[3]};
    if (begins("LUMINANCE") && format.find("ALPHA") != std::string::npos)
        return {c[0], 0, 0, c[3]};
    if (begins("LUMINANCE") || begins("INTENSITY"))
        return {c[0], 0, 0, 1};
    if (begins("RGBA") || begins("RGB5_A1") || begins("RGB10_A2"))
        return c;
    if (begins("RGB") || begins("R3_G3_B2"))
        return {c[0], c[1], c[2], 1};
    if (begins("RG"))
        return {c[0], c[1], 0, 1};
    return {c[0], 0, 0, 1};
}

/// How many channels the driver gives the bound 2-D texture, and the bits of the smallest one.
std::pair<std::size_t, int> ChannelsAndBits() {
    std::size_t channels = 0;
    int fewest = 64;
    for (int const channel :
         {GL_TEXTURE_RED_SIZE, GL_TEXTURE_GREEN_SIZE, GL_TEXTURE_BLUE_SIZE, GL_TEXTURE_ALPHA_SIZE,
          GL_TEXTURE_LUMINANCE_SIZE, GL_TEXTURE_INTENSITY_SIZE}) {
        GLint bits = 0;
        ORU_GL(GetTexLevelParameteriv, GL_TEXTURE_2D, 0, static_cast<GLenum>(channel), &bits);
        if (bits > 0) {
            ++channels;
            fewest = std::min(fewest, static_cast<int>(bits));
        }
    }
    return {channels, fewest};
}

/// A layout of a pixel in memory: whether OpenGL takes it, and its size.
struct Layout {
    Texture::Format format;
    Texture::Type type;
    bool valid;
    std::size_t bytes;
};

Layout LayoutOf(unsigned int format, unsigned int type) {
    auto const f = static_cast<Texture::Format>(format);
    auto const t = static_cast<Texture::Type>(type);
    std::size_t const component[] = {1, 1, 0, 2, 2, 4, 4, 4};
    if (t == Texture::TYPE_HALF_FLOAT)
        return {f, t, true, 2 * Texture::Channels(f)};
    if (t < Texture::TYPE_UNSIGNED_BYTE_3_3_2)
        return {f, t, true, component[t] * Texture::Channels(f)};
    std::size_t const packed = t <= Texture::TYPE_UNSIGNED_BYTE_2_3_3_REV      ? 1
                               : t <= Texture::TYPE_UNSIGNED_SHORT_1_5_5_5_REV ? 2
                                                                               : 4;
    bool const three = t <= Texture::TYPE_UNSIGNED_SHORT_5_6_5_REV;
    bool const valid =
        three ? f == Texture::FORMAT_RGB : f == Texture::FORMAT_RGBA || f == Texture::FORMAT_BGRA;
    return {f, t, valid, packed};
}

/// A float format that keeps every channel of a client format.
Texture::InternalFormat FloatFormat(Texture::Format format) {
    switch (format) {
    case Texture::FORMAT_ALPHA:
        return Texture::INTERNALFORMAT_ALPHA32F_ARB;
    case Texture::FORMAT_LUMINANCE:
        return Texture::INTERNALFORMAT_LUMINANCE32F_ARB;
    case Texture::FORMAT_LUMINANCE_ALPHA:
        return Texture::INTERNALFORMAT_LUMINANCE_ALPHA32F_ARB;
    default:
        return Texture::INTERNALFORMAT_RGBA32F_ARB;
    }
}

/// Any components that a float texture gives back exactly, or 32-bit integers to 24 bits.
class Components {
public:
    void fill(std::vector<unsigned char> &bytes, Texture::Type type) {
        for (std::size_t i = 0; i < bytes.size();) {
            switch (type) {
            case Texture::TYPE_BYTE: // -128 and -127 are one value
                bytes[i++] = static_cast<unsigned char>(static_cast<int>(random_() % 255) - 127);
                break;
            case Texture::TYPE_SHORT:
                put(bytes, i,
                    static_cast<std::int16_t>(static_cast<int>(random_() % 65535) - 32767));
                break;
            case Texture::TYPE_UNSIGNED_INT: // the largest ones overflow in the driver
            case Texture::TYPE_INT:
                put(bytes, i, static_cast<std::uint32_t>(random_()) / 3);
                break;
            case Texture::TYPE_FLOAT:
                put(bytes, i, static_cast<float>(random_()) / 1e6f - 1000.f);
                break;
            case Texture::TYPE_HALF_FLOAT: // finite, and no denormals
                put(bytes, i, static_cast<std::uint16_t>(0x0400 + random_() % 0x7800));
                break;
            default:
                bytes[i++] = static_cast<unsigned char>(random_());
            }
        }
    }

private:
    template<class T>
    static void put(std::vector<unsigned char> &bytes, std::size_t &i, T value) {
        std::memcpy(&bytes[i], &value, sizeof value);
        i += sizeof value;
    }
    std::mt19937 random_{20};
};

/// Makes 32-bit integers equal that differ by no more than a float's rounding.
void DropLowBits(std::vector<unsigned char> const &expected, std::vector<unsigned char> &read) {
    for (std::size_t i = 0; i < read.size(); i += 4) {
        std::uint32_t a, b;
        std::memcpy(&a, &expected[i], 4);
        std::memcpy(&b, &read[i], 4);
        if (std::max(a, b) - std::min(a, b) <= 128)
            std::memcpy(&read[i], &a, 4);
    }
}

Image<float> Pattern(Sides const &size) {
    Image<float> image(size, 4);
    for (std::size_t i = 0; i < image.texels.size(); ++i)
        image.texels[i] = static_cast<float>(i * 37 % 101) / 100.f;
    return image;
}

Image<float> ReadBack(Texture const &texture, Sides const &size) {
    Image<float> image(size, 4, -1.f);
    Download(texture, image.texels.data(), 0, Texture::FORMAT_RGBA, Texture::TYPE_FLOAT, 1);
    return image;
}

PixelUnpackParameters const kTight;

} // namespace

class TransferTest : public ObjectTest {};

// A part of the image is written; it and the border around it are compared within the precision
// that the driver says its storage has.
TEST_F(TransferTest, EveryInternalFormatKeepsItsChannels) {
    Sides const size = {9, 7, 1};
    Box const inside = {{2, 1, 0}, {5, 4, 1}};
    for (unsigned int i = 0; i < 58; ++i) {
        auto const format = static_cast<Texture::InternalFormat>(i);
        std::ostringstream stream;
        stream << format;
        std::string const name = stream.str();
        SCOPED_TRACE(name);
        Texture2D texture(format, 9, 7, false);
        Bind(texture);
        auto const [channels, bits] = ChannelsAndBits();
        if (format != Texture::INTERNALFORMAT_RGB4) {
            EXPECT_EQ(channels, texture.channels());
        }
        float tolerance = 0.51f / static_cast<float>((1ull << bits) - 1) + 1e-6f;
        if (name.find("16F") != std::string::npos)
            tolerance = 1.f / 2048; // the driver may cut the bits that a half has not
        else if (name.find("32F") != std::string::npos)
            tolerance = 0;

        Image<float> expected(size, 4, 0.25f), part = Pattern(inside.size);
        Upload(texture, 0, {{0, 0, 0}, size}, Texture::FORMAT_RGBA, Texture::TYPE_FLOAT, kTight,
               static_cast<void const *>(expected.texels.data()));
        Upload(texture, 0, inside, Texture::FORMAT_RGBA, Texture::TYPE_FLOAT, kTight,
               static_cast<void const *>(part.texels.data()));
        expected.paste(inside.at, part);
        Image<float> const read = ReadBack(texture, size);
        float worst = 0;
        for (std::size_t texel = 0; texel < read.texels.size(); texel += 4) {
            std::array<float, 4> colour;
            std::copy_n(&expected.texels[texel], 4, colour.begin());
            colour = Kept(name, colour);
            for (std::size_t c = 0; c < 4; ++c)
                worst = std::max(worst, std::abs(colour[c] - read.texels[texel + c]));
        }
        EXPECT_LE(worst, tolerance);
        Unbind(texture);
    }
}

// Every client format with every type: exact through a float texture, or refused by OpenGL.
TEST_F(TransferTest, EveryClientLayoutComesBackByteForByte) {
    Components components;
    for (unsigned int f = Texture::FORMAT_RED; f <= Texture::FORMAT_LUMINANCE_ALPHA; ++f) {
        Texture2D texture(FloatFormat(static_cast<Texture::Format>(f)), 5, 3, false);
        Bind(texture);
        for (unsigned int t = 0; t <= Texture::TYPE_HALF_FLOAT; ++t) {
            if (t == Texture::TYPE_BITMAP)
                continue;
            Layout const layout = LayoutOf(f, t);
            SCOPED_TRACE(testing::Message() << "format " << f << " type " << t);
            std::vector<unsigned char> bytes(15 * layout.bytes), read(bytes.size());
            components.fill(bytes, layout.type);
            auto const upload = [&] {
                texture.subImage(0, 0, 0, 5, 3, layout.format, layout.type, bytes.data(), kTight);
            };
            if (!layout.valid) {
                EXPECT_EQ("GL_INVALID_OPERATION", MessageOf(upload));
                ORU_GL0(PopClientAttrib);
                continue;
            }
            upload();
            texture.getPixelData(read.data(), 0, layout.format, layout.type, 1);
            if (t == Texture::TYPE_UNSIGNED_INT || t == Texture::TYPE_INT)
                DropLowBits(bytes, read);
            EXPECT_EQ(bytes, read);
        }
        Unbind(texture);
    }
}

// Rows of memory with gaps, skipped parts and alignments, from memory and from a buffer, into every
// kind; no unpack state is left behind.
TEST_F(TransferTest, EveryMemoryLayoutReachesEveryKind) {
    Sides const memory = {7, 6, 5};
    Sides const size = {6, 5, 4};
    Box const inside = {{1, 2, 1}, {3, 2, 2}};
    for (TextureKind const &kind : kTextureKinds) {
        for (unsigned int alignment : {1u, 2u, 4u, 8u}) {
            for (bool const fromBuffer : {false, true}) {
                SCOPED_TRACE(testing::Message() << kind.name << " alignment " << alignment
                                                << (fromBuffer ? " buffer" : " memory"));
                Sides const whole = kind.cut(size);
                Box box = {{0, 0, 0}, kind.cut(inside.size)};
                std::copy_n(inside.at.begin(), kind.sides, box.at.begin());
                // The driver here swaps too few bytes when anything is skipped.
                bool const swap = alignment == 2;
                Sides skip = {0, 0, 0};
                if (!swap)
                    std::copy_n(Sides{2, 1, 1}.begin(), kind.sides, skip.begin());

                // Pixels of two 16-bit components: a row of 7 takes 28 bytes, or 32.
                std::size_t const row =
                    ORU::IncrementToBoundaryPtr(28, static_cast<int>(alignment));
                std::vector<std::uint16_t> source(row * 6 * 5 / 2);
                std::iota(source.begin(), source.end(), std::uint16_t(1000));
                PixelUnpackParameters params;
                params.setAlignment(alignment);
                params.setRowLength(Size(memory[0]));
                params.setImageHeight(Size(memory[1]));
                params.setSkipPixels(Size(skip[0]));
                params.setSkipRows(Size(skip[1]));
                params.setSkipImages(Size(skip[2]));
                if (swap)
                    params.enableSwapBytes();

                Image<std::uint16_t> expected(whole, 2, 77);
                auto const texture = kind.make(Texture::INTERNALFORMAT_RG16, whole, false);
                Bind(*texture);
                Upload(*texture, 0, {{0, 0, 0}, whole}, Texture::FORMAT_RG,
                       Texture::TYPE_UNSIGNED_SHORT, kTight,
                       static_cast<void const *>(expected.texels.data()));
                Image<std::uint16_t>::ForEach({{0, 0, 0}, box.size}, [&](int x, int y, int z) {
                    std::size_t const line = Size(z + skip[2]) * 6 + Size(y + skip[1]);
                    for (std::size_t c = 0; c < 2; ++c) {
                        std::uint16_t v = source[line * row / 2 + Size(x + skip[0]) * 2 + c];
                        if (swap)
                            v = static_cast<std::uint16_t>(v << 8 | v >> 8);
                        expected.at(box.at[0] + x, box.at[1] + y, box.at[2] + z)[c] = v;
                    }
                });

                if (fromBuffer) {
                    std::vector<std::uint16_t> shifted(source.size() + 4);
                    std::copy(source.begin(), source.end(), shifted.begin() + 4);
                    Buffer buffer(static_cast<std::int64_t>(shifted.size() * 2),
                                  Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW,
                                  shifted.data());
                    Upload(*texture, 0, box, Texture::FORMAT_RG, Texture::TYPE_UNSIGNED_SHORT,
                           params, &buffer, std::size_t(8));
                    EXPECT_TRUE(buffer.isUnpackBuffer());
                    EXPECT_EQ(0u, buffer.getBoundID());
                } else {
                    Upload(*texture, 0, box, Texture::FORMAT_RG, Texture::TYPE_UNSIGNED_SHORT,
                           params, static_cast<void const *>(source.data()));
                }
                GLint length = -1;
                ORU_GL(GetIntegerv, GL_UNPACK_ROW_LENGTH, &length);
                EXPECT_EQ(0, length);

                Image<std::uint16_t> read(whole, 2);
                Download(*texture, read.texels.data(), 0, Texture::FORMAT_RG,
                         Texture::TYPE_UNSIGNED_SHORT, 1);
                EXPECT_EQ(expected.texels, read.texels);
                EXPECT_EQ(read.texels.size() * 2, PixelDataSize(*texture, Texture::FORMAT_RG,
                                                                Texture::TYPE_UNSIGNED_SHORT));
                Unbind(*texture);
            }
        }
    }
}

// Rows of 5 bytes come back padded to the alignment, and into a buffer at an offset.
TEST_F(TransferTest, EveryKindIsReadWithAlignmentAndIntoABuffer) {
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        Sides const size = kind.cut({5, 3, 2});
        auto const texture = kind.make(Texture::INTERNALFORMAT_RED, size, false);
        Bind(*texture);
        Image<unsigned char> image(size, 1);
        std::iota(image.texels.begin(), image.texels.end(), static_cast<unsigned char>(1));
        Upload(*texture, 0, {{0, 0, 0}, size}, Texture::FORMAT_RED, Texture::TYPE_UNSIGNED_BYTE,
               kTight, static_cast<void const *>(image.texels.data()));
        std::size_t const rows = Size(size[1]) * Size(size[2]);
        for (unsigned int const alignment : {1u, 2u, 4u, 8u}) {
            std::size_t const row = ORU::IncrementToBoundaryPtr(5, static_cast<int>(alignment));
            std::vector<unsigned char> expected(rows * row, 0xEE), read(expected);
            for (std::size_t i = 0; i < rows; ++i)
                std::copy_n(&image.texels[i * 5], 5, &expected[i * row]);
            Download(*texture, read.data(), 0, Texture::FORMAT_RED, Texture::TYPE_UNSIGNED_BYTE,
                     alignment);
            EXPECT_EQ(expected, read) << "alignment " << alignment;
        }

        Buffer occupant(4, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
        occupant.bind();
        Buffer buffer(64, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_READ,
                      std::vector<char>(64, 0x11).data());
        Download(*texture, buffer, 7, 0, Texture::FORMAT_RED, Texture::TYPE_UNSIGNED_BYTE);
        EXPECT_TRUE(occupant.isBound());
        std::vector<unsigned char> expected(64, 0x11), read(64);
        std::copy(image.texels.begin(), image.texels.end(), expected.begin() + 7);
        buffer.bind();
        buffer.getSubData(0, 64, read.data());
        EXPECT_EQ(expected, read);
        Buffer::BindDefaultPackBuffer();
        Unbind(*texture);
    }
}

TEST_F(TransferTest, WritesAndReadsMipLevels) {
    for (TextureKind const &kind : kTextureKinds) {
        if (!kind.mipmaps)
            continue;
        SCOPED_TRACE(kind.name);
        auto const texture = kind.make(Texture::INTERNALFORMAT_RGBA8, {8, 4, 2}, true);
        Bind(*texture);
        Sides size = kind.cut({8, 4, 2});
        std::vector<Image<unsigned char>> levels;
        for (int level = 0; level < 4; ++level) {
            levels.emplace_back(size, 4, static_cast<unsigned char>(40 * level + 9));
            Upload(*texture, level, {{0, 0, 0}, size}, Texture::FORMAT_BGRA,
                   Texture::TYPE_UNSIGNED_BYTE, kTight,
                   static_cast<void const *>(levels.back().texels.data()));
            for (std::size_t side = 0; side < kind.sides; ++side)
                size[side] = side == kind.layers ? size[side] : std::max(1, size[side] / 2);
        }
        for (int level = 0; level < 4; ++level) {
            auto read = levels[static_cast<std::size_t>(level)].texels;
            std::fill(read.begin(), read.end(), static_cast<unsigned char>(0));
            Download(*texture, read.data(), level, Texture::FORMAT_BGRA,
                     Texture::TYPE_UNSIGNED_BYTE, 1);
            EXPECT_EQ(levels[static_cast<std::size_t>(level)].texels, read) << level;
        }
        Unbind(*texture);
    }
}

TEST_F(TransferTest, MakesA3DTextureWithItsContents) {
    std::vector<unsigned char> const pixels = {9, 1, 2, 9, 9, 3, 4, 9, 9, 5, 6, 9, 9, 7, 8, 9};
    PixelUnpackParameters params;
    params.setRowLength(4);
    params.setSkipPixels(1);
    Texture3D const texture(Texture::INTERNALFORMAT_RED, 0, 2, 2, 2, Texture::FORMAT_RED,
                            Texture::TYPE_UNSIGNED_BYTE, pixels.data(), params);
    Bind(texture);
    std::vector<unsigned char> read(8);
    texture.getPixelData(read.data(), 0, Texture::FORMAT_RED, Texture::TYPE_UNSIGNED_BYTE, 1);
    EXPECT_EQ((std::vector<unsigned char>{1, 2, 3, 4, 5, 6, 7, 8}), read);
    Unbind(texture);
}

// From a framebuffer with a known picture: the copied rectangle, and nothing beside it.
TEST_F(TransferTest, CopiesFromTheFramebuffer) {
    Sides const size = {8, 6, 3};
    Image<unsigned char> picture({8, 6, 1}, 4);
    std::iota(picture.texels.begin(), picture.texels.end(), static_cast<unsigned char>(0));
    Texture2D source(Texture::INTERNALFORMAT_RGBA8, 8, 6, false);
    Bind(source);
    source.subImage(0, 0, 0, 8, 6, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                    picture.texels.data(), kTight);
    Unbind(source);
    GLuint framebuffer = 0;
    ORU_GL(GenFramebuffersEXT, 1, &framebuffer);
    ORU_GL(BindFramebufferEXT, GL_FRAMEBUFFER_EXT, framebuffer);
    ORU_GL(FramebufferTexture2DEXT, GL_FRAMEBUFFER_EXT, GL_COLOR_ATTACHMENT0_EXT, source.target(),
           source.objectID(), 0);
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        Sides const whole = kind.cut(size);
        auto const texture = kind.make(Texture::INTERNALFORMAT_RGBA8, whole, false);
        Image<unsigned char> expected(whole, 4, 50), read(whole, 4);
        Bind(*texture);
        Upload(*texture, 0, {{0, 0, 0}, whole}, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
               kTight, static_cast<void const *>(expected.texels.data()));
        if (auto *const one = dynamic_cast<Texture1 *>(texture.get()))
            one->copyTexSubImage(0, 2, 1, 3, 4);
        else if (auto *const two = dynamic_cast<Texture2 *>(texture.get()))
            two->copyTexSubImage(0, 2, 1, 1, 3, 4, 2);
        else
            dynamic_cast<Texture3 &>(*texture).copyTexSubImage(0, 2, 1, 2, 1, 3, 4, 2);
        Box const copied = {{0, 0, 0}, {4, kind.sides > 1 ? 2 : 1, 1}};
        Image<unsigned char>::ForEach(copied, [&](int x, int y, int) {
            std::copy_n(picture.at(x + 1, y + 3, 0), 4,
                        expected.at(x + 2, kind.sides > 1 ? y + 1 : 0, kind.sides > 2 ? 2 : 0));
        });
        Download(*texture, read.texels.data(), 0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                 1);
        EXPECT_EQ(expected.texels, read.texels);
        Unbind(*texture);
    }
    ORU_GL(BindFramebufferEXT, GL_FRAMEBUFFER_EXT, 0);
    ORU_GL(DeleteFramebuffersEXT, 1, &framebuffer);
}

// What OpenGL refuses: the buffer binding is put back, the unpack state waits on its stack.
TEST_F(TransferTest, AFailedUploadKeepsItsUnpackState) {
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 4, 4, false);
    Bind(texture);
    Buffer buffer(256, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    PixelUnpackParameters params;
    params.setRowLength(17);
    EXPECT_EQ("GL_INVALID_VALUE", MessageOf([&] {
                  texture.subImage(0, 3, 0, 2, 2, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                                   &buffer, 0, params);
              }));
    EXPECT_FALSE(buffer.isBound());
    GLint depth = 0, length = 0;
    ORU_GL(GetIntegerv, GL_CLIENT_ATTRIB_STACK_DEPTH, &depth);
    ORU_GL(GetIntegerv, GL_UNPACK_ROW_LENGTH, &length);
    EXPECT_EQ(1, depth);
    EXPECT_EQ(17, length);
    ORU_GL0(PopClientAttrib);
    Unbind(texture);
}
