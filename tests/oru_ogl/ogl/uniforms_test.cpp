// The uniform setters: every one in its four forms, read back from the program.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/programogl.h"

#include <functional>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

using Floats = std::vector<float>;

std::string const kHead = "#version 120\n#extension GL_ARB_texture_rectangle : enable\nuniform ";

enum Form { LOCATION, NAME, LOCATION_UNSAFE, NAME_UNSAFE };

/// A setter with values for the uniform `u`, and what the program must hold then.
struct Case {
    std::string type; ///< of the uniform, in GLSL
    int elements;     ///< of an array, 0 for none
    std::string use;  ///< an expression in GLSL without which it would be left out
    Floats element;   ///< the last element's components
    std::function<void(Program &, Form, int)> set;

    std::string index(int number) const {
        return elements ? "[" + std::to_string(number) + "]" : "";
    }
};

// Values of no two alike, so that an exchanged pair shows.
int const kInts[] = {2,  3,  5,  7,  11, 13, 17, 19, 23, 29,  31,  37,  41,  43,  47,  53,
                     59, 61, 67, 71, 73, 79, 83, 89, 97, 101, 103, 107, 109, 113, 127, 131};
Floats const kValues(std::begin(kInts), std::end(kInts));
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

std::vector<Case> Cases() {
    unsigned char const two = 2, zero = 0, nine = 9, one = 1;
#define ORU_CASE(type, elements, use, expected, setter, ...)                                       \
    {                                                                                              \
        type, elements, use, expected, [=](Program &p, Form form, int location) {                  \
            form == LOCATION          ? p.setter(location, __VA_ARGS__)                            \
            : form == NAME            ? p.setter("u", __VA_ARGS__)                                 \
            : form == LOCATION_UNSAFE ? p.setter##_Unsafe(location, __VA_ARGS__)                   \
                                      : p.setter##_Unsafe("u", __VA_ARGS__);                       \
        }                                                                                          \
    }
// One to four of the values, in a uniform of as many components.
#define ORU_VALUES(scalar, vector, a, b, c, d)                                                     \
    ORU_CASE(scalar, 0, "u", ToFloats(a), setUniform, a),                                          \
        ORU_CASE(vector "2", 0, "u", ToFloats(a, b), setUniform, a, b),                            \
        ORU_CASE(vector "3", 0, "u", ToFloats(a, b, c), setUniform, a, b, c),                      \
        ORU_CASE(vector "4", 0, "u", ToFloats(a, b, c, d), setUniform, a, b, c, d)
#define ORU_ARRAYS(ints, floats, n, setter)                                                        \
    ORU_CASE(ints, 3, "u[2]", Floats(kInts + 2 * n, kInts + 3 * n), setter, 3, kInts),             \
        ORU_CASE(floats, 3, "u[2]", Floats(kFloats + 2 * n, kFloats + 3 * n), setter, 3, kFloats)
// One matrix, and two that are turned over.
#define ORU_MATRIX(type, n, single, several)                                                       \
    ORU_CASE(type, 0, "u[0]", Floats(kFloats, kFloats + n * n), single, kFloats, zero),            \
        ORU_CASE(type, 2, "u[1][0]", Transposed(kFloats + n * n, n), several, 2, kFloats, one)
    return {
        ORU_VALUES("bool", "bvec", true, false, true, true),
        // The bytes themselves, in an integer.
        ORU_VALUES("int", "ivec", two, zero, nine, one),
        ORU_VALUES("int", "ivec", -5, 6, 7, 8),
        ORU_VALUES("float", "vec", 0.5f, -2.f, 3.f, 4.f),
        ORU_CASE("sampler1D", 0, "texture1D(u, 0.0)", Floats{3}, setUniformSampler1D, 3),
        ORU_CASE("sampler2D", 0, "texture2D(u, vec2(0))", Floats{4}, setUniformSampler2D, 4),
        ORU_CASE("sampler2DRect", 0, "texture2DRect(u, vec2(0))", Floats{5},
                 setUniformSampler2DRECT, 5),
        ORU_CASE("sampler3D", 0, "texture3D(u, vec3(0))", Floats{6}, setUniformSampler3D, 6),
        ORU_ARRAYS("int", "float", 1, setUniform),
        ORU_ARRAYS("ivec2", "vec2", 2, setUniform2),
        ORU_ARRAYS("ivec3", "vec3", 3, setUniform3),
        ORU_ARRAYS("ivec4", "vec4", 4, setUniform4),
        ORU_MATRIX("mat2", 2, setUniformMatrix2, setUniformMatrices2),
        ORU_MATRIX("mat3", 3, setUniformMatrix3, setUniformMatrices3),
        ORU_MATRIX("mat4", 4, setUniformMatrix4, setUniformMatrices4),
    };
}

} // namespace

class UniformsTest : public ObjectTest {};

// Every setter in every form: its calls, what it sets, and what it refuses.
TEST_F(UniformsTest, EverySetterInEveryForm) {
    for (Case const &c : Cases()) {
        std::string const source = kHead + c.type + " u" + c.index(c.elements) +
                                   "; void main() { gl_FragColor = vec4(float(" + c.use + ")); }";
        for (Form const form : {LOCATION, NAME, LOCATION_UNSAFE, NAME_UNSAFE}) {
            SCOPED_TRACE(c.type + c.index(c.elements) + " in form " + std::to_string(form));
            Program program, other;
            for (Program *const each : {&program, &other}) {
                char const *const text = source.c_str();
                each->loadFragmentShader(1, &text, nullptr);
                each->link(true);
            }
            int const location = program.getUniformLocation("u");
            program.enable();
            InterceptorScope<CountingForwarder> calls;
            c.set(program, form, location);
            if (form == LOCATION_UNSAFE) {
                c.set(program, form, -1); // makes no call
                EXPECT_EQ(1, calls->total());
            }
            Floats values(16);
            ORU_GL(GetUniformfv, static_cast<GLuint>(Get(GL_CURRENT_PROGRAM)),
                   program.getUniformLocation(("u" + c.index(c.elements - 1)).c_str()),
                   values.data());
            values.resize(c.element.size());
            EXPECT_EQ(c.element, values);

            // An array set by name goes to the program that is current, as what is set unsafely.
            other.enable();
            bool const isArray = c.elements == 3;
            bool const asks = form == LOCATION || (form == NAME && !isArray);
            EXPECT_FAILURE(asks ? "Program must be enabled to set uniform parameter" : "",
                           c.set(program, form, location));
        }
    }
}
