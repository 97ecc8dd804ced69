// The later formats, sampling parameters, cube maps, buffer textures and textures of samples.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelview.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/samplerbindscope.h"
#include "oru/oru_ogl/ogl/texture2dmultisample.h"
#include "oru/oru_ogl/ogl/texturecube.h"
#include "oru/oru_ogl/ogl/textureunit.h"

#include <cstring>
#include <random>

using namespace oru_test;

namespace {

using T = Texture;

/// Bytes that have no pattern, or floats from 0 to 1.
std::vector<unsigned char> Noise(std::size_t bytes, bool floats = false) {
    static std::mt19937 random(1);
    std::vector<unsigned char> noise(bytes);
    for (unsigned char &byte : noise)
        byte = static_cast<unsigned char>(random());
    for (std::size_t i = 0; floats && i < bytes / 4; ++i) {
        float const value = static_cast<float>(noise[4 * i]) / 255;
        std::memcpy(&noise[4 * i], &value, 4);
    }
    return noise;
}

struct FormatRow {
    T::InternalFormat format;
    Pixel pixel;
    std::string
        wrong; ///< how a transfer in FORMAT_RED, or of depth in an integer format, is refused
};

/// Every later format that is not compressed, with pixels in memory of its bits.
std::vector<FormatRow> UncompressedRows() {
    std::string const integers = "integers", depth = "depth", colours = "colours";
    std::vector<FormatRow> rows = {
        {T::INTERNALFORMAT_R8, {T::FORMAT_RED, T::TYPE_UNSIGNED_BYTE}, colours},
        {T::INTERNALFORMAT_RG8, {T::FORMAT_RG, T::TYPE_UNSIGNED_BYTE}, colours},
        {T::INTERNALFORMAT_R11F_G11F_B10F,
         {T::FORMAT_RGB, T::TYPE_UNSIGNED_INT_10F_11F_11F_REV},
         colours},
        {T::INTERNALFORMAT_SRGB8, {T::FORMAT_RGB, T::TYPE_UNSIGNED_BYTE}, colours},
        {T::INTERNALFORMAT_SRGB8_ALPHA8, {T::FORMAT_RGBA, T::TYPE_UNSIGNED_BYTE}, colours},
        {T::INTERNALFORMAT_DEPTH_COMPONENT16,
         {T::FORMAT_DEPTH_COMPONENT, T::TYPE_UNSIGNED_SHORT},
         depth},
        {T::INTERNALFORMAT_DEPTH_COMPONENT24,
         {T::FORMAT_DEPTH_COMPONENT, T::TYPE_UNSIGNED_INT},
         depth},
        {T::INTERNALFORMAT_DEPTH_COMPONENT32,
         {T::FORMAT_DEPTH_COMPONENT, T::TYPE_UNSIGNED_INT},
         depth},
        {T::INTERNALFORMAT_DEPTH_COMPONENT32F, {T::FORMAT_DEPTH_COMPONENT, T::TYPE_FLOAT}, depth},
        {T::INTERNALFORMAT_DEPTH24_STENCIL8,
         {T::FORMAT_DEPTH_STENCIL, T::TYPE_UNSIGNED_INT_24_8},
         depth},
        {T::INTERNALFORMAT_DEPTH32F_STENCIL8,
         {T::FORMAT_DEPTH_STENCIL, T::TYPE_FLOAT_32_UNSIGNED_INT_24_8_REV},
         depth}};
    T::Format const formats[] = {T::FORMAT_RED_INTEGER, T::FORMAT_RG_INTEGER, T::FORMAT_RGB_INTEGER,
                                 T::FORMAT_RGBA_INTEGER};
    T::Type const types[] = {T::TYPE_BYTE,           T::TYPE_UNSIGNED_BYTE, T::TYPE_SHORT,
                             T::TYPE_UNSIGNED_SHORT, T::TYPE_INT,           T::TYPE_UNSIGNED_INT};
    for (unsigned int i = 0; i < 24; ++i)
        rows.push_back({static_cast<T::InternalFormat>(T::INTERNALFORMAT_R8I + i),
                        {formats[i / 6], types[i % 6]},
                        integers});
    rows.push_back({T::INTERNALFORMAT_RGB10_A2UI,
                    {T::FORMAT_RGBA_INTEGER, T::TYPE_UNSIGNED_INT_2_10_10_10_REV},
                    integers});
    return rows;
}

/// Leaves out where what came back may differ: in depths of 24 bits, which drivers make floats of
/// on their way, the last of these bits; in words with a stencil all but its byte.
void DropWhatIsNotKept(FormatRow const &row, std::vector<unsigned char> const &sent,
                       std::vector<unsigned char> &back) {
    bool const is24 = row.format == T::INTERNALFORMAT_DEPTH_COMPONENT24 ||
                      row.format == T::INTERNALFORMAT_DEPTH_COMPONENT32;
    for (std::size_t i = 0; is24 && i < sent.size(); i += 4) {
        std::uint32_t before = 0, after = 0;
        std::memcpy(&before, &sent[i], 4);
        std::memcpy(&after, &back[i], 4);
        if ((before > after ? before - after : after - before) <= 0x1FF)
            std::memcpy(&back[i], &sent[i], 4);
    }
    bool const hasPadding = row.pixel.type == T::TYPE_FLOAT_32_UNSIGNED_INT_24_8_REV;
    for (std::size_t i = 4; hasPadding && i < sent.size(); i += 8)
        std::memcpy(&back[i + 1], &sent[i + 1], 3);
}

} // namespace

