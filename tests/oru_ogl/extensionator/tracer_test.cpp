// The tracer's text and what it forwards, for every operation and many stream formats.
#include "oru/oru_ogl/extensionator/opengltracer.h"

#include "tests/support/allocationcount.h"

#include "oru/oru_ogl/extensionator/openglforwarder.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstring>
#include <iomanip>
#include <locale>
#include <sstream>
#include <type_traits>

using namespace ORU::OGL;

namespace {

/// A tracer, and behind it a last link that inserts what arrives into a stream piece by piece.
class Trial : public OpenGLInterceptor {
public:
    std::ostringstream traced_;
    OpenGLTracer tracer_{traced_, this};

    explicit Trial(void (*setUp)(std::ostream &) = [](std::ostream &) {}) {
        setUp(traced_);
        setUp(expected_);
        width_ = traced_.width();
    }

    template<class Result, class... Parameters, class... Arguments>
    void call(Result (OpenGLInterceptor::*operation)(Parameters...), Arguments... arguments) {
        if (::testing::Test::HasFailure())
            return; // one says it
        for (std::ostringstream *stream : {&traced_, &expected_}) {
            stream->str("");
            stream->width(width_);
        }
        (tracer_.*operation)(arguments...);
        EXPECT_EQ(expected_.str(), tracedBefore_) << "written before the call goes on";
        EXPECT_EQ(expected_.str(), traced_.str());
        EXPECT_EQ(expected_.flags(), traced_.flags());
        EXPECT_EQ(expected_.width(), traced_.width());
    }

    template<class Result, class... Arguments>
    void callWithSamples(Result (OpenGLInterceptor::*operation)(char const *, unsigned int,
                                                                Arguments...)) {
        place_ = ++calls_ % 30; // the order in which arguments are made does not matter
        call(operation, "some/source.cpp", calls_, sample<Arguments>()...);
    }

private:
    /// The next argument of a type: different at each place of a call and extreme at times.
    template<class Type>
    Type sample() {
        static float const kFloats[] = {0.5f,  -0.0f,  3.14159265f, -1e20f, 999999.5f,
                                        1e-7f, 1e-45f, 1000000,     NAN,    -INFINITY};
        std::size_t const place = place_++;
        if constexpr (std::is_same<Type, char const *>::value)
            return place % 2 ? "" : "b{eta}[1].gamma";
        else if constexpr (std::is_pointer<Type>::value)
            return reinterpret_cast<Type>(place % 7 * 0xABCD00);
        else if constexpr (std::is_floating_point<Type>::value)
            return static_cast<Type>(kFloats[place % std::size(kFloats)]);
        else // a named value or one with all bits in use
            return static_cast<Type>(place % 2 ? 0x1900 + place : place * 0x9E3779B97F4A7C15u);
    }

    /// Inserts an argument in the form of its type in the next of the declarations.
    template<class Value>
    void insert(std::istream &declarations, Value value) {
        std::string declaration;
        std::getline(declarations, declaration, ',');
        std::string const type = declaration.substr(1, declaration.find(' ', 1) - 1);
        expected_ << std::exchange(separator_, ", ");
        if constexpr (std::is_pointer<Value>::value && !std::is_same<Value, char const *>::value) {
            expected_ << static_cast<void const *>(value);
        } else if constexpr (std::is_same<Value, float>::value) {
            std::int32_t pattern;
            std::memcpy(&pattern, &value, 4);
            expected_ << "makeFloat(" << pattern << ") /* " << value << " */";
        } else if constexpr (std::is_same<Value, GLenum>::value) {
            if (type == "GLenum")
                expected_ << ORUOGLTokenName(value);
            else
                expected_ << (type == "GLhandleARB" ? "(GLhandleARB)" : "") << value;
        } else if (type == "GLboolean") {
            expected_ << (value != Value() ? "GL_TRUE" : "GL_FALSE");
        } else {
            expected_ << value; // a byte is a character to a stream
        }
    }

    /// What writes an arriving call down.
    auto note(char const *name, char const *parameters) {
        return [=](char const *file, unsigned int line, auto... arguments) {
            std::istringstream declarations(parameters);
            declarations.ignore(1000, ',').ignore(1000, ','); // of file and line
            separator_ = "";
            expected_ << file << ":" << line << ": " << name << "(";
            (insert(declarations, arguments), ...);
            expected_ << ")\n";
            tracedBefore_ = traced_.str();
        };
    }

#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    Result cgm##Name Parameters override {                                                         \
        note("gl" #Name, #Parameters) Arguments;                                                   \
        return static_cast<Result>(0);                                                             \
    }
#include "oru/oru_ogl/extensionator/gloperations.inc"

