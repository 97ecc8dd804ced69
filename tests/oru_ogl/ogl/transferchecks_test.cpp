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
        std::string text;  ///< with % for the operation and _ for the padding
    };
    Row const rows[] = {
        {0, {0, 1, 1}, 1, "error % width_ of zero supplied"},
        {-1, {17, 0, 0}, 2, "error % height of zero supplied"},
        {-1, {17, 9, 0}, 3, "error % depth_ of zero supplied"},
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
        for (auto const &[level, size, sides, text] : rows) {
            if (sides > kind.sides)
                continue;
            auto const with = [&text = text](char const *operation, char const *padding) {
                std::string const filled = std::regex_replace(text, std::regex("%"), operation);
                return std::regex_replace(filled, std::regex("_"), padding);
            };
            std::string const upload = with("subimage", kind.sides == 3 ? " " : "");
            Box const box = {{}, size};
            EXPECT_FAILURE(upload, Upload(*texture, level, box, kBytes, kTight, nothing));
            EXPECT_FAILURE(upload,
                           Upload(*texture, level, box, kBytes, kTight, &buffer, std::size_t(99)));
            if (sides < 3) {
                EXPECT_FAILURE(with("copySubimage", ""),
                               Copy(*texture, level, {}, Size(size[0]), Size(size[1])));
            }
        }
        EXPECT_EQ(0, counter->total()) << "the checks come before any GL call";
    }
}

TEST_F(TransferChecksTest, BuffersAreChecked) {
    Buffer buffer(1024, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    buffer.bind();
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const texture(kind.make(kRGBA8, {4, 4, 4}, false));
        auto const upload = [&](Buffer *source, std::size_t offset) {
            Upload(*texture, 0, {{}, {4, 4, 4}}, kBytes, kTight, source, offset);
        };
        EXPECT_FAILURE("offset(1024) is greater than pixel buffer object size1024",
                       upload(&buffer, 1024));
        EXPECT_FAILURE("Enforce buffer != NULL", upload(nullptr, 0));
        buffer.map(GL_WRITE_ONLY);
        EXPECT_FAILURE(kMapped, upload(&buffer, 0));
        EXPECT_FAILURE(kMapped, Download(*texture, 0, kBytes, 1, &buffer, 0));
        EXPECT_TRUE(buffer.isArrayBuffer()) << "a refused transfer converts nothing";
        buffer.unmap();
    }
}

// One side is read without checks.
TEST_F(TransferChecksTest, ReadingIsChecked) {
    char data[256] = {};
    void *const memory = data;
    Buffer buffer(256, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        if (kind.sides == 1)
            continue;
        BoundTexture const texture(kind.make(kRGBA8, {4, 4, 4}, false));
        if (kind.sides == 2) {
            EXPECT_FAILURE(kNoIndices, Download(*texture, 0, kIndices, 3, &buffer, 0));
            ORU_GL(BindTexture, kind.target, 0u);
            EXPECT_FAILURE(kUnbound, Download(*texture, 0, kIndices, 3, memory));
            EXPECT_FAILURE(kUnbound, Download(*texture, 0, kIndices, 3, &buffer, 0));
            texture.bind();
        }
        EXPECT_FAILURE(kNoIndices, Download(*texture, 0, kIndices, 3, memory));
        EXPECT_FAILURE(kAlignment, Download(*texture, 0, kBytes, 3, memory));
        EXPECT_FAILURE(kAlignment, Download(*texture, 0, kBytes, 16, &buffer, 0));
    }
}

// Whatever the level; not all types have a size.
TEST_F(TransferChecksTest, PixelDataIsSizedByItsType) {
    using T = Texture;
    Texture1D const line(kRGBA8, 16, false);
    EXPECT_EQ(16u * 3, line.pixelDataSize(3, T::FORMAT_RGB, T::TYPE_BYTE));
    EXPECT_EQ(16u * 8 * 6,
              Texture2D(kRGBA8, 16, 8, false).pixelDataSize(3, T::FORMAT_RGB, T::TYPE_HALF_FLOAT));
    EXPECT_EQ(
        16u * 8 * 4 * 12,
        Texture2DArray(kRGBA8, 16, 8, 4, false).pixelDataSize(3, T::FORMAT_RGB, T::TYPE_FLOAT));
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
    auto const alignments = [] { return Get({GL_PACK_ALIGNMENT, GL_UNPACK_ALIGNMENT}); };
    EXPECT_FAILURE(kAlignment, Helpers::PushAndSetTransferByteAlignment(3));
    Helpers::PushAndSetTransferByteAlignment(8);
    Helpers::PushAndSetReadbackByteAlignment(1);
    EXPECT_EQ((std::vector<GLint>{1, 8}), alignments());
    Helpers::PopPixelTransferModes();
    EXPECT_EQ((std::vector<GLint>{4, 8}), alignments());
    Helpers::PopPixelTransferModes();
    EXPECT_EQ((std::vector<GLint>{4, 4}), alignments());
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
    EXPECT_EQ((std::vector<GLint>{4, 4}), alignments());
}
