// Uses of the classes of OpenGL 3 and 4.
#include "bench/sweep/opengl3.h"

#include "bench/sweep/faults.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/buffertexture.h"
#include "oru/oru_ogl/ogl/conditionalrenderscope.h"
#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/gputimer.h"
#include "oru/oru_ogl/ogl/pixelreadstream.h"
#include "oru/oru_ogl/ogl/pixeluploadstream.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/programpipeline.h"
#include "oru/oru_ogl/ogl/query.h"
#include "oru/oru_ogl/ogl/queryscope.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/switchscope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/ogl/transformfeedbackscope.h"
#include "oru/oru_ogl/ogl/uniformblockwriter.h"
#include "oru/oru_ogl/ogl/vertexarray.h"
#include "oru/oru_ogl/ogl/vertexarraybindscope.h"
#include "oru/oru_ogl/platformgl.h"

#include <array>
#include <chrono>
#include <cstring>
#include <vector>

namespace sweep {

using namespace ORU::OGL;

namespace {

/// A program for patches.
void LoadTessellation(Program &program) {
    program.loadVertexShader("#version 400\nvoid main() { gl_Position = vec4(0.0); }");
    program.loadTessellationEvaluationShader("#version 400\nlayout(triangles) in;"
                                             "void main() { gl_Position = vec4(0.0); }");
    program.link(true);
}

} // namespace

void Queries() {
    Fence const fence = Fence::ForOtherContexts();
    static_cast<void>(fence.isSignalled());
    static_cast<void>(fence.clientWait(std::chrono::seconds(1)));
    fence.wait();
    Query samples(Query::TYPE_SAMPLES), stamp(Query::TYPE_TIMESTAMP);
    samples.begin();
    samples.end();
    static_cast<void>(samples.available());
    static_cast<void>(samples.result());
    stamp.record();
    Query const borrowed(samples.objectID(), Query::TYPE_SAMPLES, borrow_name_tag());
    GpuTimer timer(1);
    for (int frame = 0; frame < 2; ++frame) {
        timer.begin();
        timer.end();
        ORU_GL0(Finish);
    }
    static_cast<void>(timer.take());
    ConditionalRenderScope const conditional(samples, ConditionalRenderScope::MODE_WAIT);
    Query time(Query::TYPE_TIME_ELAPSED);
    QueryScope const timing(time);
    BeginEnd();
}

void VertexArrays() {
    char const *const vertex = "#version 140\nin vec4 place; uniform Look { vec4 shift[2]; };"
                               "void main() { gl_Position = place + shift[1]; }";
    Program program;
    program.loadVertexShader(1, &vertex, nullptr);
    program.link(true);
    program.enable();
    UniformBlock const block(program, "Look");
    block.setBinding(1);
    static_cast<void>(block.binding());
    UniformBlockWriter writer(block);
    writer.set("shift", {1.f, 2.f, 3.f, 4.f}, 1);
    Buffer look(block.size(), Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
    writer.upload(look);
    look.bindBase(GL_UNIFORM_BUFFER, 1);
    std::array<unsigned int, 8> const numbers = {1, 1, 0, 0, 0, 1, 1, 0};
    Buffer const buffer(sizeof numbers, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                        numbers.data());
    VertexArray array;
    array.setAttribute(0, buffer, VertexArray::Attribute(4, GL_UNSIGNED_BYTE).normalized());
    array.setAttribute(1, buffer, VertexArray::Attribute(1, GL_INT).integer().divisor(1));
    array.disableAttribute(1);
    array.setIndices(buffer, GL_UNSIGNED_INT);
    array.setAttribute(2, buffer, VertexArray::Attribute(1, GL_DOUBLE).asDouble());
    array.drawArrays(GL_POINTS, 0, 1);
    {
        VertexArrayBindScope const scope(array);
        array.drawArrays(GL_POINTS, 0, 1);
    }
    array.bind();
    int const first = 0, count = 1;
    array.drawArraysInstanced(GL_POINTS, 0, 1, 2);
    array.drawRanges(GL_POINTS, &first, &count, 1);
    array.drawArraysIndirect(GL_POINTS, buffer);
    array.drawElements(GL_POINTS, 1);
    array.drawElements(GL_POINTS, 1, 0, 1);
    array.drawElementsInstanced(GL_POINTS, 1, 2);
    array.drawElementsInstanced(GL_POINTS, 1, 2, 0, 1);
    array.drawRangeElements(GL_POINTS, 0, 1, 2);
    array.drawRangeElements(GL_POINTS, 0, 1, 2, 0, 1);
    array.drawElementsIndirect(GL_POINTS, buffer);
    program.disable();
    Program patches;
    LoadTessellation(patches);
    patches.enable();
    array.drawPatches(4, 0, 4);
    array.drawPatchElements(4, 4);
    VertexArray::BindDefault();
    patches.disable();
    BeginEnd();
}

void Streams() {
    PixelShape const shape = {Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE, 8, 8};
    std::vector<unsigned char> pixels(shape.bytes());
    Texture2D picture(Texture::INTERNALFORMAT_RGBA8, 8, 8, false);
    TextureUnit::Unit(0)->bind(&picture);
    picture.subImage(0, 0, 0, PixelView(pixels.data(), pixels.size(), shape));
    picture.getPixelData(MutablePixelView(pixels.data(), pixels.size(), shape), 0);
    PixelUploadStream uploads(shape, 2);
    PixelReadStream reads(shape, 2);
    for (int i = 0; i < 3; ++i) {
        static_cast<void>(uploads.isFree());
        std::memset(uploads.begin().data(), i, shape.bytes());
        uploads.upload(picture, 0, 0, 0);
        reads.read(picture, 0);
        static_cast<void>(reads.isReady());
        static_cast<void>(reads.begin());
        reads.end();
    }
    TextureUnit::Unit(0)->bind2DDefault();
    BeginEnd();
}

void Stages() {
    TemporaryViewportScope const viewport({0, 0, 4, 4});
    TemporaryDepthScope const depth({1, 0, GL_LEQUAL});
    TemporaryStencilScope const stencil([](StencilState &state) {
        state.back = {GL_LESS, 1, 0x0F, GL_ZERO, GL_INCR, GL_DECR, 0x33};
    });
    TemporaryScissorScope const scissor({1, 0, 0, 2, 2});
    TemporaryCullScope const cull({1, GL_FRONT, GL_CW});
    TemporaryColorMaskScope const mask({1, 0, 1, 1});
    TemporarySwitchScope const switched(GL_DITHER, false);

    char const vertex[] = "#version 150\n#extension GL_ARB_separate_shader_objects : enable\n"
                          "out gl_PerVertex { vec4 gl_Position; }; out float number;"
                          "void main() { number = float(gl_VertexID); gl_Position = vec4(0.0); }";
    Program program;
    program.loadVertexShader(vertex);
    program.setFeedbackVaryings({"number"}, Program::FEEDBACKMODE_INTERLEAVED);
    program.setFragmentOutputLocation(0, "colour");
    program.setBinaryRetrievable(true);
    program.link(true);
    auto const binary = program.saveBinary();
    if (!program.loadBinary(binary.data(), binary.size()))
        program.link(true); // as a host does
    static_cast<void>(program.getFragmentOutputLocation("colour"));

    Buffer const buffer(64, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_COPY, nullptr);
    TransformFeedback feedback;
    feedback.setBuffer(0, buffer);
    program.enable();
    {
        TransformFeedbackScope capture(feedback, GL_POINTS);
        capture.pause();
        capture.resume();
    }
    feedback.draw(GL_POINTS);
    program.disable();

    Program const separable = Program::Separable(Shader::SHADERTYPE_VERTEX, vertex);
    ProgramPipeline pipeline;
    pipeline.useStages(ProgramPipeline::STAGE_VERTEX, separable);
    pipeline.bind();
    pipeline.activate(separable);
    static_cast<void>(pipeline.validate());
    static_cast<void>(pipeline.infoLog());
    pipeline.clearStages(ProgramPipeline::STAGE_VERTEX);
    ProgramPipeline::BindDefault();
    BeginEnd();
}

void Adopted() {
    borrow_name_tag const borrowed;
    Fence const fence;
    Fence const sameFence(fence.sync(), borrowed);
    VertexArray const array;
    VertexArray const sameArray(array.objectID(), borrowed);
    Sampler const sampler(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR, Texture::WRAPMODE_REPEAT);
    Sampler const sameSampler(sampler.objectID(), borrowed);
    ProgramPipeline pipeline;
    pipeline.bind();
    ProgramPipeline::BindDefault();
    ProgramPipeline const samePipeline(pipeline.objectID(), borrowed);
    TransformFeedback feedback;
    feedback.bind();
    TransformFeedback::BindDefault();
    TransformFeedback const sameFeedback(feedback.objectID(), borrowed);
    Buffer const buffer(64, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
    BufferTexture const texture(Texture::INTERNALFORMAT_RGBA8, buffer);
    BufferTexture const sameTexture(texture.objectID(), borrowed);
    BeginEnd();
}

} // namespace sweep
