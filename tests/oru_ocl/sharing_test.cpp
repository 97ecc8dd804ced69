// OpenCL memory over OpenGL objects: what one writes, the other reads.
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "tests/oru_ocl/sharingtest.h"

using namespace ORU::OCL;
using namespace oru_test;

namespace {

constexpr auto RGBA8 = OGL::Texture::INTERNALFORMAT_RGBA8;

/// With an OpenGL buffer of some numbers, and a kernel that changes them.
class SharedBufferTest : public SharingTest {
protected:
    void launch() { queue.enqueueKernel(advance, Range<1>(values.size()), 0, 0); }

    std::vector<cl_uint> values = Counting<cl_uint>(3001);
    std::size_t const bytes = values.size() * sizeof values[0];
    OGL::Buffer glBuffer{std::int64_t(bytes), OGL::Buffer::TYPE_ARRAY_BUFFER,
                         OGL::Buffer::USAGE_DYNAMIC_DRAW, values.data()};
    Buffer const buffer{context, both, glBuffer};
    Kernel const advance =
        KernelOf(build("kernel void f(global uint *v) { size_t i = get_global_id(0);"
                       "v[i] = v[i] * 3 + 1; }"),
                 "f", buffer);
};

} // namespace

TEST_F(SharedBufferTest, BuffersGoThereAndBack) {
    EXPECT_EQ(bytes, Get<std::size_t>(buffer, Memory::MEMORYINFO_SIZE));
    Event const acquired = queue.enqueueAcquireGLObjects({buffer});
    launch();
    Event released = queue.enqueueReleaseGLObjects({buffer});
    released.wait();

    std::vector<cl_uint> read(values.size());
    glBuffer.bind();
    glBuffer.getSubData(0, std::int64_t(bytes), read.data());
    for (cl_uint &value : values)
        value = value * 3 + 1;
    EXPECT_EQ(values, read);
}

TEST_F(SharedBufferTest, MisuseIsRefused) {
    Context const alone = makeContext();
    CommandQueue other(alone, device(), false, false);
    Buffer const plain(context, reads, false, 16);
    auto const acquire = [&] { queue.enqueueAcquireGLObjects({buffer}); };
    auto const release = [&] { queue.enqueueReleaseGLObjects({buffer}); };
    auto const run = [this] { launch(); };
    auto const read = [&] { queue.enqueueBlockingRead(buffer, 0, bytes, values.data()); };
    EXPECT_THROWN("CL_INVALID_CONTEXT", Buffer(alone, reads, glBuffer));
    EXPECT_THROWN("CL_INVALID_CONTEXT", other.enqueueAcquireGLObjects({buffer}));
    EXPECT_THROWN("CL_INVALID_GL_OBJECT", queue.enqueueAcquireGLObjects({plain}));
    // Objects are used only while acquired.
    for (std::string const error : {"CL_INVALID_OPERATION", "", "CL_INVALID_OPERATION"}) {
        EXPECT_EQ(error, Thrown(run));
        EXPECT_EQ(error, Thrown(read));
        EXPECT_EQ(error, Thrown(release));
        if (!error.empty())
            acquire();
    }
    release();

    // The buffer's name is gone, and with it what there is to share.
    GLuint const name = glBuffer.objectID();
    ORU_GL(DeleteBuffers, 1, &name);
    EXPECT_EQ("CL_INVALID_GL_OBJECT", Thrown(acquire));
    EXPECT_THROWN("CL_INVALID_GL_OBJECT", Buffer(context, reads, glBuffer));
}

TEST_F(SharingTest, TexturesGoThereAndBackOnEveryLevel) {
    std::size_t const width = 20, height = 12;
    OGL::Texture2D source(RGBA8, width, height, true), target(RGBA8, width, height, true);
    for (int level = 0; level < 3; ++level) {
        std::size_t const w = width >> level, h = height >> level;
        Upload(source, level, w, h, Pattern(w * h * 4, std::size_t(level)));
        Upload(target, level, w, h, Pattern(w * h * 4, 100));
    }
    // Another context of the share group may be current meanwhile.
    OGL::ContextOffscreen const sibling(glContext.get());
    sibling.makeCurrent();
    for (int level = 1; level < 3; ++level) {
        std::size_t const w = width >> level, h = height >> level;
        Pixels const pattern = Pattern(w * h * 4, std::size_t(level));
        invert(Image2D(context, reads, source, unsigned(level)),
               Image2D(context, writes, target, unsigned(level)), w, h);
        EXPECT_EQ(Inverted(pattern), Download(target, level, w * h * 4));
        EXPECT_EQ(pattern, Download(source, level, w * h * 4));
    }
    EXPECT_EQ(sibling.renderContext(), OGL::Context::CurrentContext());
    // The level that nobody shared is as it was.
    EXPECT_EQ(Pattern(width * height * 4, 100), Download(target, 0, width * height * 4));
    glContext->makeCurrent();
}

