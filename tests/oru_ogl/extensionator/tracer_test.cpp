// The tracer's text and what it forwards, for every operation and many stream formats.
#include "oru/oru_ogl/extensionator/opengltracer.h"

#include "../glfixture.h"
#include "tests/allocationcount.h"

#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include <cmath>
#include <cstdint>
#include <cstring>
#include <iomanip>
#include <limits>
#include <locale>
#include <ostream>
#include <sstream>
#include <string>
#include <tuple>
#include <type_traits>
#include <vector>

using namespace ORU::OGL;

namespace oru_test {

/// A way to set up a stream.
struct Format {
    char const *name;
    void (*apply)(std::ostream &stream);
};

} // namespace oru_test

using oru_test::Format;

namespace {

/// The memory of all values, one after the other.
template<class... Values>
std::string Bytes(Values const &...values) {
    std::string bytes;
    // NOLINTNEXTLINE(bugprone-sizeof-expression): of a pointer the pointer itself is meant
    (bytes.append(reinterpret_cast<char const *>(&values), sizeof values), ...);
    return bytes;
}

/// What the recorder answers to a call.
template<class Result>
Result Answer() {
    if constexpr (std::is_pointer<Result>::value)
        return reinterpret_cast<Result>(std::uintptr_t(0x5A5A0));
    else if constexpr (!std::is_void<Result>::value)
        return static_cast<Result>(0x5A);
}

/// A last link that writes down what arrives.
class Recorder : public OpenGLInterceptor {
public:
    std::string operation_;
    std::string arguments_;

#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    Result cgm##Name Parameters override {                                                         \
        operation_ = #Name;                                                                        \
        arguments_ = Bytes Arguments;                                                              \
        return Answer<Result>();                                                                   \
    }
#include "oru/oru_ogl/extensionator/gloperations.inc"
};

/// The types of an operation's parameters after file and line, as the table of entry points says
/// them.
std::vector<std::string> TypeTexts(std::string const &parameters) {
    std::vector<std::string> types;
    std::size_t begin = 1;
    for (std::size_t end; begin < parameters.size(); begin = end + 2) {
        end = std::min(parameters.find(", ", begin), parameters.size() - 1);
        std::string const declaration = parameters.substr(begin, end - begin);
        std::size_t const type = declaration.find_last_of(" *") + 1;
        types.push_back(declaration.substr(0, type - (declaration[type - 1] == ' ' ? 1 : 0)));
    }
    types.erase(types.begin(), types.begin() + 2);
    return types;
}

/// The argument of a type at a place, different at each place of a call and at the extremes at
/// times.
template<class Type>
Type Sample(std::size_t place) {
    if constexpr (std::is_same<Type, char const *>::value) {
        static char const *const texts[] = {"alpha", "", "b{eta}[1].gamma"};
        return texts[place % 3];
    } else if constexpr (std::is_pointer<Type>::value) {
        return place % 7 == 6 ? nullptr : reinterpret_cast<Type>(0xABCD0000 + 16 * place);
    } else if constexpr (std::is_floating_point<Type>::value) {
        using Limits = std::numeric_limits<Type>;
        static double const plain[] = {0.5,  -0.0,     1,       3.14159265, -1e20,
                                       1e-7, 999999.5, -999999, 1000000,    123456.5};
        static Type const extreme[] = {Limits::max(), Limits::infinity(), Limits::denorm_min(),
                                       -Limits::infinity(), Limits::quiet_NaN()};
        std::size_t const i = place % 15;
        return i < 10 ? static_cast<Type>(plain[i]) : extreme[i - 10];
    } else if constexpr (sizeof(Type) == 1) {
        return static_cast<Type>(place % 4 == 3 ? 0 : 'A' + place);
    } else if constexpr (sizeof(Type) == 8) {
        return static_cast<Type>(place % 2 ? -5000000000 - 7 * std::int64_t(place)
                                           : 5000000000 + 3 * std::int64_t(place));
    } else {
        static int const values[] = {0x0DE1, 0,      -2,     0x1908, 1,      0x12345678, 0x8892,
                                     7,      0x140B, -32768, 9729,   0x4000, 32767,      100000};
        return static_cast<Type>(values[place % (sizeof values / sizeof *values)]);
    }
}

