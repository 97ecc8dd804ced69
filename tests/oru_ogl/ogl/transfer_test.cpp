// Image transfer: what goes into a texture comes out again, the whole image, for every client
// layout and kind of texture.
#include "tests/support/texturekinds.h"

#include "oru/core/utility/boundary.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/framebuffer.h"

#include <numeric>
#include <random>

using namespace oru_test;

namespace {

using Bytes = Image<unsigned char>;

Pixel const kBytes{Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE};
Pixel const kRed{Texture::FORMAT_RED, Texture::TYPE_UNSIGNED_BYTE};
Pixel const kFloats{Texture::FORMAT_RGBA, Texture::TYPE_FLOAT};

std::size_t const kGap = 7; ///< bytes in memory before an image

/// An image in memory, behind the gap, in rows of so many bytes that begin at an alignment.
std::vector<unsigned char> InRows(Bytes const &image, std::size_t length, unsigned int alignment) {
    std::size_t const width = Size(image.size[0]), rows = image.texels.size() / width,
                      pitch = ORU::IncrementToBoundaryPtr(length, static_cast<int>(alignment));
    std::vector<unsigned char> memory(kGap + rows * pitch, 0xEE);
    for (std::size_t i = 0; i < image.texels.size(); ++i)
        memory[kGap + i / width * pitch + i % width] = image.texels[i];
    return memory;
}

} // namespace

class TransferTest : public ObjectTest {};

// A part of the image is written; it and the border around it are those of a texture that OpenGL
// alone makes and fills.
TEST_F(TransferTest, EveryInternalFormatKeepsItsChannels) {
    Image<float> const border({9, 7, 1}, 4, 0.25f);
    Image<float> part({5, 4, 1}, 4);
    for (std::size_t k = 0; k < part.texels.size(); ++k)
        part.texels[k] = static_cast<float>(k * 37 % 101) / 100.f;
    for (unsigned int i = 0; i < 58; ++i) {
        auto const format = static_cast<Texture::InternalFormat>(i);
        std::string const name = testing::PrintToString(format);
        SCOPED_TRACE(name);
        auto const glFormat = static_cast<GLint>(Texture::InternalFormat2GL(format));
        if (IsCoreRun()) {
            ::glTexImage2D(GL_PROXY_TEXTURE_2D, 0, glFormat, 9, 7, 0, GL_RGBA, GL_FLOAT, nullptr);
            if (::glGetError() != GL_NO_ERROR) {
                EXPECT_FAILURE(name + " needs a compatibility context: in a core one use a format "
                                      "of red, or of red and green",
                               Texture2D(format, 9, 7, false));
                continue;
            }
        }
        BoundTexture const texture(std::make_unique<Texture2D>(format, 9, 7, false));
        border.upload(*texture, kFloats);
        part.upload(*texture, kFloats, 0, {2, 1, 0});
        std::vector<float> const read = border.read(*texture, kFloats);

        std::size_t channels = 0;
        for (int const size :
             {GL_TEXTURE_RED_SIZE, GL_TEXTURE_GREEN_SIZE, GL_TEXTURE_BLUE_SIZE,
              GL_TEXTURE_ALPHA_SIZE, GL_TEXTURE_LUMINANCE_SIZE, GL_TEXTURE_INTENSITY_SIZE}) {
            if (IsCoreRun() && size >= GL_TEXTURE_LUMINANCE_SIZE)
                continue;
            GLint bits = 0;
            ORU_GL(GetTexLevelParameteriv, GL_TEXTURE_2D, 0, static_cast<GLenum>(size), &bits);
            channels += bits > 0;
        }
        if (format != Texture::INTERNALFORMAT_RGB4) {
            EXPECT_EQ(channels, texture->channels());
        }
        ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, glFormat, 9, 7, 0, GL_RGBA, GL_FLOAT,
               border.texels.data());
        ORU_GL(TexSubImage2D, GL_TEXTURE_2D, 0, 2, 1, 5, 4, GL_RGBA, GL_FLOAT, part.texels.data());
        EXPECT_EQ(border.read(*texture, kFloats), read);
    }
}

