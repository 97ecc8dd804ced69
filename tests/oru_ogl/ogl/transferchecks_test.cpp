// What the image transfers refuse, in which order and with which words.
#include "tests/support/texturekinds.h"

#include <regex>

using namespace oru_test;

namespace {

Pixel const kIndices{Texture::FORMAT_COLOR_INDEX, Texture::TYPE_UNSIGNED_BYTE};

char const kMapped[] = "Pixel Buffer Object cannot be memory mapped during data transfer";
char const kAlignment[] = "Invalid row byte alignment (must be of 1, 2, 4, or 8).";
char const kNoIndices[] = "COLOR_INDEX not allowed here!";
char const kUnbound[] = "Texture must be bound";

} // namespace

class TransferChecksTest : public ObjectTest {};

// Each row breaks one rule, and all but the first those after it; the texts of 3-D textures pad the
// sides' names.
TEST_F(TransferChecksTest, PartsAreCheckedInOrder) {
    struct Row {
        int level;
        Sides size;
        std::size_t sides; ///< how many sides a kind must have for the row
        std::string text;  ///< with _ for the padding
    };
    Row const rows[] = {
        {0, {0, 1, 1}, 1, "error subimage width_ of zero supplied"},
        {-1, {17, 0, 0}, 2, "error subimage height of zero supplied"},
        {-1, {17, 9, 0}, 3, "error subimage depth_ of zero supplied"},
        {-1, {17, 9, 5}, 1, "a negative texture image mip-map level supplied"},
        {2, {17, 9, 5}, 1, "width(17) is greater than width_ of image (16) "},
        {2, {16, 9, 5}, 2, "height(9) is greater than height of image (8) "},
        {2, {16, 8, 5}, 3, "depth(5) is greater than depth_ of image (4) "},
    };
    Buffer buffer(16, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    void const *const nothing = nullptr;
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const texture(kind.make(kRGBA8, {16, 8, 4}, false));
        InterceptorScope<CountingForwarder> counter;
        for (Row const &row : rows) {
            if (row.sides > kind.sides)
                continue;
            std::string const text =
                std::regex_replace(row.text, std::regex("_"), kind.sides == 3 ? " " : "");
            Box const box = {{}, row.size};
            EXPECT_FAILURE(text, Upload(*texture, row.level, box, kBytes, kTight, nothing));
            EXPECT_FAILURE(
                text, Upload(*texture, row.level, box, kBytes, kTight, &buffer, std::size_t(99)));
            auto const copy = [&] {
                Copy(*texture, row.level, {}, Size(row.size[0]), Size(row.size[1]));
            };
            EXPECT_TRUE(row.sides == 3 || !MessageOf(copy).empty());
        }
        EXPECT_EQ(0, counter->total()) << "the checks come before any GL call";
    }
}

// One side is read without checks, three sides unbound too.
TEST_F(TransferChecksTest, BuffersAndReadingAreChecked) {
    Buffer buffer(1024, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    buffer.bind();
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const texture(kind.make(kRGBA8, {4, 4, 4}, false));
        auto const upload = [&](Buffer *source, std::size_t offset) {
            Upload(*texture, 0, {{}, {4, 4, 4}}, kBytes, kTight, source, offset);
        };
        auto const read = [&](Pixel pixel, unsigned int alignment) {
            char pixels[256];
            Download(*texture, 0, pixel, alignment, static_cast<void *>(pixels));
        };
        auto const readInto = [&](Pixel pixel, unsigned int alignment) {
            Download(*texture, 0, pixel, alignment, &buffer, std::uint16_t(0));
        };
        EXPECT_FAILURE("offset(1024) is greater than pixel buffer object size1024",
                       upload(&buffer, 1024));
        EXPECT_FAILURE("Enforce buffer != NULL", upload(nullptr, 0));
        buffer.map(GL_WRITE_ONLY);
        EXPECT_FAILURE(kMapped, upload(&buffer, 0));
        EXPECT_FAILURE(kMapped, readInto(kBytes, 1));
        EXPECT_TRUE(buffer.isArrayBuffer()) << "a refused transfer converts nothing";
        buffer.unmap();
        if (kind.sides == 1)
            continue;
        EXPECT_FAILURE(kNoIndices, read(kIndices, 3));
        EXPECT_FAILURE(kAlignment, read(kBytes, 3));
        EXPECT_FAILURE(kAlignment, readInto(kBytes, 16));
        if (kind.sides == 3)
            continue;
        EXPECT_FAILURE(kNoIndices, readInto(kIndices, 3));
        ORU_GL(BindTexture, kind.target, 0u);
        EXPECT_FAILURE(kUnbound, read(kIndices, 3));
        EXPECT_FAILURE(kUnbound, readInto(kIndices, 3));
    }
}

