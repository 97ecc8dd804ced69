// What the image transfers refuse, in which order and with which words.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/extensionator/opengltokenname.h"

using namespace oru_test;

namespace {

Pixel const kBytes{Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE};
Pixel const kIndices{Texture::FORMAT_COLOR_INDEX, Texture::TYPE_UNSIGNED_BYTE};
void const *const kNothing = nullptr;

char const kMapped[] = "Pixel Buffer Object cannot be memory mapped during data transfer";
char const kAlignment[] = "Invalid row byte alignment (must be of 1, 2, 4, or 8).";

} // namespace

class TransferChecksTest : public ObjectTest {};

// Each row breaks one rule and those after it; the texts of 3-D textures pad the sides' names.
TEST_F(TransferChecksTest, PartsAreCheckedInOrder) {
    struct Row {
        int level;
        Sides size;
        std::size_t sides; ///< how many sides a kind must have for the row
        std::string text;  ///< with % for the operation and _ for the padding
    };
    Row const rows[] = {
        {-1, {0, 0, 0}, 1, "error % width_ of zero supplied"},
        {-1, {17, 0, 0}, 2, "error % height of zero supplied"},
        {-1, {17, 9, 0}, 3, "error % depth_ of zero supplied"},
        {-1, {17, 9, 5}, 1, "a negative texture image mip-map level supplied"},
        {2, {17, 9, 5}, 1, "width(17) is greater than width_ of image (16) "},
        {2, {16, 9, 5}, 2, "height(9) is greater than height of image (8) "},
        {2, {16, 8, 5}, 3, "depth(5) is greater than depth_ of image (4) "},
    };
    auto const with = [](std::string text, char const *operation, char const *padding) {
        if (auto const at = text.find('%'); at != std::string::npos)
            text.replace(at, 1, operation);
        if (auto const at = text.find('_'); at != std::string::npos)
            text.replace(at, 1, padding);
        return text;
    };
    Buffer buffer(16, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    for (TextureKind const &kind : kTextureKinds) {
        BoundTexture const texture(kind.make(Texture::INTERNALFORMAT_RGBA8, {16, 8, 4}, false));
        Pushed<CountingForwarder> counter;
        for (Row const &row : rows) {
            if (row.sides > kind.sides)
                continue;
            SCOPED_TRACE(std::string(kind.name) + ": " + row.text);
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
        EXPECT_FAILURE("offset(1024) is greater than pixel buffer object size1024",
                       upload(&buffer, 1024));
        EXPECT_FAILURE("Enforce buffer != NULL", upload(nullptr, 0));
        buffer.bind();
        buffer.map(GL_WRITE_ONLY);
        EXPECT_FAILURE(kMapped, upload(&buffer, 0));
        EXPECT_FAILURE(kMapped, Download(*texture, 0, kBytes, 1, &buffer, 0));
        EXPECT_TRUE(buffer.isArrayBuffer()) << "a refused transfer converts nothing";
        buffer.unmap();
        EXPECT_FAILURE("Buffer::convertToUnpackBuffer cannot convert buffer target while bound",
                       upload(&buffer, 0));
        EXPECT_FAILURE("Buffer::convertToPackBuffer cannot convert buffer target while bound",
                       Download(*texture, 0, kBytes, 1, &buffer, 0));
        Buffer::BindDefaultArrayBuffer();
    }
    EXPECT_EQ(0, Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
}

TEST_F(TransferChecksTest, ReadingIsChecked) {
    char data[256] = {};
    void *const memory = data;
    Buffer buffer(256, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        if (kind.sides == 1)
            continue;
        auto const texture = kind.make(Texture::INTERNALFORMAT_RGBA8, {4, 4, 4}, false);
        if (kind.sides == 2) {
            EXPECT_FAILURE("Texture must be bound", Download(*texture, 0, kIndices, 3, memory));
            EXPECT_FAILURE("Texture must be bound", Download(*texture, 0, kIndices, 3, &buffer, 0));
            ORU_GL(BindTexture, kind.target, texture->objectID());
            EXPECT_FAILURE("COLOR_INDEX not allowed here!",
                           Download(*texture, 0, kIndices, 3, &buffer, 0));
        }
        EXPECT_FAILURE("COLOR_INDEX not allowed here!", Download(*texture, 0, kIndices, 3, memory));
        EXPECT_FAILURE(kAlignment, Download(*texture, 0, kBytes, 3, memory));
        EXPECT_FAILURE(kAlignment, Download(*texture, 0, kBytes, 16, &buffer, 0));
        ORU_GL(BindTexture, kind.target, 0u);
    }
    EXPECT_EQ(0, Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
}

// Components of one, two and four bytes, whatever the level; other types have no size here.
TEST_F(TransferChecksTest, PixelDataIsSizedByItsType) {
    Texture1D const line(Texture::INTERNALFORMAT_RED, 16, false);
    Texture2D const plane(Texture::INTERNALFORMAT_RED, 16, 8, false);
    Texture2DArray const stack(Texture::INTERNALFORMAT_RED, 16, 8, 4, false);
    char const bytes[] = "110220040000000000002";
    for (unsigned int i = 0; i <= Texture::TYPE_HALF_FLOAT; ++i) {
        auto const type = static_cast<Texture::Type>(i);
        std::size_t const row = 64 * static_cast<std::size_t>(bytes[i] - '0');
        if (row == 0) {
            EXPECT_FAILURE("pixelDataSize: Unknown type " +
                               std::string(ORUOGLTokenName(Texture::Type2GL(type))),
                           plane.pixelDataSize(3, Texture::FORMAT_RGBA, type));
            continue;
        }
        EXPECT_EQ(row, line.pixelDataSize(3, Texture::FORMAT_RGBA, type));
        EXPECT_EQ(row * 8, plane.pixelDataSize(3, Texture::FORMAT_RGBA, type));
        EXPECT_EQ(row * 8 * 4, stack.pixelDataSize(3, Texture::FORMAT_RGBA, type));
    }
}

TEST_F(TransferChecksTest, AlignmentsAreChecked) {
    PixelUnpackParameters params;
    EXPECT_FAILURE("!\"Unsupported aligment in PixelUnpackParameters::setAlignment!\"",
                   params.setAlignment(3u));
    params.setAlignment(static_cast<PixelUnpackParameters::Alignment>(4));
    EXPECT_FAILURE("Enum value not recognized", params.apply());
    kTight.apply();

    struct Helpers : Texture2D {
        using Texture::PopPixelTransferModes;
        using Texture::PushAndSetTransferByteAlignment;
    };
    EXPECT_FAILURE(kAlignment, Helpers::PushAndSetTransferByteAlignment(3));
    Helpers::PushAndSetTransferByteAlignment(8);
    EXPECT_EQ(8, Get(GL_UNPACK_ALIGNMENT));
    Helpers::PopPixelTransferModes();
    EXPECT_EQ(1, Get(GL_UNPACK_ALIGNMENT));
}