// Every client format with every type is refused, or taken and given back, as by OpenGL alone.
TEST_F(TransferTest, EveryClientLayoutIsTakenAndGivenBack) {
    std::vector<unsigned char> bytes(5 * 3 * 16);
    std::mt19937 random{20};
    for (unsigned char &byte : bytes) // in all types positive, normal and finite
        byte = static_cast<unsigned char>(4 + random() % 0x74);
    ORU_GL(PixelStorei, GL_UNPACK_ALIGNMENT, 1);
    ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, 1);
    BoundTexture const texture(
        std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA32F_ARB, 5, 3, false));
    for (unsigned int f = Texture::FORMAT_RED; f <= Texture::FORMAT_LUMINANCE_ALPHA; ++f) {
        for (unsigned int t = 0; t <= Texture::TYPE_HALF_FLOAT; ++t) {
            SCOPED_TRACE(testing::Message() << "format " << f << " type " << t);
            Pixel const pixel{static_cast<Texture::Format>(f), static_cast<Texture::Type>(t)};
            std::vector<unsigned char> read(bytes.size()), expected(bytes.size());
            void const *const data = bytes.data();
            std::string const refusal = MessageOf([&] {
                Upload(*texture, 0, {{}, {5, 3, 1}}, pixel, kTight, data);
            });
            if (refusal.empty())
                Download(*texture, 0, pixel, 1, static_cast<void *>(read.data()));
            else if (!IsCoreRun())
                ORU_GL0(PopClientAttrib);

            GLenum const format = Texture::Format2GL(pixel.format);
            GLenum const type = Texture::Type2GL(pixel.type);
            ::glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, 5, 3, format, type, data);
            GLenum const error = ::glGetError();
            if (error == GL_NO_ERROR)
                ::glGetTexImage(GL_TEXTURE_2D, 0, format, type, expected.data());
            // What core contexts are without, although the driver here takes some of it.
            bool const isDeprecated =
                IsCoreRun() && (f == Texture::FORMAT_ALPHA || f >= Texture::FORMAT_LUMINANCE ||
                                t == Texture::TYPE_BITMAP);
            if (isDeprecated) {
                EXPECT_EQ(std::string("Pixels of ") + ORUOGLTokenName(format) + " and " +
                              ORUOGLTokenName(type) +
                              " need a compatibility context: in a core one use FORMAT_RED or "
                              "FORMAT_RG",
                          refusal);
            } else {
                EXPECT_TRUE(error != GL_INVALID_ENUM || t == Texture::TYPE_BITMAP);
                EXPECT_EQ(error == GL_NO_ERROR ? "" : ORUOGLTokenName(error), refusal);
                EXPECT_EQ(expected, read);
            }
            std::rotate(bytes.begin(), bytes.begin() + 1, bytes.end()); // nothing stays as it was
        }
    }
}

// A part of a level of every kind, from memory and from a buffer in rows with gaps, and the level
// back into memory and into a buffer.
TEST_F(TransferTest, EveryMemoryLayoutGoesThereAndBack) {
    for (TextureKind const &kind : kTextureKinds) {
        for (unsigned int i = 0; i < 8; ++i) {
            unsigned int const alignment = 1u << i % 4;
            bool const buffered = i >= 4;
            SCOPED_TRACE(testing::Message() << kind.name << " " << alignment << " " << buffered);
            int const level = kind.mipmaps() ? static_cast<int>(i % 2) : 0;
            Sides const whole = kind.cut({19, 10, 8});
            Bytes image(level ? kind.halved(whole) : whole, 1), part(kind.cut({4, 3, 2}), 1);
            std::iota(image.texels.begin(), image.texels.end(), static_cast<unsigned char>(0));
            std::iota(part.texels.begin(), part.texels.end(), static_cast<unsigned char>(100));
            BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RED, whole, true));
            image.upload(*texture, kRed, level);
            Box box = {{}, part.size};
            std::copy_n(Sides{1, 2, 1}.begin(), kind.sides, box.at.begin());
            image.paste(part, box);

            PixelUnpackParameters params;
            params.setAlignment(alignment);
            params.setRowLength(9);
            auto const source = InRows(part, 9, alignment);
            auto const expected = InRows(image, Size(image.size[0]), alignment);
            std::vector<unsigned char> read(expected.size(), 0xEE);
            ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, 4);
            if (buffered) {
                auto const size = static_cast<std::int64_t>(read.size());
                Buffer occupant(4, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ,
                                nullptr);
                Buffer from(static_cast<std::int64_t>(source.size()), Buffer::TYPE_ARRAY_BUFFER,
                            Buffer::USAGE_STREAM_DRAW, source.data());
                Buffer to(size, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_READ, read.data());
                occupant.bind();
                Upload(*texture, level, box, kRed, params, &from, kGap);
                Download(*texture, level, kRed, alignment, &to, static_cast<int>(kGap));
                EXPECT_TRUE(occupant.isBound());
                EXPECT_EQ(0, Get(GL_PIXEL_UNPACK_BUFFER_BINDING));
                EXPECT_EQ(kind.sides == 1 ? 1 : 4, Get(GL_PACK_ALIGNMENT)) << "1 by one side only";
                to.bind();
                to.getSubData(0, size, read.data());
                Buffer::BindDefaultPackBuffer();
            } else {
                void const *const data = &source[kGap];
                Upload(*texture, level, box, kRed, params, data);
                Download(*texture, level, kRed, alignment, static_cast<void *>(&read[kGap]));
            }
            EXPECT_EQ(expected, read);
            EXPECT_EQ(0, Get(GL_UNPACK_ROW_LENGTH));
        }
    }
}

