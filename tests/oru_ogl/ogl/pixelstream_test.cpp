// Pixel streams: every frame arrives whole and in its order, through rings that the host and OpenGL
// use in turns.
#include "tests/support/allocationcount.h"
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/openglforwarder.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelreadstream.h"
#include "oru/oru_ogl/ogl/pixeluploadstream.h"

#include <cstring>
#include <deque>
#include <set>

using namespace oru_test;

namespace {

using Texels = std::vector<unsigned char>;

PixelShape const kShape = {kBytes.format, kBytes.type, 5, 3, 1, 7, 0, 8}; // in rows with gaps
PixelShape const kWhole = {kBytes.format, kBytes.type, 8, 6};

/// A frame in memory: every byte, those between the rows too.
Texels Frame(unsigned char first) {
    Texels frame(kShape.bytes());
    for (std::size_t i = 0; i < frame.size(); ++i)
        frame[i] = static_cast<unsigned char>(first + 3 * i);
    return frame;
}

/// The picture of 8 x 6 that comes of a frame at (2, 1).
Texels Picture(unsigned char first) {
    Texels picture(kWhole.bytes(), 9);
    Texels const frame = Frame(first);
    for (std::size_t y = 0; y < 3; ++y)
        std::copy_n(&frame[y * 32], 20, &picture[(y + 1) * 32 + 8]);
    return picture;
}

Texels Taken(PixelReadStream &stream) {
    PixelView const view = stream.begin();
    Texels texels(view.bytes());
    std::memcpy(texels.data(), view.data(), texels.size());
    EXPECT_EQ(view.data(), stream.begin().data()) << "the same until it is given back";
    stream.end();
    return texels;
}

/// A driver that may be busy with all that it was given, and the buffers that were mapped.
class BusyDriver : public OpenGLForwarder {
public:
    bool isBusy = false;
    std::vector<GLint> mapped;

    void cgmGetSynciv(char const *file, unsigned int line, GLsync sync, GLenum name, GLsizei size,
                      GLsizei *length, GLint *values) override {
        OpenGLForwarder::cgmGetSynciv(file, line, sync, name, size, length, values);
        if (isBusy)
            *values = GL_UNSIGNALED;
    }
    void *cgmMapBufferRange(char const *file, unsigned int line, GLenum target, GLintptr offset,
                            GLsizeiptr size, GLbitfield access) override {
        mapped.push_back(Get(GL_PIXEL_UNPACK_BUFFER_BINDING));
        return OpenGLForwarder::cgmMapBufferRange(file, line, target, offset, size, access);
    }
};

} // namespace

class PixelStreamTest : public ObjectTest {
protected:
    PixelStreamTest() = default;

    void SetUp() override {
        ObjectTest::SetUp();
        texture_.emplace(std::make_unique<Texture2D>(kRGBA8, 8, 6, false));
        Image<unsigned char>({8, 6, 1}, 4, 9).upload(**texture_, kBytes);
    }
    void TearDown() override {
        texture_.reset();
        ObjectTest::TearDown();
    }

    Texture2 &texture() { return dynamic_cast<Texture2 &>(**texture_); }

    std::optional<BoundTexture> texture_;
};

// More frames than buffers, each read back by a stream that is kept full: from the texture and from
// a framebuffer by turns.
TEST_F(PixelStreamTest, FramesArriveInTheirOrder) {
    Framebuffer framebuffer;
    ORU_GL(BindTexture, GL_TEXTURE_2D, 0u);
    framebuffer.bind();
    framebuffer.attach(&texture(), 0, 0);
    texture_->bind();
    PixelUploadStream made(kShape);
    PixelReadStream read(kWhole, 2);
    PixelUploadStream uploads(std::move(made));
    std::deque<Texels> expected;
    for (unsigned char i = 0; i < 50; ++i) {
        Texels const frame = Frame(i);
        MutablePixelView const view = uploads.begin();
        ASSERT_EQ(frame.size(), view.bytes());
        std::memcpy(view.data(), frame.data(), frame.size());
        EXPECT_EQ(view.data(), uploads.begin().data()) << "the same until it is uploaded";
        uploads.upload(texture(), 0, 2, 1);
        if (read.isFull()) {
            EXPECT_EQ(0u, MessageOf([&] { read.read(0, 0); }).find("All frames of the stream"));
            EXPECT_EQ(expected.front(), Taken(read));
            expected.pop_front();
        }
        if (i % 2)
            read.read(texture(), 0);
        else
            read.read(0, 0);
        expected.push_back(Picture(i));
        EXPECT_EQ(expected.size(), read.count());
    }
    for (Texels const &picture : expected)
        EXPECT_EQ(picture, Taken(read));
    EXPECT_FALSE(read.isReady());
    EXPECT_EQ((std::vector<GLint>{0, 0, 4, 4, 0}),
              Get({GL_PIXEL_PACK_BUFFER_BINDING, GL_PIXEL_UNPACK_BUFFER_BINDING, GL_PACK_ALIGNMENT,
                   GL_UNPACK_ALIGNMENT, GL_UNPACK_ROW_LENGTH}));
    framebuffer.unbind();
}

