// The code of the chapter on tracing.
#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/openglforwarder.h"
#include "oru/oru_ogl/extensionator/opengltracer.h"
#include "oru/oru_ogl/extensionator/wgl/wglforwarder.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <regex>
#include <sstream>
#include <string>

using namespace ORU::OGL;

namespace {

// [meter]
class UploadMeter : public OpenGLForwarder {
public:
    long long texels = 0;

    void cgmTexSubImage2D(char const *file, unsigned int line, GLenum target, GLint level, GLint x,
                          GLint y, GLsizei width, GLsizei height, GLenum format, GLenum type,
                          GLvoid const *pixels) override {
        texels += static_cast<long long>(width) * height;
        OpenGLForwarder::cgmTexSubImage2D(file, line, target, level, x, y, width, height, format,
                                          type, pixels);
    }
};
// [meter]

// [fault]
class NoTextureMemory : public OpenGLForwarder {
public:
    void cgmTexImage2D(char const *file, unsigned int line, GLenum, GLint, GLint, GLsizei, GLsizei,
                       GLint, GLenum, GLenum, GLvoid const *) override {
        throw ExceptionOGL(file, line, "GL_OUT_OF_MEMORY", GL_OUT_OF_MEMORY);
    }
};
// [fault]

// [switches]
class SwitchCounter : public WGLForwarder {
public:
    int switches = 0;

    BOOL wcgmMakeCurrent(char const *file, unsigned int line, HDC dc, HGLRC context) override {
        ++switches;
        return WGLForwarder::wcgmMakeCurrent(file, line, dc, context);
    }
};
// [switches]

class TracingGuide : public ::testing::Test {
protected:
    TracingGuide() { context_.makeCurrent(); }

    AutoInitializer library_;
    ContextOffscreen context_;
};

} // namespace

TEST_F(TracingGuide, WritesALineForEachCall) {
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 16, 16, false);
    // [tracer]
    std::ostringstream trace; // or a file
    {
        InterceptorScope<OpenGLTracer> const tracer(trace);
        TextureUnit::Unit(0)->bind(&texture);
        trace << "-- the viewport\n"; // a line of the host's own
        ORU_GL(Viewport, 0, 0, 320, 240);
        ORU_GL(ClearColor, 0.5f, 0.f, 0.f, 1.f);
    }
    // [tracer]
    std::regex const expected(R"(\S+textureunit.cpp:\d+: glBindTexture\(GL_TEXTURE_2D, \d+\)
-- the viewport
\S+tracing.cpp:\d+: glViewport\(0, 0, 320, 240\)
\S+tracing.cpp:\d+: glClearColor\(makeFloat\(1056964608\) /\* 0.5 \*/, (.+, ){2}.+\)
)");
    EXPECT_TRUE(std::regex_match(trace.str(), expected)) << trace.str();
}

TEST_F(TracingGuide, Measures) {
    unsigned char const pixels[16 * 8 * 4] = {};
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 16, 16, false);
    TextureUnit::Unit(0)->bind(&texture);
    // [measure]
    InterceptorScope<UploadMeter> const meter;
    texture.subImage(0, 0, 0, 16, 8, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, pixels,
                     PixelUnpackParameters());
    EXPECT_EQ(16 * 8, meter->texels);
    // [measure]
}

TEST_F(TracingGuide, MakesCallsFail) {
    // [no-memory]
    InterceptorScope<NoTextureMemory> const fault;
    EXPECT_THROW(Texture2D(Texture::INTERNALFORMAT_RGBA8, 16, 16, false), ExceptionOGL);
    // [no-memory]
}

TEST_F(TracingGuide, SeesContextsChange) {
    // [count-switches]
    InterceptorScope<SwitchCounter> const counter;
    context_.makeCurrent();
    EXPECT_EQ(1, counter->switches);
    // [count-switches]
}