class TextureFormatsTest : public ObjectTest {};

// Numbered apart from the others, and by the names that OpenGL has for them.
TEST_F(TextureFormatsTest, AreTranslatedAndNamed) {
    for (unsigned int i = 256; i <= T::INTERNALFORMAT_COMPRESSED_RGB_BPTC_UNSIGNED_FLOAT; ++i) {
        auto const format = static_cast<T::InternalFormat>(i);
        unsigned int const gl = T::InternalFormat2GL(format);
        EXPECT_EQ(format, T::GL2InternalFormat(gl));
        std::string const name = testing::PrintToString(format), token = ORUOGLTokenName(gl);
        bool const isKnown = token != "Unknown Token"; // those of S3TC and BPTC are not
        EXPECT_EQ("INTERNALFORMAT_" + (isKnown ? token.substr(3) : name.substr(15)), name);
        EXPECT_TRUE(T::IsFormatSupported(format)) << "the driver here has them all";
    }
    auto const beyond =
        static_cast<T::InternalFormat>(T::INTERNALFORMAT_COMPRESSED_RGB_BPTC_UNSIGNED_FLOAT + 1);
    EXPECT_FAILURE("!\"InternalFormat enums are not all properly translated.\"",
                   T::InternalFormat2GL(beyond));
    EXPECT_EQ("UNKNOWN FORMAT", testing::PrintToString(beyond));
    EXPECT_FALSE(T::IsFormatSupported(beyond));
    unsigned int const ends[] = {
        T::Format2GL(T::FORMAT_DEPTH_STENCIL),
        T::Type2GL(T::TYPE_UNSIGNED_INT_10F_11F_11F_REV),
        T::Target2GL(T::TARGET_TEXTURE_2D_MULTISAMPLE),
        T::TargetBinding2GL(T::TARGETBINDING_TEXTURE_BINDING_2D_MULTISAMPLE),
        T::Swizzle2GL(T::SWIZZLE_ONE),
        T::Compare2GL(T::COMPARE_ALWAYS)};
    EXPECT_EQ((std::vector<unsigned int>{GL_DEPTH_STENCIL, GL_UNSIGNED_INT_10F_11F_11F_REV,
                                         GL_TEXTURE_2D_MULTISAMPLE,
                                         GL_TEXTURE_BINDING_2D_MULTISAMPLE, GL_ONE, GL_ALWAYS}),
              std::vector<unsigned int>(std::begin(ends), std::end(ends)));
}

