// The code of the chapter on OpenGL 3 and 4.
#include "oru/core/exceptions/logicalexception.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelreadstream.h"
#include "oru/oru_ogl/ogl/pixeluploadstream.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/programpipeline.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/switchscope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/ogl/transformfeedbackscope.h"
#include "oru/oru_ogl/ogl/uniformblockwriter.h"
#include "oru/oru_ogl/ogl/vertexarray.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <array>
#include <cstddef>
#include <cstring>
#include <string>
#include <string_view>
#include <vector>

using namespace ORU::OGL;

namespace {

// [fall]
constexpr std::string_view kFall = R"(#version 150
    in float height;
    out float lower;
    void main() {
        lower = 0.5 * height;
        gl_Position = vec4(0.0);
    })";
// [fall]

constexpr std::string_view kVertex = R"(#version 150
    #extension GL_ARB_separate_shader_objects : enable
    in float height;
    out gl_PerVertex { vec4 gl_Position; };
    void main() { gl_Position = vec4(height, 0.0, 0.0, 1.0); })";

// [outputs]
constexpr std::string_view kFragment = R"(#version 150
    uniform float gain;
    out vec4 colour;
    out vec4 normal;
    void main() {
        colour = vec4(gain);
        normal = vec4(0.0, 0.0, 1.0, 1.0);
    })";
// [outputs]

// [blockshader]
constexpr std::string_view kBlocks = R"(#version 150
    in vec2 place;
    in vec4 weight;
    uniform Look {
        mat4 view;
        vec3 tint;
        float gains[4];
    };
    out vec4 shade;
    void main() {
        shade = vec4(tint, 1.0) * weight * gains[0];
        gl_Position = view * vec4(place, 0.0, 1.0);
    })";
// [blockshader]

/// A few heights as points.
VertexBuffer Points(Program &program) {
    std::vector<float> const heights = {1, 2, 4};
    VertexBuffer points(
        {{"height", VertexBuffer::ATTRIBUTETYPE_FLOAT, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}}, 3,
        VertexBuffer::PRIMITIVETYPE_POINTS);
    points.setField("height", reinterpret_cast<unsigned char const *>(heights.data()), false, 0, 0);
    points.setupWithProgram(&program);
    points.marshallData();
    return points;
}

class OpenGL3Guide : public ::testing::Test {
protected:
    void SetUp() override { context_.makeCurrent(); }
    void TearDown() override { EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError()); }

    AutoInitializer library_;
    ContextOffscreen context_;
};

} // namespace

TEST_F(OpenGL3Guide, ViewsKnowTheirSize) {
    std::uint64_t const width = 4, height = 4;
    std::vector<unsigned char> pixels(4 * width * height, 7);
    std::string told;
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, width, height, false);
    ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
    // [view]
    PixelShape const shape = {Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, width, height};
    texture.subImage(0, 0, 0, PixelView(pixels.data(), pixels.size(), shape));

    std::vector<unsigned char> back(shape.bytes());
    texture.getPixelData(MutablePixelView(back.data(), back.size(), shape), 0);
    // [view]
    EXPECT_EQ(pixels, back);

    // [short]
    pixels.resize(60);
    try {
        texture.subImage(0, 0, 0, PixelView(pixels.data(), pixels.size(), shape));
    } catch (ORU::LogicalException const &e) {
        told = e.message(); // "The memory is too short: 4 x 4 x 1 pixels of GL_RGBA and
                            // GL_UNSIGNED_BYTE take 64 bytes, and it has 60"
    }
    // [short]
    EXPECT_EQ("The memory is too short: 4 x 4 x 1 pixels of GL_RGBA and GL_UNSIGNED_BYTE take 64 "
              "bytes, and it has 60",
              told);
}

TEST_F(OpenGL3Guide, StreamsDoNotWait) {
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 64, 64, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&texture, 0, 0);
    ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
    std::size_t sum = 0;
    auto const decode = [](int number, MutablePixelView const &frame) {
        std::memset(frame.data(), number, frame.bytes());
    };
    auto const encode = [&sum](PixelView const &frame) {
        sum += static_cast<unsigned char const *>(frame.data())[frame.bytes() - 1];
    };
    auto const draw = [] {};
    int const frames = 10;
    // [stream]
    PixelShape const shape = {Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 64, 64};
    PixelUploadStream uploads(shape);
    PixelReadStream reads(shape);
    for (int i = 0; i < frames; ++i) {
        decode(i, uploads.begin()); // straight into OpenGL's memory
        uploads.upload(texture, 0, 0, 0);
        draw();
        if (reads.isFull() || reads.isReady()) {
            encode(reads.begin()); // the oldest that was asked for
            reads.end();
        }
        reads.read(0, 0); // the rectangle from (0, 0) on; arrives later
    }
    for (; reads.count() > 0; reads.end())
        encode(reads.begin());
    // [stream]
    EXPECT_EQ(45u, sum);
    framebuffer.unbind();
}