// Frames of several megabytes, which go in bands: rows of 2-D textures, whole blocks of compressed
// ones, images of 3-D ones, with gaps between rows and images, of a height that is no multiple of a
// band's.
TEST_F(PixelStreamTest, LargeFramesArriveWhole) {
    auto const send = [](auto &texture, PixelShape const &shape, auto... place) {
        ORU_GL(BindTexture, texture.target(), texture.objectID());
        Texels bytes(shape.bytes());
        for (std::size_t i = 0; i < bytes.size(); ++i)
            bytes[i] = static_cast<unsigned char>(i * 2654435761u >> 24);
        PixelUploadStream uploads(shape, 2);
        std::memcpy(uploads.begin().data(), bytes.data(), bytes.size());
        uploads.upload(texture, 0, place...);
        Texels sent(texture.width(0) * texture.height(0) * texture.depth(0) * 4), wanted(sent);
        PixelShape const all = {kBytes.format, kBytes.type, texture.width(0), texture.height(0),
                                texture.depth(0)};
        texture.getPixelData(MutablePixelView(sent.data(), sent.size(), all), 0);
        texture.subImage(0, place..., PixelView(bytes.data(), bytes.size(), shape));
        texture.getPixelData(MutablePixelView(wanted.data(), wanted.size(), all), 0);
        EXPECT_TRUE(sent == wanted);
        return sent;
    };
    Texture3D images(kRGBA8, 120, 100, 70, false);
    send(images, {kBytes.format, kBytes.type, 117, 99, 61, 121, 101, 8}, 2, 1, 5);
    ORU_GL(BindTexture, GL_TEXTURE_3D, 0u);
    Texture2D blocks(Texture::INTERNALFORMAT_COMPRESSED_RG_RGTC2, 640, 1100, false);
    send(blocks, {kBytes.format, kBytes.type, 640, 1100}, 0, 0);

    Texture2D flat(kRGBA8, 640, 1100, false);
    Texels const sent = send(flat, {kBytes.format, kBytes.type, 637, 1099, 1, 700, 0, 4}, 3, 1);
    Framebuffer framebuffer;
    ORU_GL(BindTexture, GL_TEXTURE_2D, 0u);
    framebuffer.bind();
    framebuffer.attach(&flat, 0, 0);
    PixelReadStream read({kBytes.format, kBytes.type, 640, 1100}, 2);
    read.read(0, 0);
    EXPECT_TRUE(sent == Taken(read));
    framebuffer.unbind();
}

// One buffer while OpenGL keeps up, which the caches have; all of them in turns while it does not.
TEST_F(PixelStreamTest, TheHostWritesWhereOpenGLIsDone) {
    InterceptorScope<BusyDriver> driver;
    PixelUploadStream uploads(kWhole, 3);
    for (int i = 0; i < 9; ++i) {
        driver->isBusy = i >= 3;
        uploads.begin();
        uploads.upload(texture(), 0, 0, 0);
    }
    std::vector<GLint> const &order = driver->mapped;
    ASSERT_EQ(9u, order.size());
    EXPECT_EQ((std::vector<GLint>{order[0], order[0]}), (std::vector<GLint>{order[1], order[2]}));
    EXPECT_EQ(3u, (std::set<GLint>{order[2], order[3], order[4]}).size());
    EXPECT_EQ((std::vector<GLint>{order[2], order[3], order[4], order[2]}),
              (std::vector<GLint>{order[5], order[6], order[7], order[8]}));
}

TEST_F(PixelStreamTest, FramesCostNoMemory) {
    PixelUploadStream uploads(kWhole);
    PixelReadStream reads(kWhole);
    auto const frame = [&] {
        std::memset(uploads.begin().data(), 7, kWhole.bytes());
        uploads.upload(texture(), 0, 0, 0);
        reads.read(texture(), 0);
        reads.begin();
        reads.end();
    };
    for (int i = 0; i < 4; ++i)
        frame();
    long const before = AllocationCount();
    for (int i = 0; i < 20; ++i)
        frame();
    EXPECT_EQ(before, AllocationCount());
}

TEST_F(PixelStreamTest, FailuresLeaveAStreamThatWorks) {
    PixelUploadStream uploads(kShape, 2);
    PixelReadStream reads(kWhole, 2);
    EXPECT_EQ(0u, MessageOf([&] { uploads.upload(texture(), 0, 0, 0); }).find("There is no frame"));
    EXPECT_EQ(0u, MessageOf([&] { reads.begin(); }).find("No frame of the stream was asked for"));
    EXPECT_EQ(0u, MessageOf([&] { reads.end(); }).find("The host has no frame"));
    for (int i = 0; i < 3; ++i) {
        uploads.begin();
        EXPECT_FAILURE("GL_INVALID_VALUE", uploads.upload(texture(), 0, 7, 0));
        EXPECT_EQ(0u, MessageOf([&] { reads.read(texture(), 1); }).find("Level 1 has 0 x 0 x 0"));
    }
    Texels const frame = Frame(1);
    std::memcpy(uploads.begin().data(), frame.data(), frame.size());
    uploads.upload(texture(), 0, 2, 1);
    reads.read(texture(), 0);
    EXPECT_EQ(Picture(1), Taken(reads));

    EXPECT_EQ(0u, MessageOf([] { PixelReadStream(kShape, 1); }).find("A pixel stream needs two"));
    EXPECT_FAILURE("Range error: nSize > 0", PixelUploadStream({kBytes.format, kBytes.type, 0, 1}));
    PixelReadStream const other(std::move(reads));
    // NOLINTNEXTLINE(bugprone-use-after-move)
    EXPECT_EQ(0u, MessageOf([&] { reads.isFull(); }).find("This pixel stream is empty"));
    ReleaseOGLContext();
    EXPECT_EQ(0u, MessageOf([] { PixelUploadStream{kShape}; }).find("Pixel streams need"));
    context().makeCurrent();
}