// Every bit of every level there and back, and no transfer in pixels of another kind.
TEST_F(TextureFormatsTest, GoThereAndBack) {
    for (FormatRow const &row : UncompressedRows()) {
        SCOPED_TRACE(testing::PrintToString(row.format));
        BoundTexture const texture(std::make_unique<Texture2D>(row.format, 8, 4, true));
        auto &plane = dynamic_cast<Texture2D &>(*texture);
        auto const bytes = static_cast<std::size_t>(texture->sizeInBytes());
        EXPECT_EQ(bytes, plane.pixelDataSize(0, row.pixel.format, row.pixel.type));
        bool const floats = row.pixel.type == T::TYPE_FLOAT ||
                            row.pixel.type == T::TYPE_FLOAT_32_UNSIGNED_INT_24_8_REV;
        std::vector<unsigned char> sent = Noise(bytes, floats), back(bytes);
        if (row.pixel.type == T::TYPE_UNSIGNED_INT_10F_11F_11F_REV)
            std::fill(sent.begin(), sent.end(), static_cast<unsigned char>(0x35)); // no infinity
        plane.subImage(0, 0, 0, 8, 4, row.pixel.format, row.pixel.type, sent.data(), kTight);
        plane.getPixelData(back.data(), 0, row.pixel.format, row.pixel.type, 1);
        DropWhatIsNotKept(row, sent, back);
        EXPECT_EQ(sent, back);
        bool const isColour = row.wrong == "colours";
        T::Format const wrong = isColour ? T::FORMAT_RGBA_INTEGER : T::FORMAT_RED;
        std::string const refusal = "A texture of " + testing::PrintToString(row.format) +
                                    " holds " + row.wrong + ", and pixels of GL_" +
                                    (isColour ? "RGBA_INTEGER are integers" : "RED are colours") +
                                    ": transfer it in a format of its kind";
        std::vector<unsigned char> room(8 * 4 * 4);
        MutablePixelView const view(room.data(), room.size(), {wrong, T::TYPE_BYTE, 8, 4});
        EXPECT_FAILURE(refusal, plane.getPixelData(view, 0));
        EXPECT_FAILURE(refusal, plane.subImage(0, 0, 0, view));
        EXPECT_FAILURE(refusal, plane.getPixelData(back.data(), 0, wrong, T::TYPE_INT, 1));
        EXPECT_FAILURE(refusal,
                       plane.subImage(0, 0, 0, 8, 4, wrong, T::TYPE_INT, back.data(), kTight));
    }
}

TEST_F(TextureFormatsTest, CompressedBlocksGoThereAndBack) {
    for (unsigned int i = T::INTERNALFORMAT_COMPRESSED_RGB_S3TC_DXT1_EXT;
         i <= T::INTERNALFORMAT_COMPRESSED_RGB_BPTC_UNSIGNED_FLOAT; ++i) {
        auto const format = static_cast<T::InternalFormat>(i);
        SCOPED_TRACE(testing::PrintToString(format));
        BoundTexture const texture(std::make_unique<Texture2D>(format, 10, 6, true));
        auto &plane = dynamic_cast<Texture2D &>(*texture);
        std::vector<unsigned char> const sent = Noise(plane.compressedSize(0));
        GLint told = 0;
        ::glGetTexLevelParameteriv(GL_TEXTURE_2D, 0, GL_TEXTURE_COMPRESSED_IMAGE_SIZE, &told);
        EXPECT_EQ(static_cast<std::size_t>(told), sent.size()) << "three blocks by two";
        plane.compressedSubImage(0, 0, 0, 10, 6, sent.data(), sent.size());
        std::vector<unsigned char> back(sent.size());
        plane.getCompressedData(back.data(), back.size(), 0);
        EXPECT_EQ(sent, back);
        std::size_t const block = sent.size() / 6;
        EXPECT_EQ(block, plane.compressedSize(3)) << "1 x 0 texels, and so a block";
        EXPECT_FAILURE("Blocks of " + testing::PrintToString(format) +
                           " for 4 x 4 x 1 texels take " + std::to_string(block) + " bytes, not 7",
                       plane.compressedSubImage(0, 0, 0, 4, 4, sent.data(), 7));
        EXPECT_NE("", MessageOf([&] { plane.getCompressedData(back.data(), 7, 0); }));
        EXPECT_NE("", MessageOf([&] { plane.getCompressedData(back.data(), block, -1); }));
    }
    BoundTexture const stack(std::make_unique<Texture2DArray>(
        T::INTERNALFORMAT_COMPRESSED_RGBA_S3TC_DXT5_EXT, 8, 8, 3, false));
    auto &layers = dynamic_cast<Texture2DArray &>(*stack);
    std::vector<unsigned char> all = Noise(layers.compressedSize(0)), middle = Noise(64);
    layers.compressedSubImage(0, 0, 0, 0, 8, 8, 3, all.data(), all.size());
    layers.compressedSubImage(0, 0, 0, 1, 8, 8, 1, middle.data(), middle.size());
    std::copy(middle.begin(), middle.end(), all.begin() + 64);
    std::vector<unsigned char> back(all.size());
    layers.getCompressedData(back.data(), back.size(), 0);
    EXPECT_EQ(all, back);
    BoundTexture const plain(std::make_unique<Texture2D>(kRGBA8, 4, 4, false));
    EXPECT_FAILURE(
        "A texture of INTERNALFORMAT_RGBA8 is not compressed: use subImage and "
        "getPixelData",
        dynamic_cast<Texture2D &>(*plain).compressedSubImage(0, 0, 0, 4, 4, all.data(), 64));
}

