// Programs of OpenGL 3 and 4: all stages and outputs, feedback, binaries, pipelines.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/programpipeline.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/ogl/transformfeedbackscope.h"

#include <cstdint>
#include <functional>
#include <stdexcept>
#include <utility>

using namespace oru_test;

namespace {

using Floats = std::vector<float>;
using Texels = std::vector<unsigned char>;

char const kWholeView[] = "#version 150\n"
                          "void main() { vec2 corner = vec2(gl_VertexID % 2, gl_VertexID / 2);"
                          "gl_Position = vec4(4.0 * corner - 1.0, 0.0, 1.0); }";

/// Counts captured vertices from 0: `number` and its square.
char const kCounts[] = "#version 150\nout float number; out vec2 squares;\n"
                       "void main() { number = float(gl_VertexID); squares = vec2(number * number);"
                       "gl_Position = vec4(0.0); }";

/// Takes the squares up again.
char const kTakes[] = "#version 150\nin vec2 taken; out float number; out vec2 squares;\n"
                      "void main() { number = taken.x; squares = taken + vec2(1.0);"
                      "gl_Position = vec4(0.0); }";

/// Two pictures of 4 x 4 that are drawn into together, with the vertex array that core contexts
/// want.
class Target {
public:
    Target() {
        ORU_GL(GenVertexArrays, 1, &array_);
        ORU_GL(BindVertexArray, array_);
        framebuffer_.bind();
        framebuffer_.attach(&pictures_[0], 0, 0);
        framebuffer_.attach(&pictures_[1], 0, 1);
        GLenum const buffers[] = {GL_COLOR_ATTACHMENT0, GL_COLOR_ATTACHMENT1};
        ORU_GL(DrawBuffers, 2, buffers);
        ORU_GL(Viewport, 0, 0, 4, 4);
    }
    ~Target() {
        framebuffer_.unbind();
        ORU_GL(DeleteVertexArrays, 1, &array_);
    }

    /// All texels of both pictures.
    std::array<Texels, 2> read() const {
        std::array<Texels, 2> texels;
        for (std::size_t i = 0; i < 2; ++i) {
            texels[i].resize(64);
            ORU_GL(ReadBuffer, GL_COLOR_ATTACHMENT0 + static_cast<GLenum>(i));
            ORU_GL(ReadPixels, 0, 0, 4, 4, GL_RGBA, GL_UNSIGNED_BYTE, texels[i].data());
        }
        return texels;
    }

private:
    Texture2D pictures_[2] = {{kRGBA8, 4, 4, false}, {kRGBA8, 4, 4, false}};
    Framebuffer framebuffer_;
    GLuint array_ = 0;
};

Texels Filled(std::array<unsigned char, 4> colour) {
    Texels texels;
    for (int i = 0; i < 16; ++i)
        texels.insert(texels.end(), colour.begin(), colour.end());
    return texels;
}

Floats Contents(Buffer &buffer) {
    Floats values(buffer.size() / sizeof(float));
    buffer.bind();
    buffer.getSubData(0, static_cast<std::int64_t>(buffer.size()), values.data());
    Buffer::BindDefaultArrayBuffer();
    return values;
}

/// A buffer of so many numbers, all of them -1.
Buffer Numbers(std::size_t count) {
    Floats const values(count, -1.f);
    return Buffer(static_cast<std::int64_t>(count * sizeof(float)), Buffer::TYPE_ARRAY_BUFFER,
                  Buffer::USAGE_DYNAMIC_READ, values.data());
}

} // namespace

class StagesTest : public ObjectTest {};

TEST_F(StagesTest, AllStagesDrawIntoTheOutputsThatAreChosen) {
    Target const target;
    Program program;
    // A text within another one, without a zero at its end.
    std::string const vertex = "#version 150\nvoid main() { gl_Position = vec4(0.0); } nonsense";
    program.loadVertexShader(std::string_view(vertex).substr(0, vertex.find(" nonsense")));
    program.loadTessellationControlShader(
        "#version 400\nlayout(vertices = 1) out; void main() {"
        "gl_TessLevelOuter[0] = gl_TessLevelOuter[1] = gl_TessLevelOuter[2] = 1.0;"
        "gl_TessLevelInner[0] = 1.0; }");
    program.loadTessellationEvaluationShader(
        "#version 400\nlayout(triangles) in; void main() {"
        "gl_Position = vec4(4.0 * gl_TessCoord.xy - 1.0, 0.0, 1.0); }");
    program.loadGeometryShader(
        "#version 150\nlayout(triangles) in; layout(triangle_strip, max_vertices = 3) out;"
        "out float shade; void main() { for (int i = 0; i < 3; ++i) {"
        "shade = 0.2; gl_Position = gl_in[i].gl_Position; EmitVertex(); } }");
    program.loadFragmentShader("#version 150\nin float shade; out vec4 one, other;"
                               "void main() { one = vec4(shade); other = vec4(1, 0, shade, 1); }");
    program.setFragmentOutputLocation(1, "one");
    program.setFragmentOutputLocation(0, "other");
    program.link(true);
    EXPECT_EQ(1, program.getFragmentOutputLocation("one"));
    EXPECT_EQ(-1, program.getFragmentOutputLocation("third"));
    program.enable();
    ORU_GL(PatchParameteri, GL_PATCH_VERTICES, 1);
    ORU_GL(DrawArrays, GL_PATCHES, 0, 1);
    program.disable();
    EXPECT_EQ((std::array<Texels, 2>{Filled({255, 0, 51, 255}), Filled({51, 51, 51, 51})}),
              target.read());

    Program broken;
    broken.loadGeometryShader("nothing of the kind");
    EXPECT_NE(std::string::npos, broken.compileLogs().find("GL_GEOMETRY_SHADER does not compile"));
}