TEST_F(OpenGL3Guide, ScopesPutStateBack) {
    // [state]
    {
        TemporaryViewportScope const corner({0, 0, 32, 32});
        TemporaryDepthScope const behindGlass([](DepthState &state) {
            state.enabled = 1;
            state.writes = 0;
        });
        TemporaryCullScope const front({1, GL_BACK, GL_CCW});
        // … draw …
    } // as before, also when an exception ended the block
    // [state]
    EXPECT_EQ(1, CurrentState<DepthState>().writes);
}

TEST_F(OpenGL3Guide, BlocksAndArrays) {
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 8, 8, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attachTexture(texture, 0, Framebuffer::ATTACHMENT_COLOR0);
    TemporaryViewportScope const viewport({0, 0, 8, 8});
    float const identity[] = {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1};
    Program program;
    program.loadVertexShader(kBlocks);
    program.loadFragmentShader("#version 150\nin vec4 shade; out vec4 colour;"
                               "void main() { colour = shade; }");
    program.link(true);
    // [block]
    UniformBlock const look(program, "Look");
    look.setBinding(2);
    UniformBlockWriter values(look);
    values.set("view", identity, 1);
    values.set("tint", {1.f, 0.5f, 0.25f});
    values.set("gains", 0.5f); // the first of four
    Buffer buffer(look.size(), Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_DRAW, nullptr);
    values.upload(buffer);
    buffer.bindBase(GL_UNIFORM_BUFFER, 2);
    // [block]

    // [array]
    struct Corner {
        float place[2];
        std::uint8_t shade[4];
    };
    Corner const corners[] = {{{-1, -1}, {255, 255, 255, 255}},
                              {{3, -1}, {255, 255, 255, 255}},
                              {{-1, 3}, {255, 255, 255, 255}}};
    std::uint16_t const indices[] = {0, 1, 2};
    Buffer const vertices(sizeof corners, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                          corners);
    Buffer const order(sizeof indices, Buffer::TYPE_ELEMENT_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                       indices);
    VertexArray triangle;
    triangle.setAttribute(program.getAttributeLocation("place"), vertices,
                          VertexArray::Attribute(2, GL_FLOAT).stride(sizeof(Corner)));
    triangle.setAttribute(program.getAttributeLocation("weight"), vertices,
                          VertexArray::Attribute(4, GL_UNSIGNED_BYTE)
                              .normalized()
                              .stride(sizeof(Corner))
                              .offset(offsetof(Corner, shade)));
    triangle.setIndices(order, GL_UNSIGNED_SHORT);

    program.enable();
    triangle.drawElements(GL_TRIANGLES, 3);
    program.disable();
    // [array]
    std::array<unsigned char, 4> texel = {};
    Framebuffer::Read(&framebuffer, 4, 4,
                      MutablePixelView(texel.data(), texel.size(), PixelShape()));
    EXPECT_EQ((std::array<unsigned char, 4>{128, 64, 32, 128}), texel);
    Framebuffer::BindDefault();
}

TEST_F(OpenGL3Guide, FeedbackBinariesAndPipelines) {
    // [feedback]
    Program fall;
    fall.loadVertexShader(kFall);
    fall.setFeedbackVaryings({"lower"}, Program::FEEDBACKMODE_INTERLEAVED);
    fall.link(true);
    VertexBuffer points = Points(fall);
    Buffer lower(3 * sizeof(float), Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_COPY, nullptr);
    TransformFeedback feedback;
    feedback.setBuffer(0, lower);

    fall.enable();
    {
        TemporarySwitchScope const unseen(GL_RASTERIZER_DISCARD, true);
        TransformFeedbackScope const capture(feedback, GL_POINTS);
        points.drawPrimitives();
    }
    fall.disable();
    // [feedback]
    std::vector<float> captured(3);
    lower.bind();
    lower.getSubData(0, 12, captured.data());
    Buffer::BindDefaultArrayBuffer();
    EXPECT_EQ((std::vector<float>{0.5f, 1, 2}), captured);

    std::vector<unsigned char> cached;
    for (int start = 0; start < 2; ++start) {
        // [binary]
        Program program;
        program.setFragmentOutputLocation(0, "colour");
        program.setFragmentOutputLocation(1, "normal");
        if (!program.loadBinary(cached.data(), cached.size())) {
            program.loadVertexShader(kVertex);
            program.loadFragmentShader(kFragment);
            if (Program::SupportsBinaries())
                program.setBinaryRetrievable(true);
            program.link(true);
            if (Program::SupportsBinaries())
                cached = program.saveBinary(); // for the next start
        }
        // [binary]
        EXPECT_EQ(1, program.getFragmentOutputLocation("normal"));
    }

    // [pipeline]
    Program const vertices = Program::Separable(Shader::SHADERTYPE_VERTEX, kVertex);
    Program fragments = Program::Separable(Shader::SHADERTYPE_FRAGMENT, kFragment);
    ProgramPipeline pipeline;
    pipeline.useStages(ProgramPipeline::STAGE_VERTEX, vertices);
    pipeline.useStages(ProgramPipeline::STAGE_FRAGMENT, fragments);
    pipeline.bind(); // counts while no program is enabled
    pipeline.activate(fragments);
    fragments.setUniform_Unsafe("gain", 0.5f);
    // [pipeline]
    ProgramPipeline::BindDefault();
    EXPECT_TRUE(pipeline.isInitialized());
}
