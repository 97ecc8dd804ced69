// The uniform setters: every one in its four forms, read back from the program.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/internal/programimplcore.h"
#include "oru/oru_ogl/ogl/programogl.h"

#include <functional>
#include <numeric>
#include <type_traits>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

using Floats = std::vector<float>;

enum Form { LOCATION, NAME, LOCATION_UNSAFE, NAME_UNSAFE, FORMS };

/// A setter with values, and what the program must hold then.
template<class AnyProgram>
struct Case {
    char const *call;
    std::string type;      ///< of the uniform, in GLSL
    int elements;          ///< of an array, 0 for none
    unsigned int asserted; ///< the GL type that the guarded form asserts, 0 for none
    Floats element;        ///< the last element's components
    std::function<void(AnyProgram &, int, char const *)> set[FORMS];
};

// Values of no two alike, so that an exchanged pair shows.
int const kInts[] = {2, 3, 5, 7, 11, 13, 17, 19, 23, 29, 31, 37};
auto const kValues = [] {
    Floats values(32);
    std::iota(values.begin(), values.end(), 1.5f);
    return values;
}();
float const *const kFloats = kValues.data();

template<class... Values>
Floats ToFloats(Values... values) {
    return {static_cast<float>(values)...};
}

/// The n × n matrix at `data`, turned over.
Floats Transposed(float const *data, int n) {
    Floats result;
    for (int i = 0; i < n * n; ++i)
        result.push_back(data[i % n * n + i / n]);
    return result;
}

