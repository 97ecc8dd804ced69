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

/// What OpenGL gives the shader for an attribute of fewer components, and the untouched rest.
Pixels Expected(Pixels const &values, unsigned int components, unsigned int vertices = kCount) {
    Pixels pixels(std::size_t{4} * kCount, -1.f);
    for (unsigned int i = 0; i < 4 * vertices; ++i) {
        unsigned int const component = i % 4;
        pixels[i] = component < components ? values[i / 4 * components + component]
                    : component == 3       ? 1.f
                                           : 0.f;
    }
    return pixels;
}

Pixels Values(unsigned int components, float first = 100.25f) {
    Pixels values(std::size_t{kCount} * components);
    std::iota(values.begin(), values.end(), first);
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

class VertexBufferTest : public ObjectTest {
protected:
    void TearDown() override {
        program_.reset();
        ObjectTest::TearDown();
    }

    /// By default a program that writes an attribute into the pixels it is drawn at, exactly.
    void build(char const *vertex = "attribute float place; attribute vec4 value;"
                                    "varying vec4 colour; void main() { colour = value;"
                                    " gl_Position = vec4(place, 0, 0, 1); }",
               char const *fragment = "varying vec4 colour;"
                                      "void main() { gl_FragColor = colour; }") {
        program_.emplace();
        program_->loadVertexShader(1, &vertex, nullptr);
        program_->loadFragmentShader(1, &fragment, nullptr);
        program_->link(true);
    }

    unsigned int programID() {
        program_->enable();
        auto const name = static_cast<unsigned int>(Get(GL_CURRENT_PROGRAM));
        program_->disable();
        return name;
    }

    /// Draws with the program into a row of pixels and gives them, four floats each.
    Pixels drawn(VertexBuffer &buffer, std::size_t count = kCount) {
        Renderbuffer row(GL_RGBA32F, kCount, 1);
        Framebuffer framebuffer;
        framebuffer.bind();
        framebuffer.attach(&row, 0);
        ORU_GL(Viewport, 0, 0, static_cast<GLsizei>(kCount), 1);
        ORU_GL(ClearColor, -1.f, -1.f, -1.f, -1.f);
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
        program_->enable();
        buffer.drawPrimitives(count);
        program_->disable();
        EXPECT_EQ(0, Get(GL_VERTEX_ARRAY_BINDING));
        Pixels pixels(std::size_t{4} * kCount);
        ORU_GL(ReadPixels, 0, 0, static_cast<GLsizei>(kCount), 1, GL_RGBA, GL_FLOAT, pixels.data());
        framebuffer.unbind();
        return pixels;
    }

    std::optional<Program> program_;
};

TEST_F(VertexBufferTest, DrawsFieldsOfEveryType) {
    build();
    for (unsigned int components = 1; components <= 4; ++components) {
        SCOPED_TRACE(components);
        Pixels const values = Values(components);
        VertexBuffer buffer = Points(components);
        EXPECT_EQ(4 * components, Field("", Type(components), {}).byteSize());
        buffer.setupWithProgram(&*program_);
        buffer.marshallData();
        EXPECT_EQ(Expected(Pixels(values.size()), components), drawn(buffer)) << "zeros until set";
        buffer.setField("value", Bytes(values), false, 0, 0);
        buffer.marshallData();
        EXPECT_EQ(Expected(values, components), drawn(buffer));
        buffer.marshallData(3);
        EXPECT_EQ(Expected(values, components, 2), drawn(buffer, 2));
        EXPECT_EQ(Pixels(std::size_t{4} * kCount, -1.f), drawn(buffer, 0));
    }
}

TEST_F(VertexBufferTest, GathersFromPaddedVertices) {
    build();
    for (unsigned int components = 1; components <= 4; ++components) {
        SCOPED_TRACE(components);
        Pixels values = Values(components);
        std::size_t const step = 5;
        Pixels padded(step * kCount, 77.f);
        for (std::size_t i = 0; i < values.size(); ++i)
            padded[i / components * step + i % components] = values[i];
        VertexBuffer buffer = Points(components);
        buffer.setField(0, Bytes(padded), step * 4, 0);
        buffer.setupWithProgram(programID());
        buffer.marshallData();
        EXPECT_EQ(Expected(values, components), drawn(buffer));
        Pixels const others = Values(components, 7); // the first three lie together
        buffer.setField(0, Bytes(others), 4 * components, 3);
        buffer.marshallData();
        std::copy_n(others.begin(), 3 * components, values.begin());
        EXPECT_EQ(Expected(values, components), drawn(buffer));
    }
}

TEST_F(VertexBufferTest, CopiesHaveNoOpenGLObjects) {
    build();
    VertexBuffer buffer = Points(1);
    Pixels const values = Values(1);
    buffer.setField("value", Bytes(values), false, 0, 0);
    buffer.setupWithProgram(&*program_);
    buffer.marshallData();
    VertexBuffer copy(buffer), assigned;
    EXPECT_EQ(0u, assigned.vertexCount());
    assigned = buffer;
    EXPECT_FAILURE("vertexBuffer_ != 0", copy.marshallData());
    EXPECT_FAILURE("vertexBuffer_ != 0", assigned.marshallData());
    EXPECT_EQ(kCount, assigned.vertexCount());
    EXPECT_EQ(VertexBuffer::PRIMITIVETYPE_POINTS, assigned.primitiveType());
    copy.setupWithProgram(&*program_);
    copy.marshallData();
    EXPECT_EQ(Expected(values, 1), drawn(copy));
    VertexBuffer taken(std::move(buffer)); // with its objects
    EXPECT_EQ(Expected(values, 1), drawn(taken));
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
    EXPECT_FAILURE("vertexBuffer_ != 0", buffer.marshallData());
    EXPECT_FAILURE("Enforce oglProgram != NULL",
                   buffer.setupWithProgram(static_cast<Program *>(nullptr)));
    build("void main() { gl_Position = vec4(0); }", "void main() {}");
    EXPECT_FAILURE("f.resolvedSlot_ >= 0", buffer.setupWithProgram(&*program_));
    EXPECT_FAILURE("f.resolvedSlot_ >= 0", buffer.setupWithProgram(programID()));
}
