// What tests of GL objects share: the fixture that counts names, expected failures, queries.
#pragma once

#include "tests/support/failure.h"
#include "tests/support/glfixture.h"

#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include <map>
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
        try {                                                                                      \
            OpenGLForwarder::cgmGen##Objects(file, line, n, names);                                \
        } catch (...) { /* of an error that was pending: the names are made */                     \
            note(#Objects, n, names, 1);                                                           \
            throw;                                                                                 \
        }                                                                                          \
        note(#Objects, n, names, 1);                                                               \
    }                                                                                              \
    void cgmDelete##Objects(char const *file, unsigned int line, GLsizei n, GLuint const *names)   \
        override {                                                                                 \
        note(#Objects, n, names, -1);                                                              \
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
        note(#Object, 1, &name, 1);                                                                \
        return name;                                                                               \
    }                                                                                              \
    void cgmDelete##Object(char const *file, unsigned int line, GLuint name) override {            \
        note(#Object, 1, &name, -1);                                                               \
        OpenGLForwarder::cgmDelete##Object(file, line, name);                                      \
    }
    ORU_FOLLOW(Shader, (char const *file, unsigned int line, GLenum type), file, line, type)
    ORU_FOLLOW(Program, (char const *file, unsigned int line), file, line)
#undef ORU_FOLLOW

    /// The names that were not deleted or deleted twice, empty when all is well.
    std::string leaks() const {
        std::string text;
        for (auto const &[name, balance] : balances_)
            text += balance == 0 ? "" : name + (balance > 0 ? " lives; " : " deleted too often; ");
        return text;
    }

private:
    void note(char const *kind, GLsizei n, GLuint const *names, int change) {
        for (GLsizei i = 0; i < n; ++i)
            balances_[kind + std::to_string(names[i])] += change;
    }

    std::map<std::string, int> balances_; ///< generations less deletions
};

/// Every test ends with the names deleted that it made and the client state popped that it pushed.
class ObjectTest : public OffscreenTest {
protected:
    void TearDown() override {
        EXPECT_EQ("", ledger_->leaks());
        if (!IsCoreRun()) {
            EXPECT_EQ(0, Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
        }
        OffscreenTest::TearDown();
    }

private:
    ORU::OGL::InterceptorScope<NameLedger> ledger_;
};

} // namespace oru_test
