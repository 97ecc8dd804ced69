// What tests of GL objects share: the fixture that counts names, and expected failures.
#pragma once

#include "../glfixture.h"
#include "tests/messageof.h"

#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include <optional>
#include <set>
#include <sstream>
#include <string>
#include <vector>

namespace oru_test {

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

    GLuint cgmCreateShader(char const *file, unsigned int line, GLenum type) override {
        GLuint const name = OpenGLForwarder::cgmCreateShader(file, line, type);
        add("Shader", 1, &name);
        return name;
    }
    void cgmDeleteShader(char const *file, unsigned int line, GLuint name) override {
        remove("Shader", 1, &name);
        OpenGLForwarder::cgmDeleteShader(file, line, name);
    }
    GLuint cgmCreateProgram(char const *file, unsigned int line) override {
        GLuint const name = OpenGLForwarder::cgmCreateProgram(file, line);
        add("Program", 1, &name);
        return name;
    }
    void cgmDeleteProgram(char const *file, unsigned int line, GLuint name) override {
        remove("Program", 1, &name);
        OpenGLForwarder::cgmDeleteProgram(file, line, name);
    }

    int made() const {
        return made_;
    }

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
        made_ += n;
    }
    void remove(char const *kind, GLsizei n, GLuint const *names) {
        for (GLsizei i = 0; i < n; ++i) {
            if (!alive_.erase(Name(kind, names[i])))
                faults_ += std::string(kind) + " deleted that were not made; ";
        }
    }

    std::set<Name> alive_;
    std::string faults_;
    int made_ = 0;
};

/// Every test ends with the names deleted that it made.
class ObjectTest : public OffscreenTest {
protected:
    void SetUp() override {
        OffscreenTest::SetUp();
        ledger_.emplace();
    }
    void TearDown() override {
        EXPECT_EQ("", (*ledger_)->leaks());
        ledger_.reset();
        OffscreenTest::TearDown();
    }

private:
    std::optional<Pushed<NameLedger>> ledger_;
};

} // namespace oru_test
