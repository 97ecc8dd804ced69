// Image transfer: what goes into a texture comes out again, the whole image, for every client
// layout and kind of texture.
#include "tests/support/texturekinds.h"

#include "oru/core/utility/boundary.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/framebuffer.h"

#include <cstring>
#include <numeric>
#include <random>

using namespace oru_test;

namespace {

Pixel const kBytes{Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE};
Pixel const kRed{Texture::FORMAT_RED, Texture::TYPE_UNSIGNED_BYTE};

/// What a texel of a base format keeps of a colour, as glGetTexImage gives it back for GL_RGBA.
std::array<float, 4> Kept(std::string const &format, float const *c) {
    auto const begins = [&](char const *prefix) {
        return format.rfind(std::string("INTERNALFORMAT_") + prefix, 0) == 0;
    };
    if (begins("ALPHA"))
        return {0, 0, 0, c[3]};
    if (begins("LUMINANCE") && format.find("ALPHA") != std::string::npos)
        return {c[0], 0, 0, c[3]};
    if (begins("LUMINANCE") || begins("INTENSITY"))
        return {c[0], 0, 0, 1};
    if (begins("RGBA") || begins("RGB5_A1") || begins("RGB10_A2"))
        return {c[0], c[1], c[2], c[3]};
    if (begins("RGB") || begins("R3_G3_B2"))
        return {c[0], c[1], c[2], 1};
    return {c[0], begins("RG") ? c[1] : 0, 0, 1};
}

/// How many channels the driver gives the bound 2-D texture, and the bits of the smallest one.
std::pair<std::size_t, int> ChannelsAndBits() {
    std::size_t channels = 0;
    int fewest = 64;
    GLenum const sizes[] = {GL_TEXTURE_RED_SIZE,       GL_TEXTURE_GREEN_SIZE,
                            GL_TEXTURE_BLUE_SIZE,      GL_TEXTURE_ALPHA_SIZE,
                            GL_TEXTURE_LUMINANCE_SIZE, GL_TEXTURE_INTENSITY_SIZE};
    for (GLenum const size : sizes) {
        GLint bits = 0;
        ORU_GL(GetTexLevelParameteriv, GL_TEXTURE_2D, 0, size, &bits);
        channels += bits > 0;
        fewest = bits > 0 ? std::min(fewest, int{bits}) : fewest;
    }
    return {channels, fewest};
}

/// Whether two images of 32-bit integers differ by no more than a float's rounding.
bool AreNear(std::vector<unsigned char> const &a, std::vector<unsigned char> const &b) {
    for (std::size_t i = 0; i < a.size(); i += 4) {
        std::int32_t of[2];
        std::memcpy(&of[0], &a[i], 4);
        std::memcpy(&of[1], &b[i], 4);
        if (std::abs(of[0] - of[1]) > 128)
            return false;
    }
    return true;
}

using Bytes = Image<unsigned char>;

/// Writes a part of a level, from rows of memory with gaps or from a buffer with the same, and a
/// copy of the part into `image`.
void UploadPart(TextureKind const &kind, Texture &texture, int level, Bytes &image,
                unsigned int alignment, bool buffered) {
    Box box = {{}, kind.cut({3, 2, 2})};
    std::copy_n(Sides{1, 2, 1}.begin(), kind.sides, box.at.begin());
    PixelUnpackParameters params;
    params.setAlignment(alignment);
    params.setRowLength(9);
    std::size_t const row = ORU::IncrementToBoundaryPtr(9, static_cast<int>(alignment));
    std::vector<unsigned char> source(8 + row * 4);
    std::iota(source.begin(), source.end(), static_cast<unsigned char>(100));
    Bytes::ForEach(box.size, [&](int x, int y, int z) {
        *image.at(box.at[0] + x, box.at[1] + y, box.at[2] + z) =
            source[8 + Size(z * 2 + y) * row + Size(x)];
    });
    if (buffered) {
        Buffer buffer(static_cast<std::int64_t>(source.size()), Buffer::TYPE_ARRAY_BUFFER,
                      Buffer::USAGE_STREAM_DRAW, source.data());
        Upload(texture, level, box, kRed, params, &buffer, std::size_t(8));
        EXPECT_TRUE(buffer.isUnpackBuffer());
        EXPECT_EQ(0u, buffer.getBoundID());
    } else {
        Upload(texture, level, box, kRed, params, static_cast<void const *>(&source[8]));
    }
    EXPECT_EQ(0, Get(GL_UNPACK_ROW_LENGTH));
}

/// Expects an image in rows of an alignment, in memory or in a buffer, behind a gap.
void ExpectRows(TextureKind const &kind, Texture const &texture, int level, Bytes const &image,
                unsigned int alignment, bool buffered) {
    std::size_t const width = Size(image.size[0]), gap = 7,
                      row = ORU::IncrementToBoundaryPtr(width, static_cast<int>(alignment));
    std::vector<unsigned char> expected(gap + image.texels.size() / width * row, 0xEE);
    std::vector<unsigned char> read(expected);
    for (std::size_t i = 0; i < image.texels.size(); ++i)
        expected[gap + i / width * row + i % width] = image.texels[i];
    if (buffered) {
        auto const size = static_cast<std::int64_t>(read.size());
        Buffer occupant(4, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
        Buffer buffer(size, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_READ, read.data());
        occupant.bind();
        ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, 4);
        Download(texture, level, kRed, alignment, &buffer, static_cast<int>(gap));
        EXPECT_TRUE(occupant.isBound());
        EXPECT_EQ(kind.sides == 1 ? 1 : 4, Get(GL_PACK_ALIGNMENT)) << "left so by one side only";
        buffer.bind();
        buffer.getSubData(0, size, read.data());
        Buffer::BindDefaultPackBuffer();
    } else {
        Download(texture, level, kRed, alignment, static_cast<void *>(&read[gap]));
    }
    EXPECT_EQ(expected, read);
}

} // namespace

