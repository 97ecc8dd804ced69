// What fences, queries, vertex arrays, uniform blocks and ranges of buffers cost over the raw
// calls.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/conditionalrenderscope.h"
#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/gputimer.h"
#include "oru/oru_ogl/ogl/mappedrange.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/query.h"
#include "oru/oru_ogl/ogl/queryscope.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/uniformblockwriter.h"
#include "oru/oru_ogl/ogl/vertexarray.h"
#include "oru/oru_ogl/ogl/vertexarraybindscope.h"

#include <cstring>
#include <vector>

using namespace ORU::OGL;
using oru_bench::Compare;
using oru_bench::EntryPoint;
using oru_bench::ThreadContext;

namespace {

/// An entry point, looked up once.
#define ORU_ENTRY(name, NAME) PFNGL##NAME##PROC const name = EntryPoint<PFNGL##NAME##PROC>(#name)

void FenceAndWait(benchmark::State &state) {
    ThreadContext const context;
    ORU_ENTRY(glFenceSync, FENCESYNC);
    ORU_ENTRY(glClientWaitSync, CLIENTWAITSYNC);
    ORU_ENTRY(glDeleteSync, DELETESYNC);
    Compare(
        state, 200,
        [=] {
            GLsync const sync = glFenceSync(GL_SYNC_GPU_COMMANDS_COMPLETE, 0);
            benchmark::DoNotOptimize(::glGetError());
            ORU_PLAIN(glClientWaitSync(sync, GL_SYNC_FLUSH_COMMANDS_BIT, 1000000000));
            ORU_PLAIN(glDeleteSync(sync));
        },
        [] {
            Fence const fence;
            fence.clientWait(std::chrono::seconds(1));
        });
}
BENCHMARK(FenceAndWait)->UseManualTime()->Iterations(300);

void CountSamples(benchmark::State &state) {
    ThreadContext const context;
    ORU_ENTRY(glBeginQuery, BEGINQUERY);
    ORU_ENTRY(glEndQuery, ENDQUERY);
    ORU_ENTRY(glGetQueryObjectui64v, GETQUERYOBJECTUI64V);
    Query query(Query::TYPE_SAMPLES);
    GLuint const name = query.objectID();
    Compare(
        state, 200,
        [=] {
            ORU_PLAIN(glBeginQuery(GL_SAMPLES_PASSED, name));
            ORU_PLAIN(glEndQuery(GL_SAMPLES_PASSED));
            GLuint64 samples = 0;
            ORU_PLAIN(glGetQueryObjectui64v(name, GL_QUERY_RESULT, &samples));
            benchmark::DoNotOptimize(samples);
        },
        [&] {
            { QueryScope const scope(query); }
            benchmark::DoNotOptimize(query.result());
        });
}
BENCHMARK(CountSamples)->UseManualTime()->Iterations(300);

/// A ring of stamps as a host keeps it.
void TimeFrames(benchmark::State &state) {
    ThreadContext const context;
    ORU_ENTRY(glGenQueries, GENQUERIES);
    ORU_ENTRY(glDeleteQueries, DELETEQUERIES);
    ORU_ENTRY(glQueryCounter, QUERYCOUNTER);
    ORU_ENTRY(glGetQueryObjectiv, GETQUERYOBJECTIV);
    ORU_ENTRY(glGetQueryObjectui64v, GETQUERYOBJECTUI64V);
    GLuint stamps[8] = {};
    glGenQueries(8, stamps);
    std::size_t oldest = 0, pending = 0;
    GpuTimer timer(4);
    Compare(
        state, 200,
        [&] {
            GLuint const *const now = &stamps[2 * ((oldest + pending) % 4)];
            ORU_PLAIN(glQueryCounter(now[0], GL_TIMESTAMP));
            ORU_PLAIN(glQueryCounter(now[1], GL_TIMESTAMP));
            ++pending;
            GLint isThere = GL_FALSE;
            ORU_PLAIN(
                glGetQueryObjectiv(stamps[2 * oldest + 1], GL_QUERY_RESULT_AVAILABLE, &isThere));
            if (!isThere && pending < 4)
                return;
            GLuint64 begin = 0, end = 0;
            ORU_PLAIN(glGetQueryObjectui64v(stamps[2 * oldest], GL_QUERY_RESULT, &begin));
            ORU_PLAIN(glGetQueryObjectui64v(stamps[2 * oldest + 1], GL_QUERY_RESULT, &end));
            benchmark::DoNotOptimize(end - begin);
            oldest = (oldest + 1) % 4;
            --pending;
        },
        [&] {
            timer.begin();
            timer.end();
            benchmark::DoNotOptimize(timer.take());
        });
    glDeleteQueries(8, stamps);
}
BENCHMARK(TimeFrames)->UseManualTime()->Iterations(300);

void MapRange(benchmark::State &state) {
    ThreadContext const context;
    ORU_ENTRY(glBindBuffer, BINDBUFFER);
    ORU_ENTRY(glMapBufferRange, MAPBUFFERRANGE);
    ORU_ENTRY(glUnmapBuffer, UNMAPBUFFER);
    GLsizeiptr const size = state.range(0);
    std::vector<char> const bytes(static_cast<std::size_t>(size), 1);
    Buffer buffer(size, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    GLuint const name = buffer.objectID();
    GLbitfield const access = GL_MAP_WRITE_BIT | GL_MAP_INVALIDATE_BUFFER_BIT;
    Compare(
        state, 100,
        [&] {
            GLint previous = 0;
            ORU_PLAIN(::glGetIntegerv(GL_ARRAY_BUFFER_BINDING, &previous));
            ORU_PLAIN(glBindBuffer(GL_ARRAY_BUFFER, name));
            void *const data = glMapBufferRange(GL_ARRAY_BUFFER, 0, size, access);
            benchmark::DoNotOptimize(::glGetError());
            std::memcpy(data, bytes.data(), bytes.size());
            ORU_PLAIN(glBindBuffer(GL_ARRAY_BUFFER, name)); // whatever was bound meanwhile
            ORU_PLAIN(glUnmapBuffer(GL_ARRAY_BUFFER));
            ORU_PLAIN(glBindBuffer(GL_ARRAY_BUFFER, static_cast<GLuint>(previous)));
        },
        [&] {
            MappedRange range(buffer, 0, size, access);
            std::memcpy(range.data(), bytes.data(), bytes.size());
        });
}
BENCHMARK(MapRange)->Arg(4096)->Arg(1 << 20)->UseManualTime()->Iterations(300)->ArgName("bytes");

void CopyRange(benchmark::State &state) {
    ThreadContext const context;
    ORU_ENTRY(glBindBuffer, BINDBUFFER);
    ORU_ENTRY(glCopyBufferSubData, COPYBUFFERSUBDATA);
    GLsizeiptr const size = state.range(0);
    Buffer from(size, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_COPY, nullptr);
    Buffer to(size, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_COPY, nullptr);
    GLuint const source = from.objectID(), name = to.objectID();
    Compare(
        state, 100,
        [&] {
            GLint reader = 0, writer = 0;
            ORU_PLAIN(::glGetIntegerv(GL_COPY_READ_BUFFER, &reader));
            ORU_PLAIN(::glGetIntegerv(GL_COPY_WRITE_BUFFER, &writer));
            ORU_PLAIN(glBindBuffer(GL_COPY_READ_BUFFER, source));
            ORU_PLAIN(glBindBuffer(GL_COPY_WRITE_BUFFER, name));
            ORU_PLAIN(glCopyBufferSubData(GL_COPY_READ_BUFFER, GL_COPY_WRITE_BUFFER, 0, 0, size));
            ORU_PLAIN(glBindBuffer(GL_COPY_WRITE_BUFFER, static_cast<GLuint>(writer)));
            ORU_PLAIN(glBindBuffer(GL_COPY_READ_BUFFER, static_cast<GLuint>(reader)));
        },
        [&] { to.copySubData(from, 0, 0, size); });
}
BENCHMARK(CopyRange)->Arg(1 << 20)->UseManualTime()->Iterations(300)->ArgName("bytes");

/// Three vertices, indices and a uniform block, drawn into a small picture.
struct Scene {
    Scene() {
        char const *const vertex =
            "#version 140\nin vec2 place; layout(std140) uniform Look { vec4 colour; mat4 view;"
            "float gains[8]; }; out vec4 shade; void main() { shade = colour * gains[3];"
            "gl_Position = view * vec4(place, 0, 1); }";
        char const *const fragment =
            "#version 140\nin vec4 shade; void main() { gl_FragColor = shade; }";
        program.loadVertexShader(1, &vertex, nullptr);
        program.loadFragmentShader(1, &fragment, nullptr);
        program.link(true);
        program.enable();
        framebuffer.bind();
        framebuffer.attach(&pixels, 0);
        ::glViewport(0, 0, 16, 16);
        array.setAttribute(program.getAttributeLocation("place"), corners, {2, GL_FLOAT});
        array.setIndices(indices, GL_UNSIGNED_SHORT);
    }

    static constexpr float kCorners[] = {-1, -1, -0.9f, -1, -1, -0.9f};
    static constexpr unsigned short kIndices[] = {0, 1, 2};

    ThreadContext context;
    Program program;
    Renderbuffer pixels{GL_RGBA8, 16, 16};
    Framebuffer framebuffer;
    Buffer corners{sizeof kCorners, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, kCorners};
    Buffer indices{sizeof kIndices, Buffer::TYPE_ELEMENT_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                   kIndices};
    VertexArray array;
};

/// A draw of a vertex array that is not bound yet.
void BindAndDraw(benchmark::State &state) {
    Scene scene;
    ORU_ENTRY(glBindVertexArray, BINDVERTEXARRAY);
    GLuint const name = scene.array.objectID();
    Compare(
        state, 2000,
        [=] {
            GLint previous = 0;
            ORU_PLAIN(::glGetIntegerv(GL_VERTEX_ARRAY_BINDING, &previous));
            ORU_PLAIN(glBindVertexArray(name));
            ORU_PLAIN(::glDrawElements(GL_TRIANGLES, 3, GL_UNSIGNED_SHORT, nullptr));
            ORU_PLAIN(glBindVertexArray(static_cast<GLuint>(previous)));
        },
        [&] { scene.array.drawElements(GL_TRIANGLES, 3); });
}
BENCHMARK(BindAndDraw)->UseManualTime()->Iterations(50);

/// One draw of many with the same vertex array.
void DrawBound(benchmark::State &state) {
    Scene scene;
    VertexArrayBindScope const bound(scene.array);
    Compare(
        state, 2000,
        [=] { ORU_PLAIN(::glDrawElements(GL_TRIANGLES, 3, GL_UNSIGNED_SHORT, nullptr)); },
        [&] { scene.array.drawElements(GL_TRIANGLES, 3); });
}
BENCHMARK(DrawBound)->UseManualTime()->Iterations(50);

/// A draw that depends on a query.
void DrawConditionally(benchmark::State &state) {
    Scene scene;
    VertexArrayBindScope const bound(scene.array);
    ORU_ENTRY(glBeginConditionalRender, BEGINCONDITIONALRENDER);
    ORU_ENTRY(glEndConditionalRender, ENDCONDITIONALRENDER);
    Query query(Query::TYPE_SAMPLES);
    { // of what is seen: the draws are made
        scene.program.disable();
        QueryScope const scope(query);
        ::glRectf(-1, -1, 1, 1);
    }
    scene.program.enable();
    if (query.result() == 0)
        state.SkipWithError("nothing was drawn");
    GLuint const name = query.objectID();
    Compare(
        state, 1000,
        [=] {
            ORU_PLAIN(glBeginConditionalRender(name, GL_QUERY_NO_WAIT));
            ORU_PLAIN(::glDrawElements(GL_TRIANGLES, 3, GL_UNSIGNED_SHORT, nullptr));
            ORU_PLAIN(glEndConditionalRender());
        },
        [&] {
            ConditionalRenderScope const scope(query, ConditionalRenderScope::MODE_NO_WAIT);
            scene.array.drawElements(GL_TRIANGLES, 3);
        });
}
BENCHMARK(DrawConditionally)->UseManualTime()->Iterations(50);

/// A block filled, written and bound, as a host does that keeps offsets of std140 by hand.
void UploadBlock(benchmark::State &state) {
    Scene scene;
    ORU_ENTRY(glBindBuffer, BINDBUFFER);
    ORU_ENTRY(glBufferSubData, BUFFERSUBDATA);
    ORU_ENTRY(glBindBufferBase, BINDBUFFERBASE);
    UniformBlock const block(scene.program, "Look");
    UniformBlockWriter writer(block);
    UniformBlock::Member const &colour = block.member("colour"), &view = block.member("view");
    Buffer buffer(block.size(), Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_DRAW, nullptr);
    GLuint const name = buffer.objectID();
    float const values[16] = {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1};
    struct Look {
        float colour[4], view[16], gains[8][4];
    } look = {};
    Compare(
        state, 1000,
        [&] {
            std::memcpy(look.colour, values, sizeof look.colour);
            std::memcpy(look.view, values, sizeof look.view);
            GLint previous = 0;
            ORU_PLAIN(::glGetIntegerv(GL_ARRAY_BUFFER_BINDING, &previous));
            ORU_PLAIN(glBindBuffer(GL_ARRAY_BUFFER, name));
            ORU_PLAIN(glBufferSubData(GL_ARRAY_BUFFER, 0, sizeof look, &look));
            ORU_PLAIN(glBindBuffer(GL_ARRAY_BUFFER, static_cast<GLuint>(previous)));
            ORU_PLAIN(glBindBufferBase(GL_UNIFORM_BUFFER, 0, name));
        },
        [&] {
            writer.set(colour, values, 1);
            writer.set(view, values, 1);
            writer.upload(buffer);
            buffer.bindBase(GL_UNIFORM_BUFFER, 0);
        });
}
BENCHMARK(UploadBlock)->UseManualTime()->Iterations(200);

} // namespace
