// Vertex arrays: attributes of every kind and every way to draw, all seen in whole pictures.
#include "tests/support/shaders.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/vertexarray.h"
#include "oru/oru_ogl/ogl/vertexarraybindscope.h"

#include <cstring>
#include <functional>
#include <numeric>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

using Attribute = VertexArray::Attribute;
using Floats = std::vector<float>;

int const kCount = 4; ///< vertices, each a point on a pixel of its own

template<class Number>
Buffer BufferOf(std::vector<Number> const &numbers) {
    return Buffer(static_cast<std::int64_t>(numbers.size() * sizeof(Number)),
                  Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, numbers.data());
}

/// A program that draws the attribute `value`, of a type of GLSL, at the pixel `place`.
Program Points(std::string const &type) {
    return Linked(
        {{Shader::SHADERTYPE_VERTEX,
          "#version 410\nin float place; in " + type +
              " value; out vec4 colour; void main() { colour = vec4(value);"
              " gl_Position = vec4((2.0 * place + 1.0) / 4.0 - 1.0, 0, 0, 1); }"},
         {Shader::SHADERTYPE_FRAGMENT,
          "#version 410\nin vec4 colour; out vec4 pixel; void main() { pixel = colour; }"}});
}

/// Draws numbers that lie behind a gap and apart, as vectors of four.
template<class Number>
void ExpectDrawn(std::string const &glsl, Attribute attribute, Floats const &expected,
                 std::vector<Number> const &numbers) {
    SCOPED_TRACE(glsl);
    std::size_t const each = 4 * sizeof(Number), step = each + 8, gap = 16;
    std::vector<unsigned char> bytes(gap + step * kCount, 0xEE);
    for (std::size_t i = 0; i < kCount; ++i)
        std::memcpy(&bytes[gap + i * step], &numbers[4 * i], each);
    Buffer const values = BufferOf(bytes), places = BufferOf(Floats{0, 1, 2, 3});
    Program program = Points(glsl);
    program.enable();
    VertexArray array;
    Buffer occupant = BufferOf(Floats{1});
    occupant.bind();
    array.setAttribute(program.getAttributeLocation("place"), places, {1, GL_FLOAT});
    array.setAttribute(program.getAttributeLocation("value"), values,
                       attribute.stride(static_cast<int>(step)).offset(gap));
    EXPECT_TRUE(occupant.isBound());
    EXPECT_EQ(0, Get(GL_VERTEX_ARRAY_BINDING));
    Floats const drawn = DrawnInto(kCount, [&] { array.drawArrays(GL_POINTS, 0, kCount); });
    for (std::size_t i = 0; i < drawn.size(); ++i)
        EXPECT_NEAR(expected[i], drawn[i], 1e-6) << "number " << i;
    EXPECT_EQ(0, Get(GL_VERTEX_ARRAY_BINDING));
    Buffer::BindDefaultArrayBuffer();
    program.disable();
}

/// 16 numbers, and what becomes of them.
template<class Number, class Change>
void ExpectAll(std::string const &glsl, Attribute const &attribute, Number step, Change change) {
    std::vector<Number> numbers(std::size_t{4} * kCount);
    Floats expected(numbers.size());
    for (std::size_t i = 0; i < numbers.size(); ++i) {
        numbers[i] = static_cast<Number>(step * static_cast<Number>(static_cast<int>(i) - 7));
        expected[i] = static_cast<float>(change(numbers[i]));
    }
    ExpectDrawn(glsl, attribute, expected, numbers);
}

} // namespace

class VertexArrayTest : public ObjectTest {};

TEST_F(VertexArrayTest, ReadsAttributesOfEveryKind) {
    auto const same = [](auto number) { return number; };
    ExpectAll<float>("vec4", {4, GL_FLOAT}, 0.25f, same);
    ExpectAll<std::uint8_t>("vec4", {4, GL_UNSIGNED_BYTE}, 3, same);
    ExpectAll<std::uint8_t>("vec4", Attribute(4, GL_UNSIGNED_BYTE).normalized(), 17,
                            [](float number) { return number / 255; });
    ExpectAll<std::int16_t>("vec4", {4, GL_SHORT}, 1001, same);
    ExpectAll<std::int32_t>("ivec4", Attribute(4, GL_INT).integer(), 1000001, same);
    ExpectAll<std::uint16_t>("uvec4", Attribute(4, GL_UNSIGNED_SHORT).integer(), 999, same);
    ExpectAll<double>("dvec4", Attribute(4, GL_DOUBLE).asDouble(), 0.125, same);
}

