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

/// An OpenGL context, current. A base, so that it is there before the OpenCL context.
class WithGLContext {
protected:
    WithGLContext() { glContext->makeCurrent(); }

private:
    OGL::AutoInitializer library_;

protected:
    std::unique_ptr<OGL::ContextOffscreen> glContext = std::make_unique<OGL::ContextOffscreen>();
};

/// An OpenCL context that shares the objects of the current OpenGL context.
class SharingTest : protected WithGLContext, public QueueTest {
protected:
    using Pixels = std::vector<unsigned char>;

    SharingTest() : QueueTest(ORU::OCL::Context(propertiesToShare(), device())) {}

    void TearDown() override {
        if (OGL::Context::CurrentContext()) {
            EXPECT_EQ(GLenum(GL_NO_ERROR), ::glGetError());
        }
    }

    ORU::OCL::ContextProperties propertiesToShare() const {
        ORU::OCL::ContextProperties properties(platform());
        properties.setSharedRenderContext(glContext->renderContext());
        properties.setDisplayContext(glContext->deviceContext());
        return properties;
    }

    /// Bytes that differ from pixel to pixel and from channel to channel.
    static Pixels Pattern(std::size_t bytes, std::size_t seed) {
        Pixels pixels(bytes);
        for (std::size_t i = 0; i < bytes; ++i)
            pixels[i] = static_cast<unsigned char>(i * 37 + i / 251 + seed);
        return pixels;
    }

    /// RGBA bytes into a level of a 2-D or rectangle texture.
    static void Upload(OGL::Texture2 const &texture, int level, std::size_t width,
                       std::size_t height, Pixels const &pixels) {
        ORU_GL(BindTexture, texture.target(), texture.objectID());
        ORU_GL(TexSubImage2D, texture.target(), level, 0, 0, GLsizei(width), GLsizei(height),
               GL_RGBA, GL_UNSIGNED_BYTE, pixels.data());
    }

    /// And out of any texture.
    static Pixels Download(OGL::Object const &texture, int level, std::size_t bytes) {
        Pixels pixels(bytes);
        ORU_GL(BindTexture, texture.target(), texture.objectID());
        ORU_GL(GetTexImage, texture.target(), level, GL_RGBA, GL_UNSIGNED_BYTE, pixels.data());
        return pixels;
    }

    static Pixels Inverted(Pixels pixels) {
        for (unsigned char &value : pixels)
            value = static_cast<unsigned char>(255 - value);
        return pixels;
    }

    /// Inverts one image into another by a kernel, both acquired for it.
    void invert(ORU::OCL::Image2D const &source, ORU::OCL::Image2D const &target, std::size_t width,
                std::size_t height) {
        ORU::OCL::Program const program = build(R"(
constant sampler_t plain = CLK_NORMALIZED_COORDS_FALSE | CLK_ADDRESS_NONE | CLK_FILTER_NEAREST;
kernel void invert(read_only image2d_t source, write_only image2d_t target) {
    int2 at = (int2)(get_global_id(0), get_global_id(1));
    write_imagef(target, at, 1 - read_imagef(source, plain, at));
})");
        ORU::OCL::Kernel kernel = KernelOf(program, "invert", source);
        kernel.setArg(1, target);
        ORU_GL0(Finish);
        ORU::OCL::Event const acquired = queue.enqueueAcquireGLObjects({source, target});
        ORU::OCL::Event const done =
            queue.enqueueKernel(kernel, ORU::OCL::Range<2>(width, height), 0, 0, {acquired});
        queue.enqueueReleaseGLObjects({source, target}, {done}).wait();
    }
};

} // namespace oru_test