TEST_F(StagesTest, FeedbackCapturesWhatIsAskedFor) {
    Target const target;
    ORU_GL(Enable, GL_RASTERIZER_DISCARD);
    auto const link = [](char const *source, Program::FeedbackMode mode) {
        Program program;
        program.loadVertexShader(source);
        program.setFeedbackVaryings({"squares", "number"}, mode);
        program.link(true);
        program.enable();
        return program;
    };
    auto const draw = [](GLint first, GLsizei count) {
        ORU_GL(DrawArrays, GL_POINTS, first, count);
    };
    Buffer one = Numbers(8), other = Numbers(3);
    TransformFeedback feedback;
    {
        Program const program = link(kCounts, Program::FEEDBACKMODE_SEPARATE);
        feedback.setBuffer(0, one, 4, 24);
        feedback.setBuffer(1, other);
        {
            TransformFeedbackScope capture(feedback, GL_POINTS);
            EXPECT_TRUE(feedback.isBound());
            draw(1, 1);
            capture.pause();
            draw(7, 5);
            capture.resume();
            draw(3, 2);
        }
        EXPECT_EQ((Floats{-1, 1, 1, 9, 9, 16, 16, -1}), Contents(one));
        EXPECT_EQ((Floats{1, 3, 4}), Contents(other));
    }
    EXPECT_EQ((std::vector<GLint>{0, 0}),
              Get({GL_TRANSFORM_FEEDBACK_BINDING, GL_TRANSFORM_FEEDBACK_BUFFER_BINDING}));

    // As many as were captured are drawn, into the context's own object. Exceptions end a capture.
    Program program = link(kTakes, Program::FEEDBACKMODE_INTERLEAVED);
    auto const taken = static_cast<GLuint>(program.getAttributeLocation("taken"));
    one.bind();
    ORU_GL(VertexAttribPointer, taken, 2, GL_FLOAT, GL_FALSE, 8,
           reinterpret_cast<void const *>(std::uintptr_t(4)));
    ORU_GL(EnableVertexAttribArray, taken);
    Buffer::BindDefaultArrayBuffer();
    Buffer all = Numbers(12);
    ORU_GL(BindBufferBase, GL_TRANSFORM_FEEDBACK_BUFFER, 0u, all.objectID());
    ::glEnable(GL_NONE); // an error that the host left must not begin a capture without an end
    EXPECT_FAILURE("GL_INVALID_ENUM", TransformFeedbackScope(GL_POINTS));
    try {
        TransformFeedbackScope const capture(GL_POINTS);
        EXPECT_FAILURE("GL_INVALID_OPERATION", TransformFeedbackScope(GL_POINTS)); // goes on
        feedback.draw(GL_POINTS);
        throw std::runtime_error("ends the capture");
    } catch (std::runtime_error const &) {
    }
    EXPECT_EQ((Floats{2, 2, 1, 10, 10, 9, 17, 17, 16, -1, -1, -1}), Contents(all));
    EXPECT_FAILURE("GL_INVALID_ENUM", TransformFeedbackScope(feedback, GL_TRIANGLE_STRIP));
    EXPECT_FALSE(feedback.isBound());
    ORU_GL(UseProgram, 0u);
    EXPECT_FAILURE("GL_INVALID_OPERATION", TransformFeedbackScope(GL_POINTS));
    ORU_GL(Disable, GL_RASTERIZER_DISCARD);

    struct Part {
        std::size_t offset, size;
    };
    for (Part const part : {Part{0, 0}, {0, 33}, {0, 36}, {4, 32}, {2, 4}, {32, 4}, {36, 4}})
        EXPECT_EQ("Feedback goes to whole multiples of 4 bytes within its buffer: not to " +
                      std::to_string(part.size) + " bytes behind " + std::to_string(part.offset) +
                      " of 32",
                  MessageOf([&] { feedback.setBuffer(0, one, part.offset, part.size); }));
}