/// The beginning of the line of a call, then its arguments, inserted piece by piece.
class Pieces {
public:
    explicit Pieces(std::ostream &stream) : stream_(stream) {}

    void begin(char const *file, unsigned int line, char const *name) {
        stream_ << file << ":" << line << ": " << (std::string("gl") + name + "(").c_str();
    }

    template<class Value>
    void argument(std::string const &type, Value value) {
        if (!first_)
            stream_ << ", ";
        first_ = false;
        if constexpr (std::is_pointer<Value>::value) {
            if constexpr (std::is_same<Value, char const *>::value)
                stream_ << value;
            else
                stream_ << static_cast<void const *>(value);
        } else if constexpr (std::is_same<Value, float>::value) {
            std::int32_t pattern;
            std::memcpy(&pattern, &value, 4);
            stream_ << "makeFloat(" << pattern << ") /* " << value << " */";
        } else if (type == "GLenum") {
            stream_ << ORUOGLTokenName(static_cast<GLenum>(value));
        } else if (type == "GLboolean") {
            stream_ << (value != 0 ? "GL_TRUE" : "GL_FALSE");
        } else if (type == "GLhandleARB") {
            stream_ << "(GLhandleARB)" << value;
        } else {
            stream_ << value; // a byte is a character to a stream
        }
    }

    void end() { stream_ << ")\n"; }

private:
    std::ostream &stream_;
    bool first_ = true;
};

/// A tracer in front of a recorder, and the text that its calls should give.
class Trial {
public:
    explicit Trial(Format const &format) : format_(format), tracer_(actual_, &recorder_) {
        format.apply(actual_);
        format.apply(expected_);
        width_ = actual_.width();
    }

    template<class Result, class... Arguments>
    void call(char const *name, char const *parameters,
              Result (OpenGLInterceptor::*operation)(char const *, unsigned int, Arguments...)) {
        callWith(name, parameters, operation, std::index_sequence_for<Arguments...>());
    }

    int calls() const { return calls_; }

private:
    template<class Result, class... Arguments, std::size_t... Places>
    void callWith(char const *name, char const *parameters,
                  Result (OpenGLInterceptor::*operation)(char const *, unsigned int, Arguments...),
                  std::index_sequence<Places...>) {
        unsigned int const line = static_cast<unsigned int>(++calls_);
        std::size_t const shift = line % 30;
        std::tuple<Arguments...> const values(Sample<Arguments>(shift + Places)...);
        std::vector<std::string> const types = TypeTexts(parameters);
        ASSERT_EQ(sizeof...(Arguments), types.size()) << name;

        for (std::ostringstream *stream : {&actual_, &expected_}) {
            stream->str("");
            stream->width(width_);
        }
        Pieces pieces(expected_);
        pieces.begin(kFile, line, name);
        (pieces.argument(types[Places], std::get<Places>(values)), ...);
        pieces.end();

        OpenGLInterceptor &first = tracer_;
        if constexpr (std::is_void<Result>::value)
            (first.*operation)(kFile, line, std::get<Places>(values)...);
        else
            EXPECT_EQ(Answer<Result>(),
                      (first.*operation)(kFile, line, std::get<Places>(values)...));
        ASSERT_EQ(expected_.str(), actual_.str()) << format_.name;
        EXPECT_EQ(name, recorder_.operation_);
        EXPECT_EQ(Bytes(kFile, line, std::get<Places>(values)...), recorder_.arguments_) << name;
        EXPECT_EQ(expected_.flags(), actual_.flags());
        EXPECT_EQ(expected_.width(), actual_.width());
        EXPECT_TRUE(actual_.good());
    }

    static constexpr char const *kFile = "some/source.cpp";

    Format const &format_;
    std::ostringstream actual_;
    std::ostringstream expected_;
    std::streamsize width_ = 0;
    int calls_ = 0;
    Recorder recorder_;
    OpenGLTracer tracer_;
};

struct GroupedDigits : std::numpunct<char> {
    char do_decimal_point() const override { return ','; }
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
};

