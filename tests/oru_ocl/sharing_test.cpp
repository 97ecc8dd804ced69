// OpenCL memory over OpenGL objects: what one writes, the other reads.
#include "tests/oru_ocl/sharingtest.h"

using namespace ORU::OCL;
using namespace oru_test;

namespace {

using GLTexture = OGL::Texture;
constexpr auto RGBA8 = GLTexture::INTERNALFORMAT_RGBA8;

cl_GLenum TargetOf(Memory const &memory) {
    cl_GLenum target = 0;
    ExtensionManager::instance()->table().clGetGLTextureInfo(memory.id(), CL_GL_TEXTURE_TARGET,
                                                             sizeof target, &target, nullptr);
    return target;
}

/// A framebuffer with one renderbuffer, bound for a scope.
class BoundRenderbuffer {
public:
    explicit BoundRenderbuffer(OGL::Renderbuffer const &renderbuffer) {
        ORU_GL(GenFramebuffers, 1, &name_);
        ORU_GL(BindFramebuffer, GL_FRAMEBUFFER, name_);
        ORU_GL(FramebufferRenderbuffer, GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_RENDERBUFFER,
               renderbuffer.objectID());
    }
    ~BoundRenderbuffer() {
        ORU_GL(BindFramebuffer, GL_FRAMEBUFFER, 0);
        ORU_GL(DeleteFramebuffers, 1, &name_);
    }
    BoundRenderbuffer(BoundRenderbuffer const &) = delete;
    BoundRenderbuffer &operator=(BoundRenderbuffer const &) = delete;

private:
    GLuint name_ = 0;
};

} // namespace

TEST_F(SharingTest, BuffersGoThereAndBack) {
    std::vector<cl_uint> values = Counting<cl_uint>(3001);
    std::size_t const bytes = values.size() * sizeof values[0];
    OGL::Buffer glBuffer(std::int64_t(bytes), OGL::Buffer::TYPE_ARRAY_BUFFER,
                         OGL::Buffer::USAGE_DYNAMIC_DRAW, values.data());
    Buffer const buffer(context, Memory::MEMORY_READ_WRITE, glBuffer);
    std::size_t size = 0;
    buffer.getInfo(Memory::MEMORYINFO_SIZE, sizeof size, &size, nullptr);
    EXPECT_EQ(bytes, size);

    Program program(context, "kernel void f(global uint *v) { size_t i = get_global_id(0);"
                             "v[i] = v[i] * 3 + 1; }");
    program.build("");
    Kernel kernel = program.kernel("f");
    kernel.setArg(0, buffer);
    Event const acquired = queue.enqueueAcquireGLObjects({buffer});
    EXPECT_EQ(unsigned(CL_COMMAND_ACQUIRE_GL_OBJECTS), acquired.commandType());
    queue.enqueueKernel(kernel, Range<1>(values.size()), 0, 0);
    Event released = queue.enqueueReleaseGLObjects({buffer});
    released.wait();
    EXPECT_EQ(unsigned(CL_COMMAND_RELEASE_GL_OBJECTS), released.commandType());

    std::vector<cl_uint> read(values.size());
    glBuffer.bind();
    glBuffer.getSubData(0, std::int64_t(bytes), read.data());
    for (cl_uint &value : values)
        value = value * 3 + 1;
    EXPECT_EQ(values, read);
}

