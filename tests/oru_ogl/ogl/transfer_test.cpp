// Image transfer: what goes into a texture comes out again, the whole image, for every layout in
// memory and kind of texture.
#include "tests/support/texturekinds.h"

#include "oru/core/utility/boundary.h"
#include "oru/oru_ogl/ogl/framebuffer.h"

#include <numeric>

using namespace oru_test;

namespace {

using Bytes = Image<unsigned char>;

Pixel const kRed{Texture::FORMAT_RED, Texture::TYPE_UNSIGNED_BYTE};

std::uint16_t const kGap = 7; ///< bytes before an image, in a type that every class takes

/// An image whose bytes count up.
Bytes Counting(Sides const &size, std::size_t channels, unsigned char first) {
    Bytes image(size, channels);
    std::iota(image.texels.begin(), image.texels.end(), first);
    return image;
}

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

// Core contexts lack some client formats, although the driver here takes them.
TEST_F(TransferTest, EveryClientFormatIsTakenOrRefused) {
    BoundTexture const texture(std::make_unique<Texture2D>(kRGBA8, 1, 1, false));
    Bytes const texel({1, 1, 1}, 4);
    for (unsigned int f = Texture::FORMAT_RED; f <= Texture::FORMAT_LUMINANCE_ALPHA; ++f) {
        Pixel const pixel{static_cast<Texture::Format>(f), kBytes.type};
        bool const isLacking =
            IsCoreRun() && (f == Texture::FORMAT_ALPHA || f >= Texture::FORMAT_LUMINANCE);
        EXPECT_EQ(isLacking, !MessageOf([&] { texel.upload(*texture, pixel); }).empty()) << f;
    }
}

// A part of a level of every kind, from memory and from a buffer in rows with gaps, and the level
// back into memory and into a buffer. Pixel storage, none of it as it is at first, stays.
TEST_F(TransferTest, EveryMemoryLayoutGoesThereAndBack) {
    std::vector<GLenum> storage; // of packing the alignment, as others apply
    for (unsigned int i = Texture::PIXELSTOREMODE_PACK_ALIGNMENT;
         i <= Texture::PIXELSTOREMODE_UNPACK_ALIGNMENT; ++i)
        storage.push_back(Texture::PixelStoreMode2GL(static_cast<Texture::PixelStoreMode>(i)));
    for (TextureKind const &kind : kTextureKinds) {
        for (unsigned int i = 0; i < 8; ++i) {
            unsigned int const alignment = 1u << i % 4;
            bool const buffered = i >= 4;
            SCOPED_TRACE(testing::Message() << kind.name << " " << alignment << " " << buffered);
            for (GLenum const name : storage)
                ORU_GL(PixelStorei, name, 1);
            int const level = kind.mipmaps() ? static_cast<int>(i % 2) : 0;
            Sides const whole = kind.cut({19, 10, 8});
            Bytes image = Counting(level ? kind.halved(whole) : whole, 1, 0);
            Bytes const part = Counting(kind.cut({4, 3, 2}), 1, 100);
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
            std::vector<GLint> kept(storage.size(), 1);
            if (buffered) {
                auto const size = static_cast<std::int64_t>(read.size());
                Buffer from(static_cast<std::int64_t>(source.size()), Buffer::TYPE_ARRAY_BUFFER,
                            Buffer::USAGE_STREAM_DRAW, source.data());
                Buffer to(size, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_READ, read.data());
                Upload(*texture, level, box, kRed, params, &from, kGap);
                Download(*texture, level, kRed, alignment, &to, kGap);
                EXPECT_EQ(std::vector<GLint>(2),
                          Get({GL_PIXEL_PACK_BUFFER_BINDING, GL_PIXEL_UNPACK_BUFFER_BINDING}));
                to.bind();
                to.getSubData(0, size, read.data());
                Buffer::BindDefaultPackBuffer();
            } else {
                void const *const data = &source[kGap];
                Upload(*texture, level, box, kRed, params, data);
                Download(*texture, level, kRed, alignment, static_cast<void *>(&read[kGap]));
                kept[0] = kind.sides == 1 ? static_cast<int>(alignment) : 1; // as `Download` set it
            }
            EXPECT_EQ(expected, read);
            EXPECT_EQ(kept, Get(storage));
        }
    }
}

TEST_F(TransferTest, MakesA3DTextureWithItsContents) {
    Bytes const expected = Counting({2, 2, 2}, 1, 1);
    auto const pixels = InRows(expected, 4, 1);
    PixelUnpackParameters params;
    params.setRowLength(4);
    auto const make = [&](int level) {
        return std::make_unique<Texture3D>(Texture::INTERNALFORMAT_RED, level, 2, 2, 2, kRed.format,
                                           kRed.type, &pixels[kGap], params);
    };
    BoundTexture const texture(make(0));
    EXPECT_EQ(expected.texels, expected.read(*texture, kRed));
    EXPECT_FAILURE("GL_INVALID_VALUE", make(-1));
    EXPECT_EQ(0, Get(GL_UNPACK_ROW_LENGTH));
    EXPECT_TRUE(texture->isBound());
}

// From a framebuffer with a known picture: the copied rectangle, and nothing beside it.
TEST_F(TransferTest, CopiesFromTheFramebuffer) {
    Bytes const picture = Counting({8, 6, 1}, 4, 0);
    Texture2D source(kRGBA8, 8, 6, false);
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
        BoundTexture const texture(kind.make(kRGBA8, whole, true));
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
    BoundTexture const texture(std::make_unique<Texture2D>(kRGBA8, 4, 4, false));
    Buffer buffer(256, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    PixelUnpackParameters params;
    params.setRowLength(17);
    EXPECT_FAILURE("GL_INVALID_VALUE", Upload(*texture, 0, {{3, 0, 0}, {2, 2, 1}}, kBytes, params,
                                              &buffer, std::size_t(0)));
    EXPECT_FALSE(buffer.isBound());
    EXPECT_EQ(IsCoreRun() ? 0 : 17, Get(GL_UNPACK_ROW_LENGTH));
    if (!IsCoreRun())
        ORU_GL0(PopClientAttrib);
    EXPECT_EQ(0, Get(GL_UNPACK_ROW_LENGTH));
}

// The other levels follow level 0, whichever way it is written.
TEST_F(TransferTest, LevelsFollowTheFirst) {
    Buffer buffer(4, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    for (TextureKind const &kind : kTextureKinds) {
        if (!kind.mipmaps())
            continue;
        SCOPED_TRACE(kind.name);
        Sides const size = kind.cut({4, 4, 4});
        BoundTexture const texture(kind.make(kRGBA8, size, true));
        auto const expectBelow = [&](unsigned char value) {
            Bytes const below(kind.halved(size), 4, value);
            EXPECT_EQ(below.texels, below.read(*texture, kBytes, 1));
        };
        InterceptorScope<CountingForwarder> calls;
        texture->enableAutoMIPGeneration(true);
        Upload(*texture, 0, {{}, {1, 1, 1}}, kBytes, kTight, &buffer, std::size_t(0));
        Copy(*texture, 0, {}, 1, 1);
        Bytes(size, 4, 200).upload(*texture, kBytes);
        expectBelow(200);
        EXPECT_EQ(IsCoreRun() ? 3 : 0, calls->count("GenerateMipmap")) << "OpenGL's own elsewhere";
        Bytes(kind.halved(size), 4, 33).upload(*texture, kBytes, 1);
        expectBelow(33);
        texture->enableAutoMIPGeneration(false);
        Bytes(size, 4, 100).upload(*texture, kBytes);
        expectBelow(33);
    }
}
