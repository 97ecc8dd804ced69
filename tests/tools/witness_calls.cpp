// Makes OpenGL calls with arguments of every form under a tracer, for a witness to compare.
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/opengltracer.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <fstream>

static void MakeCalls() {
    ORU_GL(ColorMask, GL_TRUE, GL_FALSE, GL_TRUE, GL_FALSE);
    ORU_GL(BlendFunc, GL_ONE, GL_ZERO);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT | GL_DEPTH_BUFFER_BIT);
    ORU_GL(Ortho, -1.5, 1.5, -1, 1, -1e-7, 1234567.25);
    ORU_GL(Begin, GL_TRIANGLE_FAN);
    ORU_GL(Color3b, 'a', '#', '~');
    ORU_GL(Vertex3i, -2147483647 - 1, 0, 2147483647);
    ORU_GL(Vertex4f, 16777216.f, 1e-30f, -0.0f, -1.f / 3);
    ORU_GL0(End);
    GLubyte const bits[] = {0xAA};
    ORU_GL(Bitmap, 8, 1, 0, 0.5f, 8, 0, bits);

    GLuint buffer = 0;
    ORU_GL(GenBuffers, 1, &buffer);
    ORU_GL(BindBuffer, GL_ARRAY_BUFFER, buffer);
    ORU_GL(BufferData, GL_ARRAY_BUFFER, 4096, nullptr, GL_STREAM_DRAW);
    ORU_GL(VertexPointer, 3, GL_FLOAT, 32, reinterpret_cast<void const *>(16));
    GLhandleARB const program = ORU_GL0(CreateProgramObjectARB);
    ORU_GL(BindAttribLocationARB, program, 3, "lights[2].colour");
    GLsync const sync = ORU_GL(FenceSync, GL_SYNC_GPU_COMMANDS_COMPLETE, 0);
    ORU_GL(ClientWaitSync, sync, GL_SYNC_FLUSH_COMMANDS_BIT, 10000000000u);
}

int main(int count, char **arguments) {
    if (count != 2)
        return 2;
    ORU::OGL::AutoInitializer const library;
    ORU::OGL::ContextOffscreen const context;
    context.makeCurrent();
    std::ofstream file(arguments[1], std::ios_base::binary);
    ORU::OGL::InterceptorScope<ORU::OGL::OpenGLTracer> const tracer(file);
    MakeCalls();
    return file.flush() ? 0 : 1;
}