TEST_F(SharingTest, TexturesGoThereAndBackOnEveryLevel) {
    std::size_t const width = 20, height = 12;
    OGL::Texture2D source(RGBA8, width, height, true), target(RGBA8, width, height, true);
    for (int level = 0; level < 3; ++level) {
        std::size_t const bytes = (width >> level) * (height >> level) * 4;
        Upload(source, level, Pattern(bytes, unsigned(level)));
        Upload(target, level, Pattern(bytes, 100));
    }
    for (int level = 1; level < 3; ++level) {
        std::size_t const w = width >> level, h = height >> level;
        mirror(Image2D(context, Memory::MEMORY_READ_ONLY, source, unsigned(level)),
               Image2D(context, Memory::MEMORY_WRITE_ONLY, target, unsigned(level)), w, h);
        EXPECT_EQ(Mirrored(Pattern(w * h * 4, unsigned(level)), w),
                  Download(target, level, w * h * 4));
        EXPECT_EQ(Pattern(w * h * 4, unsigned(level)), Download(source, level, w * h * 4));
    }
    // The level that nobody shared is as it was.
    EXPECT_EQ(Pattern(width * height * 4, 100), Download(target, 0, width * height * 4));
}

TEST_F(SharingTest, RectangleTexturesAndRenderbuffersGoThereAndBack) {
    std::size_t const width = 19, height = 7, bytes = width * height * 4;
    OGL::TextureRECT rectangle(RGBA8, width, height);
    Upload(rectangle, 0, Pattern(bytes, 3));
    OGL::Renderbuffer renderbuffer(GL_RGBA8, int(width), int(height));
    OGL::Texture2D back(RGBA8, width, height, false);

    Image2D const source(context, Memory::MEMORY_READ_ONLY, rectangle, 0);
    EXPECT_EQ(0x84F5u, TargetOf(source));
    Image2D const target(context, Memory::MEMORY_READ_WRITE, renderbuffer);
    mirror(source, target, width, height);
    {
        BoundRenderbuffer const bound(renderbuffer);
        Pixels read(bytes);
        ORU_GL(ReadPixels, 0, 0, GLsizei(width), GLsizei(height), GL_RGBA, GL_UNSIGNED_BYTE,
               read.data());
        EXPECT_EQ(Mirrored(Pattern(bytes, 3), width), read);
        // What OpenGL draws into the renderbuffer arrives too.
        ORU_GL(ClearColor, 0.2f, 0.4f, 0.6f, 0.8f);
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    }
    mirror(target, Image2D(context, Memory::MEMORY_WRITE_ONLY, back, 0), width, height);
    Pixels cleared;
    for (std::size_t i = 0; i < width * height; ++i)
        cleared.insert(cleared.end(), {51, 102, 153, 204});
    EXPECT_EQ(cleared, Download(back, 0, bytes));
}

TEST_F(SharingTest, VolumesGoThereAndBack) {
    std::size_t const width = 6, height = 5, depth = 4, bytes = width * height * depth * 4;
    OGL::Texture3D texture(RGBA8, width, height, depth, false);
    Pixels const before = Pattern(bytes, 1), after = Pattern(bytes, 50);
    ORU_GL(BindTexture, GL_TEXTURE_3D, texture.objectID());
    ORU_GL(TexSubImage3D, GL_TEXTURE_3D, 0, 0, 0, 0, GLsizei(width), GLsizei(height),
           GLsizei(depth), GL_RGBA, GL_UNSIGNED_BYTE, before.data());

    Image3D const image(context, Memory::MEMORY_READ_WRITE, texture, 0);
    EXPECT_EQ(Memory::MEMORYOBJECTTYPE_IMAGE3D, image.memType());
    EXPECT_EQ(GLenum(GL_TEXTURE_3D), TargetOf(image));
    queue.enqueueAcquireGLObjects({image});
    FunctionTable const &cl = ExtensionManager::instance()->table();
    std::size_t const origin[3] = {}, region[3] = {width, height, depth};
    Pixels read(bytes);
    EXPECT_EQ(CL_SUCCESS, cl.clEnqueueReadImage(queue.id(), image.id(), CL_TRUE, origin, region, 0,
                                                0, read.data(), 0, nullptr, nullptr));
    EXPECT_EQ(before, read);
    EXPECT_EQ(CL_SUCCESS, cl.clEnqueueWriteImage(queue.id(), image.id(), CL_TRUE, origin, region, 0,
                                                 0, after.data(), 0, nullptr, nullptr));
    queue.enqueueReleaseGLObjects({image}).wait();
    EXPECT_EQ(after, Download(texture, 0, bytes));
}

