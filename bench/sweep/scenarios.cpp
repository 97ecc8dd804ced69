// Uses of the library's classes.
#include "bench/sweep/scenarios.h"

#include "bench/sweep/faults.h"
#include "bench/sweep/opengl3.h"

#include "apps/develop/job.h"
#include "apps/develop/options.h"
#include "oru/core/utility/integerrect.h"
#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ocl/programocl.h"
#include "oru/oru_ocl/sampler.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/blendscope.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/linescope.h"
#include "oru/oru_ogl/ogl/mappedrange.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "oru/oru_ogl/ogl/texturebindscope.h"
#include "oru/oru_ogl/ogl/texturestate.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"
#include "oru/oru_ogl/platformgl.h"
#include "tests/support/testwindow.h"

#include <array>
#include <chrono>
#include <cstdio>
#include <stdexcept>

namespace sweep {

namespace {

using namespace ORU::OGL;
namespace CL = ORU::OCL;

constexpr auto kRGBA8 = Texture::INTERNALFORMAT_RGBA8;
constexpr auto kRGBA = Texture::FORMAT_RGBA;
constexpr auto kBytes = Texture::TYPE_UNSIGNED_BYTE;

void OffscreenContext() {
    ContextOffscreen context;
    context.makeCurrent();
    ContextOffscreen sharing(&context);
    sharing.makeCurrent();
    BeginEnd();
}

void WindowedContext() {
    oru_test::TestWindow const window(0);
    ContextWindowed context(window.hwnd(), BufferFormat::FORMAT_RGBA8_D24,
                            Context::BUFFERING_DOUBLE, Context::MULTISAMPLING_NONE, nullptr);
    context.makeCurrent();
    context.swapBuffers();
    BeginEnd();
}

void WrappedContext() {
    ContextWrapped const context;
    ScopedContextWrapper const scope;
    BeginEnd();
}

void Textures() {
    std::vector<unsigned char> pixels(1024);
    PixelUnpackParameters const plain;
    Texture1D line(kRGBA8, 8, true);
    TextureUnit::Unit(0)->bind(&line);
    line.setWrap(Texture::WRAPMODE_REPEAT);
    line.subImage(0, 0, 8, kRGBA, kBytes, pixels.data(), plain);
    line.copyTexSubImage(0, 0, 0, 0, 4);
    line.getPixelData(pixels.data(), 0, GL_RGBA, GL_UNSIGNED_BYTE);

    Texture2D picture(kRGBA8, 8, 8, true);
    TextureState::SetActiveTextureUnit(1);
    TextureUnit::Unit(1)->bind(&picture);
    picture.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
    float const border[4] = {};
    picture.setBorderColor(border);
    picture.setWrap(Texture::WRAPMODE_REPEAT, Texture::WRAPMODE_CLAMP_TO_EDGE);
    picture.subImage(0, 0, 0, 8, 8, kRGBA, kBytes, pixels.data(), plain);
    picture.generateMipmap();
    picture.copyTexSubImage(0, 0, 0, 0, 0, 4, 4);
    picture.getPixelData(pixels.data(), 0, kRGBA, kBytes, 1);
    Buffer buffer(256, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    picture.subImage(0, 0, 0, 8, 8, kRGBA, kBytes, &buffer, 0, plain);
    picture.getPixelData(&buffer, 0, 0, kRGBA, kBytes, 1);
    TextureUnit::Unit(1)->bind2DDefault();
    TextureState::SetActiveTextureUnit(0);

    Texture3D volume(kRGBA8, 8, 8, 4, false);
    TextureUnit::Unit(0)->bind(&volume);
    volume.setWrap(Texture::WRAPMODE_REPEAT, Texture::WRAPMODE_REPEAT, Texture::WRAPMODE_REPEAT);
    volume.subImage(0, 0, 0, 0, 8, 8, 4, kRGBA, kBytes, pixels.data(), plain);
    volume.getPixelData(pixels.data(), 0, kRGBA, kBytes, 1);
    Texture2DArray const layers(kRGBA8, 4, 4, 2, false);
    TextureRECT const rectangle(kRGBA8, 4, 4);
    Texture2DBindScope const scope(&picture, 0, true);
    BeginEnd();
}

void Buffers() {
    std::vector<unsigned char> bytes(64);
    Buffer buffer(64, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, bytes.data());
    buffer.bind();
    buffer.subData(0, 32, bytes.data());
    buffer.getSubData(0, 64, bytes.data());
    static_cast<void>(buffer.map(GL_READ_WRITE));
    buffer.unmap();
    Buffer::BindDefaultArrayBuffer();
    buffer.convertToElementArrayBuffer();
    buffer.bind();
    buffer.orphan();
    Buffer::BindDefaultElementArrayBuffer();
    Buffer other(64, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, bytes.data());
    buffer.copySubData(other, 0, 32, 32);
    buffer.bindRange(GL_UNIFORM_BUFFER, 0, 0, 64);
    buffer.bindBase(GL_UNIFORM_BUFFER, 1);
    Buffer::BindDefaultBase(GL_UNIFORM_BUFFER, 1);
    MappedRange range(other, 0, 64, MappedRange::ACCESS_WRITE | MappedRange::ACCESS_FLUSH_EXPLICIT);
    range.flush(0, 32);
    range.unmap();
    MappedRange const rest(other, 32, 32, MappedRange::ACCESS_READ);
    BeginEnd();
}

void Framebuffers() {
    Texture2D picture(kRGBA8, 8, 8, false);
    Renderbuffer depth(GL_DEPTH_COMPONENT24, 8, 8);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&picture, 0, 0);
    framebuffer.attach(&depth, 0);
    unsigned int status = 0;
    if (!framebuffer.statusOkay(&status))
        throw std::logic_error("the framebuffer is not complete");
    framebuffer.detach(&picture, 0);
    framebuffer.detach(&depth, 0);
    framebuffer.unbind();
    depth.bind();
    depth.unbind();
    TemporaryAlphaBlendScope const blending;
    TemporaryLineSmoothScope const smooth;
    TemporaryLineStippleScope const stipple(1, 1, 0x5555);
    TemporaryLineWidthScope const width(2);
    BeginEnd();
}

void Programs() {
    char const *const vertex = "attribute vec4 place; void main() { gl_Position = place; }";
    char const *const fragment = "uniform vec4 colour; void main() { gl_FragColor = colour; }";
    Program program;
    program.loadVertexShader(1, &vertex, nullptr);
    program.loadFragmentShader(1, &fragment, nullptr);
    program.link(true);
    static_cast<void>(program.validate());
    std::array<float, 16> const corners = {-1, -1, 0, 1, 1, -1, 0, 1, -1, 1, 0, 1, 1, 1, 0, 1};
    VertexBuffer square(
        {{"place", VertexBuffer::ATTRIBUTETYPE_FLOAT4, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}}, 4,
        VertexBuffer::PRIMITIVETYPE_TRIANGLE_STRIP);
    square.setField("place", reinterpret_cast<unsigned char const *>(corners.data()), false, 16, 0);
    square.setupWithProgram(&program);
    square.marshallData();
    ProgramEnabledScope const scope(&program);
    program.setUniform("colour", 1.f, 0.f, 0.f, 1.f);
    square.drawPrimitives();
    BeginEnd();
}

void OpenCL() {
    CL::Platform const platform = CL::platforms().front();
    CL::Device const device = platform.devices(CL::Device::TYPE_ALL).front();
    static_cast<void>(device.name());
    CL::Context const context(CL::ContextProperties(platform), device);
    CL::CommandQueue queue(context, device, false, false);
    std::vector<float> values(64, 1.f);
    CL::Buffer buffer(context, CL::Memory::MEMORY_READ_WRITE, false, 256, values.data());
    cl_image_format const rgba8 = {CL_RGBA, CL_UNORM_INT8};
    CL::Image2D const image(context, CL::Memory::MEMORY_READ_ONLY, false, rgba8, 4, 4, 0);
    CL::Sampler const smooth(context, true, CL::Sampler::ADDRESS_CLAMP_TO_EDGE,
                             CL::Sampler::FILTER_LINEAR);
    CL::Program program(context,
                        "kernel void twice(global float *v) { v[get_global_id(0)] *= 2; }");
    program.build("");
    CL::Kernel twice = program.kernel("twice");
    twice.setArg(0, buffer);
    CL::Event const written = queue.enqueueWrite(buffer, 0, 256, values.data());
    CL::Event const done = queue.enqueueKernel(twice, CL::Range<1>(64), 0, 0, {written});
    queue.flush();
    queue.enqueueBlockingRead(buffer, 0, 256, values.data());
    queue.enqueueBlockingRead(image, ORU::IntegerRect({0, 0}, ORU::size2(4, 4)), values.data(), 0);
    queue.finish();
    BeginEnd();
}

/// As the program's main does it.
void DevelopPhoto(std::initializer_list<char const *> arguments) {
    int result = 1;
    try {
        int code = 0;
        auto const options = Develop::ParseOptions({arguments.begin(), arguments.end()}, code);
        result = options ? Develop::RunJob(*options) : code;
    } catch (std::exception const &failure) {
        std::fprintf(stderr, "develop: %s\n", failure.what());
    }
    if (result != 0)
        throw ProgramFailed();
}

void DevelopWithSpots() {
    DevelopPhoto({kPhoto, "--quiet", "--exposure", "0.5", "--spots", kSpots, "--output", kOutput});
}

void DevelopSharpened() {
    DevelopPhoto(
        {kPhoto, "--quiet", "--sharpen", "0.8", "--opencl", "ocl_runtime", "--output", kOutput});
}

} // namespace

std::vector<Scenario> const &Scenarios() {
    static std::vector<Scenario> const kScenarios = {
        // A context of a version is tried first, then any; the one that was current before is put
        // back
        // by a destructor; nothing looks at what a swap leads to.
        {"offscreen", OffscreenContext, Needs::OpenGL,
         "wglCreateContextAttribsARB wglMakeCurrent SwapBuffers"},
        {"windowed", WindowedContext, Needs::OpenGL,
         "wglCreateContextAttribsARB wglMakeCurrent SwapBuffers"},
        // Whether contexts share is found out by trying: what fails means that they do not.
        {"wrapped", WrappedContext, Needs::Context, "wglMakeCurrent glGenLists glIsList"},
        {"textures", Textures, Needs::Context, ""},
        {"buffers", Buffers, Needs::Context, ""},
        {"queries", Queries, Needs::Context, ""},
        {"arrays", VertexArrays, Needs::Context, "glBindVertexArray"},
        {"framebuffers", Framebuffers, Needs::Context, ""},
        {"later-textures", LaterTextures, Needs::Context, ""},
        {"framebuffer-transfers", FramebufferTransfers, Needs::Context, ""},
        {"framebuffer-images", FramebufferImages, Needs::Context, ""},
        {"programs", Programs, Needs::Context, ""},
        {"streams", Streams, Needs::Context, ""},
        // The end of a capture is a destructor, as are those of state.
        {"stages", Stages, Needs::Context, "glEndTransformFeedback glBindTransformFeedback"},
        {"adopted", Adopted, Needs::Context, ""},
        // Wrappers do not look at what retaining and releasing lead to.
        {"opencl", OpenCL, Needs::OpenCL, "clRetain clRelease"},
        {"develop", DevelopWithSpots, Needs::Nothing, ""},
        {"sharpen", DevelopSharpened, Needs::Nothing, ""},
    };
    return kScenarios;
}

} // namespace sweep
