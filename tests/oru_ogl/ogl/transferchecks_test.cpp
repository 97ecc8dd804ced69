// What the image transfers refuse, in which order and with which words.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include <regex>

using namespace oru_test;

namespace {

Pixel const kBytes{Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE};
Pixel const kIndices{Texture::FORMAT_COLOR_INDEX, Texture::TYPE_UNSIGNED_BYTE};
void const *const kNothing = nullptr;

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
        {-1, {0, 0, 0}, 1, "error % width_ of zero supplied"},
        {-1, {17, 0, 0}, 2, "error % height of zero supplied"},
        {-1, {17, 9, 0}, 3, "error % depth_ of zero supplied"},
        {-1, {17, 9, 5}, 1, "a negative texture image mip-map level supplied"},
        {2, {17, 9, 5}, 1, "width(17) is greater than width_ of image (16) "},
        {2, {16, 9, 5}, 2, "height(9) is greater than height of image (8) "},
        {2, {16, 8, 5}, 3, "depth(5) is greater than depth_ of image (4) "},
    };
    auto const with = [](std::string const &text, char const *operation, char const *padding) {
        std::string const filled = std::regex_replace(text, std::regex("%"), operation);
        return std::regex_replace(filled, std::regex("_"), padding);
    };
    Buffer buffer(16, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    for (TextureKind const &kind : kTextureKinds) {
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, {16, 8, 4}, false));
        Pushed<CountingForwarder> counter;
        for (auto const &row : rows) {
            if (row.sides > kind.sides)
                continue;
            SCOPED_TRACE(kind.name);
            std::string const upload = with(row.text, "subimage", kind.sides == 3 ? " " : "");
            Box const box = {{}, row.size};
            EXPECT_FAILURE(upload, Upload(*texture, row.level, box, kBytes, kTight, kNothing));
            EXPECT_FAILURE(
                upload, Upload(*texture, row.level, box, kBytes, kTight, &buffer, std::size_t(99)));
            if (row.sides < 3) {
                EXPECT_FAILURE(with(row.text, "copySubimage", ""),
                               Copy(*texture, row.level, {}, Size(row.size[0]), Size(row.size[1])));
            }
        }
        EXPECT_EQ(0, counter->total()) << "the checks come before any GL call";
    }
}

TEST_F(TransferChecksTest, BuffersAreChecked) {
    Buffer buffer(1024, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, {4, 4, 4}, false));
        auto const upload = [&](Buffer *source, std::size_t offset) {
            Upload(*texture, 0, {{}, {4, 4, 4}}, kBytes, kTight, source, offset);
        };
        auto const download = [&] { Download(*texture, 0, kBytes, 1, &buffer, 0); };
        EXPECT_FAILURE("offset(1024) is greater than pixel buffer object size1024",
                       upload(&buffer, 1024));
        EXPECT_FAILURE("Enforce buffer != NULL", upload(nullptr, 0));
        buffer.bind();
        buffer.map(GL_WRITE_ONLY);
        EXPECT_FAILURE(kMapped, upload(&buffer, 0));
        EXPECT_FAILURE(kMapped, download());
        EXPECT_TRUE(buffer.isArrayBuffer()) << "a refused transfer converts nothing";
        buffer.unmap();
        std::string const bound = " cannot convert buffer target while bound";
        EXPECT_FAILURE("Buffer::convertToUnpackBuffer" + bound, upload(&buffer, 0));
        EXPECT_FAILURE("Buffer::convertToPackBuffer" + bound, download());
        Buffer::BindDefaultArrayBuffer();
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
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, {4, 4, 4}, false));
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

// Components of one, two and four bytes, whatever the level; other types have no size here.
TEST_F(TransferChecksTest, PixelDataIsSizedByItsType) {
    Texture1D const line(Texture::INTERNALFORMAT_RED, 16, false);
    Texture2D const plane(Texture::INTERNALFORMAT_RED, 16, 8, false);
    Texture2DArray const stack(Texture::INTERNALFORMAT_RED, 16, 8, 4, false);
    std::string const bytes = "110220040000000000002";
    for (unsigned int i = 0; i < bytes.size(); ++i) {
        auto const type = static_cast<Texture::Type>(i);
        auto const size = [&](auto const &texture) {
            return texture.pixelDataSize(3, Texture::FORMAT_RGBA, type);
        };
        std::size_t const row = 64 * Size(bytes[i] - '0');
        if (row == 0) {
            EXPECT_FAILURE("pixelDataSize: Unknown type " +
                               std::string(ORUOGLTokenName(Texture::Type2GL(type))),
                           size(plane));
        } else {
            EXPECT_EQ((std::array{row, row * 8, row * 8 * 4}),
                      (std::array{size(line), size(plane), size(stack)}));
        }
    }
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
    for (int const swap : {1, 0}) {
        params.apply();
        EXPECT_EQ((std::vector<GLint>{swap, 1 - swap, 3, 4, 5, 6, 7, 2}),
                  Get({GL_UNPACK_SWAP_BYTES, GL_UNPACK_LSB_FIRST, GL_UNPACK_ROW_LENGTH,
                       GL_UNPACK_SKIP_ROWS, GL_UNPACK_SKIP_PIXELS, GL_UNPACK_IMAGE_HEIGHT,
                       GL_UNPACK_SKIP_IMAGES, GL_UNPACK_ALIGNMENT}));
        params.disableSwapBytes();
        params.makeFirstLSB();
    }

    struct Helpers : Texture2D {
        using Texture::PopPixelTransferModes;
        using Texture::PushAndSetReadbackByteAlignment;
        using Texture::PushAndSetTransferByteAlignment;
    };
    EXPECT_FAILURE(kAlignment, Helpers::PushAndSetTransferByteAlignment(3));
    Helpers::PushAndSetTransferByteAlignment(8);
    EXPECT_EQ(8, Get(GL_UNPACK_ALIGNMENT));
    Helpers::PushAndSetTransferByteAlignment(4);
    Helpers::PushAndSetReadbackByteAlignment(1);
    EXPECT_EQ((std::vector<GLint>{1, 4}), Get({GL_PACK_ALIGNMENT, GL_UNPACK_ALIGNMENT}));
    Helpers::PopPixelTransferModes();
    EXPECT_EQ((std::vector<GLint>{4, 4}), Get({GL_PACK_ALIGNMENT, GL_UNPACK_ALIGNMENT}));
    Helpers::PopPixelTransferModes();
    EXPECT_EQ(8, Get(GL_UNPACK_ALIGNMENT));
    Helpers::PopPixelTransferModes();
    EXPECT_EQ(2, Get(GL_UNPACK_ALIGNMENT));
    EXPECT_FAILURE(IsCoreRun() ? "No pixel storage of this context was saved: call a PushAndSet... "
                                 "function before each PopPixelTransferModes"
                               : "GL_STACK_UNDERFLOW",
                   Helpers::PopPixelTransferModes());
    auto const fill = [] {
        for (int i = 0; i < 99; ++i)
            Helpers::PushAndSetTransferByteAlignment(1);
    };
    EXPECT_FAILURE(IsCoreRun()
                       ? "No room to save pixel storage: end each PushAndSetReadbackByteAlignment "
                         "and PushAndSetTransferByteAlignment with a PopPixelTransferModes"
                       : "GL_STACK_OVERFLOW",
                   fill());
    for (int i = 0; i < 16; ++i)
        Helpers::PopPixelTransferModes();
    EXPECT_EQ(2, Get(GL_UNPACK_ALIGNMENT));
}
