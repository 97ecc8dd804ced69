// The uniform setters: every one in its four forms, read back from the program.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/internal/programimplcore.h"
#include "oru/oru_ogl/ogl/programogl.h"

#include <functional>
#include <numeric>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

enum Form { LOCATION, NAME, LOCATION_UNSAFE, NAME_UNSAFE, FORMS };

/// A setter with values, and what the program must hold then.
template<class AnyProgram>
struct Case {
    char const *name;
    char const *type;           ///< of the uniform, in GLSL
    int elements;               ///< of an array, 0 for none
    unsigned int asserted;      ///< the GL type that the guarded form asserts, 0 for none
    std::vector<float> element; ///< the last element's components
    std::function<void(AnyProgram &, int, char const *)> set[FORMS];
};

// Values of no two alike, so that an exchanged pair shows.
int const kInts[] = {2, 3, 5, 7, 11, 13, 17, 19, 23, 29, 31, 37};
auto const kValues = [] {
    std::vector<float> values(32);
    std::iota(values.begin(), values.end(), 1.5f);
    return values;
}();
float const *const kFloats = kValues.data();

/// The n × n matrix at `data`, turned over.
std::vector<float> Transposed(float const *data, int n) {
    std::vector<float> result;
    for (int i = 0; i < n * n; ++i)
        result.push_back(data[i % n * n + i / n]);
    return result;
}

