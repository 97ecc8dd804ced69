// What a vertex buffer costs over the raw calls: uploading and binding its fields, and drawing.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <vector>

using namespace ORU::OGL;
using oru_bench::Comparison;
using oru_bench::EntryPoint;
using oru_bench::Seconds;
using oru_bench::ThreadContext;

namespace {

int const kBatches = 10000;
unsigned int const kVertices = 3;

/// A small triangle with a position and a colour, drawn into a renderbuffer.
class Fixture {
public:
    Fixture() {
        char const *const vertex = "attribute vec2 position; attribute vec4 colour;"
                                   "varying vec4 shade; void main() { shade = colour;"
                                   " gl_Position = vec4(position, 0, 1); }";
        char const *const fragment = "varying vec4 shade; void main() { gl_FragColor = shade; }";
        program.loadVertexShader(1, &vertex, nullptr);
        program.loadFragmentShader(1, &fragment, nullptr);
        program.link(true);
        program.enable();
        framebuffer.bind();
        framebuffer.attach(&pixels, 0);
        ::glViewport(0, 0, 16, 16);
        batch.setField("position", reinterpret_cast<unsigned char const *>(kPositions), false, 0,
                       0);
        batch.setField("colour", reinterpret_cast<unsigned char const *>(kColours), false, 0, 0);
        batch.setupWithProgram(&program);
        batch.marshallData();
    }

    static constexpr float kPositions[2 * kVertices] = {-1, -1, -0.9f, -1, -1, -0.9f};
    static constexpr float kColours[4 * kVertices] = {1, 0, 0, 1, 0, 1, 0, 1, 0, 0, 1, 1};

    ThreadContext context;
    Program program;
    Renderbuffer pixels{GL_RGBA8, 16, 16};
    Framebuffer framebuffer;
    VertexBuffer batch{{VertexBuffer::Field("position", VertexBuffer::ATTRIBUTETYPE_FLOAT2,
                                            VertexBuffer::EXPECTEDUSAGE_STREAM_DRAW),
                        VertexBuffer::Field("colour", VertexBuffer::ATTRIBUTETYPE_FLOAT4,
                                            VertexBuffer::EXPECTEDUSAGE_STREAM_DRAW)},
                       kVertices,
                       VertexBuffer::PRIMITIVETYPE_TRIANGLES};
};

/// The same by plain calls, each with its error query.
class Raw {
public:
    explicit Raw(Fixture &fixture)
        : slots_{static_cast<GLuint>(fixture.program.getAttributeLocation("position")),
                 static_cast<GLuint>(fixture.program.getAttributeLocation("colour"))} {
        EntryPoint<PFNGLGENVERTEXARRAYSPROC>("glGenVertexArrays")(1, &array_);
        EntryPoint<PFNGLGENBUFFERSPROC>("glGenBuffers")(2, buffers_);
    }
    ~Raw() {
        EntryPoint<PFNGLDELETEVERTEXARRAYSPROC>("glDeleteVertexArrays")(1, &array_);
        EntryPoint<PFNGLDELETEBUFFERSPROC>("glDeleteBuffers")(2, buffers_);
    }
    Raw(Raw const &) = delete;
    Raw &operator=(Raw const &) = delete;

    void bindFields() const {
        bindArray(array_);
        bindField(0, 2, sizeof Fixture::kPositions, Fixture::kPositions);
        bindField(1, 4, sizeof Fixture::kColours, Fixture::kColours);
        bindArray(0);
    }
    void draw() const {
        bindArray(array_);
        ::glDrawArrays(GL_TRIANGLES, 0, kVertices);
        query();
        bindArray(0);
    }

private:
    static void query() { benchmark::DoNotOptimize(::glGetError()); }
    void bindArray(GLuint array) const {
        bindVertexArray_(array);
        query();
    }
    void bindField(int i, GLint components, GLsizeiptr bytes, void const *data) const {
        bindBuffer_(GL_ARRAY_BUFFER, buffers_[i]);
        query();
        bufferData_(GL_ARRAY_BUFFER, bytes, data, GL_STREAM_DRAW);
        query();
        attribPointer_(slots_[i], components, GL_FLOAT, GL_FALSE, 0, nullptr);
        query();
        enableAttrib_(slots_[i]);
        query();
    }

    PFNGLBINDVERTEXARRAYPROC bindVertexArray_ =
        EntryPoint<PFNGLBINDVERTEXARRAYPROC>("glBindVertexArray");
    PFNGLBINDBUFFERPROC bindBuffer_ = EntryPoint<PFNGLBINDBUFFERPROC>("glBindBuffer");
    PFNGLBUFFERDATAPROC bufferData_ = EntryPoint<PFNGLBUFFERDATAPROC>("glBufferData");
    PFNGLVERTEXATTRIBPOINTERPROC attribPointer_ =
        EntryPoint<PFNGLVERTEXATTRIBPOINTERPROC>("glVertexAttribPointer");
    PFNGLENABLEVERTEXATTRIBARRAYPROC enableAttrib_ =
        EntryPoint<PFNGLENABLEVERTEXATTRIBARRAYPROC>("glEnableVertexAttribArray");
    GLuint array_ = 0;
    GLuint buffers_[2] = {};
    GLuint slots_[2];
};

/// All batches of a turn, with the drawing that they ask for.
template<class Batch>
double Batches(Batch batch) {
    return Seconds([&] {
        for (int i = 0; i < kBatches; ++i)
            batch();
        ::glFinish();
    });
}

void BindFields(benchmark::State &state) {
    Fixture fixture;
    Raw const raw(fixture);
    Comparison comparison(state, kBatches);
    for (auto _ : state) {
        double const base = Batches([&] { raw.bindFields(); });
        comparison.add(base, Batches([&] { fixture.batch.marshallData(); }));
    }
}
BENCHMARK(BindFields)->UseManualTime()->Iterations(50)->Unit(benchmark::kMillisecond);

void Draw(benchmark::State &state) {
    Fixture fixture;
    Raw const raw(fixture);
    raw.bindFields();
    Comparison comparison(state, kBatches);
    for (auto _ : state) {
        double const base = Batches([&] { raw.draw(); });
        comparison.add(base, Batches([&] { fixture.batch.drawPrimitives(); }));
    }
}
BENCHMARK(Draw)->UseManualTime()->Iterations(20)->Unit(benchmark::kMillisecond);

void BindFieldsAndDraw(benchmark::State &state) {
    Fixture fixture;
    Raw const raw(fixture);
    Comparison comparison(state, kBatches);
    for (auto _ : state) {
        double const base = Batches([&] {
            raw.bindFields();
            raw.draw();
        });
        comparison.add(base, Batches([&] {
                           fixture.batch.marshallData();
                           fixture.batch.drawPrimitives();
                       }));
    }
}
BENCHMARK(BindFieldsAndDraw)->UseManualTime()->Iterations(20)->Unit(benchmark::kMillisecond);

} // namespace
