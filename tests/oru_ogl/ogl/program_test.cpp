// Shaders and programs: their states, their logs, what they refuse.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/oruopengl.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/shader.h"

#include <set>
#include <tuple>
#include <utility>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

char const kVertex[] = "attribute vec4 position; attribute vec4 colour; varying vec4 shade;"
                       "void main() { shade = colour; gl_Position = position; }";
char const kFragment[] = "varying vec4 shade; uniform float gain; uniform vec2 offsets[3];"
                         "void main() { gl_FragColor = gain * shade + vec4(offsets[2], 0, 0); }";
char const kBroken[] = "void main() { gl_FragColor = nothing; }";

void Load(Program &program, char const *fragment = kFragment) {
    char const *const vertex = kVertex;
    program.loadVertexShader(1, &vertex, nullptr);
    program.loadFragmentShader(1, &fragment, nullptr);
}

/// Answers for the driver: whether linking succeeds, and its log.
struct Driver : OpenGLForwarder {
    int isLinked = 0;
    std::string log;

    void cgmGetProgramiv(char const *, unsigned int, GLuint, GLenum name, GLint *value) override {
        GLint const length = log.empty() ? 0 : static_cast<GLint>(log.size()) + 1;
        *value = name == GL_INFO_LOG_LENGTH ? length : isLinked;
    }
    void cgmGetProgramInfoLog(char const *, unsigned int, GLuint, GLsizei size, GLsizei *,
                              char *buffer) override {
        log.copy(buffer, static_cast<std::size_t>(size));
    }
};

} // namespace

class ProgramTest : public ObjectTest {};

TEST_F(ProgramTest, ShaderIsLoadedThenCompiled) {
    VertexShader shader;
    shader.load("");
    EXPECT_FALSE(shader.isLoaded());
    // Two texts, the first by its length, the second by its final zero.
    char const *const texts[] = {"void main() { rubbish", "gl_Position = vec4(0); }"};
    int const lengths[] = {14, -1};
    shader.load(2, texts, lengths);
    EXPECT_TRUE(shader.isLoaded());
    EXPECT_FALSE(shader.isCompiled());
    shader.compile(true);
    EXPECT_TRUE(shader.isCompiled());
    EXPECT_FAILURE("Unsupported shader type", ComputeShader());
}

TEST_F(ProgramTest, LinkReportsTheLog) {
    Program program;
    Load(program, kBroken); // the failed compilation shows at link time
    program.link(false);
    EXPECT_FALSE(program.isLinked());
    std::vector<char> log(static_cast<std::size_t>(program.getInfoLogLength()) + 1);
    program.getInfoLog(program.getInfoLogLength(), log.data());
    EXPECT_FAILURE(std::string("Program Link Error: \n") + log.data(), program.link(true));
    EXPECT_FAILURE("Program must be linked before being enabled", program.enable());

    InterceptorScope<Driver> driver;
    EXPECT_FAILURE("Unknown Program Link Error\n", program.link(true));
    driver->isLinked = 1;
    driver->log = "a note does not fail a link";
    EXPECT_FAILURE("", program.link(true));
    driver->log = "The shader will run in software.";
    EXPECT_FAILURE("Program Link Error(Falling to Software): \n" + driver->log, program.link(true));
}

TEST_F(ProgramTest, AttachesLoadedShadersOnly) {
    Program program;
    FragmentShader shader;
    EXPECT_FAILURE("Shader must be loaded before attaching", program.attach(&shader));
    shader.load(kFragment);
    program.attach(&shader); // not compiled
    program.detach(&shader);
    EXPECT_FAILURE("GL_INVALID_OPERATION", program.detach(&shader)); // detached already
    EXPECT_FAILURE("Enforce coreShader != NULL", program.attach(nullptr));
    EXPECT_FAILURE("Enforce coreShader != NULL", program.detach(nullptr));
}

// Detaching looks at 64 shaders at a time, in at most four passes where others may stay.
TEST_F(ProgramTest, DetachesByType) {
    Program program;
    auto const refill = [&, source = "void main() {}"] {
        program.loadVertexShader(1, &source, nullptr);
        for (int i = 0; i < 70; ++i)
            program.loadFragmentShader(1, &source, nullptr);
    };
    InterceptorScope<CountingForwarder> calls;
    auto const expect = [&](void (Program::*operation)(), int detached, int passes) {
        calls->reset();
        (program.*operation)();
        EXPECT_EQ(detached, calls->count("DetachShader"));
        EXPECT_EQ(passes, calls->count("GetAttachedShaders"));
    };
    refill();
    expect(&Program::detachAllFragmentShaders, 70, 4);
    expect(&Program::detachAllVertexShaders, 1, 2);
    refill();
    expect(&Program::detachAllVertexShaders, 1, 4);
    expect(&Program::detachAllShaders, 70, 3);
}

