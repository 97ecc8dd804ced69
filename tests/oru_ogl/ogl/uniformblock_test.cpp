// Uniform blocks: whatever their layout, a shader reads what the writer wrote.
#include "tests/support/shaders.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/uniformblock.h"
#include "oru/oru_ogl/ogl/uniformblockwriter.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

using namespace ORU::OGL;
using namespace oru_test;

namespace {

using Writer = UniformBlockWriter;

struct Member {
    std::string type, name;
    unsigned int count; ///< of an array, 0 for none
    unsigned int columns, rows;
    char kind; ///< of numbers: f, d, i, u, b
};

// With gaps wherever a layout may want them.
Member const kMembers[] = {
    {"float", "one", 0, 1, 1, 'f'},        {"vec3", "three", 0, 1, 3, 'f'},
    {"vec2", "pairs", 3, 1, 2, 'f'},       {"mat3", "square", 0, 3, 3, 'f'},
    {"mat2x3", "flat_", 2, 2, 3, 'f'},     {"float", "several", 3, 1, 1, 'f'},
    {"mat4x2", "wide", 0, 4, 2, 'f'},      {"int", "whole", 0, 1, 1, 'i'},
    {"ivec4", "wholes", 0, 1, 4, 'i'},     {"uvec3", "naturals", 2, 1, 3, 'u'},
    {"bool", "truth", 0, 1, 1, 'b'},       {"bvec2", "truths", 2, 1, 2, 'b'},
    {"double", "exact", 0, 1, 1, 'd'},     {"dvec3", "exacts", 2, 1, 3, 'd'},
    {"dmat2x3", "exactFlat", 0, 2, 3, 'd'}};

std::string Index(unsigned int i) {
    return '[' + std::to_string(i) + ']';
}

template<class Number>
void Set(Writer &writer, Member const &member, std::vector<float> const &values) {
    std::vector<Number> numbers;
    for (float const value : values)
        numbers.push_back(static_cast<Number>(value));
    unsigned int const elements = std::max(member.count, 1u);
    std::size_t const each = numbers.size() / elements;
    if (numbers.size() == 1) // by the member as OpenGL knows it
        return writer.set(writer.block().member(member.name), numbers[0]);
    writer.set(member.name, numbers.data(), elements - 1); // the last one by itself
    writer.set(member.name, numbers.data() + each * (elements - 1), 1, elements - 1);
}

} // namespace

class UniformBlockTest : public ObjectTest {};

