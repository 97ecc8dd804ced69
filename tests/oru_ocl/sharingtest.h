// What tests of shared objects use: both layers open, a context of each, and ways to look at
// pixels.
#pragma once

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "tests/oru_ocl/computetest.h"
#include "tests/oru_ogl/glfixture.h"

#include <memory>
#include <vector>

namespace oru_test {

namespace OGL = ORU::OGL;

/// An OpenGL context, current, and an OpenCL context with a queue that shares its objects.
class SharingTest : public ComputeTest {
protected:
    using Pixels = std::vector<unsigned char>;

    SharingTest()
        : glContext(std::make_unique<OGL::ContextOffscreen>()), context(Share(*glContext)),
          queue(context, device(), false, false) {
        glContext->makeCurrent();
    }

    void TearDown() override {
        if (OGL::Context::CurrentContext()) {
            EXPECT_EQ(GLenum(GL_NO_ERROR), ::glGetError());
        }
        EXPECT_EQ(2u, runtime()->liveHandles());
    }

    static ORU::OCL::Context Share(OGL::Context const &glContext) {
        ORU::OCL::ContextProperties properties(platform());
        properties.setSharedRenderContext(glContext.renderContext());
        properties.setDisplayContext(glContext.deviceContext());
        return ORU::OCL::Context(properties, device());
    }

    /// Bytes that differ from pixel to pixel and from channel to channel.
    static Pixels Pattern(std::size_t bytes, unsigned int seed) {
        Pixels pixels(bytes);
        for (std::size_t i = 0; i < bytes; ++i)
            pixels[i] = static_cast<unsigned char>(i * 37 + i / 251 + seed);
        return pixels;
    }

    /// RGBA bytes into a level of a 2-D or rectangle texture, and out again.
    static void Upload(OGL::Texture2 const &texture, int level, Pixels const &pixels) {
        ORU_GL(BindTexture, texture.target(), texture.objectID());
        auto const size = [&](GLenum query) {
            GLint value = 0;
            ORU_GL(GetTexLevelParameteriv, texture.target(), level, query, &value);
            return value;
        };
        ORU_GL(TexSubImage2D, texture.target(), level, 0, 0, size(GL_TEXTURE_WIDTH),
               size(GL_TEXTURE_HEIGHT), GL_RGBA, GL_UNSIGNED_BYTE, pixels.data());
    }

    static Pixels Download(OGL::Object const &texture, int level, std::size_t bytes) {
        Pixels pixels(bytes);
        ORU_GL(BindTexture, texture.target(), texture.objectID());
        ORU_GL(GetTexImage, texture.target(), level, GL_RGBA, GL_UNSIGNED_BYTE, pixels.data());
        return pixels;
    }

    /// RGBA8 pixels of a row order turned left to right.
    static Pixels Mirrored(Pixels const &pixels, std::size_t width) {
        Pixels result(pixels.size());
        for (std::size_t i = 0; i < pixels.size() / 4; ++i) {
            std::size_t const from = i / width * width + (width - 1 - i % width);
            std::copy_n(pixels.begin() + std::ptrdiff_t(4 * from), 4,
                        result.begin() + std::ptrdiff_t(4 * i));
        }
        return result;
    }

    /// Mirrors one image into another by a kernel, both acquired for it.
    void mirror(ORU::OCL::Image2D const &source, ORU::OCL::Image2D const &target, std::size_t width,
                std::size_t height) {
        ORU::OCL::Program program(context, R"(
constant sampler_t plain = CLK_NORMALIZED_COORDS_FALSE | CLK_ADDRESS_NONE | CLK_FILTER_NEAREST;
kernel void mirror(read_only image2d_t source, write_only image2d_t target) {
    int2 at = (int2)(get_global_id(0), get_global_id(1));
    int2 from = (int2)(get_global_size(0) - 1 - at.x, at.y);
    write_imagef(target, at, read_imagef(source, plain, from));
})");
        program.build("");
        ORU::OCL::Kernel kernel = program.kernel("mirror");
        kernel.setArg(0, source);
        kernel.setArg(1, target);
        ORU_GL0(Finish);
        ORU::OCL::Event const acquired = queue.enqueueAcquireGLObjects({source, target});
        ORU::OCL::Event const done =
            queue.enqueueKernel(kernel, ORU::OCL::Range<2>(width, height), 0, 0, {acquired});
        queue.enqueueReleaseGLObjects({source, target}, {done}).wait();
    }

private:
    OGL::AutoInitializer library_;

protected:
    std::unique_ptr<OGL::ContextOffscreen> glContext;
    ORU::OCL::Context context;
    ORU::OCL::CommandQueue queue;
};

} // namespace oru_test