TEST_F(SharingTest, RectangleTexturesAndRenderbuffersGoThereAndBack) {
    std::size_t const width = 19, height = 7, bytes = width * height * 4;
    OGL::TextureRECT rectangle(RGBA8, width, height);
    Upload(rectangle, 0, width, height, Pattern(bytes, 3));
    OGL::Renderbuffer renderbuffer(GL_RGBA8, int(width), int(height));
    OGL::Texture2D back(RGBA8, width, height, false);

    Image2D const source(context, reads, rectangle, 0);
    EXPECT_EQ(cl_mem_flags(CL_MEM_READ_ONLY), Get<cl_mem_flags>(source, Memory::MEMORYINFO_FLAGS));
    Image2D const target(context, both, renderbuffer);
    invert(source, target, width, height);
    OGL::Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&renderbuffer, 0);
    Pixels read(bytes), cleared;
    ORU_GL(ReadPixels, 0, 0, GLsizei(width), GLsizei(height), GL_RGBA, GL_UNSIGNED_BYTE,
           read.data());
    EXPECT_EQ(Inverted(Pattern(bytes, 3)), read);

    // What OpenGL draws into the renderbuffer arrives too.
    ORU_GL(ClearColor, 0.2f, 0.4f, 0.6f, 0.8f);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    invert(target, Image2D(context, writes, back, 0), width, height);
    for (std::size_t i = 0; i < width * height; ++i)
        cleared.insert(cleared.end(), {204, 153, 102, 51});
    EXPECT_EQ(cleared, Download(back, 0, bytes));
}

TEST_F(SharingTest, VolumesGoThereAndBack) {
    std::size_t const width = 6, height = 5, depth = 4, bytes = width * height * depth * 4;
    OGL::Texture3D texture(RGBA8, width, height, depth, false);
    Pixels const before = Pattern(bytes, 1), after = Pattern(bytes, 50);
    ORU_GL(BindTexture, GL_TEXTURE_3D, texture.objectID());
    ORU_GL(TexSubImage3D, GL_TEXTURE_3D, 0, 0, 0, 0, GLsizei(width), GLsizei(height),
           GLsizei(depth), GL_RGBA, GL_UNSIGNED_BYTE, before.data());

    Image3D const image(context, both, texture, 0);
    EXPECT_EQ(Memory::MEMORYOBJECTTYPE_IMAGE3D, image.memType());
    queue.enqueueAcquireGLObjects({image});
    std::size_t const origin[3] = {}, region[3] = {width, height, depth};
    Pixels read(bytes);
    ORU_CL(EnqueueReadImage, queue.id(), image.id(), CL_TRUE, origin, region, 0, 0, read.data(), 0,
           nullptr, nullptr);
    EXPECT_EQ(before, read);
    ORU_CL(EnqueueWriteImage, queue.id(), image.id(), CL_TRUE, origin, region, 0, 0, after.data(),
           0, nullptr, nullptr);
    queue.enqueueReleaseGLObjects({image}).wait();
    EXPECT_EQ(after, Download(texture, 0, bytes));
}

TEST_F(SharingTest, TexturesThatCannotBeSharedAreRefused) {
    OGL::Texture2D texture(RGBA8, 8, 8, true);
    OGL::Texture2D rgb(OGL::Texture::INTERNALFORMAT_RGB8, 8, 8, false);
    EXPECT_THROWN("", Image2D(context, reads, texture, 3));
    EXPECT_THROWN("CL_INVALID_MIP_LEVEL", Image2D(context, reads, texture, 4));
    EXPECT_THROWN("CL_INVALID_IMAGE_FORMAT_DESCRIPTOR", Image2D(context, reads, rgb, 0));

    // A texture of another size is another object.
    Image2D const image(context, both, texture, 0);
    queue.enqueueAcquireGLObjects({image});
    queue.enqueueReleaseGLObjects({image});
    ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
    ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, GL_RGBA8, 16, 16, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    EXPECT_THROWN("CL_INVALID_GL_OBJECT", queue.enqueueAcquireGLObjects({image}));
    Image2D const again(context, Memory::MemoryAccessFlags(7), texture, 0);
    queue.enqueueAcquireGLObjects({again});
    queue.enqueueReleaseGLObjects({again});
}

TEST_F(SharingTest, TheOpenGLContextMayGoFirst) {
    auto texture = std::make_unique<OGL::Texture2D>(RGBA8, 8, 8, false);
    Image2D const image(context, both, *texture, 0);
    queue.enqueueAcquireGLObjects({image});
    texture.reset();
    ContextProperties const properties = propertiesToShare();
    glContext.reset();
    EXPECT_THROWN("CL_INVALID_GL_OBJECT", queue.enqueueReleaseGLObjects({image}));

    // Neither can a new OpenCL context share with it; the callback is told why.
    std::string reason;
    Context::NotifyCallback const callback(
        [](char const *text, void const *, std::size_t, void *data) {
            *static_cast<std::string *>(data) = text;
        },
        &reason);
    EXPECT_THROWN("UNKNOWN CL ERROR CODE", Context(properties, device(), callback));
    EXPECT_FALSE(reason.empty());
}