// A shader that draws every number of every member at a pixel of its own.
TEST_F(UniformBlockTest, ShadersReadWhatWasWritten) {
    std::string declared, reads;
    std::vector<float> expected;
    for (Member const &member : kMembers) {
        declared +=
            member.type + ' ' + member.name + (member.count ? Index(member.count) : "") + ';';
        for (unsigned int e = 0; e < std::max(member.count, 1u); ++e)
            for (unsigned int c = 0; c < member.columns; ++c)
                for (unsigned int r = 0; r < member.rows; ++r) {
                    reads += "if (n == " + std::to_string(expected.size()) +
                             ") return float(BLOCK " + member.name +
                             (member.count ? Index(e) : "") + (member.columns > 1 ? Index(c) : "") +
                             (member.rows > 1 ? Index(r) : "") + ");";
                    expected.push_back(member.kind == 'b'
                                           ? static_cast<float>(expected.size() % 3 == 0)
                                           : static_cast<float>(7 * expected.size() + 1));
                }
    }
    int const count = static_cast<int>(expected.size());
    for (std::string const layout : {"std140", "shared", "packed", "std140, row_major"}) {
        for (std::string const instance : {"", "named"}) {
            SCOPED_TRACE(layout + ' ' + instance);
            std::string const block =
                "layout(" + layout + ") uniform Values {" + declared + '}' + instance + ";";
            Program program = Linked(
                {{Shader::SHADERTYPE_VERTEX,
                  "#version 410\n#define BLOCK" + (instance.empty() ? "" : ' ' + instance + '.') +
                      '\n' + block + "float read(int n) {" + reads +
                      "return -2.0; } flat out float value; void main() {"
                      "value = read(gl_VertexID); gl_Position = vec4((2.0 * float(gl_VertexID) +"
                      "1.0) / float(" +
                      std::to_string(count) + ") - 1.0, 0, 0, 1); }"},
                 {Shader::SHADERTYPE_FRAGMENT, "#version 410\nflat in float value; out vec4 pixel;"
                                               "void main() { pixel = vec4(value); }"}});
            UniformBlock const layoutOf(program, "Values");
            layoutOf.setBinding(3);
            EXPECT_EQ(3u, layoutOf.binding());
            EXPECT_EQ(std::size(kMembers), layoutOf.members().size());
            Writer writer(layoutOf);
            std::size_t at = 0;
            for (Member const &member : kMembers) {
                std::size_t const size =
                    std::size_t{std::max(member.count, 1u)} * member.columns * member.rows;
                std::vector<float> const values(expected.begin() + static_cast<int>(at),
                                                expected.begin() + static_cast<int>(at + size));
                at += size;
                switch (member.kind) {
                case 'f':
                    Set<float>(writer, member, values);
                    break;
                case 'd':
                    Set<double>(writer, member, values);
                    break;
                case 'u':
                    Set<unsigned int>(writer, member, values);
                    break;
                default:
                    Set<int>(writer, member, values);
                }
            }
            auto const before = static_cast<std::int64_t>(UniformBlock::OffsetAlignment());
            auto const size = static_cast<std::int64_t>(layoutOf.size());
            Buffer buffer(before + size, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW,
                          nullptr);
            writer.upload(buffer, before);
            EXPECT_FALSE(buffer.isBound());
            buffer.bindRange(GL_UNIFORM_BUFFER, 3, before, size);
            program.enable();
            VertexArray const array;
            auto const drawn = DrawnInto(count, [&] { array.drawArrays(GL_POINTS, 0, count); });
            for (std::size_t i = 0; i < expected.size(); ++i)
                EXPECT_EQ(expected[i], drawn[4 * i]) << "number " << i;
            Buffer::BindDefaultBase(GL_UNIFORM_BUFFER, 3);
            program.disable();
        }
    }
    EXPECT_LE(36u, UniformBlock::MaxBindings());
    EXPECT_LE(16384u, UniformBlock::MaxSize());
}

TEST_F(UniformBlockTest, RefusesWhatIsNotThere) {
    Program program = Linked(
        {{Shader::SHADERTYPE_VERTEX,
          "#version 410\nlayout(std140) uniform Light { vec3 colour; float gains[2]; bool on; }"
          "lights[2]; void main() { gl_Position = vec4(lights[1].colour * lights[0].gains[1],"
          "lights[1].on); }"}});
    EXPECT_FAILURE("The program has no active uniform block \"Lights\"",
                   UniformBlock(program, "Lights"));
    UniformBlock const block(program, "Light[1]");
    EXPECT_EQ(block.member("gains").offset, block.member("Light.gains[0]").offset);
    EXPECT_FAILURE("The uniform block \"Light[1]\" has no active member \"shade\"",
                   block.member("shade"));
    Writer writer(block);
    EXPECT_FAILURE("The uniform \"colour\" takes 3 numbers for each element, and was given 2",
                   writer.set("colour", {1.f, 2.f}));
    EXPECT_FAILURE("The uniform \"colour\" is of the type GL_FLOAT_VEC3, and was given values of "
                   "GL_INT",
                   writer.set("colour", {1, 2, 3}));
    EXPECT_FAILURE("The uniform \"gains\" has 2 elements, and was given 2 from 1 on",
                   writer.set("gains", {1.f, 2.f}, 1));
    EXPECT_FAILURE("The uniform \"gains\" has 2 elements, and was given 1 from 3 on",
                   writer.set("gains", {1.f}, 3));
    UniformBlock::Member foreign = block.member("gains");
    foreign.offset = block.size() - 4;
    EXPECT_FAILURE(
        "The uniform \"gains\" is of another block than \"Light[1]\": it would lie behind "
        "it",
        writer.set(foreign, {1.f, 2.f}));
    writer.set("on", true);
    writer.set("colour", {1.f, 2.f, 3.f});
    Buffer small(block.size() - 1, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    std::string const size = std::to_string(block.size()), less = std::to_string(small.size());
    EXPECT_FAILURE("The uniform block \"Light[1]\" of " + size +
                       " bytes does not fit into the buffer of " + less + " from 0 on",
                   writer.upload(small));
}
