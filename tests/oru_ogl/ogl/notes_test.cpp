// What failures say besides their fixed texts, and calls of functions that are not there.
#include "tests/support/objecttest.h"

#include "oru/core/exceptions/calledfrom.h"
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <cstring>
#include <iterator>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

using namespace ORU::OGL;
using oru_test::MessageOf;

namespace {

/// What the call of an operation with zeros says, of the chain's last link.
template<class Result, class... Arguments>
std::string SaidBy(Result (OpenGLInterceptor::*operation)(char const *, unsigned int,
                                                          Arguments...)) {
    OpenGLErrorChecker checker;
    return MessageOf([&] { (checker.*operation)("f", 1, Arguments()...); });
}

/// What streaming the failure of a call gives behind its fixed form.
template<class Call>
std::string NoteOf(Call call) {
    try {
        call();
    } catch (ORU::LogicalException const &failure) {
        std::ostringstream streamed;
        streamed << failure;
        std::string const text = streamed.str();
        std::string const fixed = std::string(failure.message()) + ") ";
        auto const end = text.find(fixed);
        return end == std::string::npos ? "" : text.substr(end + fixed.size());
    }
    return "no failure";
}

/// An operation that goes through the table, and what its call with zeros says.
struct Extended {
    std::string name;
    std::string (*said)();
};

std::vector<Extended> ExtendedOperations() {
    Extended const all[] = {
#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    {"gl" #Name, [] { return SaidBy(&OpenGLInterceptor::cgm##Name); }},
#include "oru/oru_ogl/extensionator/gloperations.inc"
    };
    return {std::end(all) - sizeof(FunctionTable) / sizeof(PROC), std::end(all)};
}

} // namespace

using MissingFunctionsTest = oru_test::OffscreenTest;
class NotesTest : public oru_test::ObjectTest {};

// Hosts that called such a function saw a jump to address 0.
TEST_F(MissingFunctionsTest, AreNamed) {
    auto const operations = ExtendedOperations();
    std::vector<PROC> entries(operations.size());
    std::memcpy(entries.data(), &ExtensionManager::CurrentTable(), sizeof(FunctionTable));
    std::string const where = std::string(" is not in this driver (OpenGL ") +
                              reinterpret_cast<char const *>(::glGetString(GL_VERSION)) +
                              "), which would need GL_";
    int missing = 0;
    for (std::size_t i = 0; i < entries.size(); ++i) {
        if (entries[i])
            continue;
        ++missing;
        EXPECT_EQ(0u, operations[i].said().rfind(operations[i].name + where, 0));
    }
    EXPECT_LT(0, missing) << "a driver with everything shows nothing";

    ORU_WGL(MakeCurrent, nullptr, nullptr);
    for (Extended const &operation : operations)
        EXPECT_EQ(operation.name + " was called without a current OpenGL context: make one current "
                                   "in this thread (Context::makeCurrent)",
                  operation.said());
    EXPECT_EQ(0u, NoteOf([] {
                      ORU_GL(BindTexture, GL_TEXTURE_2D, 1);
                  }).find("in glBindTexture, without a current OpenGL context"));
    context().makeCurrent();
}

TEST_F(NotesTest, AnErrorNamesItsFunctionAndTheHostsCall) {
    auto const bind = [] { ORU_GL(BindTexture, GL_TRIANGLES, 0); };
    EXPECT_EQ("in glBindTexture", NoteOf(bind));
    unsigned int const line = __LINE__ + 1;
    auto const host = [&] { ORU_FROM_HERE(bind()); };
    EXPECT_EQ("in glBindTexture, called from " __FILE__ ":" + std::to_string(line), NoteOf(host));
    EXPECT_EQ(7, ORU_FROM_HERE(3 + 4)) << "the value comes through";
}

TEST_F(NotesTest, AProgramTellsWhatTheCompilerSaid) {
    Program program;
    char const *const good = "void main() { gl_Position = vec4(0.0); }";
    char const *const bad = "void main() { gl_FragColor = misspelt; }";
    program.loadVertexShader(1, &good, nullptr);
    program.loadFragmentShader(1, &bad, nullptr);
    std::string const logs = program.compileLogs();
    EXPECT_EQ(0u, logs.find("GL_FRAGMENT_SHADER does not compile: ")) << logs;
    EXPECT_NE(std::string::npos, logs.find("misspelt")) << logs;
    EXPECT_EQ(std::string::npos, logs.find("GL_VERTEX_SHADER")) << logs;
    EXPECT_EQ(logs, NoteOf([&] { program.link(true); }));
}

TEST_F(NotesTest, AnAttributeThatIsNotUsedIsNamed) {
    char const *const vertex =
        "attribute vec2 position; void main() { gl_Position = position.xyxy; }";
    char const *const fragment = "void main() { gl_FragColor = vec4(1.0); }";
    Program program;
    program.loadVertexShader(1, &vertex, nullptr);
    program.loadFragmentShader(1, &fragment, nullptr);
    program.link(true);
    VertexBuffer misspelt(
        {{"positoin", VertexBuffer::ATTRIBUTETYPE_FLOAT2, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
        3, VertexBuffer::PRIMITIVETYPE_TRIANGLES);
    EXPECT_EQ("the program has no active attribute \"positoin\"",
              NoteOf([&] { misspelt.setupWithProgram(&program); }));
}

// What the host left pending ends the library's next call, after its work is done: no name may leak
// or be deleted twice for that, and a buffer knows whether it is mapped.
TEST_F(NotesTest, APendingErrorOfTheHostLosesNothing) {
    auto const failsAfterError = [](auto call) {
        ::glEnable(0);
        EXPECT_EQ("GL_INVALID_ENUM", MessageOf(call));
    };
    failsAfterError([] { Texture2D(Texture::INTERNALFORMAT_RGBA8, 4, 4, false); });
    failsAfterError([] { Framebuffer(); });
    failsAfterError([] { Program(); });
    failsAfterError([] { VertexShader(); });
    for (GLuint name = 1; name < 100; ++name) // the ledger does not see what the call lost
        EXPECT_FALSE(ORU_GL(IsProgram, name) || ORU_GL(IsShader, name)) << name;
    auto const make = [] {
        return std::make_unique<Buffer>(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                                        nullptr);
    };
    failsAfterError(make);

    auto const buffer = make();
    buffer->bind();
    failsAfterError([&] { buffer->map(GL_WRITE_ONLY); });
    EXPECT_TRUE(buffer->isMapped());
    failsAfterError([&] { buffer->unmap(); });
    EXPECT_FALSE(buffer->isMapped());
    Buffer::BindDefaultArrayBuffer();

    Program program;
    char const *const vertex = "attribute vec2 p; void main() { gl_Position = p.xyxy; }";
    program.loadVertexShader(1, &vertex, nullptr);
    program.link(false);
    VertexBuffer vertices(
        {{"p", VertexBuffer::ATTRIBUTETYPE_FLOAT2, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}}, 3,
        VertexBuffer::PRIMITIVETYPE_TRIANGLES);
    vertices.setupWithProgram(&program);
    failsAfterError([&] { vertices.setupWithProgram(&program); });
}