class TransferTest : public ObjectTest {};

// A part of the image is written; it and the border around it are compared within the precision
// that the driver says its storage has.
TEST_F(TransferTest, EveryInternalFormatKeepsItsChannels) {
    Pixel const floats{Texture::FORMAT_RGBA, Texture::TYPE_FLOAT};
    for (unsigned int i = 0; i < 58; ++i) {
        auto const format = static_cast<Texture::InternalFormat>(i);
        std::string const name = testing::PrintToString(format);
        SCOPED_TRACE(name);
        BoundTexture const texture(std::make_unique<Texture2D>(format, 9, 7, false));
        auto const [channels, bits] = ChannelsAndBits();
        if (format != Texture::INTERNALFORMAT_RGB4) {
            EXPECT_EQ(channels, texture->channels());
        }
        float tolerance = 0.51f / static_cast<float>((1ull << bits) - 1) + 1e-6f;
        if (name.find("16F") != std::string::npos)
            tolerance = 1.f / 2048; // the driver may cut the bits that a half has not
        else if (name.find("32F") != std::string::npos)
            tolerance = 0;

        Image<float> expected({9, 7, 1}, 4, 0.25f), part({5, 4, 1}, 4);
        for (std::size_t k = 0; k < part.texels.size(); ++k)
            part.texels[k] = static_cast<float>(k * 37 % 101) / 100.f;
        expected.upload(*texture, floats);
        part.upload(*texture, floats, 0, {2, 1, 0});
        Image<float>::ForEach(part.size, [&](int x, int y, int) {
            std::copy_n(part.at(x, y, 0), 4, expected.at(x + 2, y + 1, 0));
        });
        std::vector<float> const read = expected.read(*texture, floats);
        for (std::size_t k = 0; k < read.size(); ++k)
            EXPECT_NEAR(Kept(name, &expected.texels[k / 4 * 4])[k % 4], read[k], tolerance) << k;
    }
}

// Every client format with every type is taken or refused as OpenGL has it, and comes back byte for
// byte through a float texture; its size is told unless the type is packed or an integer of 32
// bits.
TEST_F(TransferTest, EveryClientLayoutComesBackByteForByte) {
    char const typeBytes[] = "110224441122222244442"; // of a component, or of a packed pixel
    std::mt19937 random{20};
    for (unsigned int f = Texture::FORMAT_RED; f <= Texture::FORMAT_LUMINANCE_ALPHA; ++f) {
        auto const format = static_cast<Texture::Format>(f);
        auto made = std::make_unique<Texture2D>(
            format == Texture::FORMAT_ALPHA  ? Texture::INTERNALFORMAT_ALPHA32F_ARB
            : f >= Texture::FORMAT_LUMINANCE ? Texture::INTERNALFORMAT_LUMINANCE_ALPHA32F_ARB
                                             : Texture::INTERNALFORMAT_RGBA32F_ARB,
            5, 3, false);
        Texture2D const &plane = *made;
        BoundTexture const texture(std::move(made));
        for (unsigned int t = 0; t <= Texture::TYPE_HALF_FLOAT; ++t) {
            auto const type = static_cast<Texture::Type>(t);
            SCOPED_TRACE(testing::Message() << "format " << f << " type " << t);
            bool const isInteger = t == Texture::TYPE_INT || t == Texture::TYPE_UNSIGNED_INT;
            bool const packed = t > Texture::TYPE_FLOAT && t < Texture::TYPE_HALF_FLOAT;
            bool const ofThree = t <= Texture::TYPE_UNSIGNED_SHORT_5_6_5_REV;
            bool const ofFour = format == Texture::FORMAT_RGBA || format == Texture::FORMAT_BGRA;
            bool const valid = !packed || (ofThree ? format == Texture::FORMAT_RGB : ofFour);
            Bytes image({5, 3, 1},
                        Size(typeBytes[t] - '0') * (packed ? 1 : Texture::Channels(format)));
            std::size_t size = 0;
            auto const measure = [&] { size = plane.pixelDataSize(1, format, type); };
            if (packed || isInteger || t == Texture::TYPE_BITMAP) {
                EXPECT_FAILURE("pixelDataSize: Unknown type " +
                                   std::string(ORUOGLTokenName(Texture::Type2GL(type))),
                               measure());
            } else {
                measure();
                EXPECT_EQ(image.texels.size(), size);
            }
            if (t == Texture::TYPE_BITMAP)
                continue;
            for (unsigned char &byte : image.texels) // in all types positive, normal and finite
                byte = static_cast<unsigned char>(4 + random() % 0x74);
            EXPECT_FAILURE(valid ? "" : "GL_INVALID_OPERATION",
                           image.upload(*texture, {format, type}));
            if (!valid) {
                ORU_GL0(PopClientAttrib);
                continue;
            }
            std::vector<unsigned char> const read = image.read(*texture, {format, type});
            if (isInteger)
                EXPECT_TRUE(AreNear(image.texels, read));
            else
                EXPECT_EQ(image.texels, read);
        }
    }
}

