// OpenCL memory over OpenGL objects: what one writes, the other reads.
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "tests/support/computetest.h"

using namespace ORU::OCL;
using namespace oru_test;

namespace {

constexpr auto RGBA8 = OGL::Texture::INTERNALFORMAT_RGBA8;

using Pixels = std::vector<unsigned char>;

/// Bytes that differ from pixel to pixel and from channel to channel.
Pixels Pattern(std::size_t bytes, std::size_t seed) {
    Pixels pixels(bytes);
    for (std::size_t i = 0; i < bytes; ++i)
        pixels[i] = static_cast<unsigned char>(i * 37 + i / 251 + seed);
    return pixels;
}

/// RGBA bytes into a level of a 2-D or rectangle texture.
void Upload(OGL::Texture2 const &texture, int level, std::size_t width, std::size_t height,
            Pixels const &pixels) {
    ORU_GL(BindTexture, texture.target(), texture.objectID());
    ORU_GL(TexSubImage2D, texture.target(), level, 0, 0, GLsizei(width), GLsizei(height), GL_RGBA,
           GL_UNSIGNED_BYTE, pixels.data());
}

/// And out of any texture.
Pixels Download(OGL::Object const &texture, int level, std::size_t bytes) {
    Pixels pixels(bytes);
    ORU_GL(BindTexture, texture.target(), texture.objectID());
    ORU_GL(GetTexImage, texture.target(), level, GL_RGBA, GL_UNSIGNED_BYTE, pixels.data());
    return pixels;
}

Pixels Inverted(Pixels pixels) {
    for (unsigned char &value : pixels)
        value = static_cast<unsigned char>(255 - value);
    return pixels;
}

} // namespace

TEST_F(SharingTest, BuffersGoThereAndBack) {
    std::vector<cl_uint> values = Counting<cl_uint>(3001), read(3001);
    std::size_t const bytes = values.size() * sizeof values[0];
    OGL::Buffer glBuffer(std::int64_t(bytes), OGL::Buffer::TYPE_ARRAY_BUFFER,
                         OGL::Buffer::USAGE_DYNAMIC_DRAW, values.data());
    Buffer const buffer(context, both, glBuffer);
    EXPECT_EQ(bytes, Get<std::size_t>(buffer, Memory::MEMORYINFO_SIZE));
    Program const program = build("kernel void f(global uint *v) { size_t i = get_global_id(0);"
                                  "v[i] = v[i] * 3 + 1; }");
    Kernel const kernel = KernelOf(program, "f", buffer);
    auto const launch = [&] { queue.enqueueKernel(kernel, Range<1>(values.size()), 0, 0); };
    EXPECT_THROWN("CL_INVALID_OPERATION", launch());
    queue.enqueueAcquireGLObjects({buffer});
    launch();
    queue.enqueueReleaseGLObjects({buffer}).wait();
    EXPECT_THROWN("CL_INVALID_OPERATION", launch());

    glBuffer.bind();
    glBuffer.getSubData(0, std::int64_t(bytes), read.data());
    for (cl_uint &value : values)
        value = value * 3 + 1;
    EXPECT_EQ(values, read);
}