    std::ostringstream expected_;
    std::string tracedBefore_;
    std::streamsize width_ = 0;
    std::size_t place_ = 0;
    char const *separator_ = "";
    unsigned int calls_ = 0;
};

struct GroupedDigits : std::numpunct<char> {
    char do_decimal_point() const override { return ','; }
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
};

std::pair<char const *, void (*)(std::ostream &)> const kFormats[] = {
    {"as started", [](std::ostream &) {}},
    {"hexadecimal", [](std::ostream &s) { s << std::hex << std::showbase << std::uppercase; }},
    {"scientific", [](std::ostream &s) { s << std::scientific << std::setprecision(3); }},
    {"longer than the buffer", [](std::ostream &s) { s << std::fixed << std::setprecision(1500); }},
    {"precise", [](std::ostream &s) { s << std::setprecision(17); }},
    {"grouped digits",
     [](std::ostream &s) { s.imbue(std::locale(std::locale::classic(), new GroupedDigits)); }},
    {"wide", [](std::ostream &s) { s << std::setw(40) << std::setfill('.'); }},
    {"wide at the left", [](std::ostream &s) { s << std::setw(18) << std::left; }}};

} // namespace

TEST(Tracer, WritesAndForwardsEveryOperation) {
    for (auto const &[name, setUp] : kFormats) {
        SCOPED_TRACE(name);
        Trial trial(setUp);
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    trial.callWithSamples(&OpenGLInterceptor::cgm##Name);
#include "oru/oru_ogl/extensionator/gloperations.inc"
    }
}

TEST(Tracer, WritesTheseLines) {
    Trial trial;
    std::ostringstream other;
    // A pointer that is null where a text belongs must not spoil the stream for later lines.
    trial.tracer_.cgmGetUniformLocation("f", 94, 7, nullptr);
    trial.tracer_.cgmFlush("f", 95);
    trial.tracer_.setOutputStream(other);
    trial.tracer_.cgmFlush("g", 1);
    EXPECT_EQ("f:94: glGetUniformLocation(7, 0)\nf:95: glFlush()\n", trial.traced_.str());
    EXPECT_EQ("g:1: glFlush()\n", other.str());
}

// Numbers of a new stream have a formatter of their own: all magnitudes, ties between two last
// digits, both sides of powers of ten, and doubles that are no floats.
TEST(Tracer, WritesNumbersAsTheStreamDoes) {
    Trial trial;
    auto const write = [&](double number) {
        trial.call(&OpenGLInterceptor::cgmClearDepth, "", 1u, number);
    };
    for (std::uint64_t pattern = 0; pattern <= 0xFFFFFFFF; pattern += 65521) {
        float number;
        std::memcpy(&number, &pattern, sizeof number);
        write(static_cast<double>(number));
    }
    for (int i = 0; i < 13000; ++i)
        write(1000000.5 + 1234.5 * i);
    for (int power = -9; power < 21; ++power)
        for (float const side : {0.f, 1.f, 1e30f}) {
            float const ten = std::pow(10.f, static_cast<float>(power));
            auto const neighbour = static_cast<double>(std::nextafter(ten, side));
            for (double const number : {neighbour, -neighbour, neighbour * (1 + 1e-12)})
                write(number);
        }
}

TEST(Tracer, WritesTextsOfAnyLength) {
    Trial trial;
    for (std::size_t length = 950; length < 2100; ++length) {
        std::string const file(length, 'f'), name(length % 1100, 'n');
        trial.call(&OpenGLInterceptor::cgmGetUniformLocation, file.c_str(), 12345u, 6u,
                   name.c_str());
    }
}

TEST(Tracer, WritesALineAtOnceWithoutAllocating) {
    struct CountingBuffer : std::streambuf {
        int writes = 0;
        std::streamsize xsputn(char const *, std::streamsize n) override { return ++writes, n; }
    } buffer;
    struct Nothing : OpenGLForwarder {
        void cgmUniform3f(char const *, unsigned int, GLint, GLfloat, GLfloat, GLfloat) override {}
    } nothing;
    std::ostream stream(&buffer);
    OpenGLTracer tracer(stream, &nothing);

    long const before = oru_test::AllocationCount();
    tracer.cgmUniform3f("f", 1, 2, 0.1f, -1e-20f, INFINITY);
    stream << std::hex << std::scientific;
    tracer.cgmUniform3f("f", 1, 2, 0.1f, -1e-20f, INFINITY);
    EXPECT_EQ(2, buffer.writes);
    EXPECT_EQ(before, oru_test::AllocationCount());
}
