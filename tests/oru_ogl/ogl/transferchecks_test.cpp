// What the image transfers refuse, in which order and with which words.
#include "texturekinds.h"

using namespace ORU::OGL;
using namespace oru_test;

namespace {

PixelUnpackParameters const kTight;
Texture::Format const kRGBA = Texture::FORMAT_RGBA;
Texture::Type const kBytes = Texture::TYPE_UNSIGNED_BYTE;

char const *const kMapped = "Pixel Buffer Object cannot be memory mapped during data transfer";

} // namespace

class TransferChecksTest : public ObjectTest {};

// Each row breaks one rule and those after it; the texts of 3-D textures pad the sides' names.
TEST_F(TransferChecksTest, PartsAreCheckedInOrder) {
    struct Row {
        int level;
        Sides size;
        std::size_t sides; ///< how many sides a kind must have for the row
        std::string plain;
        std::string padded;
    };
    Row const rows[] = {
        {-1, {0, 0, 0}, 1, "error % width of zero supplied", "error % width  of zero supplied"},
        {-1, {17, 0, 0}, 2, "error % height of zero supplied", "error % height of zero supplied"},
        {-1, {17, 9, 0}, 3, "", "error % depth  of zero supplied"},
        {-1,
         {17, 9, 5},
         1,
         "a negative texture image mip-map level supplied",
         "a negative texture image mip-map level supplied"},
        {2,
         {17, 9, 5},
         1,
         "width(17) is greater than width of image (16) ",
         "width(17) is greater than width  of image (16) "},
        {2,
         {16, 9, 5},
         2,
         "height(9) is greater than height of image (8) ",
         "height(9) is greater than height of image (8) "},
        {2, {16, 8, 5}, 3, "", "depth(5) is greater than depth  of image (4) "},
    };
    auto const with = [](std::string text, char const *operation) {
        auto const at = text.find('%');
        return at == std::string::npos ? text : text.replace(at, 1, operation);
    };
    Buffer buffer(16, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    for (TextureKind const &kind : kTextureKinds) {
        auto const texture = kind.make(Texture::INTERNALFORMAT_RGBA8, {16, 8, 4}, false);
        Bind(*texture);
        Pushed<CountingForwarder> counter;
        for (Row const &row : rows) {
            if (row.sides > kind.sides)
                continue;
            SCOPED_TRACE(std::string(kind.name) + ": " + row.padded);
            std::string const upload = with(kind.sides == 3 ? row.padded : row.plain, "subimage");
            Box const box = {{0, 0, 0}, row.size};
            EXPECT_EQ(upload, MessageOf([&] {
                          Upload(*texture, row.level, box, kRGBA, kBytes, kTight,
                                 static_cast<void const *>(nullptr));
                      }));
            EXPECT_EQ(upload, MessageOf([&] {
                          Upload(*texture, row.level, box, kRGBA, kBytes, kTight, &buffer,
                                 std::size_t(99));
                      }));
            if (row.sides == 3)
                continue;
            std::uint64_t const w = Size(row.size[0]), h = Size(row.size[1]);
            EXPECT_EQ(with(row.plain, "copySubimage"), MessageOf([&] {
                          if (auto *one = dynamic_cast<Texture1 *>(texture.get()))
                              one->copyTexSubImage(row.level, 0, 0, 0, w);
                          else if (auto *two = dynamic_cast<Texture2 *>(texture.get()))
                              two->copyTexSubImage(row.level, 0, 0, 0, 0, w, h);
                          else
                              dynamic_cast<Texture3 &>(*texture).copyTexSubImage(row.level, 0, 0, 0,
                                                                                 0, 0, w, h);
                      }));
        }
        EXPECT_EQ(0, counter->total()) << "the checks come before any GL call";
        Unbind(*texture);
    }
}

TEST_F(TransferChecksTest, BuffersAreChecked) {
    Buffer buffer(1024, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        auto const texture = kind.make(Texture::INTERNALFORMAT_RGBA8, {4, 4, 4}, false);
        Bind(*texture);
        Box const box = {{0, 0, 0}, {4, 4, 4}};
        auto const upload = [&](Buffer *source, std::size_t offset) {
            return MessageOf(
                [&] { Upload(*texture, 0, box, kRGBA, kBytes, kTight, source, offset); });
        };
        EXPECT_EQ("offset(1024) is greater than pixel buffer object size1024",
                  upload(&buffer, 1024));
        EXPECT_EQ("Enforce buffer != NULL", upload(nullptr, 0));
        buffer.bind();
        buffer.map(GL_WRITE_ONLY);
        EXPECT_EQ(kMapped, upload(&buffer, 0));
        EXPECT_EQ(kMapped, MessageOf([&] { Download(*texture, buffer, 0, 0, kRGBA, kBytes); }));
        EXPECT_TRUE(buffer.isArrayBuffer()) << "a refused transfer converts nothing";
        buffer.unmap();
        EXPECT_EQ("Buffer::convertToUnpackBuffer cannot convert buffer target while bound",
                  upload(&buffer, 0));
        EXPECT_EQ("Buffer::convertToPackBuffer cannot convert buffer target while bound",
                  MessageOf([&] { Download(*texture, buffer, 0, 0, kRGBA, kBytes); }));
        Buffer::BindDefaultArrayBuffer();
        Unbind(*texture);
    }
    GLint depth = -1;
    ORU_GL(GetIntegerv, GL_CLIENT_ATTRIB_STACK_DEPTH, &depth);
    EXPECT_EQ(0, depth);
}

TEST_F(TransferChecksTest, ReadingIsChecked) {
    char data[256] = {};
    Buffer buffer(256, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    Texture::Format const index = Texture::FORMAT_COLOR_INDEX;
    for (TextureKind const &kind : kTextureKinds) {
        SCOPED_TRACE(kind.name);
        auto const texture = kind.make(Texture::INTERNALFORMAT_RGBA8, {4, 4, 4}, false);
        auto const *const two = dynamic_cast<Texture2 const *>(texture.get());
        auto const *const three = dynamic_cast<Texture3 const *>(texture.get());
        if (two) {
            EXPECT_EQ("Texture must be bound",
                      MessageOf([&] { two->getPixelData(data, 0, index, kBytes, 3); }));
            EXPECT_EQ("Texture must be bound",
                      MessageOf([&] { two->getPixelData(&buffer, 0, 0, index, kBytes, 3); }));
            Bind(*texture);
            EXPECT_EQ("COLOR_INDEX not allowed here!",
                      MessageOf([&] { two->getPixelData(data, 0, index, kBytes, 3); }));
            EXPECT_EQ("COLOR_INDEX not allowed here!",
                      MessageOf([&] { two->getPixelData(&buffer, 0, 0, index, kBytes, 3); }));
            EXPECT_EQ("Invalid row byte alignment (must be of 1, 2, 4, or 8).",
                      MessageOf([&] { two->getPixelData(data, 0, kRGBA, kBytes, 3); }));
            Unbind(*texture);
        }
        if (three) {
            EXPECT_EQ("COLOR_INDEX not allowed here!",
                      MessageOf([&] { three->getPixelData(data, 0, index, kBytes, 3); }));
            EXPECT_EQ("Invalid row byte alignment (must be of 1, 2, 4, or 8).",
                      MessageOf([&] { three->getPixelData(data, 0, kRGBA, kBytes, 16); }));
        }
    }
    // Components of one, two and four bytes; other types have no size here.
    Texture2D const texture(Texture::INTERNALFORMAT_RGBA32F_ARB, 16, 8, false);
    std::string sizes;
    for (unsigned int type = 0; type <= Texture::TYPE_HALF_FLOAT; ++type) {
        std::size_t size = 0;
        std::string const message = MessageOf(
            [&] { size = texture.pixelDataSize(3, kRGBA, static_cast<Texture::Type>(type)); });
        sizes += static_cast<char>('0' + size / 512);
        if (size == 0) {
            EXPECT_EQ(0u, message.find("pixelDataSize: Unknown type GL_")) << message;
        }
    }
    EXPECT_EQ("110220040000000000002", sizes);
}

TEST_F(TransferChecksTest, AlignmentsAreChecked) {
    PixelUnpackParameters params;
    EXPECT_EQ("!\"Unsupported aligment in PixelUnpackParameters::setAlignment!\"",
              MessageOf([&] { params.setAlignment(3u); }));
    params.setAlignment(static_cast<PixelUnpackParameters::Alignment>(4));
    EXPECT_EQ("Enum value not recognized", MessageOf([&] { params.apply(); }));
    kTight.apply();

    struct Helpers : Texture2D {
        using Texture::PopPixelTransferModes;
        using Texture::PushAndSetTransferByteAlignment;
    };
    EXPECT_EQ("Invalid row byte alignment (must be of 1, 2, 4, or 8).",
              MessageOf([] { Helpers::PushAndSetTransferByteAlignment(3); }));
    Helpers::PushAndSetTransferByteAlignment(8);
    GLint alignment = 0;
    ORU_GL(GetIntegerv, GL_UNPACK_ALIGNMENT, &alignment);
    EXPECT_EQ(8, alignment);
    Helpers::PopPixelTransferModes();
    ORU_GL(GetIntegerv, GL_UNPACK_ALIGNMENT, &alignment);
    EXPECT_EQ(1, alignment);
}