Format const kFormats[] = {
    {"AsStarted", [](std::ostream &) {}},
    {"Hexadecimal", [](std::ostream &s) { s << std::hex << std::showbase << std::uppercase; }},
    {"OctalWithSign", [](std::ostream &s) { s << std::oct << std::showpos << std::showpoint; }},
    {"Scientific", [](std::ostream &s) { s << std::scientific << std::setprecision(3); }},
    {"LongerThanTheBuffer", [](std::ostream &s) { s << std::fixed << std::setprecision(1500); }},
    {"Precise", [](std::ostream &s) { s << std::setprecision(17); }},
    {"HexadecimalFloat", [](std::ostream &s) { s << std::hexfloat << std::boolalpha; }},
    {"NoBase", [](std::ostream &s) { s.unsetf(std::ios_base::basefield); }},
    {"GroupedDigits",
     [](std::ostream &s) { s.imbue(std::locale(std::locale::classic(), new GroupedDigits)); }},
    {"Wide", [](std::ostream &s) { s << std::setw(40) << std::setfill('.'); }},
    {"WideAtTheLeft", [](std::ostream &s) { s << std::setw(18) << std::left; }}};

class TracerFormatTest : public ::testing::TestWithParam<Format> {};

/// A stream that counts its writes and keeps nothing.
class CountingBuffer : public std::streambuf {
public:
    int writes = 0;

protected:
    std::streamsize xsputn(char const *, std::streamsize count) override {
        ++writes;
        return count;
    }
    int_type overflow(int_type c) override { return ++writes, traits_type::not_eof(c); }
};

} // namespace