TEST_F(SharingTest, OnlyTheAccessGoesIntoTheFlags) {
    OGL::Texture2D texture(RGBA8, 4, 4, false);
    cl_mem_flags const flags[] = {CL_MEM_READ_ONLY, CL_MEM_WRITE_ONLY, CL_MEM_READ_WRITE};
    for (int access = 0; access < 3; ++access) {
        Image2D const image(context, Memory::MemoryAccessFlags(access), texture, 0);
        cl_mem_flags value = 0;
        image.getInfo(Memory::MEMORYINFO_FLAGS, sizeof value, &value, nullptr);
        EXPECT_EQ(flags[access], value);
        EXPECT_EQ(GLenum(GL_TEXTURE_2D), TargetOf(image));
    }
    Image2D const any(context, Memory::MemoryAccessFlags(7), texture, 0);
}

TEST_F(SharingTest, ObjectsAreUsedOnlyWhileAcquired) {
    std::vector<int> values = Counting<int>(8);
    OGL::Buffer glBuffer(32, OGL::Buffer::TYPE_ARRAY_BUFFER, OGL::Buffer::USAGE_DYNAMIC_DRAW,
                         values.data());
    Buffer const buffer(context, Memory::MEMORY_READ_WRITE, glBuffer);
    Program program(context, "kernel void f(global int *v) { v[get_global_id(0)] = 0; }");
    program.build("");
    Kernel kernel = program.kernel("f");
    kernel.setArg(0, buffer);
    auto const launch = [&] { queue.enqueueKernel(kernel, Range<1>(8), 0, 0); };
    auto const read = [&] { queue.enqueueBlockingRead(buffer, 0, 32, values.data()); };

    EXPECT_EQ(CL_INVALID_OPERATION, ErrorCode(launch));
    EXPECT_EQ(CL_INVALID_OPERATION, ErrorCode(read));
    EXPECT_EQ(CL_INVALID_OPERATION, ErrorCode([&] { queue.enqueueReleaseGLObjects({buffer}); }));
    queue.enqueueAcquireGLObjects({buffer});
    EXPECT_EQ(CL_SUCCESS, ErrorCode(launch));
    EXPECT_EQ(CL_SUCCESS, ErrorCode(read));
    queue.enqueueReleaseGLObjects({buffer});
    EXPECT_EQ(CL_INVALID_OPERATION, ErrorCode(launch));
}

TEST_F(SharingTest, WhatCannotBeSharedIsRefused) {
    OGL::Texture2D texture(RGBA8, 8, 8, true);
    OGL::Texture2D rgb(GLTexture::INTERNALFORMAT_RGB8, 8, 8, false);
    OGL::Buffer glBuffer(16, OGL::Buffer::TYPE_ARRAY_BUFFER, OGL::Buffer::USAGE_STATIC_DRAW,
                         nullptr);
    auto const share = [this](auto &&...arguments) {
        return ErrorCode([&] { Image2D(context, Memory::MEMORY_READ_ONLY, arguments...); });
    };
    EXPECT_EQ(CL_SUCCESS, share(texture, 3u));
    EXPECT_EQ(CL_INVALID_MIP_LEVEL, share(texture, 4u));
    EXPECT_EQ(CL_INVALID_IMAGE_FORMAT_DESCRIPTOR, share(rgb, 0u));

    Context const alone = makeContext();
    EXPECT_EQ(CL_INVALID_CONTEXT,
              ErrorCode([&] { Buffer(alone, Memory::MEMORY_READ_ONLY, glBuffer); }));
    CommandQueue other(alone, device(), false, false);
    Buffer const shared(context, Memory::MEMORY_READ_ONLY, glBuffer);
    EXPECT_EQ(CL_INVALID_CONTEXT, ErrorCode([&] { other.enqueueAcquireGLObjects({shared}); }));
    Buffer const plain(context, Memory::MEMORY_READ_ONLY, false, 16);
    EXPECT_EQ(CL_INVALID_GL_OBJECT, ErrorCode([&] { queue.enqueueAcquireGLObjects({plain}); }));

    // The buffer's name is gone, and with it what there is to share.
    GLuint const name = glBuffer.objectID();
    ORU_GL(DeleteBuffers, 1, &name);
    EXPECT_EQ(CL_INVALID_GL_OBJECT, ErrorCode([&] { queue.enqueueAcquireGLObjects({shared}); }));
    EXPECT_EQ(CL_INVALID_GL_OBJECT,
              ErrorCode([&] { Buffer(context, Memory::MEMORY_READ_ONLY, glBuffer); }));
}

