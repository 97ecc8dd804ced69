// Uses of the classes of OpenGL 3 and 4.
#include "bench/sweep/opengl3.h"

#include "bench/sweep/faults.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/pixelreadstream.h"
#include "oru/oru_ogl/ogl/pixeluploadstream.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/programpipeline.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/ogl/transformfeedbackscope.h"
#include "oru/oru_ogl/platformgl.h"

#include <cstring>
#include <vector>

namespace sweep {

using namespace ORU::OGL;

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
    TemporaryStencilScope const stencil([](StencilState &state) { state.back.reference = 1; });

    char const vertex[] = "#version 150\n#extension GL_ARB_separate_shader_objects : enable\n"
                          "out gl_PerVertex { vec4 gl_Position; }; out float number;"
                          "void main() { number = float(gl_VertexID); gl_Position = vec4(0.0); }";
    Program program;
    program.loadVertexShader(vertex);
    program.setFeedbackVaryings({"number"}, Program::FEEDBACKMODE_INTERLEAVED);
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

} // namespace sweep
