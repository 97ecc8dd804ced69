// Vertex buffers: fields of every type drawn and read back, copies, and what they refuse.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <algorithm>
#include <numeric>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

using Field = VertexBuffer::Field;
using Floats = std::vector<float>;

unsigned int const kCount = 5; ///< vertices, each a point on a pixel of its own

unsigned char const *Bytes(Floats const &values) {
    return reinterpret_cast<unsigned char const *>(values.data());
}

VertexBuffer::AttributeType Type(unsigned int components) {
    return static_cast<VertexBuffer::AttributeType>(components);
}

/// What OpenGL gives the shader for an attribute of fewer components, and the untouched rest.
Floats Expected(Floats const &values, unsigned int components, unsigned int vertices = kCount) {
    Floats pixels(std::size_t{4} * kCount, -1.f);
    for (unsigned int i = 0; i < 4 * vertices; ++i) {
        unsigned int const component = i % 4;
        float const missing = component == 3 ? 1.f : 0.f;
        pixels[i] = component < components ? values[i / 4 * components + component] : missing;
    }
    return pixels;
}

/// Points at the centres of kCount pixels in a row.
VertexBuffer Points(unsigned int components) {
    VertexBuffer buffer({Field("value", Type(components), VertexBuffer::EXPECTEDUSAGE_DYNAMIC_DRAW),
                         Field("place", VertexBuffer::ATTRIBUTETYPE_FLOAT,
                               VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW)},
                        kCount, VertexBuffer::PRIMITIVETYPE_POINTS);
    Floats const places = {-0.8f, -0.4f, 0.f, 0.4f, 0.8f};
    buffer.setField("place", Bytes(places), false, 0, 0);
    return buffer;
}

void Build(Program &program, char const *vertex, char const *fragment) {
    program.loadVertexShader(1, &vertex, nullptr);
    program.loadFragmentShader(1, &fragment, nullptr);
    program.link(true);
}

/// Draws with the current program into a row of pixels and gives them, four floats each.
Floats Drawn(VertexBuffer &buffer, std::size_t count = kCount) {
    auto const width = static_cast<GLsizei>(kCount);
    Renderbuffer row(GL_RGBA32F, width, 1);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&row, 0);
    ORU_GL(Viewport, 0, 0, width, 1);
    ORU_GL(ClearColor, -1.f, -1.f, -1.f, -1.f);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    buffer.drawPrimitives(count);
    EXPECT_EQ(0, Get(GL_VERTEX_ARRAY_BINDING));
    Floats pixels(std::size_t{4} * kCount);
    ORU_GL(ReadPixels, 0, 0, width, 1, GL_RGBA, GL_FLOAT, pixels.data());
    return pixels;
}

} // namespace

class VertexBufferTest : public ObjectTest {};

// Every type, gathered from vertices that lie together or apart.
TEST_F(VertexBufferTest, DrawsFieldsOfEveryType) {
    // Writes an attribute into the pixels it is drawn at, exactly.
    Program program;
    Build(program,
          "attribute float place; attribute vec4 value; varying vec4 colour;"
          "void main() { colour = value; gl_Position = vec4(place, 0, 0, 1); }",
          "varying vec4 colour; void main() { gl_FragColor = colour; }");
    program.enable();
    auto const name = static_cast<unsigned int>(Get(GL_CURRENT_PROGRAM));
    for (unsigned int components = 1; components <= 4; ++components) {
        for (unsigned int const step : {0u, components, 5u}) {
            SCOPED_TRACE(testing::Message() << components << " in " << step);
            Floats values(std::size_t{kCount} * components);
            std::iota(values.begin(), values.end(), 100.25f);
            std::size_t const stride = std::max(step, components);
            Floats source(stride * kCount, 77.f);
            for (std::size_t i = 0; i < values.size(); ++i)
                source[i / components * stride + i % components] = values[i];
            VertexBuffer buffer = Points(components);
            buffer.setupWithProgram(name);
            buffer.setField("value", Bytes(source), false, 4 * step, 0);
            buffer.marshallData();
            EXPECT_EQ(Expected(values, components), Drawn(buffer));

            std::iota(values.begin(), values.begin() + 2 * components, 7.f);
            buffer.setField(0, Bytes(values), 0, 2);
            buffer.marshallData(3);
            EXPECT_EQ(Expected(values, components, 3), Drawn(buffer, 3));
        }
    }
}

TEST_F(VertexBufferTest, CopiesHaveNoOpenGLObjects) {
    Program program;
    Build(program, "attribute float p; void main() { gl_Position = vec4(p); }", "void main() {}");
    VertexBuffer buffer(
        {Field("p", VertexBuffer::ATTRIBUTETYPE_FLOAT, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW)},
        kCount, VertexBuffer::PRIMITIVETYPE_LINES);
    buffer.setupWithProgram(&program);
    VertexBuffer const copy(buffer);
    VertexBuffer assigned;
    assigned = copy;
    EXPECT_EQ(VertexBuffer::PRIMITIVETYPE_LINES, assigned.primitiveType());
    EXPECT_FAILURE("vertexBuffer_ != 0", assigned.marshallData());
    VertexBuffer taken(std::move(buffer)); // with its objects
    EXPECT_FAILURE("", taken.marshallData());
    taken = std::move(assigned);
    EXPECT_FAILURE("vertexBuffer_ != 0", taken.marshallData());
}

TEST_F(VertexBufferTest, RefusesWhatItCannotDraw) {
    for (unsigned int const type : {0u, 5u})
        EXPECT_FAILURE("Unexpected field type", Field("p", Type(type), {}));
    VertexBuffer buffer = Points(2);
    unsigned char const data[8] = {};
    EXPECT_FAILURE("ignoreMissingFields", buffer.setField("missing", data, false, 0, 1));
    EXPECT_FAILURE("", buffer.setField("missing", data, true, 0, 1));
    EXPECT_FAILURE("Enforce oglProgram != NULL",
                   buffer.setupWithProgram(static_cast<Program *>(nullptr)));
    Program other; // without the attributes
    Build(other, "void main() { gl_Position = vec4(0); }", "void main() {}");
    EXPECT_FAILURE("f.resolvedSlot_ >= 0", buffer.setupWithProgram(&other));

    // The three primitive types that core contexts lack; others are OpenGL's matter.
    for (unsigned int type = 6; type <= 10; ++type) {
        VertexBuffer shape({}, 0, static_cast<VertexBuffer::PrimitiveType>(type));
        EXPECT_EQ(IsCoreRun() && type > 6 && type < 10,
                  MessageOf([&] { shape.drawPrimitives(0); }).find("Quadrilaterals") == 0);
    }
}
