// Vertex buffers: fields of every type drawn and read back, copies, and what they refuse.
#include "objecttest.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <cstring>
#include <numeric>

using namespace ORU::OGL;
using oru_test::MessageOf;

namespace {

using Field = VertexBuffer::Field;
using Pixels = std::vector<float>;

unsigned int const kCount = 5; ///< vertices, each a point on a pixel of its own

unsigned char const *Bytes(std::vector<float> const &values) {
    return reinterpret_cast<unsigned char const *>(values.data());
}

/// The x coordinates of the centres of kCount pixels in a row.
Pixels Places() {
    Pixels places;
    for (unsigned int i = 0; i < kCount; ++i)
        places.push_back((static_cast<float>(i) + 0.5f) / kCount * 2 - 1);
    return places;
}

VertexBuffer::AttributeType Type(unsigned int components) {
    return static_cast<VertexBuffer::AttributeType>(components);
}

/// A program that writes an attribute into the pixels it is drawn at, exactly.
void Build(Program &program) {
    char const *const vertex = "attribute float place; attribute vec4 value; varying vec4 colour;"
                               "void main() { colour = value;"
                               " gl_Position = vec4(place, 0, 0, 1); }";
    char const *const fragment = "varying vec4 colour; void main() { gl_FragColor = colour; }";
    program.loadVertexShader(1, &vertex, nullptr);
    program.loadFragmentShader(1, &fragment, nullptr);
    program.link(true);
}

class VertexBufferTest : public oru_test::ObjectTest {
protected:
    /// Runs `draw` with the program current and gives the row of pixels, four floats each.
    template<class Draw>
    Pixels drawn(Program &program, Draw draw) {
        Renderbuffer row(GL_RGBA32F, kCount, 1);
        Framebuffer framebuffer;
        framebuffer.bind();
        framebuffer.attach(&row, 0);
        ORU_GL(Viewport, 0, 0, static_cast<GLsizei>(kCount), 1);
        ORU_GL(ClearColor, -1.f, -1.f, -1.f, -1.f);
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
        program.enable();
        draw();
        program.disable();
        Pixels pixels(4 * kCount);
        ORU_GL(ReadPixels, 0, 0, static_cast<GLsizei>(kCount), 1, GL_RGBA, GL_FLOAT, pixels.data());
        framebuffer.unbind();
        return pixels;
    }
};

/// What OpenGL gives the shader for an attribute of fewer components, and the untouched rest.
Pixels Expected(Pixels const &values, unsigned int components, unsigned int vertices) {
    Pixels pixels(4 * kCount, -1.f);
    for (unsigned int i = 0; i < 4 * vertices; ++i) {
        unsigned int const component = i % 4;
        pixels[i] = component < components ? values[i / 4 * components + component]
                    : component == 3       ? 1.f
                                           : 0.f;
    }
    return pixels;
}

Pixels Values(unsigned int components) {
    Pixels values(kCount * components);
    std::iota(values.begin(), values.end(), 100.25f);
    return values;
}

VertexBuffer Points(unsigned int components) {
    VertexBuffer buffer({Field("value", Type(components), VertexBuffer::EXPECTEDUSAGE_DYNAMIC_DRAW),
                         Field("place", VertexBuffer::ATTRIBUTETYPE_FLOAT,
                               VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW)},
                        kCount, VertexBuffer::PRIMITIVETYPE_POINTS);
    buffer.setField("place", Bytes(Places()), false, 0, 0);
    return buffer;
}

} // namespace

TEST_F(VertexBufferTest, DrawsFieldsOfEveryType) {
    Program program;
    Build(program);
    for (unsigned int components = 1; components <= 4; ++components) {
        SCOPED_TRACE(components);
        Pixels const values = Values(components);
        VertexBuffer buffer = Points(components);
        EXPECT_EQ(4 * components, Field("", Type(components), {}).byteSize());
        EXPECT_EQ(Expected(Pixels(values.size()), components, kCount),
                  drawn(program,
                        [&] {
                            buffer.setupWithProgram(&program);
                            buffer.marshallData();
                            buffer.drawPrimitives();
                        }))
            << "zeros until set";
        buffer.setField("value", Bytes(values), false, 0, 0);
        EXPECT_EQ(Expected(values, components, kCount), drawn(program, [&] {
                      buffer.marshallData();
                      buffer.drawPrimitives();
                  }));
        EXPECT_EQ(Expected(values, components, 2), drawn(program, [&] {
                      buffer.marshallData(3);
                      buffer.drawPrimitives(2);
                  }));
        EXPECT_EQ(Pixels(4 * kCount, -1.f), drawn(program, [&] { buffer.drawPrimitives(0); }));
    }
    GLint bound = -1;
    ::glGetIntegerv(GL_VERTEX_ARRAY_BINDING, &bound);
    EXPECT_EQ(0, bound);
}