template<class AnyProgram>
std::vector<Case<AnyProgram>> Cases() {
    using Floats = std::vector<float>;
    unsigned char const two = 2, zero = 0, nine = 9, one = 1;
#define ORU_CASE(type, elements, asserted, expected, setter, ...)                                  \
    {                                                                                              \
#setter "(" #__VA_ARGS__ ")", type, elements, asserted, expected, {                        \
            [=](AnyProgram &p, int location, char const *) { p.setter(location, __VA_ARGS__); },   \
                [=](AnyProgram &p, int, char const *name) { p.setter(name, __VA_ARGS__); },        \
                [=](AnyProgram &p, int location, char const *) {                                   \
                    p.setter##_Unsafe(location, __VA_ARGS__);                                      \
                },                                                                                 \
                [=](AnyProgram &p, int, char const *name) {                                        \
                    p.setter##_Unsafe(name, __VA_ARGS__);                                          \
                }                                                                                  \
        }                                                                                          \
    }
    return {
        ORU_CASE("bool", 0, GL_BOOL, (Floats{1}), setUniform, true),
        ORU_CASE("bvec2", 0, GL_BOOL_VEC2, (Floats{0, 1}), setUniform, false, true),
        ORU_CASE("bvec3", 0, GL_BOOL_VEC3, (Floats{1, 0, 1}), setUniform, true, false, true),
        ORU_CASE("bvec4", 0, GL_BOOL_VEC4, (Floats{0, 0, 1, 0}), setUniform, false, false, true,
                 false),
        ORU_CASE("bool", 0, GL_BOOL, (Floats{1}), setUniform, two),
        ORU_CASE("bvec2", 0, GL_BOOL_VEC2, (Floats{0, 1}), setUniform, zero, nine),
        ORU_CASE("bvec3", 0, GL_BOOL_VEC3, (Floats{1, 0, 1}), setUniform, two, zero, nine),
        ORU_CASE("bvec4", 0, GL_BOOL_VEC4, (Floats{0, 1, 0, 1}), setUniform, zero, one, zero, nine),
        // The bytes themselves, in an integer.
        ORU_CASE("int", 0, GL_BOOL, (Floats{9}), setUniform, nine),
        ORU_CASE("ivec4", 0, GL_BOOL_VEC4, (Floats{2, 0, 9, 1}), setUniform, two, zero, nine, one),
        ORU_CASE("int", 0, GL_INT, (Floats{-5}), setUniform, -5),
        ORU_CASE("ivec2", 0, GL_INT_VEC2, (Floats{-5, 6}), setUniform, -5, 6),
        ORU_CASE("ivec3", 0, GL_INT_VEC3, (Floats{-5, 6, 7}), setUniform, -5, 6, 7),
        ORU_CASE("ivec4", 0, GL_INT_VEC4, (Floats{-5, 6, 7, 8}), setUniform, -5, 6, 7, 8),
        ORU_CASE("float", 0, GL_FLOAT, (Floats{0.5f}), setUniform, 0.5f),
        ORU_CASE("vec2", 0, GL_FLOAT_VEC2, (Floats{0.5f, -2}), setUniform, 0.5f, -2.f),
        ORU_CASE("vec3", 0, GL_FLOAT_VEC3, (Floats{0.5f, -2, 3}), setUniform, 0.5f, -2.f, 3.f),
        ORU_CASE("vec4", 0, GL_FLOAT_VEC4, (Floats{0.5f, -2, 3, 4}), setUniform, 0.5f, -2.f, 3.f,
                 4.f),
        ORU_CASE("sampler1D", 0, GL_SAMPLER_1D, (Floats{3}), setUniformSampler1D, 3),
        ORU_CASE("sampler2D", 0, GL_SAMPLER_2D, (Floats{4}), setUniformSampler2D, 4),
        ORU_CASE("sampler2DRect", 0, GL_SAMPLER_2D_RECT, (Floats{5}), setUniformSampler2DRECT, 5),
        ORU_CASE("sampler3D", 0, GL_SAMPLER_3D, (Floats{6}), setUniformSampler3D, 6),
        ORU_CASE("int", 3, 0, (Floats{5}), setUniform, 3, kInts),
        ORU_CASE("float", 3, 0, (Floats{3.5f}), setUniform, 3, kFloats),
        ORU_CASE("ivec2", 3, 0, (Floats{11, 13}), setUniform2, 3, kInts),
        ORU_CASE("vec2", 3, 0, (Floats{5.5f, 6.5f}), setUniform2, 3, kFloats),
        ORU_CASE("ivec3", 3, 0, (Floats{17, 19, 23}), setUniform3, 3, kInts),
        ORU_CASE("vec3", 3, 0, (Floats{7.5f, 8.5f, 9.5f}), setUniform3, 3, kFloats),
        ORU_CASE("ivec4", 3, 0, (Floats{23, 29, 31, 37}), setUniform4, 3, kInts),
        ORU_CASE("vec4", 3, 0, (Floats{9.5f, 10.5f, 11.5f, 12.5f}), setUniform4, 3, kFloats),
        ORU_CASE("mat2", 0, GL_FLOAT_MAT2, (Floats(kFloats, kFloats + 4)), setUniformMatrix2,
                 kFloats, zero),
        ORU_CASE("mat3", 0, GL_FLOAT_MAT3, (Floats(kFloats, kFloats + 9)), setUniformMatrix3,
                 kFloats, zero),
        ORU_CASE("mat4", 0, GL_FLOAT_MAT4, (Floats(kFloats, kFloats + 16)), setUniformMatrix4,
                 kFloats, zero),
        ORU_CASE("mat2", 2, GL_FLOAT_MAT2, Transposed(kFloats + 4, 2), setUniformMatrices2, 2,
                 kFloats, one),
        ORU_CASE("mat3", 2, GL_FLOAT_MAT3, Transposed(kFloats + 9, 3), setUniformMatrices3, 2,
                 kFloats, one),
        ORU_CASE("mat4", 2, GL_FLOAT_MAT4, Transposed(kFloats + 16, 4), setUniformMatrices4, 2,
                 kFloats, one),
    };
#undef ORU_CASE
}

std::string NameOf(std::size_t i) {
    return "u" + std::to_string(i);
}

/// The element that a case looks at.
template<class Case>
std::string LastOf(Case const &c, std::string const &name) {
    return c.elements ? name + "[" + std::to_string(c.elements - 1) + "]" : name;
}

/// A fragment shader in which every case has a uniform of its own, and none is left out as unused.
template<class Cases>
std::string Source(Cases const &cases) {
    std::string uniforms = "#version 120\n#extension GL_ARB_texture_rectangle : enable\n", use;
    for (std::size_t i = 0; i < cases.size(); ++i) {
        std::string const type = cases[i].type, name = NameOf(i), value = LastOf(cases[i], name);
        int const elements = cases[i].elements;
        uniforms += "uniform " + type + " " + name +
                    (elements ? "[" + std::to_string(elements) + "];\n" : ";\n");
        if (type.find("sampler") == 0) {
            std::string const kind = type.substr(7);
            use += "sum += texture" + kind + "(" + value + ", " +
                   (kind == "1D"   ? "0.0"
                    : kind == "3D" ? "vec3(0)"
                                   : "vec2(0)") +
                   ").r;\n";
        } else {
            use += "sum += float(" + value +
                   (type.find("mat") == 0 ? "[0][0]"
                    : type.back() <= '9'  ? ".x"
                                          : "") +
                   ");\n";
        }
    }
    return uniforms + "void main() { float sum = 0.0;\n" + use + "gl_FragColor = vec4(sum); }";
}

