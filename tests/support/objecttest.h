// What tests of GL objects share: the fixture that counts names, expected failures, queries.
#pragma once

#include "tests/support/failure.h"
#include "tests/support/glfixture.h"

#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include <optional>
#include <set>
#include <sstream>
#include <string>
#include <vector>

namespace oru_test {

inline GLint Get(GLenum name) {
    GLint value = -1;
    ::glGetIntegerv(name, &value);
    return value;
}

inline std::vector<GLint> Get(std::vector<GLenum> const &names) {
    std::vector<GLint> values;
    for (GLenum const name : names)
        values.push_back(Get(name));
    return values;
}

/// Follows the names of GL objects from generation to deletion.
class NameLedger : public ORU::OGL::OpenGLForwarder {
public:
#define ORU_FOLLOW(Objects)                                                                        \
    void cgmGen##Objects(char const *file, unsigned int line, GLsizei n, GLuint *names) override { \
        OpenGLForwarder::cgmGen##Objects(file, line, n, names);                                    \
        add(#Objects, n, names);                                                                   \
    }                                                                                              \
    void cgmDelete##Objects(char const *file, unsigned int line, GLsizei n, GLuint const *names)   \
        override {                                                                                 \
        remove(#Objects, n, names);                                                                \
        OpenGLForwarder::cgmDelete##Objects(file, line, n, names);                                 \
    }
    ORU_FOLLOW(Buffers)
    ORU_FOLLOW(FramebuffersEXT)
    ORU_FOLLOW(RenderbuffersEXT)
    ORU_FOLLOW(Textures)
    ORU_FOLLOW(VertexArrays)
#undef ORU_FOLLOW

#define ORU_FOLLOW(Object, Parameters, ...)                                                        \
    GLuint cgmCreate##Object Parameters override {                                                 \
        GLuint const name = OpenGLForwarder::cgmCreate##Object(__VA_ARGS__);                       \
        add(#Object, 1, &name);                                                                    \
        return name;                                                                               \
    }                                                                                              \
    void cgmDelete##Object(char const *file, unsigned int line, GLuint name) override {            \
        remove(#Object, 1, &name);                                                                 \
        OpenGLForwarder::cgmDelete##Object(file, line, name);                                      \
    }
    ORU_FOLLOW(Shader, (char const *file, unsigned int line, GLenum type), file, line, type)
    ORU_FOLLOW(Program, (char const *file, unsigned int line), file, line)
#undef ORU_FOLLOW

    /// The names that were not deleted or deleted twice, empty when all is well.
    std::string leaks() const {
        std::ostringstream text;
        for (auto const &name : alive_)
            text << name.first << " " << name.second << " lives; ";
        return text.str() + faults_;
    }

private:
    using Name = std::pair<std::string, GLuint>;

    void add(char const *kind, GLsizei n, GLuint const *names) {
        for (GLsizei i = 0; i < n; ++i)
            alive_.insert(Name(kind, names[i]));
    }
    void remove(char const *kind, GLsizei n, GLuint const *names) {
        for (GLsizei i = 0; i < n; ++i) {
            if (!alive_.erase(Name(kind, names[i])))
                faults_ += std::string(kind) + " deleted that were not made; ";
        }
    }

    std::set<Name> alive_;
    std::string faults_;
};

/// Every test ends with the names deleted that it made and the client state popped that it pushed.
class ObjectTest : public OffscreenTest {
protected:
    void SetUp() override {
        OffscreenTest::SetUp();
        ledger_.emplace();
    }
    void TearDown() override {
        EXPECT_EQ("", (*ledger_)->leaks());
        if (!IsCoreRun()) {
            EXPECT_EQ(0, Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
        }
        ledger_.reset();
        OffscreenTest::TearDown();
    }

private:
    std::optional<Pushed<NameLedger>> ledger_;
};

} // namespace oru_test
