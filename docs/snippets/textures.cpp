// The code of the chapter on textures.
#include "oru/core/exceptions/logicalexception.h"
#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/samplerbindscope.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "oru/oru_ogl/ogl/texturecube.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <numeric>
#include <sstream>
#include <string>
#include <vector>

using namespace ORU::OGL;

namespace {

class TexturesGuide : public ::testing::Test {
protected:
    void SetUp() override { context_.makeCurrent(); }

    /// Bytes that are all different from their neighbours.
    static std::vector<unsigned char> photo(std::size_t bytes) {
        std::vector<unsigned char> pixels(bytes);
        std::iota(pixels.begin(), pixels.end(), static_cast<unsigned char>(0));
        return pixels;
    }

private:
    AutoInitializer library_;
    ContextOffscreen context_;
};

} // namespace

TEST_F(TexturesGuide, GoesThereAndBack) {
    std::size_t const width = 30, height = 20;
    std::vector<unsigned char> pixels = photo(width * height * 4);
    // [roundtrip]
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, width, height, false);
    TextureUnit::Unit(0)->bind(&texture); // on the active unit

    texture.subImage(0, 0, 0, width, height, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                     pixels.data(), PixelUnpackParameters());

    std::vector<unsigned char> back(
        texture.pixelDataSize(0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE));
    texture.getPixelData(back.data(), 0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1);
    // [roundtrip]
    EXPECT_EQ(pixels, back);

    // [parameters]
    texture.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
    texture.setWrap(Texture::WRAPMODE_REPEAT, Texture::WRAPMODE_CLAMP_TO_EDGE);
    // [parameters]

    std::string told;
    // [unbound]
    TextureUnit::Unit(0)->bind2DDefault();
    try {
        texture.getPixelData(back.data(), 0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1);
    } catch (ORU::LogicalException const &e) {
        told = e.message(); // "Texture must be bound"
    }
    // [unbound]
    EXPECT_EQ("Texture must be bound", told);

    // [units]
    TextureState::SetActiveTextureUnit(1);
    TextureUnit::Unit(1)->bind(&texture); // for a sampler2D uniform that is 1
    TextureState::SetActiveTextureUnit(0);
    // [units]
    TextureState::SetActiveTextureUnit(1);
    EXPECT_TRUE(texture.isBound());
}

TEST_F(TexturesGuide, TellsWhatItIs) {
    std::ostringstream out;
    // [formats]
    if (ExtensionManager::Instance()->supportsFloatingPointTextures()) {
        Texture2D const light(Texture::INTERNALFORMAT_RGBA16F_ARB, 640, 480, false);
        out << light.format() << ": " << light.channels() << " channels, " << light.sizeInBytes()
            << " bytes"; // INTERNALFORMAT_RGBA16F_ARB: 4 channels, 2457600 bytes
    }
    // [formats]
    EXPECT_EQ("INTERNALFORMAT_RGBA16F_ARB: 4 channels, 2457600 bytes", out.str());
}

TEST_F(TexturesGuide, TakesAPartOfAnImage) {
    std::size_t const photoWidth = 50;
    std::vector<unsigned char> const pixels = photo(photoWidth * 40 * 3);
    Texture2D texture(Texture::INTERNALFORMAT_RGB8, 16, 8, false);
    TextureUnit::Unit(0)->bind(&texture);
    // [part]
    PixelUnpackParameters part;
    part.setRowLength(photoWidth); // pixels from one row to the next
    part.setSkipPixels(10);        // the part's corner in the photo
    part.setSkipRows(5);
    texture.subImage(0, 0, 0, 16, 8, Texture::FORMAT_RGB, Texture::TYPE_UNSIGNED_BYTE,
                     pixels.data(), part);
    // [part]
    std::vector<unsigned char> back(16 * 8 * 3);
    texture.getPixelData(back.data(), 0, Texture::FORMAT_RGB, Texture::TYPE_UNSIGNED_BYTE, 1);
    for (std::size_t y = 0; y < 8; ++y)
        EXPECT_TRUE(std::equal(&back[y * 48], &back[y * 48] + 48,
                               &pixels[((y + 5) * photoWidth + 10) * 3]));
}

TEST_F(TexturesGuide, StreamsThroughBuffers) {
    std::size_t const width = 30, height = 20;
    std::vector<unsigned char> const frame = photo(width * height * 4);
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, width, height, false);
    TextureUnit::Unit(0)->bind(&texture);
    // [stream]
    Buffer pixels(static_cast<std::int64_t>(frame.size()), Buffer::TYPE_PIXEL_UNPACK_BUFFER,
                  Buffer::USAGE_STREAM_DRAW, nullptr);
    pixels.bind();
    std::memcpy(pixels.map(GL_WRITE_ONLY), frame.data(), frame.size());
    pixels.unmap();
    Buffer::BindDefaultUnpackBuffer();

    texture.subImage(0, 0, 0, width, height, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                     &pixels, 0, PixelUnpackParameters()); // from offset 0 of the buffer
    // [stream]

    std::vector<unsigned char> back(frame.size());
    // [readback]
    texture.getPixelData(&pixels, 0, 0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1);
    // ... time for something else, while the GPU fills the buffer ...
    pixels.bind();
    pixels.getSubData(0, static_cast<std::int64_t>(back.size()), back.data());
    Buffer::BindDefaultPackBuffer();
    // [readback]
    EXPECT_EQ(frame, back);
}