// Each draw gives the picture that its arguments say: which vertices, from which values on.
TEST_F(VertexArrayTest, DrawsByEveryWay) {
    Program program = Points("float");
    Program patches = Linked(
        {{Shader::SHADERTYPE_VERTEX,
          "#version 410\nin float place; in float value; out vec4 passed; void main() {"
          " passed = vec4(value); gl_Position = vec4((2.0 * place + 1.0) / 4.0 - 1.0, 0, 0, 1); }"},
         {Shader::SHADERTYPE_TESSELLATION_EVALUATION,
          "#version 410\nlayout(quads, point_mode) in; in vec4 passed[]; out vec4 colour;"
          " void main() { colour = passed[1]; gl_Position = gl_in[1].gl_Position; }"},
         {Shader::SHADERTYPE_FRAGMENT,
          "#version 410\nin vec4 colour; out vec4 pixel; void main() { pixel = colour; }"}});
    for (Program *const each : {&program, &patches}) {
        each->setAttributeLocation(0, "place");
        each->setAttributeLocation(1, "value");
        each->link(true);
    }
    Buffer const places = BufferOf(Floats{0, 1, 2, 3}), values = BufferOf(Floats{10, 20, 30, 40});
    Buffer const bytes = BufferOf(std::vector<std::uint8_t>{9, 0, 1, 2, 3, 1, 0});
    Buffer const shorts = BufferOf(std::vector<std::uint16_t>{9, 0, 1, 2, 3, 1, 0});
    Buffer const ints = BufferOf(std::vector<std::uint32_t>{9, 0, 1, 2, 3, 1, 0});
    // A draw of nothing, then arrays: count, instances, first, 0; then elements, with a base.
    Buffer const commands =
        BufferOf(std::vector<std::uint32_t>{0, 0, 0, 0, 2, 1, 1, 0, 2, 1, 1, 1, 0});
    using Draw = std::function<void(VertexArray const &)>;
    GLenum const points = GL_POINTS;
    int const firsts[] = {0, 3}, counts[] = {1, 1};
    std::pair<std::vector<int>, Draw> const draws[] = {
        {{1, 2}, [&](auto const &a) { a.drawArrays(points, 1, 2); }},
        {{0, 3}, [&](auto const &a) { a.drawRanges(points, firsts, counts, 2); }},
        {{1, 2}, [&](auto const &a) { a.drawArraysIndirect(points, commands, 16); }},
        {{2, 3}, [&](auto const &a) { a.drawElements(points, 2, 3); }},
        {{1, 2, 3}, [&](auto const &a) { a.drawElements(points, 3, 1, 1); }},
        {{0, 1}, [&](auto const &a) { a.drawRangeElements(points, 0, 1, 2, 1); }},
        {{2, 3}, [&](auto const &a) { a.drawRangeElements(points, 0, 1, 2, 1, 2); }},
        {{1, 2}, [&](auto const &a) { a.drawElementsIndirect(points, commands, 32); }},
        {{1, 3}, [&](auto const &a) { patches.enable(), a.drawPatches(2, 0, 4); }},
        {{0, 3}, [&](auto const &a) { patches.enable(), a.drawPatchElements(2, 4, 3); }}};
    for (auto const &[indices, type] : {std::pair{&bytes, GL_UNSIGNED_BYTE},
                                        {&shorts, GL_UNSIGNED_SHORT},
                                        {&ints, GL_UNSIGNED_INT}}) {
        VertexArray array;
        array.setAttribute(0, places, {1, GL_FLOAT});
        array.setAttribute(1, values, {1, GL_FLOAT});
        array.setIndices(*indices, static_cast<unsigned int>(type));
        for (auto const &[drawn, draw] : draws) {
            SCOPED_TRACE(testing::Message() << &draw - &draws[0].second << " of " << type);
            Floats expected(std::size_t{4} * kCount, -1.f);
            for (int const vertex : drawn)
                std::fill_n(expected.begin() + 4 * vertex, 4,
                            10.f * static_cast<float>(vertex + 1));
            program.enable();
            EXPECT_EQ(expected, DrawnInto(kCount, [&, &go = draw] { go(array); }));
        }
        EXPECT_EQ(3, Get(GL_PATCH_VERTICES)) << "what it is from the start";
        EXPECT_EQ(0, Get(GL_DRAW_INDIRECT_BUFFER_BINDING));
    }
    // Instances: the place is that of the instance, the value of every second one.
    VertexArray array;
    array.setAttribute(0, places, Attribute(1, GL_FLOAT).divisor(1));
    array.setAttribute(1, values, Attribute(1, GL_FLOAT).divisor(2));
    array.setIndices(shorts, GL_UNSIGNED_SHORT);
    Floats expected(std::size_t{4} * kCount, 10.f);
    std::fill_n(expected.begin() + 8, 8, 20.f);
    program.enable();
    array.bind();
    for (Draw const &draw : std::initializer_list<Draw>{
             [&](auto const &a) { a.drawArraysInstanced(points, 0, 1, kCount); },
             [&](auto const &a) { a.drawElementsInstanced(points, 1, kCount, 1); },
             [&](auto const &a) { a.drawElementsInstanced(points, 1, kCount, 1, 2); }})
        EXPECT_EQ(expected, DrawnInto(kCount, [&] { draw(array); }));
    EXPECT_TRUE(array.isBound()) << "as before the draws";
    // Within scopes there is nothing but the draw, and each puts back what it found.
    VertexArray other;
    {
        VertexArrayBindScope const scope(other);
        {
            VertexArrayBindScope const inner(array);
            { VertexArrayBindScope const again(array); }
            InterceptorScope<CountingForwarder> calls;
            draws[0].second(array);
            EXPECT_EQ(calls->count("DrawArrays"), calls->total());
        }
        EXPECT_TRUE(other.isBound());
        EXPECT_EQ(expected,
                  DrawnInto(kCount, [&] { array.drawArraysInstanced(points, 0, 1, kCount); }))
            << "another than the one that the scope holds";
        VertexArrayBindScope const inner(array);
        other.drawArrays(points, 0, 0);
        EXPECT_TRUE(array.isBound()) << "an inner scope's";
    }
    EXPECT_TRUE(array.isBound());
    VertexArray::BindDefault();
    array.setAttribute(0, places, {1, GL_FLOAT}); // for each vertex again
    array.disableAttribute(1);
    ORU_GL(VertexAttrib1f, 1, 70.f);
    EXPECT_EQ(Floats(std::size_t{4} * kCount, 70.f),
              DrawnInto(kCount, [&] { array.drawArrays(points, 0, kCount); }));
    ORU_GL(VertexAttrib1f, 1, 0.f);
    program.disable();
}