TEST_F(TransferTest, MakesA3DTextureWithItsContents) {
    std::vector<unsigned char> const pixels = {9, 1, 2, 9, 9, 3, 4, 9, 9, 5, 6, 9, 9, 7, 8, 9};
    PixelUnpackParameters params;
    params.setRowLength(4);
    params.setSkipPixels(1);
    auto const make = [&](int level) {
        return std::make_unique<Texture3D>(Texture::INTERNALFORMAT_RED, level, 2, 2, 2, kRed.format,
                                           kRed.type, pixels.data(), params);
    };
    BoundTexture const texture(make(0));
    EXPECT_EQ((std::vector<unsigned char>{1, 2, 3, 4, 5, 6, 7, 8}),
              Bytes({2, 2, 2}, 1).read(*texture, kRed));
    EXPECT_FAILURE("GL_INVALID_VALUE", make(-1));
    EXPECT_EQ(0, Get(GL_UNPACK_ROW_LENGTH));
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
        Box box = {{}, {4, kind.sides > 1 ? 2 : 1, 1}};
        std::copy_n(Sides{2, 1, 2}.begin(), kind.sides, box.at.begin());
        expected.paste(picture, box, {1, 3, 0});
        EXPECT_EQ(expected.texels, expected.read(*texture, kBytes, level));
    }
    framebuffer.unbind();
}

// What OpenGL refuses: the buffer binding is put back, the unpack state waits on its stack; in a
// core context, which has none, it is put back too.
TEST_F(TransferTest, AFailedUploadKeepsItsUnpackState) {
    BoundTexture const texture(
        std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, 4, 4, false));
    Buffer buffer(256, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    PixelUnpackParameters params;
    params.setRowLength(17);
    EXPECT_FAILURE("GL_INVALID_VALUE", Upload(*texture, 0, {{3, 0, 0}, {2, 2, 1}}, kBytes, params,
                                              &buffer, std::size_t(0)));
    EXPECT_FALSE(buffer.isBound());
    if (IsCoreRun()) {
        EXPECT_EQ(0, Get(GL_UNPACK_ROW_LENGTH));
        return;
    }
    EXPECT_EQ(1, Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
    EXPECT_EQ(17, Get(GL_UNPACK_ROW_LENGTH));
    ORU_GL0(PopClientAttrib);
}

// The parameters of glPixelStore, none as it is at first, are the same after each transfer.
TEST_F(TransferTest, LeavesPixelStorageAsItWas) {
    auto const storage = [](bool set) {
        std::vector<GLint> values;
        for (unsigned int i = 7; i < 16; ++i) { // of packing the alignment, as others apply
            GLenum const name = Texture::PixelStoreMode2GL(static_cast<Texture::PixelStoreMode>(i));
            if (set)
                ORU_GL(PixelStorei, name, i % 8 == 7 ? 2 : 1);
            values.push_back(Get(name));
        }
        return values;
    };
    std::vector<GLint> const before = storage(true);
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        Bytes image(kind.cut({4, 4, 4}), 4, 7);
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, image.size, false));
        image.upload(*texture, kBytes);
        EXPECT_EQ(before, storage(false));
        if (kind.sides == 1)
            continue; // read as the caller has set it
        Pushed<CountingForwarder> calls;
        EXPECT_EQ(image.texels, image.read(*texture, kBytes));
        EXPECT_EQ(before, storage(false));
        image.upload(*texture, kBytes);
        EXPECT_EQ(IsCoreRun() ? 0 : 2, calls->count("PushClientAttrib"));
        EXPECT_EQ(IsCoreRun() ? 0 : 2, calls->count("PopClientAttrib"));
    }
}

// The other levels follow level 0, by themselves or on demand, whichever way it is written.
TEST_F(TransferTest, LevelsFollowTheFirst) {
    Texture2D source(Texture::INTERNALFORMAT_RGBA8, 8, 8, false);
    ORU_GL(BindTexture, GL_TEXTURE_2D, source.objectID());
    Bytes({8, 8, 1}, 4, 60).upload(source, kBytes);
    ORU_GL(BindTexture, GL_TEXTURE_2D, 0u);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&source, 0, 0);
    for (TextureKind const &kind : kTextureKinds) {
        if (!kind.mipmaps())
            continue;
        SCOPED_TRACE(kind.name);
        Sides const size = kind.cut({4, 4, 4});
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, size, true));
        Bytes below(kind.halved(size), 4);
        auto const expectBelow = [&](unsigned char value) {
            std::fill(below.texels.begin(), below.texels.end(), value);
            EXPECT_EQ(below.texels, below.read(*texture, kBytes, 1));
        };
        texture->enableAutoMIPGeneration(true);
        Bytes(size, 4, 200).upload(*texture, kBytes);
        expectBelow(200);
        Bytes const other(size, 4, 120);
        Buffer buffer(static_cast<std::int64_t>(other.texels.size()), Buffer::TYPE_ARRAY_BUFFER,
                      Buffer::USAGE_STREAM_DRAW, other.texels.data());
        Upload(*texture, 0, {{}, size}, kBytes, kTight, &buffer, std::size_t(0));
        expectBelow(120);
        for (int z = 0; z < size[2]; ++z)
            Copy(*texture, 0, {0, 0, z}, 4, Size(size[1]));
        expectBelow(60);

        Bytes(below.size, 4, 33).upload(*texture, kBytes, 1);
        expectBelow(33);
        texture->enableAutoMIPGeneration(false);
        Bytes(size, 4, 90).upload(*texture, kBytes);
        expectBelow(33);
        texture->generateMipmap();
        expectBelow(90);
    }
    framebuffer.unbind();
}