// Levels of every kind, from memory and from a buffer, into memory and into a buffer.
TEST_F(TransferTest, EveryMemoryLayoutGoesThereAndBack) {
    for (TextureKind const &kind : kTextureKinds) {
        for (unsigned int i = 0; i < 8; ++i) {
            unsigned int const alignment = 1u << i % 4;
            bool const buffered = i >= 4;
            SCOPED_TRACE(testing::Message() << kind.name << " " << alignment << " " << buffered);
            int const level = kind.mipmaps() ? static_cast<int>(i % 2) : 0;
            Sides const whole = kind.cut({19, 10, 8});
            Bytes image(level ? kind.halved(whole) : whole, 1);
            std::iota(image.texels.begin(), image.texels.end(), static_cast<unsigned char>(0));
            BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RED, whole, true));
            image.upload(*texture, kRed, level);
            UploadPart(kind, *texture, level, image, alignment, buffered);
            ExpectRows(kind, *texture, level, image, alignment, buffered);
        }
    }
}

TEST_F(TransferTest, MakesA3DTextureWithItsContents) {
    std::vector<unsigned char> const pixels = {9, 1, 2, 9, 9, 3, 4, 9, 9, 5, 6, 9, 9, 7, 8, 9};
    PixelUnpackParameters params;
    params.setRowLength(4);
    params.setSkipPixels(1);
    BoundTexture const texture(std::make_unique<Texture3D>(
        Texture::INTERNALFORMAT_RED, 0, 2, 2, 2, kRed.format, kRed.type, pixels.data(), params));
    EXPECT_EQ((std::vector<unsigned char>{1, 2, 3, 4, 5, 6, 7, 8}),
              Bytes({2, 2, 2}, 1).read(*texture, kRed));
    EXPECT_FAILURE("GL_INVALID_VALUE", Texture3D(Texture::INTERNALFORMAT_RED, -1, 2, 2, 2,
                                                 kRed.format, kRed.type, pixels.data(), params));
    EXPECT_EQ(0, Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
    EXPECT_TRUE(texture->isBound());
}

// From a framebuffer with a known picture: the copied rectangle, and nothing beside it.
TEST_F(TransferTest, CopiesFromTheFramebuffer) {
    Bytes picture({8, 6, 1}, 4);
    std::iota(picture.texels.begin(), picture.texels.end(), static_cast<unsigned char>(0));
    Texture2D source(Texture::INTERNALFORMAT_RGBA8, 8, 6, false);
    ORU_GL(BindTexture, GL_TEXTURE_2D, source.objectID());
    picture.upload(source, kBytes);
    ORU_GL(BindTexture, GL_TEXTURE_2D, 0u);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&source, 0, 0);
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        int const level = kind.mipmaps() ? 1 : 0;
        Sides const whole = kind.cut({16, 12, 6});
        Bytes expected(level ? kind.halved(whole) : whole, 4, 50);
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, whole, true));
        expected.upload(*texture, kBytes, level);
        Copy(*texture, level, {2, 1, 2}, 4, 2);
        Bytes::ForEach({4, kind.sides > 1 ? 2 : 1, 1}, [&](int x, int y, int) {
            std::copy_n(picture.at(x + 1, y + 3, 0), 4,
                        expected.at(x + 2, kind.sides > 1 ? y + 1 : 0, kind.sides > 2 ? 2 : 0));
        });
        EXPECT_EQ(expected.texels, expected.read(*texture, kBytes, level));
    }
    framebuffer.unbind();
}

// What OpenGL refuses: the buffer binding is put back, the unpack state waits on its stack.
TEST_F(TransferTest, AFailedUploadKeepsItsUnpackState) {
    BoundTexture const texture(
        std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, 4, 4, false));
    Buffer buffer(256, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    PixelUnpackParameters params;
    params.setRowLength(17);
    EXPECT_FAILURE("GL_INVALID_VALUE", Upload(*texture, 0, {{3, 0, 0}, {2, 2, 1}}, kBytes, params,
                                              &buffer, std::size_t(0)));
    EXPECT_FALSE(buffer.isBound());
    EXPECT_EQ(1, Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
    EXPECT_EQ(17, Get(GL_UNPACK_ROW_LENGTH));
    ORU_GL0(PopClientAttrib);
}