TEST_F(ProgramTest, IsCurrentWhileEnabled) {
    Program first, second;
    for (Program *const program : {&first, &second}) {
        Load(*program);
        program->link(true);
    }
    EXPECT_TRUE(first.validate());
    first.enable();
    EXPECT_TRUE(first.isEnabled());
    EXPECT_FALSE(second.isEnabled());
    {
        ProgramEnabledScope scope;
        scope.enable(&first);
        EXPECT_TRUE(first.isEnabled());
        EXPECT_FAILURE("!theProgram_", scope.enable(&second));
        { ProgramEnabledScope const inner(&second); }
        EXPECT_FALSE(second.isEnabled()) << "a scope leaves no program current";
        first.enable();
    }
    EXPECT_FALSE(first.isEnabled());
    EXPECT_FAILURE("theProgram", ProgramEnabledScope const scope(nullptr));
}

TEST_F(ProgramTest, TellsAttributesAndUniforms) {
    Program program;
    Load(program);
    int size = 0;
    unsigned int type = 0;
    char name[32] = "";
    EXPECT_FAILURE("Program must be linked to get active uniform count",
                   program.getMaxUniformStringLength());
    program.setAttributeLocation(5, "colour");
    program.setAttributeLocation(2, "position");
    program.link(true);
    EXPECT_EQ(5, program.getAttributeLocation("colour"));
    EXPECT_EQ(2, program.getAttributeLocation("position"));

    EXPECT_EQ(11, program.getMaxUniformStringLength()); // "offsets[0]" and its zero
    std::set<std::tuple<std::string, int, unsigned int>> found;
    for (unsigned int i = 0; i < program.getActiveUniformCount(); ++i) {
        program.getActiveUniform(i, sizeof name, &size, &type, name);
        found.emplace(name, size, type);
    }
    EXPECT_EQ((decltype(found){{"gain", 1, GL_FLOAT}, {"offsets[0]", 3, GL_FLOAT_VEC2}}), found);
}

TEST_F(ProgramTest, MovedFromObjectsThrow) {
    Program program;
    VertexShader shader;
    Shader const taken(std::move(shader));
    // NOLINTNEXTLINE(bugprone-use-after-move)
    EXPECT_FAILURE("Enforce actualShader_ != NULL", shader.load(""));
    EXPECT_FAILURE("Enforce coreShader != NULL", program.attach(&shader));
    Load(program);
    Program const loaded(std::move(program));
    // NOLINTNEXTLINE(bugprone-use-after-move,clang-analyzer-cplusplus.Move)
    EXPECT_FAILURE("Enforce actualProgram_ != NULL", program.link(true));
}

TEST_F(ProgramTest, HelpersWorkOnGLNames) {
    Program owner;
    Load(owner, "uniform bool on; uniform vec4 four; uniform mat4 matrix; uniform sampler2D image;"
                "void main() { gl_FragColor = on ? matrix * four : texture2D(image, vec2(0)); }");
    owner.link(true);
    owner.enable();
    auto const program = static_cast<GLuint>(Get(GL_CURRENT_PROGRAM));
    Disable(12345); // whichever is named
    EXPECT_FALSE(owner.isEnabled());
    Enable(program);
    EXPECT_TRUE(owner.isEnabled());

    using Floats = std::vector<float>;
    auto const expect = [&](char const *name, Floats const &expected) {
        Floats values(expected.size());
        ORU_GL(GetUniformfv, program, owner.getUniformLocation(name), values.data());
        EXPECT_EQ(expected, values) << name;
    };
    SetUniformBool(program, "on", true);
    expect("on", {1});
    SetUniformFloat4(program, "four", 1, 2, 3, 4);
    expect("four", {1, 2, 3, 4});
    SetUniformSampler2D(program, "image", 7);
    expect("image", {7});
    Floats const matrix = {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15};
    SetUniformMatrix4(program, "matrix", matrix.data(), false);
    expect("matrix", matrix);
    SetUniformMatrix4(program, "matrix", matrix.data(), true);
    expect("matrix", {0, 4, 8, 12, 1, 5, 9, 13, 2, 6, 10, 14, 3, 7, 11, 15});
    Disable(program);
}