TEST_F(SharingTest, ImagesGoThereAndBack) {
    // Through every kind of 2-D image, while another context of the share group is current.
    std::size_t const width = 20, height = 12, bytes = width * height * 4;
    Pixels const pattern = Pattern(bytes, 3), whole = Pattern(bytes * 4, 9);
    OGL::Texture2D texture(RGBA8, width * 2, height * 2, true), last(RGBA8, width, height, false);
    OGL::TextureRECT rectangle(RGBA8, width, height);
    OGL::Renderbuffer renderbuffer(GL_RGBA8, int(width), int(height));
    Upload(texture, 0, width * 2, height * 2, whole);
    Upload(texture, 1, width, height, pattern);
    ORU_GL0(Finish);
    OGL::ContextOffscreen const sibling(glContext.get());
    sibling.makeCurrent();
    Image2D const images[] = {
        Image2D(context, reads, texture, 1), Image2D(context, both, rectangle, 0),
        Image2D(context, both, renderbuffer), Image2D(context, writes, last, 0)};
    EXPECT_EQ(cl_mem_flags(CL_MEM_WRITE_ONLY),
              Get<cl_mem_flags>(images[3], Memory::MEMORYINFO_FLAGS));
    Program const program = build(R"(
constant sampler_t plain = CLK_NORMALIZED_COORDS_FALSE | CLK_ADDRESS_NONE | CLK_FILTER_NEAREST;
kernel void invert(read_only image2d_t source, write_only image2d_t target) {
    int2 at = (int2)(get_global_id(0), get_global_id(1));
    write_imagef(target, at, 1 - read_imagef(source, plain, at));
})");
    Kernel invert = program.kernel("invert");
    for (int i = 0; i < 3; ++i) {
        std::vector<Memory> const pair = {images[i], images[i + 1]};
        invert.setArg(0, images[i]);
        invert.setArg(1, images[i + 1]);
        Event const acquired = queue.enqueueAcquireGLObjects(pair);
        Event const done = queue.enqueueKernel(invert, Range<2>(width, height), 0, 0, {acquired});
        queue.enqueueReleaseGLObjects(pair, {done}).wait();
    }
    EXPECT_EQ(sibling.renderContext(), OGL::Context::CurrentContext());
    EXPECT_EQ(Inverted(pattern), Download(rectangle, 0, bytes));
    EXPECT_EQ(Inverted(pattern), Download(last, 0, bytes));
    EXPECT_EQ(pattern, Download(texture, 1, bytes));
    EXPECT_EQ(whole, Download(texture, 0, bytes * 4));
    glContext->makeCurrent();
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

TEST_F(SharingTest, WhatCannotBeSharedIsRefused) {
    OGL::Texture2D texture(RGBA8, 8, 8, true);
    OGL::Texture2D rgb(OGL::Texture::INTERNALFORMAT_RGB8, 8, 8, false);
    Context const alone = makeContext();
    CommandQueue other(alone, device(), false, false);
    Buffer const plain(context, reads, false, 16);
    Image2D const image(context, Memory::MemoryAccessFlags(7), texture, 3);
    EXPECT_THROWN("CL_INVALID_CONTEXT", Image2D(alone, reads, texture, 0));
    EXPECT_THROWN("CL_INVALID_MIP_LEVEL", Image2D(context, reads, texture, 4));
    EXPECT_THROWN("CL_INVALID_IMAGE_FORMAT_DESCRIPTOR", Image2D(context, reads, rgb, 0));
    EXPECT_THROWN("CL_INVALID_CONTEXT", other.enqueueAcquireGLObjects({image}));
    EXPECT_THROWN("CL_INVALID_GL_OBJECT", queue.enqueueAcquireGLObjects({plain}));
    EXPECT_THROWN("CL_INVALID_OPERATION", queue.enqueueReleaseGLObjects({image}));

    // A level of another size is another object, and a name that is gone is none.
    ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
    ORU_GL(TexImage2D, GL_TEXTURE_2D, 3, GL_RGBA8, 16, 16, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    EXPECT_THROWN("CL_INVALID_GL_OBJECT", queue.enqueueAcquireGLObjects({image}));
    GLuint const name = texture.objectID();
    ORU_GL(DeleteTextures, 1, &name);
    EXPECT_THROWN("CL_INVALID_GL_OBJECT", Image2D(context, reads, texture, 0));
}

TEST_F(SharingTest, TheOpenGLContextMayGoFirst) {
    OGL::Renderbuffer renderbuffer(GL_RGBA8, 8, 8);
    Image2D const image(context, both, renderbuffer);
    ContextProperties const properties = propertiesToShare();
    glContext.reset();
    EXPECT_THROWN("CL_INVALID_GL_OBJECT", queue.enqueueAcquireGLObjects({image}));

    // Neither can a new OpenCL context share with it; the callback is told why.
    std::string reason;
    auto const notify = [](char const *text, void const *, std::size_t, void *data) {
        *static_cast<std::string *>(data) = text;
    };
    EXPECT_THROWN("UNKNOWN CL ERROR CODE", Context(properties, device(), {notify, &reason}));
    EXPECT_FALSE(reason.empty());
}
