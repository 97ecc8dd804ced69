// OpenCL memory over OpenGL objects.
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "tests/support/computetest.h"

using namespace ORU::OCL;
using namespace oru_test;

TEST_F(SharingTest, TheRuntimeIsToldTheObject) {
    auto const format = OGL::Texture::INTERNALFORMAT_RGBA8;
    OGL::Buffer buffer(64, OGL::Buffer::TYPE_ARRAY_BUFFER, OGL::Buffer::USAGE_STATIC_DRAW, nullptr);
    OGL::Texture2D texture(format, 8, 8, true);
    OGL::TextureRECT rectangle(format, 8, 8);
    OGL::Texture3D volume(format, 8, 8, 8, true);
    OGL::Renderbuffer renderbuffer(GL_RGBA8, 8, 8);
    // Of an access that is none the runtime is told nothing.
    cl_mem_flags const flags[] = {CL_MEM_READ_ONLY, CL_MEM_WRITE_ONLY, CL_MEM_READ_WRITE, 0};
    for (int i = 0; i < 4; ++i) {
        auto const access = Memory::MemoryAccessFlags(i);
        auto const passes = [&](Memory const &, char const *entryPoint, auto... object) {
            EXPECT_EQ(TextOf(context.id(), flags[i], object...), runtime->arguments(entryPoint));
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