TEST_P(TracerFormatTest, WritesAndForwardsEveryOperation) {
    Trial trial(GetParam());
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    trial.call(#Name, #Parameters, &OpenGLInterceptor::cgm##Name);                                 \
    if (HasFatalFailure())                                                                         \
        return;
#include "oru/oru_ogl/extensionator/gloperations.inc"
    EXPECT_EQ(1182, trial.calls());
}

INSTANTIATE_TEST_SUITE_P(Streams, TracerFormatTest, ::testing::ValuesIn(kFormats),
                         [](auto const &format) { return format.param.name; });

TEST(Tracer, WritesTheseLines) {
    Recorder recorder;
    std::ostringstream text;
    OpenGLTracer tracer(text, &recorder);
    OpenGLInterceptor &first = tracer;
    first.cgmGetError("f", 87);
    first.cgmBlendFunc("f", 88, GL_ONE, GL_ZERO);
    first.cgmColorMask("f", 89, 1, 0, 2, 0);
    first.cgmBufferData("f", 91, GL_ARRAY_BUFFER, 5000000000, nullptr, GL_STATIC_DRAW);
    first.cgmVertex2f("f", 92, 0.5f, -0.0f);
    first.cgmColor4b("f", 93, 'a', 'b', 'c', 'd');
    // A pointer that is null where a text belongs must not spoil the stream for later lines.
    first.cgmGetUniformLocation("f", 94, 7, nullptr);
    first.cgmAttachObjectARB("f", 4294967295, 3, 4);
    EXPECT_EQ("f:87: glGetError()\n"
              "f:88: glBlendFunc(GL_CURRENT_BIT, GL_POINTS)\n"
              "f:89: glColorMask(GL_TRUE, GL_FALSE, GL_TRUE, GL_FALSE)\n"
              "f:91: glBufferData(GL_ARRAY_BUFFER, 5000000000, 0, GL_STATIC_DRAW)\n"
              "f:92: glVertex2f(makeFloat(1056964608) /* 0.5 */, makeFloat(-2147483648) /* -0 */)\n"
              "f:93: glColor4b(a, b, c, d)\n"
              "f:94: glGetUniformLocation(7, 0)\n"
              "f:4294967295: glAttachObjectARB((GLhandleARB)3, (GLhandleARB)4)\n",
              text.str());

    std::ostringstream other;
    tracer.setOutputStream(other);
    text.str("");
    first.cgmFlush("g", 1);
    EXPECT_EQ("g:1: glFlush()\n", other.str());
    EXPECT_EQ("", text.str());
}

// Numbers of a new stream have a formatter of their own: floats of all magnitudes, ties between two
// last digits, both sides of powers of ten, and doubles that are no floats.
TEST(Tracer, WritesNumbersAsTheStreamDoes) {
    std::vector<double> numbers;
    for (std::uint64_t pattern = 0; pattern <= 0xFFFFFFFF; pattern += 65521) {
        auto const bits = static_cast<std::uint32_t>(pattern);
        float number;
        std::memcpy(&number, &bits, sizeof number);
        numbers.push_back(static_cast<double>(number));
    }
    for (int i = 0; i < 13000; ++i)
        numbers.push_back(1000000.5 + 1234.5 * i);
    double number = 0.5;
    for (int i = 0; i < 60; ++i, number = number * 1.25 + 0.125)
        numbers.insert(numbers.end(), {number, number + 1. / 16, number + 3. / 64, number * 1.1});
    for (int power = -9; power < 21; ++power)
        for (float const side : {0.f, 1.f, 1e30f}) {
            float const ten = std::pow(10.f, static_cast<float>(power));
            auto const neighbour = static_cast<double>(std::nextafter(ten, side));
            numbers.insert(numbers.end(), {neighbour, -neighbour, neighbour * (1 + 1e-12)});
        }

    Recorder recorder;
    std::ostringstream text, expected;
    OpenGLTracer tracer(text, &recorder);
    for (double const value : numbers) {
        text.str("");
        tracer.cgmClearDepth("", 1, value);
        expected.str("");
        expected << ":1: glClearDepth(" << value << ")\n";
        ASSERT_EQ(expected.str(), text.str());
    }
}

TEST(Tracer, WritesTextsOfAnyLength) {
    Recorder recorder;
    for (std::size_t const length : {900u, 1000u, 1015u, 1023u, 1024u, 1025u, 5000u}) {
        std::string const file(length, 'f');
        std::string const name(length + 3, 'n');
        std::ostringstream text;
        OpenGLTracer tracer(text, &recorder);
        tracer.cgmGetUniformLocation(file.c_str(), 5, 6, name.c_str());
        tracer.cgmUniform4f(file.c_str(), 8, 9, 0.1f, 0.1f, 0.1f, 0.1f);
        std::string const tenth = ", makeFloat(1036831949) /* 0.1 */";
        std::ostringstream expected;
        expected << file << ":5: glGetUniformLocation(6, " << name << ")\n"
                 << file << ":8: glUniform4f(9" << tenth << tenth << tenth << tenth << ")\n";
        EXPECT_EQ(expected.str(), text.str());
    }
}

TEST(Tracer, WritesALineAtOnceWithoutAllocating) {
    Recorder recorder;
    CountingBuffer buffer;
    std::ostream stream(&buffer);
    OpenGLTracer tracer(stream, nullptr);
    struct Nothing : OpenGLForwarder {
        void cgmUniform4f(char const *, unsigned int, GLint, GLfloat, GLfloat, GLfloat,
                          GLfloat) override {}
        void cgmVertex3d(char const *, unsigned int, GLdouble, GLdouble, GLdouble) override {}
    } nothing;
    tracer.setInterceptor(&nothing);

    long const before = oru_test::AllocationCount();
    tracer.cgmUniform4f("f", 1, 2, 0.1f, -1e-20f, std::numeric_limits<float>::infinity(), 4);
    EXPECT_EQ(1, buffer.writes);
    stream << std::hex << std::scientific;
    tracer.cgmVertex3d("f", 1, 0.1, 2, -3e200);
    EXPECT_EQ(2, buffer.writes);
    EXPECT_EQ(before, oru_test::AllocationCount());
}

class TracerOnContextTest : public oru_test::OffscreenTest {};

TEST_F(TracerOnContextTest, WritesACallThatIsRejected) {
    oru_test::Pushed<OpenGLTracer> tracer;
    std::ostringstream text;
    tracer->setOutputStream(text);
    EXPECT_THROW(OpenGLInterceptor::Instance()->cgmBindTexture("f", 3, 0x12345678, 0),
                 ExceptionOGL);
    EXPECT_EQ("f:3: glBindTexture(Unknown Token, 0)\n", text.str());
}