TEST_F(VertexArrayTest, RefusesWhatItDoesNotHave) {
    VertexArray array;
    Buffer const numbers = BufferOf(std::vector<std::uint32_t>{1, 2, 3, 4});
    std::string const noAttribute =
        "A vertex array has no attribute below 0: the program does not use the attribute whose "
        "location was asked";
    EXPECT_FAILURE(noAttribute, array.setAttribute(-1, numbers, {1, GL_FLOAT}));
    EXPECT_FAILURE(noAttribute, array.disableAttribute(-1));
    EXPECT_FAILURE("VertexArray::setAttribute: the offset must not be negative",
                   array.setAttribute(0, numbers, Attribute(1, GL_FLOAT).offset(-4)));
    EXPECT_FAILURE("GL_INVALID_VALUE", array.setAttribute(0, numbers, {5, GL_FLOAT}));
    EXPECT_FAILURE("Indices are of GL_UNSIGNED_BYTE, GL_UNSIGNED_SHORT or GL_UNSIGNED_INT",
                   array.setIndices(numbers, GL_FLOAT));
    std::string const noIndices =
        "The vertex array has no indices to draw by: call setIndices() first";
    EXPECT_FAILURE(noIndices, array.drawElements(GL_POINTS, 1));
    EXPECT_FAILURE(noIndices, array.drawElementsIndirect(GL_POINTS, numbers));
    array.setIndices(numbers, GL_UNSIGNED_INT);
    for (auto const &range : {std::pair{5, 0}, {2, 3}, {1, -1}, {0, 5}})
        EXPECT_FAILURE("The vertex array has 4 indices, not " + std::to_string(range.first) +
                           " from " + std::to_string(range.second) + " on",
                       array.drawElements(GL_POINTS, range.first, range.second));
    for (int const offset : {-4, 1, 4})
        EXPECT_FAILURE("A draw of 16 bytes in the buffer of 16 cannot stand at " +
                           std::to_string(offset) +
                           ": it has to lie in the buffer, at a multiple of 4",
                       array.drawArraysIndirect(GL_POINTS, numbers, offset));
    EXPECT_EQ(0, Get(GL_VERTEX_ARRAY_BINDING));
    EXPECT_EQ(0, Get(GL_ARRAY_BUFFER_BINDING));
}
