// Pixels that know their memory: its size for every layout, held against what OpenGL writes, and
// whole images through it.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/pixelview.h"

#include <limits>
#include <numeric>

using namespace oru_test;

namespace {

/// `subImage` and `getPixelData` by views.
void UploadView(Texture &texture, Sides const &at, PixelView const &pixels) {
    AsItsClass(texture, [&](auto &as, auto... side) { as.subImage(0, at[side]..., pixels); });
}
void ReadView(Texture &texture, MutablePixelView const &pixels, int level = 0) {
    AsItsClass(texture, [&](auto &as, auto...) { as.getPixelData(pixels, level); });
}

PixelShape Shape(Pixel pixel, Sides const &size) {
    return {pixel.format, pixel.type, Size(size[0]), Size(size[1]), Size(size[2])};
}

/// The shapes of an image in many layouts.
std::vector<PixelShape> Layouts(PixelShape shape) {
    std::vector<PixelShape> all;
    for (shape.alignment = 1; shape.alignment <= 8; shape.alignment *= 2)
        for (std::uint64_t const gap : {0u, 3u}) {
            shape.rowLength = gap ? shape.width + gap : 0;
            shape.imageHeight = gap ? shape.height + 2 : 0;
            all.push_back(shape);
        }
    return all;
}

/// Where the bytes end that a read-back writes: those that come out alike whatever was there.
std::size_t EndOfWritten(Texture &texture, PixelShape const &shape) {
    std::vector<unsigned char> one(shape.bytes() + 64, 0x00), other(one.size(), 0xFF);
    ReadView(texture, MutablePixelView(one.data(), one.size(), shape));
    ReadView(texture, MutablePixelView(other.data(), other.size(), shape));
    std::size_t end = one.size();
    while (end > 0 && one[end - 1] != other[end - 1])
        --end;
    return end;
}

} // namespace

class PixelViewTest : public ObjectTest {};

TEST_F(PixelViewTest, EndsWhereOpenGLEnds) {
    // What the host left behind counts for nothing.
    std::pair<GLenum, GLint> const left[] = {
        {GL_PACK_SKIP_IMAGES, 3}, {GL_PACK_IMAGE_HEIGHT, 50}, {GL_PACK_SKIP_ROWS, 2}};
    for (auto const &[parameter, value] : left)
        ORU_GL(PixelStorei, parameter, value);
    for (TextureKind const &kind : kTextureKinds) {
        Sides const size = kind.cut({5, 3, 2});
        BoundTexture const texture(kind.make(kRGBA8, size, false));
        int layouts = 0;
        for (auto const format :
             {Texture::FORMAT_RED, Texture::FORMAT_RG, Texture::FORMAT_RGB, Texture::FORMAT_BGRA}) {
            for (unsigned int type = 0; type <= Texture::TYPE_HALF_FLOAT; ++type) {
                Pixel const pixel{format, static_cast<Texture::Type>(type)};
                if (type == Texture::TYPE_BITMAP)
                    continue;
                for (PixelShape const &shape : Layouts(Shape(pixel, size))) {
                    std::size_t end = 0;
                    // Not every packed type goes with every format.
                    if (MessageOf([&] { end = EndOfWritten(*texture, shape); }) ==
                        "GL_INVALID_OPERATION")
                        continue;
                    ++layouts;
                    EXPECT_EQ(shape.bytes(), end)
                        << kind.name << " " << format << " " << type << " " << shape.alignment
                        << " " << shape.rowLength;
                }
            }
        }
        EXPECT_LT(300, layouts);
        EXPECT_EQ((std::vector<GLint>{4, 0}), Get({GL_PACK_ALIGNMENT, GL_PACK_ROW_LENGTH}));
    }
    for (auto const &[parameter, value] : left) {
        EXPECT_EQ(value, Get(parameter));
        ORU_GL(PixelStorei, parameter, 0);
    }
}