TEST_F(VertexBufferTest, GathersFromPaddedVertices) {
    Program program;
    Build(program);
    GLint current = 0;
    program.enable();
    ::glGetIntegerv(GL_CURRENT_PROGRAM, &current);
    for (unsigned int components = 1; components <= 4; ++components) {
        SCOPED_TRACE(components);
        Pixels const values = Values(components);
        std::size_t const step = 5;
        Pixels padded(step * kCount, 77.f);
        for (std::size_t i = 0; i < values.size(); ++i)
            padded[i / components * step + i % components] = values[i];
        VertexBuffer buffer = Points(components);
        unsigned int const size = 4 * components;
        auto const draw = [&] {
            buffer.setupWithProgram(static_cast<unsigned int>(current));
            buffer.marshallData();
            buffer.drawPrimitives();
        };
        buffer.setField(0, Bytes(padded), step * 4, 0);
        EXPECT_EQ(Expected(values, components, kCount), drawn(program, draw));
        Pixels doubled = values;
        for (float &value : doubled)
            value *= 2;
        buffer.setField(0, Bytes(doubled), size, 3); // the first three lie together
        std::copy(values.begin() + 3 * components, values.end(), doubled.begin() + 3 * components);
        EXPECT_EQ(Expected(doubled, components, kCount), drawn(program, draw));
    }
}

TEST_F(VertexBufferTest, CopiesHaveNoOpenGLObjects) {
    Program program;
    Build(program);
    VertexBuffer buffer = Points(1);
    Pixels const values = Values(1);
    buffer.setField("value", Bytes(values), false, 0, 0);
    buffer.setupWithProgram(&program);
    buffer.marshallData();
    VertexBuffer copy(buffer), assigned;
    assigned = buffer;
    EXPECT_EQ("vertexBuffer_ != 0", MessageOf([&] { copy.marshallData(); }));
    EXPECT_EQ("vertexBuffer_ != 0", MessageOf([&] { assigned.marshallData(); }));
    EXPECT_EQ(kCount, assigned.vertexCount());
    EXPECT_EQ(VertexBuffer::PRIMITIVETYPE_POINTS, assigned.primitiveType());
    copy.setupWithProgram(&program);
    EXPECT_EQ(Expected(values, 1, kCount), drawn(program, [&] {
                  copy.marshallData();
                  copy.drawPrimitives();
              }));
    VertexBuffer const &same = copy;
    copy = same;
    VertexBuffer taken(std::move(buffer)); // with its objects
    EXPECT_EQ(Expected(values, 1, kCount), drawn(program, [&] { taken.drawPrimitives(); }));
    taken = std::move(copy); // the self-assigned copy was one without objects again
    EXPECT_EQ("vertexBuffer_ != 0", MessageOf([&] { taken.marshallData(); }));
    VertexBuffer const empty;
    EXPECT_EQ(0u, empty.vertexCount());
}

TEST_F(VertexBufferTest, RefusesWhatItCannotDraw) {
    for (unsigned int const type : {0u, 5u})
        EXPECT_EQ("Unexpected field type", MessageOf([&] { Field("p", Type(type), {}); }));

    VertexBuffer buffer = Points(2);
    unsigned char const data[8] = {};
    EXPECT_EQ("ignoreMissingFields",
              MessageOf([&] { buffer.setField("missing", data, false, 0, 1); }));
    buffer.setField("missing", data, true, 0, 1);
    EXPECT_EQ("vertexBuffer_ != 0", MessageOf([&] { buffer.marshallData(); }));
    EXPECT_EQ("Enforce oglProgram != NULL",
              MessageOf([&] { buffer.setupWithProgram(static_cast<Program *>(nullptr)); }));

    Program unrelated;
    char const *const source = "void main() { gl_Position = vec4(0); }";
    unrelated.loadVertexShader(1, &source, nullptr);
    unrelated.link(true);
    EXPECT_EQ("f.resolvedSlot_ >= 0", MessageOf([&] { buffer.setupWithProgram(&unrelated); }));
    unrelated.enable();
    GLint current = 0;
    ::glGetIntegerv(GL_CURRENT_PROGRAM, &current);
    EXPECT_EQ("f.resolvedSlot_ >= 0",
              MessageOf([&] { buffer.setupWithProgram(static_cast<unsigned int>(current)); }));
    unrelated.disable();
}