template<class AnyProgram, class Cases>
void Build(AnyProgram &program, Cases const &cases) {
    std::string const source = Source(cases);
    char const *const text = source.c_str();
    program.loadFragmentShader(1, &text, nullptr);
    program.link(true);
}

std::vector<float> Read(Program const &program, std::string const &name, std::size_t size) {
    std::vector<float> values(16);
    ORU_GL(GetUniformfv, static_cast<GLuint>(Get(GL_CURRENT_PROGRAM)),
           program.getUniformLocation(name.c_str()), values.data());
    values.resize(size);
    return values;
}

} // namespace

class UniformsTest : public ObjectTest {};

TEST_F(UniformsTest, EverySetterInEveryForm) {
    auto const cases = Cases<Program>();
    for (int form = 0; form < FORMS; ++form) {
        Program program, other;
        Build(program, cases);
        Build(other, cases);
        for (std::size_t i = 0; i < cases.size(); ++i) {
            auto const &c = cases[i];
            SCOPED_TRACE(std::string(c.name) + " form " + std::to_string(form));
            std::string const name = NameOf(i), last = LastOf(c, name);
            int const location = program.getUniformLocation(name.c_str());
            auto const set = [&] { c.set[form](program, location, name.c_str()); };
            program.enable();
            EXPECT_EQ(std::vector<float>(c.element.size()), Read(program, last, c.element.size()));
            EXPECT_FAILURE("", set());
            EXPECT_EQ(c.element, Read(program, last, c.element.size()));
            // An array set by name goes to the program that is current, as what is set unsafely.
            other.enable();
            bool const asks = form == LOCATION || (form == NAME && c.asserted != 0);
            EXPECT_FAILURE(asks ? "Program must be enabled to set uniform parameter" : "", set());
        }
        other.disable();
    }
}

TEST_F(UniformsTest, CallsAndAssertionsOfEachForm) {
    /// Notes what it is asked to assert.
    class Body : public ProgramImplCore {
    public:
        using ProgramImplCore::setUniform;
        mutable std::vector<unsigned int> asserted;
        void assertActiveUniformType(int location, unsigned int type,
                                     unsigned int count) const override {
            asserted = {static_cast<unsigned int>(location), type, count};
        }
    };
    auto const cases = Cases<Body>();
    Body body;
    Build(body, cases);
    body.enable();
    for (std::size_t i = 0; i < cases.size(); ++i) {
        auto const &c = cases[i];
        SCOPED_TRACE(c.name);
        std::string const name = NameOf(i);
        int const location = body.getUniformLocation(name.c_str());
        unsigned int const count = c.elements ? static_cast<unsigned int>(c.elements) : 1;
        std::vector<unsigned int> asserted;
        if (c.asserted)
            asserted = {static_cast<unsigned int>(location), c.asserted, count};
        Pushed<CountingForwarder> calls;
        auto const expect = [&](Form form, int at, std::vector<unsigned int> const &assertion,
                                int lookUps, int queries, int total) {
            body.asserted.clear();
            calls->reset();
            c.set[form](body, at, name.c_str());
            EXPECT_EQ(assertion, body.asserted) << form;
            EXPECT_EQ(lookUps, calls->count("GetUniformLocation")) << form;
            EXPECT_EQ(queries, calls->count("GetIntegerv")) << form;
            EXPECT_EQ(total, calls->total()) << form;
        };
        expect(LOCATION, location, asserted, 0, 1, 2);
        bool const matrix = std::string(c.type).find("mat") == 0; // asks by location only
        int const queries = !c.asserted ? 0 : matrix ? 1 : 2;
        expect(NAME, location, asserted, 1, queries, queries + 2);
        expect(LOCATION_UNSAFE, location, {}, 0, 0, 1);
        expect(LOCATION_UNSAFE, -1, {}, 0, 0, 0);
        expect(NAME_UNSAFE, location, {}, 1, 0, 2);
    }
    body.disable();
}
