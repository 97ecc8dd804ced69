// Timed frames: nine frames on their way at once. Each has its sky uploaded and is read back
// without waiting, is timed on the GPU, and has a flare only while the sun is not behind the hill.
#include "examples/ported/plaingl.h"
#include "examples/ported/ported.h"

#include "oru/oru_ogl/ogl/conditionalrenderscope.h"
#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/gputimer.h"
#include "oru/oru_ogl/ogl/pixelreadstream.h"
#include "oru/oru_ogl/ogl/pixeluploadstream.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/query.h"
#include "oru/oru_ogl/ogl/queryscope.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

#include <algorithm>
#include <chrono>

using namespace ORU::OGL;
using namespace std::chrono_literals;
using ported::kSide;
using ported::Picture;

namespace {

constexpr int kFrame = 32, kFrames = 9, kRing = 3; ///< pixels of a frame's side, numbers
constexpr std::size_t kFrameBytes = std::size_t{kFrame} * kFrame * 4;

char const *const kVertexShader = R"(#version 330
    uniform vec4 area; // left, bottom, right, top
    uniform float depth;
    out vec2 place;
    void main() {
        place = vec2(gl_VertexID % 2, gl_VertexID / 2);
        gl_Position = vec4(mix(area.xy, area.zw, place), depth, 1.0);
    })";

char const *const kFragmentShader = R"(#version 330
    uniform sampler2D sky;
    uniform vec4 paint; // of which alpha says how much of the sky is seen
    in vec2 place;
    out vec4 colour;
    void main() { colour = vec4(mix(paint.rgb, texture(sky, place).rgb, paint.a), 1.0); })";

struct Figure {
    float area[4], depth, paint[4];
};
Figure const kSky = {{-1, -1, 1, 1}, 0.9f, {0, 0, 0, 1}},
             kHill = {{0, -1, 0.6f, 0.5f}, -0.5f, {0.2f, 0.4f, 0.2f, 0}};

float SunAt(int frame) {
    return 0.2f * static_cast<float>(frame) - 0.8f;
}
Figure Sun(int frame) {
    float const x = SunAt(frame);
    return {{x - 0.15f, 0.1f, x + 0.15f, 0.4f}, 0.5f, {1, 0.9f, 0.3f, 0}};
}
Figure Flare(int frame) {
    float const x = SunAt(frame);
    return {{x - 0.5f, 0.2f, x + 0.5f, 0.3f}, -0.9f, {1, 1, 0.8f, 0.3f}};
}

/// What a camera or a decoder would do: a sky that gets darker from frame to frame.
void Decode(int frame, void *pixels) {
    auto *pixel = static_cast<unsigned char *>(pixels);
    for (int i = 0; i < kFrame * kFrame; ++i, pixel += 4) {
        int const y = i / kFrame, shade = 220 - 12 * frame;
        pixel[0] = static_cast<unsigned char>(shade - 3 * y);
        pixel[1] = static_cast<unsigned char>(shade - 2 * y);
        pixel[2] = static_cast<unsigned char>(shade + (i * 7 + frame * 13) % 20);
        pixel[3] = 255;
    }
}

/// What an encoder would do: puts a frame into its place in the picture.
void Encode(int frame, void const *pixels, Picture &picture) {
    auto const *pixel = static_cast<unsigned char const *>(pixels);
    for (int i = 0; i < kFrame * kFrame; ++i, pixel += 4) {
        int const x = frame % 3 * kFrame + i % kFrame, y = frame / 3 * kFrame + i / kFrame;
        std::copy_n(pixel, 3, picture.begin() + 3 * std::ptrdiff_t{y * kSide + x});
    }
}

void RequireTimes(int times) {
    if (times != kFrames)
        throw std::runtime_error("not every frame was timed");
}

constexpr int kPlainMark = __LINE__;
/// Waits for a ring's buffer; a null fence is behind nothing.
void Await(GLsync &fence) {
    if (fence &&
        glClientWaitSync(fence, GL_SYNC_FLUSH_COMMANDS_BIT, 1000000000) == GL_TIMEOUT_EXPIRED)
        throw std::runtime_error("a buffer is still used after a second");
    glDeleteSync(fence);
    fence = nullptr;
}