TEST_F(SharingTest, AResizedTextureIsNoLongerShared) {
    OGL::Texture2D texture(RGBA8, 8, 8, false);
    Image2D const image(context, Memory::MEMORY_READ_WRITE, texture, 0);
    queue.enqueueAcquireGLObjects({image});
    queue.enqueueReleaseGLObjects({image}).wait();
    ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
    ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, GL_RGBA8, 16, 16, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    EXPECT_EQ(CL_INVALID_GL_OBJECT, ErrorCode([&] { queue.enqueueAcquireGLObjects({image}); }));
    Image2D const again(context, Memory::MEMORY_READ_WRITE, texture, 0);
    queue.enqueueAcquireGLObjects({again});
    queue.enqueueReleaseGLObjects({again}).wait();
}

TEST_F(SharingTest, TheOpenGLContextMayGoFirst) {
    auto texture = std::make_unique<OGL::Texture2D>(RGBA8, 8, 8, false);
    Image2D const image(context, Memory::MEMORY_READ_WRITE, *texture, 0);
    queue.enqueueAcquireGLObjects({image});
    texture.reset();
    cl_context const before = context.id();
    OGL::ContextOffscreen const *const gone = glContext.get();
    HGLRC const handle = gone->renderContext();
    HDC const dc = gone->deviceContext();
    glContext.reset();
    EXPECT_EQ(CL_INVALID_GL_OBJECT, ErrorCode([&] { queue.enqueueReleaseGLObjects({image}); }));
    EXPECT_EQ(before, context.id());

    // Neither can a new OpenCL context share with it; the callback is told why.
    ContextProperties properties(platform());
    properties.setSharedRenderContext(handle);
    properties.setDisplayContext(dc);
    std::string reason;
    Context::NotifyCallback const callback(
        [](char const *text, void const *, std::size_t, void *data) {
            *static_cast<std::string *>(data) = text;
        },
        &reason);
    EXPECT_EQ(-1000, ErrorCode([&] { Context(properties, device(), callback); }));
    EXPECT_FALSE(reason.empty());
}

TEST_F(SharingTest, AnotherContextOfTheShareGroupMayBeCurrent) {
    OGL::ContextOffscreen const sibling(glContext.get());
    std::size_t const width = 9, height = 4, bytes = width * height * 4;
    OGL::Texture2D source(RGBA8, width, height, false), target(RGBA8, width, height, false);
    Upload(source, 0, Pattern(bytes, 9));
    ORU_GL0(Finish);
    sibling.makeCurrent();
    mirror(Image2D(context, Memory::MEMORY_READ_ONLY, source, 0),
           Image2D(context, Memory::MEMORY_WRITE_ONLY, target, 0), width, height);
    EXPECT_EQ(sibling.renderContext(), OGL::Context::CurrentContext());
    EXPECT_EQ(Mirrored(Pattern(bytes, 9), width), Download(target, 0, bytes));
    glContext->makeCurrent();
}