// Names without a size, as other code uses them.
TEST_F(TextureFormatsTest, TheirShortNamesAreAdopted) {
    std::pair<GLint, T::InternalFormat> const names[] = {
        {GL_DEPTH_STENCIL, T::INTERNALFORMAT_DEPTH24_STENCIL8},
        {GL_SRGB, T::INTERNALFORMAT_SRGB8},
        {GL_SRGB_ALPHA, T::INTERNALFORMAT_SRGB8_ALPHA8},
        {GL_DEPTH_COMPONENT, T::INTERNALFORMAT_DEPTH_COMPONENT24}};
    for (auto const &[gl, format] : names) {
        BoundTexture const made(std::make_unique<Texture2D>(kRGBA8, 4, 4, false));
        GLenum const pixels =
            gl == GL_SRGB || gl == GL_SRGB_ALPHA ? GL_RGBA : static_cast<GLenum>(gl);
        ::glTexImage2D(GL_TEXTURE_2D, 0, gl, 4, 4, 0, pixels,
                       gl == GL_DEPTH_STENCIL ? GL_UNSIGNED_INT_24_8 : GL_UNSIGNED_INT, nullptr);
        T::InternalFormat const adopted = Texture2D(made->objectID(), borrow_name_tag()).format();
        // How many bits a depth gets is the driver's choice.
        bool const isDepth = adopted == T::INTERNALFORMAT_DEPTH_COMPONENT16 ||
                             adopted == T::INTERNALFORMAT_DEPTH_COMPONENT32;
        EXPECT_EQ(format, gl == GL_DEPTH_COMPONENT && isDepth ? format : adopted) << adopted;
    }
}