Picture DrawPlain(GLuint) {
    GLuint sky = 0, array = 0;
    glGenTextures(1, &sky);
    glBindTexture(GL_TEXTURE_2D, sky);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA8, kFrame, kFrame, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_NEAREST);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_NEAREST);
    glGenVertexArrays(1, &array);
    glBindVertexArray(array);

    GLuint uploads[kRing] = {}, reads[kRing] = {}, stamps[kFrames][2] = {}, visible = 0;
    GLsync uploaded[kRing] = {}, read[kRing] = {};
    glGenBuffers(kRing, uploads);
    glGenBuffers(kRing, reads);
    for (int i = 0; i < kRing; ++i) {
        glBindBuffer(GL_PIXEL_UNPACK_BUFFER, uploads[i]);
        glBufferData(GL_PIXEL_UNPACK_BUFFER, kFrameBytes, nullptr, GL_STREAM_DRAW);
        glBindBuffer(GL_PIXEL_PACK_BUFFER, reads[i]);
        glBufferData(GL_PIXEL_PACK_BUFFER, kFrameBytes, nullptr, GL_STREAM_READ);
    }
    glBindBuffer(GL_PIXEL_PACK_BUFFER, 0);
    glGenQueries(2 * kFrames, stamps[0]);
    glGenQueries(1, &visible);
    plain::Check("rings");

    GLuint const program = plain::MakeProgram(kVertexShader, kFragmentShader);
    GLint const area = glGetUniformLocation(program, "area"),
                depth = glGetUniformLocation(program, "depth"),
                paint = glGetUniformLocation(program, "paint");
    auto const draw = [=](Figure const &figure) {
        glUniform4fv(area, 1, figure.area);
        glUniform1f(depth, figure.depth);
        glUniform4fv(paint, 1, figure.paint);
        glDrawArrays(GL_TRIANGLE_STRIP, 0, 4);
    };
    Picture picture = ported::EmptyPicture();
    auto const take = [&](int frame) {
        int const slot = frame % kRing;
        Await(read[slot]);
        glBindBuffer(GL_PIXEL_PACK_BUFFER, reads[slot]);
        void const *const pixels =
            glMapBufferRange(GL_PIXEL_PACK_BUFFER, 0, kFrameBytes, GL_MAP_READ_BIT);
        if (!pixels)
            throw std::runtime_error("a frame cannot be mapped");
        Encode(frame, pixels, picture);
        glUnmapBuffer(GL_PIXEL_PACK_BUFFER);
        glBindBuffer(GL_PIXEL_PACK_BUFFER, 0);
        plain::Check("taking a frame");
    };

    glUseProgram(program);
    glViewport(0, 0, kFrame, kFrame);
    glEnable(GL_DEPTH_TEST);
    int taken = 0;
    for (int frame = 0; frame < kFrames; ++frame) {
        int const slot = frame % kRing;
        glQueryCounter(stamps[frame][0], GL_TIMESTAMP);
        Await(uploaded[slot]);
        glBindBuffer(GL_PIXEL_UNPACK_BUFFER, uploads[slot]);
        void *const pixels = glMapBufferRange(GL_PIXEL_UNPACK_BUFFER, 0, kFrameBytes,
                                              GL_MAP_WRITE_BIT | GL_MAP_INVALIDATE_BUFFER_BIT);
        if (!pixels)
            throw std::runtime_error("memory for a frame cannot be mapped");
        Decode(frame, pixels);
        if (!glUnmapBuffer(GL_PIXEL_UNPACK_BUFFER))
            throw std::runtime_error("a frame was lost");
        glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, kFrame, kFrame, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
        glBindBuffer(GL_PIXEL_UNPACK_BUFFER, 0);
        uploaded[slot] = glFenceSync(GL_SYNC_GPU_COMMANDS_COMPLETE, 0);

        glClear(GL_DEPTH_BUFFER_BIT);
        draw(kSky);
        draw(kHill);
        glBeginQuery(GL_ANY_SAMPLES_PASSED, visible);
        draw(Sun(frame));
        glEndQuery(GL_ANY_SAMPLES_PASSED);
        glBeginConditionalRender(visible, GL_QUERY_WAIT);
        draw(Flare(frame));
        glEndConditionalRender();

        if (frame - taken == kRing)
            take(taken++);
        glBindBuffer(GL_PIXEL_PACK_BUFFER, reads[slot]);
        glReadPixels(0, 0, kFrame, kFrame, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
        glBindBuffer(GL_PIXEL_PACK_BUFFER, 0);
        read[slot] = glFenceSync(GL_SYNC_GPU_COMMANDS_COMPLETE, 0);
        glQueryCounter(stamps[frame][1], GL_TIMESTAMP);
        plain::Check("a frame");
    }
    for (; taken < kFrames; ++taken)
        take(taken);
    GLsync done = glFenceSync(GL_SYNC_GPU_COMMANDS_COMPLETE, 0);
    Await(done);
    int times = 0;
    for (int frame = 0; frame < kFrames; ++frame) {
        GLuint64 began = 0, ended = 0;
        glGetQueryObjectui64v(stamps[frame][0], GL_QUERY_RESULT, &began);
        glGetQueryObjectui64v(stamps[frame][1], GL_QUERY_RESULT, &ended);
        times += ended >= began;
    }
    RequireTimes(times);
    plain::Check("times");

    glDisable(GL_DEPTH_TEST);
    for (int i = 0; i < kRing; ++i)
        glDeleteSync(uploaded[i]);
    glDeleteBuffers(kRing, uploads);
    glDeleteBuffers(kRing, reads);
    glDeleteQueries(2 * kFrames, stamps[0]);
    glDeleteQueries(1, &visible);
    glUseProgram(0);
    glDeleteProgram(program);
    glDeleteVertexArrays(1, &array);
    glDeleteTextures(1, &sky);
    return picture;
}