template<class AnyProgram>
std::vector<Case<AnyProgram>> Cases() {
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
// One to four of the values, in a uniform of as many components.
#define ORU_VALUES(scalar, vector, asserted, a, b, c, d)                                           \
    ORU_CASE(scalar, 0, asserted, ToFloats(a), setUniform, a),                                     \
        ORU_CASE(vector "2", 0, asserted##_VEC2, ToFloats(a, b), setUniform, a, b),                \
        ORU_CASE(vector "3", 0, asserted##_VEC3, ToFloats(a, b, c), setUniform, a, b, c),          \
        ORU_CASE(vector "4", 0, asserted##_VEC4, ToFloats(a, b, c, d), setUniform, a, b, c, d)
#define ORU_ARRAY(type, components, setter, data)                                                  \
    ORU_CASE(type, 3, 0, Floats(data + 2 * components, data + 3 * components), setter, 3, data)
// One matrix, and two that are turned over.
#define ORU_MATRIX(type, n, asserted, single, several)                                             \
    ORU_CASE(type, 0, asserted, Floats(kFloats, kFloats + n * n), single, kFloats, zero),          \
        ORU_CASE(type, 2, asserted, Transposed(kFloats + n * n, n), several, 2, kFloats, one)
    return {
        ORU_VALUES("bool", "bvec", GL_BOOL, true, false, true, true),
        // The bytes themselves, in an integer.
        ORU_VALUES("int", "ivec", GL_BOOL, two, zero, nine, one),
        ORU_VALUES("int", "ivec", GL_INT, -5, 6, 7, 8),
        ORU_VALUES("float", "vec", GL_FLOAT, 0.5f, -2.f, 3.f, 4.f),
        ORU_CASE("sampler1D", 0, GL_SAMPLER_1D, (Floats{3}), setUniformSampler1D, 3),
        ORU_CASE("sampler2D", 0, GL_SAMPLER_2D, (Floats{4}), setUniformSampler2D, 4),
        ORU_CASE("sampler2DRect", 0, GL_SAMPLER_2D_RECT, (Floats{5}), setUniformSampler2DRECT, 5),
        ORU_CASE("sampler3D", 0, GL_SAMPLER_3D, (Floats{6}), setUniformSampler3D, 6),
        ORU_ARRAY("int", 1, setUniform, kInts),
        ORU_ARRAY("float", 1, setUniform, kFloats),
        ORU_ARRAY("ivec2", 2, setUniform2, kInts),
        ORU_ARRAY("vec2", 2, setUniform2, kFloats),
        ORU_ARRAY("ivec3", 3, setUniform3, kInts),
        ORU_ARRAY("vec3", 3, setUniform3, kFloats),
        ORU_ARRAY("ivec4", 4, setUniform4, kInts),
        ORU_ARRAY("vec4", 4, setUniform4, kFloats),
        ORU_MATRIX("mat2", 2, GL_FLOAT_MAT2, setUniformMatrix2, setUniformMatrices2),
        ORU_MATRIX("mat3", 3, GL_FLOAT_MAT3, setUniformMatrix3, setUniformMatrices3),
        ORU_MATRIX("mat4", 4, GL_FLOAT_MAT4, setUniformMatrix4, setUniformMatrices4),
    };
#undef ORU_MATRIX
#undef ORU_ARRAY
#undef ORU_VALUES
#undef ORU_CASE
}

/// The number in brackets, for arrays.
std::string Index(int elements, int number) {
    return elements ? "[" + std::to_string(number) + "]" : "";
}

/// A fragment shader in which every case has a uniform of its own, and none is left out as unused.
template<class Cases>
std::string Source(Cases const &cases) {
    std::string uniforms = "#version 120\n#extension GL_ARB_texture_rectangle : enable\n", sum;
    for (std::size_t i = 0; i < cases.size(); ++i) {
        auto const &c = cases[i];
        std::string const name = "u" + std::to_string(i);
        uniforms += "uniform " + c.type + " " + name + Index(c.elements, c.elements) + ";\n";
        std::string use = name + Index(c.elements, c.elements - 1);
        if (c.type.find("sampler") == 0)
            use = "texture" + c.type.substr(7) + "(" + use +
                  (c.type[7] == '1' ? ", 0.0)" : ", vec" + c.type.substr(7, 1) + "(0))");
        sum += " + float(" + use + (c.type.find("mat") == 0 ? "[0][0])" : ")");
    }
    return uniforms + "void main() { gl_FragColor = vec4(0.0" + sum + "); }";
}

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

/// Every setter in one form: its calls, what it asserts and sets, and what it refuses.
template<class AnyProgram>
void ExpectSetters(Form form) {
    auto const cases = Cases<AnyProgram>();
    std::string const source = Source(cases);
    char const *const text = source.c_str();
    AnyProgram program, other;
    for (AnyProgram *const each : {&program, &other}) {
        each->loadFragmentShader(1, &text, nullptr);
        each->link(true);
    }
    bool const isNamed = form == NAME || form == NAME_UNSAFE;
    for (std::size_t i = 0; i < cases.size(); ++i) {
        auto const &c = cases[i];
        SCOPED_TRACE(testing::Message() << c.call << " form " << form);
        std::string const name = "u" + std::to_string(i);
        std::string const last = name + Index(c.elements, c.elements - 1);
        int const location = program.getUniformLocation(name.c_str());
        auto const set = [&](int at) { c.set[form](program, at, name.c_str()); };
        auto const read = [&] {
            Floats values(16);
            ORU_GL(GetUniformfv, static_cast<GLuint>(Get(GL_CURRENT_PROGRAM)),
                   program.getUniformLocation(last.c_str()), values.data());
            values.resize(c.element.size());
            return values;
        };
        program.enable();
        EXPECT_EQ(Floats(c.element.size()), read());
        bool const isArray = c.asserted == 0, isMatrix = c.type.find("mat") == 0;
        {
            Pushed<CountingForwarder> calls;
            set(location);
            // A setter by name asks twice whether the program is current, one of matrices once.
            int const queries = form == LOCATION          ? 1
                                : form != NAME || isArray ? 0
                                : isMatrix                ? 1
                                                          : 2;
            EXPECT_EQ(isNamed ? 1 : 0, calls->count("GetUniformLocation"));
            EXPECT_EQ(queries, calls->count("GetIntegerv"));
            EXPECT_EQ(queries + (isNamed ? 2 : 1), calls->total());
            calls->reset();
            if (form == LOCATION_UNSAFE)
                set(-1);
            EXPECT_EQ(0, calls->total());
        }
        EXPECT_EQ(c.element, read());
        if constexpr (std::is_same_v<AnyProgram, Body>) {
            std::vector<unsigned int> asserted = {
                static_cast<unsigned int>(location), c.asserted,
                static_cast<unsigned int>(std::max(c.elements, 1))};
            if (isArray || form >= LOCATION_UNSAFE)
                asserted.clear();
            EXPECT_EQ(asserted, program.asserted);
            program.asserted.clear();
        }
        // An array set by name goes to the program that is current, as what is set unsafely.
        other.enable();
        bool const asks = form == LOCATION || (form == NAME && !isArray);
        EXPECT_FAILURE(asks ? "Program must be enabled to set uniform parameter" : "",
                       set(location));
    }
    other.disable();
}

} // namespace

class UniformsTest : public ObjectTest {};

TEST_F(UniformsTest, EverySetterInEveryForm) {
    for (int form = 0; form < FORMS; ++form) {
        ExpectSetters<Program>(static_cast<Form>(form));
        ExpectSetters<Body>(static_cast<Form>(form));
    }
}