TEST_F(StagesTest, ABinaryIsItsDriversOnly) {
    Program source;
    source.loadVertexShader(kWholeView);
    source.loadFragmentShader("#version 150\nuniform vec4 tint; out vec4 colour;"
                              "void main() { colour = tint; }");
    if (!Program::SupportsBinaries()) {
        EXPECT_EQ(0u, MessageOf([&] { source.saveBinary(); }).find("Programs have no binaries"));
        EXPECT_FALSE(source.loadBinary("", 1));
        return;
    }
    source.setBinaryRetrievable(true);
    EXPECT_FAILURE("Program must be linked before its binary is saved", source.saveBinary());
    source.link(true);
    auto binary = source.saveBinary();

    Target const target;
    Program program;
    InterceptorScope<CountingForwarder> calls;
    binary.back() ^= 0x10;
    EXPECT_FALSE(program.loadBinary(binary.data(), binary.size()));
    binary.back() ^= 0x10;
    EXPECT_FALSE(program.loadBinary(binary.data(), binary.size() - 1));
    EXPECT_EQ(0, calls->count("ProgramBinary")) << "refused before the driver has it";
    ASSERT_TRUE(program.loadBinary(binary.data(), binary.size()));
    program.enable();
    program.setUniform("tint", 1.f, 0.f, 0.2f, 0.f);
    ORU_GL(DrawArrays, GL_TRIANGLES, 0, 3);
    program.disable();
    EXPECT_EQ(Filled({255, 0, 51, 0}), target.read()[0]);
}

TEST_F(StagesTest, PipelinesExchangeStages) {
    Target const target;
    auto const tinted = [](std::string const &colour) {
        return Program::Separable(Shader::SHADERTYPE_FRAGMENT,
                                  "#version 150\nuniform float tint; out vec4 colour;"
                                  "void main() { colour = " +
                                      colour + "; }");
    };
    Program const vertices =
        Program::Separable(Shader::SHADERTYPE_VERTEX,
                           std::string(kWholeView)
                               .insert(13, "#extension GL_ARB_separate_shader_objects : enable\n"
                                           "out gl_PerVertex { vec4 gl_Position; };"));
    Program red = tinted("vec4(tint, 0, 0, 1)"), green = tinted("vec4(0, tint, 0, 1)");
    ProgramPipeline pipeline;
    pipeline.useStages(ProgramPipeline::STAGE_VERTEX, vertices);
    pipeline.bind();
    for (Program *const program : {&red, &green}) {
        pipeline.useStages(ProgramPipeline::STAGE_FRAGMENT, *program);
        EXPECT_TRUE(pipeline.validate()) << pipeline.infoLog();
        pipeline.activate(*program);
        program->setUniform_Unsafe("tint", 0.2f);
        ORU_GL(DrawArrays, GL_TRIANGLES, 0, 3);
        EXPECT_EQ(program == &red ? Filled({51, 0, 0, 255}) : Filled({0, 51, 0, 255}),
                  target.read()[0]);
    }
    pipeline.clearStages(ProgramPipeline::STAGE_VERTEX);
    GLint vertex = -1;
    ORU_GL(GetProgramPipelineiv, pipeline.objectID(), GL_VERTEX_SHADER, &vertex);
    EXPECT_EQ(0, vertex);
    ProgramPipeline::BindDefault();
    EXPECT_FALSE(pipeline.isBound());

    Program joined;
    joined.loadVertexShader(kWholeView);
    joined.link(true);
    EXPECT_EQ(0u, MessageOf([&] {
                      pipeline.useStages(ProgramPipeline::STAGE_VERTEX, joined);
                  }).find("A program for a pipeline must be linked as a separable one"));
    EXPECT_NE("", MessageOf([] { Program::Separable(Shader::SHADERTYPE_VERTEX, "nonsense"); }));
}

TEST_F(StagesTest, WithoutAContextASentenceTellsWhatIsMissing) {
    Program program;
    ReleaseOGLContext();
    EXPECT_FALSE(ProgramPipeline::IsSupported() || TransformFeedback::IsSupported() ||
                 Program::SupportsBinaries());
    std::pair<std::string, std::function<void()>> const uses[] = {
        {"Program pipelines need", [] { ProgramPipeline(); }},
        {"Separable programs need", [&] { program.setSeparable(true); }},
        {"Transform feedback objects need", [] { TransformFeedback(); }},
        {"Transform feedback needs", [] { TransformFeedbackScope(GL_POINTS); }},
        {"Programs have no binaries", [&] { program.setBinaryRetrievable(true); }},
        {"Outputs of programs", [&] { program.setFragmentOutputLocation(0, "colour"); }},
    };
    for (auto const &[text, use] : uses)
        EXPECT_EQ(0u, MessageOf(use).find(text)) << text;
    context().makeCurrent();
}