TEST_F(PixelViewTest, GoesThereAndBackInEveryLayout) {
    for (TextureKind const &kind : kTextureKinds) {
        Sides const size = kind.cut({5, 3, 2}), whole = kind.cut({7, 6, 4}), at = {2, 1, 1};
        Sides const corner = {at[0], kind.sides > 1 ? at[1] : 0, kind.sides > 2 ? at[2] : 0};
        BoundTexture const texture(kind.make(kRGBA8, whole, false));
        for (PixelShape const &shape : Layouts(Shape(kBytes, size))) {
            Image<unsigned char> image(whole, 4, 9), part(size, 4);
            image.upload(*texture, kBytes);
            std::vector<unsigned char> memory(shape.bytes());
            std::iota(memory.begin(), memory.end(), static_cast<unsigned char>(1));
            std::size_t const row =
                (4 * (shape.rowLength ? shape.rowLength : shape.width) + shape.alignment - 1) /
                shape.alignment * shape.alignment;
            for (int z = 0; z < size[2]; ++z)
                for (int y = 0; y < size[1]; ++y)
                    std::copy_n(&memory[row * (Size(z) * (shape.imageHeight ? shape.imageHeight
                                                                            : shape.height) +
                                               Size(y))],
                                4 * size[0], &part.texels[part.index(0, y, z)]);
            image.paste(part, {corner, size});
            UploadView(*texture, at, PixelView(memory.data(), memory.size(), shape));
            PixelShape const tight = Shape(kBytes, whole);
            std::vector<unsigned char> read(tight.bytes());
            ReadView(*texture, MutablePixelView(read.data(), read.size(), tight));
            EXPECT_EQ(image.texels, read) << kind.name << " " << shape.alignment;
        }
    }
}

TEST_F(PixelViewTest, RefusesWhatDoesNotFit) {
    std::vector<unsigned char> memory(64);
    PixelShape const shape = Shape(kBytes, {4, 4, 1});
    PixelShape endless = shape, crooked = shape, bits = shape;
    endless.rowLength = std::numeric_limits<std::uint64_t>::max();
    crooked.alignment = 3;
    bits.type = Texture::TYPE_BITMAP;
    std::string const pixels =
        "The memory is too short: 4 x 4 x 1 pixels of GL_RGBA and GL_UNSIGNED_BYTE take ";
    EXPECT_FAILURE(pixels + "64 bytes, and it has 63", PixelView(memory.data(), 63, shape));
    EXPECT_FAILURE(pixels + "64 bytes, and it has 0", PixelView(nullptr, 64, shape));
    EXPECT_FAILURE(pixels + "18446744073709551615 bytes, and it has 64",
                   PixelView(memory.data(), 64, endless));
    EXPECT_FAILURE("Invalid row byte alignment (must be of 1, 2, 4, or 8).",
                   PixelView(memory.data(), 64, crooked));
    EXPECT_FAILURE("Pixels of GL_BITMAP are no whole bytes: give the pointer itself",
                   PixelView(memory.data(), 64, bits));
    EXPECT_FAILURE("", PixelView(nullptr, 0, Shape(kBytes, {4, 0, 1})));

    Texture2D square(kRGBA8, 4, 4, true);
    Texture1D line(kRGBA8, 4, false);
    MutablePixelView const view(memory.data(), 64, shape);
    EXPECT_FAILURE("Texture must be bound", square.getPixelData(view, 0));
    BoundTexture const bound(std::make_unique<Texture2D>(kRGBA8, 4, 4, true));
    InterceptorScope<CountingForwarder> calls;
    EXPECT_FAILURE("Level 1 has 2 x 2 x 1 texels and is read as a whole: the pixels are 4 x 4 x 1",
                   ReadView(*bound, view, 1));
    EXPECT_FAILURE("a negative texture image mip-map level supplied", ReadView(*bound, view, -1));
    EXPECT_FAILURE("Pixels of 4 x 4 x 1 have more sides than the texture, which has 1",
                   line.subImage(0, 0, view));
    EXPECT_EQ(calls->count("GetIntegerv") + calls->count("GetTexLevelParameteriv"), calls->total())
        << "whether it is bound, and how large";
    EXPECT_FAILURE("GL_INVALID_VALUE", UploadView(*bound, {1, 0, 0}, view));
    for (int i = 0; i < 20; ++i) { // more than the stack of pixel storage holds
        ::glEnable(GL_NONE);
        EXPECT_FAILURE("GL_INVALID_ENUM", UploadView(*bound, {}, view));
    }
    EXPECT_FAILURE("", UploadView(*bound, {}, view));
    // Levels that other code made are of the size that OpenGL tells.
    ::glTexImage2D(GL_TEXTURE_2D, 1, GL_RGBA8, 9, 9, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    EXPECT_FAILURE(
        "Level 1 has 9 x 9 x 1 texels and is read as a whole: the pixels are 9 x 1 x 1",
        ReadView(*bound, MutablePixelView(memory.data(), 36, Shape(kBytes, {9, 1, 1})), 1));
    EXPECT_EQ((std::vector<GLint>{4, 0}), Get({GL_UNPACK_ALIGNMENT, GL_UNPACK_ROW_LENGTH}))
        << "put back after a failure";
}