// Whatever the level; not all types have a size.
TEST_F(TransferChecksTest, PixelDataIsSizedByItsType) {
    using T = Texture;
    Texture1D const line(kRGBA8, 16, false);
    Texture2D const plane(kRGBA8, 16, 8, false);
    Texture2DArray const stack(kRGBA8, 16, 8, 4, false);
    EXPECT_EQ(16u * 3, line.pixelDataSize(3, T::FORMAT_RGB, T::TYPE_BYTE));
    EXPECT_EQ(16u * 8 * 6, plane.pixelDataSize(3, T::FORMAT_RGB, T::TYPE_HALF_FLOAT));
    EXPECT_EQ(16u * 8 * 4 * 12, stack.pixelDataSize(3, T::FORMAT_RGB, T::TYPE_FLOAT));
    EXPECT_FAILURE("pixelDataSize: Unknown type GL_INT",
                   line.pixelDataSize(3, T::FORMAT_RGB, T::TYPE_INT));
}

TEST_F(TransferChecksTest, UnpackStateIsCheckedAndSet) {
    PixelUnpackParameters params;
    EXPECT_FAILURE("!\"Unsupported aligment in PixelUnpackParameters::setAlignment!\"",
                   params.setAlignment(3u));
    params.setAlignment(static_cast<PixelUnpackParameters::Alignment>(4));
    EXPECT_FAILURE("Enum value not recognized", params.apply());
    params.setAlignment(2u);
    params.setRowLength(3);
    params.setSkipRows(4);
    params.setSkipPixels(5);
    params.setImageHeight(6);
    params.setSkipImages(7);
    params.enableSwapBytes();
    params.apply();
    EXPECT_EQ((std::vector<GLint>{1, 0, 3, 4, 5, 6, 7, 2}),
              Get({GL_UNPACK_SWAP_BYTES, GL_UNPACK_LSB_FIRST, GL_UNPACK_ROW_LENGTH,
                   GL_UNPACK_SKIP_ROWS, GL_UNPACK_SKIP_PIXELS, GL_UNPACK_IMAGE_HEIGHT,
                   GL_UNPACK_SKIP_IMAGES, GL_UNPACK_ALIGNMENT}));
}

// Saved on a stack: OpenGL's, or in a core context the library's own.
TEST_F(TransferChecksTest, AlignmentsAreSavedAndPutBack) {
    struct Helpers : Texture2D {
        using Texture::PopPixelTransferModes;
        using Texture::PushAndSetReadbackByteAlignment;
        using Texture::PushAndSetTransferByteAlignment;
    };
    std::vector<GLenum> const both = {GL_PACK_ALIGNMENT, GL_UNPACK_ALIGNMENT};
    EXPECT_FAILURE(kAlignment, Helpers::PushAndSetTransferByteAlignment(3));
    Helpers::PushAndSetTransferByteAlignment(8);
    Helpers::PushAndSetReadbackByteAlignment(1);
    EXPECT_EQ((std::vector<GLint>{1, 8}), Get(both));
    Helpers::PopPixelTransferModes();
    EXPECT_EQ((std::vector<GLint>{4, 8}), Get(both));
    Helpers::PopPixelTransferModes();
    EXPECT_EQ((std::vector<GLint>{4, 4}), Get(both));
    EXPECT_NE("", MessageOf(Helpers::PopPixelTransferModes));
    int pushed = 0;
    auto const fill = [&pushed] {
        for (; pushed < 99; ++pushed)
            Helpers::PushAndSetTransferByteAlignment(1);
    };
    EXPECT_NE("", MessageOf(fill));
    EXPECT_EQ(16, pushed);
    while (pushed-- > 0)
        Helpers::PopPixelTransferModes();
    EXPECT_EQ((std::vector<GLint>{4, 4}), Get(both));
}