// Of the bound texture and of a sampler: the same names give the same values.
TEST_F(TextureFormatsTest, SamplingParametersAreSet) {
    BoundTexture const texture(std::make_unique<Texture2D>(kRGBA8, 8, 8, true));
    auto const ofTexture = [](GLenum name) {
        GLint value = -1;
        ORU_GL(GetTexParameteriv, GL_TEXTURE_2D, name, &value);
        return value;
    };
    texture->setSwizzle(T::SWIZZLE_ZERO, T::SWIZZLE_RED, T::SWIZZLE_ONE, T::SWIZZLE_GREEN);
    texture->setLevelRange(1, 2);
    texture->setCompare(T::COMPARE_GREATER);
    texture->setMaxAnisotropy(2);
    std::vector<GLint> told;
    for (int const name :
         {GL_TEXTURE_SWIZZLE_R, GL_TEXTURE_SWIZZLE_G, GL_TEXTURE_SWIZZLE_B, GL_TEXTURE_SWIZZLE_A,
          GL_TEXTURE_BASE_LEVEL, GL_TEXTURE_MAX_LEVEL, GL_TEXTURE_COMPARE_MODE,
          GL_TEXTURE_COMPARE_FUNC, GL_TEXTURE_MAX_ANISOTROPY_EXT})
        told.push_back(ofTexture(static_cast<GLenum>(name)));
    EXPECT_EQ((std::vector<GLint>{GL_ZERO, GL_RED, GL_ONE, GL_GREEN, 1, 2,
                                  GL_COMPARE_REF_TO_TEXTURE, GL_GREATER, 2}),
              told);
    texture->setCompare(T::COMPARE_NONE);
    EXPECT_EQ(GL_NONE, ofTexture(GL_TEXTURE_COMPARE_MODE));
    EXPECT_FAILURE("Levels 3 to 2 are no range: the last is not before the first, and at most 1000",
                   texture->setLevelRange(3, 2));

    Sampler sampler(T::FILTER_LINEAR_MIPMAP_NEAREST, T::FILTER_NEAREST, T::WRAPMODE_REPEAT);
    sampler.setCompare(T::COMPARE_LEQUAL);
    sampler.setMaxAnisotropy(4);
    sampler.setLevelOfDetailRange(-1, 3);
    sampler.setLevelOfDetailBias(1);
    std::array<float, 4> const colour = {0.25f, 0.5f, 0.75f, 1};
    sampler.setBorderColor(colour.data());
    std::vector<float> values;
    for (int const name :
         {GL_TEXTURE_MIN_FILTER, GL_TEXTURE_MAG_FILTER, GL_TEXTURE_WRAP_S, GL_TEXTURE_WRAP_T,
          GL_TEXTURE_WRAP_R, GL_TEXTURE_COMPARE_FUNC, GL_TEXTURE_MAX_ANISOTROPY_EXT,
          GL_TEXTURE_MIN_LOD, GL_TEXTURE_MAX_LOD, GL_TEXTURE_LOD_BIAS}) {
        values.push_back(0);
        ORU_GL(GetSamplerParameterfv, sampler.objectID(), static_cast<GLenum>(name),
               &values.back());
    }
    EXPECT_EQ((std::vector<float>{GL_LINEAR_MIPMAP_NEAREST, GL_NEAREST, GL_REPEAT, GL_REPEAT,
                                  GL_REPEAT, GL_LEQUAL, 4, -1, 3, 1}),
              values);
    std::array<float, 4> border = {};
    ORU_GL(GetSamplerParameterfv, sampler.objectID(), GL_TEXTURE_BORDER_COLOR, border.data());
    EXPECT_EQ(colour, border);
    std::string const refusal =
        "An anisotropy of 0.5 is not from 1 to " + testing::PrintToString(T::MaxAnisotropy());
    EXPECT_FAILURE(refusal, texture->setMaxAnisotropy(0.5f));
    EXPECT_FAILURE(refusal, sampler.setMaxAnisotropy(0.5f));
}

// On the active unit and on another, within each other, with the active unit as it was.
TEST_F(TextureFormatsTest, SamplersAreBoundForAScope) {
    Sampler const outer(T::FILTER_LINEAR, T::FILTER_LINEAR, T::WRAPMODE_REPEAT);
    Sampler const inner(T::FILTER_NEAREST, T::FILTER_NEAREST, T::WRAPMODE_REPEAT);
    for (unsigned int const unit : {0u, 3u}) {
        auto const bound = [unit] {
            ORU_GL(ActiveTexture, GL_TEXTURE0 + unit);
            auto const name = static_cast<unsigned int>(Get(GL_SAMPLER_BINDING));
            ORU_GL(ActiveTexture, GL_TEXTURE0);
            return name;
        };
        outer.bind(unit);
        {
            SamplerBindScope const scope(inner, unit);
            EXPECT_EQ(GL_TEXTURE0, Get(GL_ACTIVE_TEXTURE));
            EXPECT_EQ(inner.objectID(), bound());
        }
        EXPECT_EQ(outer.objectID(), bound());
        Sampler::BindDefault(unit);
        EXPECT_EQ(0u, bound());
    }
    EXPECT_FAILURE("GL_INVALID_ENUM", SamplerBindScope(inner, 1000));
    EXPECT_EQ(GL_TEXTURE0, Get(GL_ACTIVE_TEXTURE));
}

