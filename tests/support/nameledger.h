// Which names of GL objects are made and deleted.
#pragma once

#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/openglforwarder.h"
#include "oru/oru_ogl/platformgl.h"

#include <cstdint>
#include <map>
#include <mutex>
#include <string>

namespace oru_test {

/// Follows the names of GL objects from generation to deletion, on all threads.
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
    ORU_FOLLOW(ProgramPipelines)
    ORU_FOLLOW(Queries)
    ORU_FOLLOW(RenderbuffersEXT)
    ORU_FOLLOW(Samplers)
    ORU_FOLLOW(Textures)
    ORU_FOLLOW(TransformFeedbacks)
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

    GLsync cgmFenceSync(char const *file, unsigned int line, GLenum condition,
                        GLbitfield flags) override {
        GLsync const sync = OpenGLForwarder::cgmFenceSync(file, line, condition, flags);
        note(sync, 1);
        return sync;
    }
    void cgmDeleteSync(char const *file, unsigned int line, GLsync sync) override {
        note(sync, -1);
        OpenGLForwarder::cgmDeleteSync(file, line, sync);
    }

    /// The names that were not deleted or deleted twice, empty when all is well.
    std::string leaks() const {
        std::string text;
        for (auto const &[name, balance] : balances_)
            text += balance == 0 ? "" : name + (balance > 0 ? " lives; " : " deleted too often; ");
        return text;
    }

private:
    void note(char const *kind, GLsizei n, GLuint const *names, int change) {
        std::lock_guard<std::mutex> const lock(mutex_);
        for (GLsizei i = 0; i < n; ++i)
            balances_[kind + std::to_string(names[i])] += change;
    }

    void note(GLsync sync, int change) {
        std::lock_guard<std::mutex> const lock(mutex_);
        balances_["Sync" + std::to_string(reinterpret_cast<std::uintptr_t>(sync))] += change;
    }

    std::mutex mutex_;
    std::map<std::string, int> balances_; ///< generations less deletions
};

} // namespace oru_test
