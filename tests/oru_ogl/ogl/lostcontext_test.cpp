// Objects and scopes whose context has gone: their ends find none, or another one.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/blendscope.h"
#include "oru/oru_ogl/ogl/conditionalrenderscope.h"
#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/gputimer.h"
#include "oru/oru_ogl/ogl/linescope.h"
#include "oru/oru_ogl/ogl/mappedrange.h"
#include "oru/oru_ogl/ogl/oruopengl.h"
#include "oru/oru_ogl/ogl/pixelreadstream.h"
#include "oru/oru_ogl/ogl/pixeluploadstream.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/programpipeline.h"
#include "oru/oru_ogl/ogl/query.h"
#include "oru/oru_ogl/ogl/queryscope.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/samplerbindscope.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/switchscope.h"
#include "oru/oru_ogl/ogl/texturebindscope.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/ogl/transformfeedbackscope.h"
#include "oru/oru_ogl/ogl/vertexarray.h"
#include "oru/oru_ogl/ogl/vertexarraybindscope.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

using namespace oru_test;

namespace {

struct Everything {
    Texture2D texture{Texture::INTERNALFORMAT_RGBA8, 4, 4, false};
    Buffer buffer{4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr};
    Framebuffer framebuffer;
    Renderbuffer renderbuffer{GL_RGBA8, 1, 1};
    Sampler sampler{Texture::FILTER_LINEAR, Texture::FILTER_LINEAR, Texture::WRAPMODE_REPEAT};
    SamplerBindScope sampled{sampler, 1};
    VertexShader shader;
    Program program;
    VertexBuffer vertices{{VertexBuffer::Field("", VertexBuffer::ATTRIBUTETYPE_FLOAT, {})},
                          1,
                          VertexBuffer::PRIMITIVETYPE_POINTS};
    VertexArray array;
    VertexArrayBindScope held{array};
    Fence fence;
    GpuTimer timer;
    Query samples{Query::TYPE_SAMPLES}, time{Query::TYPE_TIME_ELAPSED};
    QueryScope timing{time};
    std::optional<ConditionalRenderScope> conditional;
    std::optional<MappedRange> mapped;
    TemporaryAlphaBlendScope blend;
    TemporaryLineWidthScope width{3};
    TemporaryLineSmoothScope smooth;
    std::optional<TemporaryLineStippleScope> stipple;
    Texture2DBindScope bound{&texture, 0, true};
    ProgramEnabledScope enabled;
    TemporaryDepthScope depth{{1, 0, GL_ALWAYS}};
    TemporarySwitchScope dither{GL_DITHER, false};
    ProgramPipeline pipeline;
    PixelUploadStream uploads{PixelShape(), 2};
    PixelReadStream reads{PixelShape(), 2};
    TransformFeedback feedback;
    std::optional<TransformFeedbackScope> capture;

    Everything() {
        if (!IsCoreRun())
            stipple.emplace(static_cast<unsigned char>(1), 2, static_cast<unsigned short>(0xAAAA));
        mapped.emplace(buffer, 0, 4, MappedRange::ACCESS_WRITE);
        samples.begin();
        samples.end();
        conditional.emplace(samples, ConditionalRenderScope::MODE_NO_WAIT);
        char const *const source = "void main() { gl_Position = vec4(0); }";
        program.loadVertexShader(1, &source, nullptr);
        program.setFeedbackVaryings({"gl_Position"}, Program::FEEDBACKMODE_INTERLEAVED);
        program.link(true);
        enabled.enable(&program);
        EXPECT_NE("", MessageOf([&] { vertices.setupWithProgram(&program); })) << "but has names";
        uploads.begin();
        reads.read(0, 0);
        feedback.setBuffer(0, buffer);
        capture.emplace(feedback, GL_POINTS);
    }
};

} // namespace

using LostContextTest = OffscreenTest;

TEST_F(LostContextTest, EndsThrowNothingAndMakeNoCallWithoutAContext) {
    for (bool const inAnother : {false, true}) {
        auto other = std::make_unique<ContextOffscreen>();
        other->makeCurrent();
        auto everything = std::make_unique<Everything>();
        context().makeCurrent();
        other.reset();
        if (!inAnother)
            ReleaseOGLContext();
        InterceptorScope<CountingForwarder> calls;
        EXPECT_NO_THROW(everything.reset());
        EXPECT_EQ(inAnother, calls->total() > 0);
        EXPECT_EQ(inAnother, !GetGLString(GL_VENDOR).empty());
        context().makeCurrent();
        ::glGetError();
    }
}
