// Makes OpenGL calls with arguments of every form under a tracer, for a witness to compare.
#include "oru/core/exceptions/logicalexception.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/opengltracer.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <fstream>
#include <iostream>

namespace {

void DrawAtOnce() {
    ORU_GL(ClearDepth, 0.125);
    ORU_GL(ColorMask, GL_TRUE, GL_FALSE, GL_TRUE, GL_FALSE);
    ORU_GL(BlendFunc, GL_ONE, GL_ZERO);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT | GL_DEPTH_BUFFER_BIT);
    ORU_GL(Ortho, -1.5, 1.5, -1, 1, -1e-3, 1234567.25);
    GLfloat const matrix[16] = {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1};
    ORU_GL(MultMatrixf, matrix);
    ORU_GL(Begin, GL_TRIANGLE_FAN);
    ORU_GL(Color3b, 'a', '#', '~');
    ORU_GL(Color4ub, 'R', 'G', 'B', 'A');
    ORU_GL(Color3us, 0, 1, 65535);
    ORU_GL(Color3ui, 0, 1, 4294967295u);
    ORU_GL(Vertex2s, -32768, 32767);
    ORU_GL(Vertex3i, -2147483647 - 1, 0, 2147483647);
    ORU_GL(TexCoord2f, 0.1f, -0.0f);
    ORU_GL(Vertex4f, 16777216.f, 1e-30f, 3.4e38f, -1.f / 3);
    ORU_GL(Vertex3d, 0.1, -2, 1e-7);
    ORU_GL(Vertex2fv, matrix);
    ORU_GL0(End);
    GLubyte const bits[] = {0xAA};
    ORU_GL(Bitmap, 8, 1, 0, 0.5f, 8, 0, bits);
    GLuint const list = ORU_GL(GenLists, 1);
    ORU_GL(NewList, list, GL_COMPILE);
    ORU_GL(PointSize, 2.5f);
    ORU_GL0(EndList);
    ORU_GL(CallLists, 1, GL_UNSIGNED_INT, &list);
    ORU_GL(DeleteLists, list, 1);
}

void UseBuffers() {
    GLuint buffer = 0;
    ORU_GL(GenBuffers, 1, &buffer);
    ORU_GL(BindBuffer, GL_ARRAY_BUFFER, buffer);
    ORU_GL(BufferData, GL_ARRAY_BUFFER, 4096, nullptr, GL_STREAM_DRAW);
    GLdouble const data[8] = {};
    ORU_GL(BufferSubData, GL_ARRAY_BUFFER, 1024, sizeof data, data);
    ORU_GL(VertexPointer, 3, GL_FLOAT, 32, reinterpret_cast<void const *>(16));
    void *const mapped = ORU_GL(MapBufferRange, GL_ARRAY_BUFFER, 64, 128,
                                GL_MAP_WRITE_BIT | GL_MAP_INVALIDATE_RANGE_BIT);
    if (mapped)
        ORU_GL(UnmapBuffer, GL_ARRAY_BUFFER);
    ORU_GL(DeleteBuffers, 1, &buffer);
}

void UsePrograms() {
    GLhandleARB const program = ORU_GL0(CreateProgramObjectARB);
    GLhandleARB const shader = ORU_GL(CreateShaderObjectARB, GL_VERTEX_SHADER_ARB);
    GLcharARB const *source = "attribute vec4 place; void main() { gl_Position = place; }";
    ORU_GL(ShaderSourceARB, shader, 1, &source, nullptr);
    ORU_GL(CompileShaderARB, shader);
    ORU_GL(AttachObjectARB, program, shader);
    ORU_GL(BindAttribLocationARB, program, 3, "place");
    ORU_GL(LinkProgramARB, program);
    ORU_GL(GetUniformLocationARB, program, "lights[2].colour");
    ORU_GL(DeleteObjectARB, shader);
    ORU_GL(DeleteObjectARB, program);
}

void Wait() {
    GLsync const sync = ORU_GL(FenceSync, GL_SYNC_GPU_COMMANDS_COMPLETE, 0);
    ORU_GL(ClientWaitSync, sync, GL_SYNC_FLUSH_COMMANDS_BIT, 10000000000u);
    ORU_GL(DeleteSync, sync);
}

} // namespace

int main(int count, char **arguments) {
    if (count != 2)
        return 2;
    try {
        ORU::OGL::AutoInitializer const library;
        ORU::OGL::ContextOffscreen const context;
        context.makeCurrent();
        std::ofstream file(arguments[1], std::ios_base::binary);
        ORU::OGL::OpenGLTracer tracer(file);
        ORU::OGL::OpenGLInterceptor::Instance()->addInterceptor(&tracer);
        DrawAtOnce();
        UseBuffers();
        UsePrograms();
        Wait();
        ORU::OGL::OpenGLInterceptor::Instance()->popInterceptor();
        return file.flush() ? 0 : 1;
    } catch (ORU::LogicalException const &e) {
        std::cerr << e.message() << '\n';
        return 1;
    }
}