// Six images of their own on two levels, from memory and buffers and back, then levels made anew.
TEST_F(TextureFormatsTest, CubesKeepTheirFacesApart) {
    TextureCube cube(kRGBA8, 8, true);
    EXPECT_EQ(0, Get(GL_TEXTURE_BINDING_CUBE_MAP));
    TextureUnit::Unit(0)->bind(&cube);
    EXPECT_EQ(static_cast<int>(6 * cube.pixelDataSize(kBytes.format, kBytes.type)),
              cube.sizeInBytes());
    std::vector<std::vector<unsigned char>> sent;
    Buffer buffer(8 * 8 * 4, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    for (TextureCube::Face const face : kCubeFaces) {
        sent.push_back(Noise(8 * 8 * 4));
        buffer.convertToUnpackBuffer();
        buffer.bind();
        buffer.subData(0, 8 * 8 * 4, sent.back().data());
        Buffer::BindDefaultUnpackBuffer();
        cube.subImage(face, 0, 0, 0, 8, 8, kBytes.format, kBytes.type, &buffer, 0, kTight);
        cube.subImage(face, 1, 1, 2,
                      PixelView(sent.back().data(), 8, {kBytes.format, kBytes.type, 2, 1}));
    }
    for (TextureCube::Face const face : kCubeFaces) {
        std::vector<unsigned char> back(8 * 8 * 4), half(4 * 4 * 4);
        cube.getPixelData(face, &buffer, 0, 0, kBytes.format, kBytes.type, 1);
        buffer.bind();
        buffer.getSubData(0, 8 * 8 * 4, back.data());
        Buffer::BindDefaultPackBuffer();
        EXPECT_EQ(sent[face], back);
        cube.getPixelData(
            face, MutablePixelView(half.data(), half.size(), {kBytes.format, kBytes.type, 4, 4}),
            1);
        EXPECT_TRUE(std::equal(&half[4 * 9], &half[4 * 11], sent[face].data()));
    }
    std::vector<unsigned char> const white(8 * 8 * 4, 255);
    cube.subImage(TextureCube::FACE_NEGATIVE_Y, 0, 0, 0, 8, 8, kBytes.format, kBytes.type,
                  white.data(), kTight);
    cube.generateMipmap();
    std::vector<unsigned char> last(4), other(4);
    cube.getPixelData(TextureCube::FACE_NEGATIVE_Y, last.data(), 3, kBytes.format, kBytes.type, 1);
    cube.getPixelData(TextureCube::FACE_POSITIVE_Z, other.data(), 3, kBytes.format, kBytes.type, 1);
    EXPECT_EQ(std::vector<unsigned char>(4, 255), last);
    EXPECT_NE(last, other);
    EXPECT_FAILURE("A cube map has no face 6: they count from 0 to 5",
                   cube.subImage(static_cast<TextureCube::Face>(6), 0, 0, 0, 8, 8, kBytes.format,
                                 kBytes.type, white.data(), kTight));

    TextureCube blocks(T::INTERNALFORMAT_COMPRESSED_RG_RGTC2, 8, true);
    TextureUnit::Unit(0)->bind(&blocks);
    std::vector<unsigned char> const compressed = Noise(blocks.compressedSize(0) / 6);
    blocks.compressedSubImage(TextureCube::FACE_NEGATIVE_Z, 0, 0, 0, 8, 8, compressed.data(),
                              compressed.size());
    std::vector<unsigned char> back(compressed.size());
    blocks.getCompressedData(TextureCube::FACE_NEGATIVE_Z, back.data(), back.size(), 0);
    EXPECT_EQ(compressed, back);
    TextureUnit::Unit(0)->bind(GL_TEXTURE_CUBE_MAP, 0);
    EXPECT_FAILURE("Texture must be bound",
                   cube.getPixelData(TextureCube::FACE_NEGATIVE_Z, back.data(), 0, kBytes.format,
                                     kBytes.type, 1));

    BoundTexture const several(std::make_unique<TextureCubeArray>(kRGBA8, 4, 2, true));
    EXPECT_EQ(12u, several->depth(1));
    auto &array = dynamic_cast<TextureCubeArray &>(*several);
    Image<unsigned char> const images({4, 4, 12}, 4, 9);
    images.upload(array, kBytes);
    EXPECT_EQ(images.texels, images.read(array, kBytes));
    array.generateMipmap();
    EXPECT_EQ(Image<unsigned char>({1, 1, 12}, 4, 9).texels,
              Image<unsigned char>({1, 1, 12}, 4).read(array, kBytes, 2));
}