constexpr int kPortedMark = __LINE__;
Picture DrawPorted(Framebuffer &target) {
    Texture2D sky(Texture::INTERNALFORMAT_RGBA8, kFrame, kFrame, false);
    TextureUnit::Unit(0)->bind(&sky);
    VertexArray const corners;

    PixelShape const shape = {Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, kFrame, kFrame};
    PixelUploadStream uploads(shape, kRing);
    PixelReadStream reads(shape, kRing);
    GpuTimer timer(kFrames);
    Query visible(Query::TYPE_ANY_SAMPLES);

    Program program = ported::MakeProgram(kVertexShader, kFragmentShader);
    ProgramEnabledScope const enabled(&program);
    auto const draw = [&](Figure const &figure) {
        program.setUniform4("area", 1, figure.area);
        program.setUniform("depth", figure.depth);
        program.setUniform4("paint", 1, figure.paint);
        corners.drawArrays(GL_TRIANGLE_STRIP, 0, 4);
    };
    Picture picture = ported::EmptyPicture();
    int taken = 0;
    auto const take = [&] {
        Encode(taken++, reads.begin().data(), picture);
        reads.end();
    };

    TemporaryViewportScope const whole({0, 0, kFrame, kFrame});
    TemporaryDepthScope const depth([](DepthState &state) { state.enabled = 1; });
    for (int frame = 0; frame < kFrames; ++frame) {
        timer.begin();
        Decode(frame, uploads.begin().data());
        uploads.upload(sky, 0, 0, 0);

        Framebuffer::ClearDepth(&target, 1, nullptr);
        draw(kSky);
        draw(kHill);
        {
            QueryScope const counted(visible);
            draw(Sun(frame));
        }
        {
            ConditionalRenderScope const ifVisible(visible, ConditionalRenderScope::MODE_WAIT);
            draw(Flare(frame));
        }

        if (reads.isFull() || reads.isReady())
            take();
        reads.read(0, 0);
        timer.end();
    }
    while (reads.count() > 0)
        take();
    if (!Fence().clientWait(1s))
        throw std::runtime_error("the GPU is still busy after a second");
    int times = 0;
    while (timer.take())
        ++times;
    RequireTimes(times);
    return picture;
}

constexpr int kEndMark = __LINE__;

} // namespace

ported::Comparison const ported::kTimedFrames = {
    "timed_frames", DrawPlain, DrawPorted, {kPlainMark, kPortedMark, kEndMark}};