TEST_F(TexturesGuide, HasLevelsAndLayers) {
    std::vector<unsigned char> const pixels = photo(64 * 64 * 4);
    // [mipmaps]
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 64, 64, true); // 64, 32, 16, 8, 4, 2, 1
    TextureUnit::Unit(0)->bind(&texture);
    texture.enableAutoMIPGeneration(true); // level 0 makes the others
    texture.subImage(0, 0, 0, 64, 64, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                     pixels.data(), PixelUnpackParameters());
    texture.setFilter(Texture::FILTER_LINEAR_MIPMAP_LINEAR, Texture::FILTER_LINEAR);
    // [mipmaps]
    unsigned char last[4] = {};
    texture.getPixelData(last, 6, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1);
    EXPECT_NEAR(126, last[0], 4) << "the mean of the photo";

    // [layers]
    Texture2DArray frames(Texture::INTERNALFORMAT_RGBA8, 64, 64, 10, false);
    TextureUnit::Unit(0)->bind(&frames);
    int const layer = 7;
    frames.subImage(0, 0, 0, layer, 64, 64, 1, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                    pixels.data(), PixelUnpackParameters());
    // [layers]
    std::vector<unsigned char> back(64 * 64 * 4 * 10);
    frames.getPixelData(back.data(), 0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1);
    EXPECT_TRUE(std::equal(pixels.begin(), pixels.end(), &back[64 * 64 * 4 * 7]));
}

TEST_F(TexturesGuide, HasCubesBlocksAndSamplers) {
    std::vector<unsigned char> const pixels = photo(64 * 64 * 4), blocks = photo(64 * 64);
    {
        // [compressed]
        Texture2D texture(Texture::INTERNALFORMAT_COMPRESSED_RGBA_S3TC_DXT5_EXT, 64, 64, true);
        TextureUnit::Unit(0)->bind(&texture);
        texture.compressedSubImage(0, 0, 0, 64, 64, blocks.data(), blocks.size());
        // [compressed]
        std::vector<unsigned char> back(blocks.size());
        texture.getCompressedData(back.data(), back.size(), 0);
        EXPECT_EQ(blocks, back);
    }
    // [cube]
    TextureCube sky(Texture::INTERNALFORMAT_SRGB8_ALPHA8, 64, true);
    TextureUnit::Unit(0)->bind(&sky);
    for (TextureCube::Face face : kCubeFaces)
        sky.subImage(face, 0, 0, 0, 64, 64, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                     pixels.data(), PixelUnpackParameters());
    sky.generateMipmap();
    // [cube]
    std::vector<unsigned char> back(pixels.size());
    sky.getPixelData(TextureCube::FACE_NEGATIVE_Z, back.data(), 0, Texture::FORMAT_RGBA,
                     Texture::TYPE_UNSIGNED_BYTE, 1);
    EXPECT_EQ(pixels, back);
    // [sampler]
    Sampler shadows(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR,
                    Texture::WRAPMODE_CLAMP_TO_EDGE);
    shadows.setCompare(Texture::COMPARE_LEQUAL); // for a sampler2DShadow
    SamplerBindScope const scope(shadows, 2);
    // [sampler]
    TextureState::SetActiveTextureUnit(2);
    EXPECT_TRUE(shadows.isBound());
}

TEST_F(TexturesGuide, CopiesWhatWasDrawn) {
    Texture2D drawn(Texture::INTERNALFORMAT_RGBA8, 16, 16, false);
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 8, 8, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&drawn, 0, 0);
    ORU_GL(ClearColor, 1.f, 0.f, 0.f, 1.f);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    // [copy]
    TextureUnit::Unit(0)->bind(&texture);
    texture.copyTexSubImage(0, 0, 0, 4, 4, 8, 8); // from (4, 4) of the bound framebuffer
    // [copy]
    std::vector<unsigned char> back(8 * 8 * 4);
    texture.getPixelData(back.data(), 0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 1);
    EXPECT_EQ(255, back[0]);
    EXPECT_EQ(0, back[1]);
    framebuffer.unbind();
}

TEST_F(TexturesGuide, ReportsWhatOpenGLRefuses) {
    std::vector<unsigned char> const pixels = photo(8 * 8);
    Texture2D texture(Texture::INTERNALFORMAT_RED, 8, 8, false);
    TextureUnit::Unit(0)->bind(&texture);
    std::string told;
    // [refused]
    try {
        texture.subImage(0, 4, 0, 8, 8, Texture::FORMAT_RED, Texture::TYPE_UNSIGNED_BYTE,
                         pixels.data(), PixelUnpackParameters()); // 4 texels too far to the right
    } catch (ORU::OGL::ExceptionOGL const &e) {
        told = e.message(); // "GL_INVALID_VALUE"
        ORU_GL0(PopClientAttrib);
    }
    // [refused]
    EXPECT_EQ("GL_INVALID_VALUE", told);
    GLint depth = -1;
    ORU_GL(GetIntegerv, GL_CLIENT_ATTRIB_STACK_DEPTH, &depth);
    EXPECT_EQ(0, depth);
}
