// OpenCL memory over OpenGL objects.
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "tests/support/computetest.h"

#include <functional>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

constexpr auto RGBA8 = OGL::Texture::INTERNALFORMAT_RGBA8;

} // namespace

TEST_F(SharingTest, TheRuntimeIsToldTheObject) {
    OGL::Buffer buffer(64, OGL::Buffer::TYPE_ARRAY_BUFFER, OGL::Buffer::USAGE_STATIC_DRAW, nullptr);
    OGL::Texture2D texture(RGBA8, 8, 8, true);
    OGL::TextureRECT rectangle(RGBA8, 8, 8);
    OGL::Texture3D volume(RGBA8, 8, 8, 8, true);
    OGL::Renderbuffer renderbuffer(GL_RGBA8, 8, 8);
    // Of an access that is none the runtime is told nothing.
    cl_mem_flags const flags[] = {CL_MEM_READ_ONLY, CL_MEM_WRITE_ONLY, CL_MEM_READ_WRITE, 0};
    for (int i = 0; i < 4; ++i) {
        auto const access = Memory::MemoryAccessFlags(i);
        auto const passes = [&](Memory const &, char const *entryPoint, auto... object) {
            EXPECT_EQ(TextOf(context.id(), flags[i], object...), runtime()->arguments(entryPoint));
        };
        passes(Buffer(context, access, buffer), "clCreateFromGLBuffer", buffer.objectID());
        passes(Image2D(context, access, texture, 2), "clCreateFromGLTexture2D", GL_TEXTURE_2D, 2,
               texture.objectID());
        passes(Image2D(context, access, rectangle, 0), "clCreateFromGLTexture2D",
               GL_TEXTURE_RECTANGLE, 0, rectangle.objectID());
        passes(Image2D(context, access, renderbuffer), "clCreateFromGLRenderbuffer",
               renderbuffer.objectID());
        passes(Image3D(context, access, volume, 3), "clCreateFromGLTexture3D", GL_TEXTURE_3D, 3,
               volume.objectID());
    }
}

TEST_F(SharingTest, BufferAndTextureGoThereAndBack) {
    std::vector<unsigned char> values = Counting<unsigned char>(4 * 4 * 4), read(values.size());
    auto const bytes = std::int64_t(values.size());
    OGL::Buffer glBuffer(bytes, OGL::Buffer::TYPE_ARRAY_BUFFER, OGL::Buffer::USAGE_DYNAMIC_DRAW,
                         values.data());
    OGL::Texture2D texture(RGBA8, 8, 8, true);
    Buffer const buffer(context, reads, glBuffer);
    Image2D const image(context, writes, texture, 1);
    Program const program = build(R"(
kernel void copy(global uchar4 *from, write_only image2d_t to) {
    int2 at = (int2)(get_global_id(0), get_global_id(1));
    write_imagef(to, at, convert_float4(from[4 * at.y + at.x]) / 255);
})");
    Kernel copy = KernelOf(program, "copy", buffer);
    copy.setArg(1, image);
    queue.enqueueAcquireGLObjects({buffer, image});
    queue.enqueueKernel(copy, Range<2>(4, 4), 0, 0);
    queue.enqueueReleaseGLObjects({buffer, image}).wait();
    ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
    ORU_GL(GetTexImage, GL_TEXTURE_2D, 1, GL_RGBA, GL_UNSIGNED_BYTE, read.data());
    EXPECT_EQ(values, read);
}

TEST_F(SharingTest, AContextThatCannotShareIsTold) {
    ContextProperties properties = propertiesToShare();
    properties.setSharedRenderContext(reinterpret_cast<HGLRC>(&properties));
    std::string reason;
    auto const notify = [](char const *text, void const *, std::size_t, void *data) {
        *static_cast<std::string *>(data) += text;
    };
    Context::NotifyCallback const callback(notify, &reason);
    std::string expected;
    for (auto const &make : std::vector<std::function<void()>>{
             [&] { Context(properties, device(), callback); },
             [&] { Context(properties, std::vector<Device>{device()}, callback); },
             [&] { Context(properties, Device::TYPE_ALL, callback); }}) {
        EXPECT_FAILURE("OCL Exception: UNKNOWN CL ERROR CODE", make());
        EXPECT_EQ(expected += "The OpenGL context is not current", reason);
    }
}
