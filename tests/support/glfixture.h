// What tests on a real context share: the fixture, a decorator that counts calls.
#pragma once

#include "tests/support/coreprofile.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/extensionator/interceptorscope.h"
#include "oru/oru_ogl/extensionator/openglforwarder.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <map>
#include <numeric>
#include <optional>

namespace oru_test {

/// Counts the calls of every operation by name, and forwards them.
class CountingForwarder : public ORU::OGL::OpenGLInterceptorDecorator {
public:
    /// Calls of one entry point, named without its `gl`.
    int count(std::string const &name) const { return counts_.count(name) ? counts_.at(name) : 0; }

    int total() const {
        return std::accumulate(counts_.begin(), counts_.end(), 0,
                               [](int sum, auto const &entry) { return sum + entry.second; });
    }

    /// The calls since the last time that are no queries, in alphabetical order.
    std::string takeChanges() {
        std::string names;
        for (auto const &[name, calls] : counts_) {
            for (int i = 0; name.rfind("Get", 0) != 0 && i < calls; ++i)
                names += name + " ";
        }
        reset();
        return names;
    }

    void reset() { counts_.clear(); }

#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    Result cgm##Name Parameters override {                                                         \
        ++counts_[#Name];                                                                          \
        return interceptor()->cgm##Name Arguments;                                                 \
    }
#include "oru/oru_ogl/extensionator/gloperations.inc"

private:
    std::map<std::string, int> counts_;
};

/// Every test runs with an offscreen context current and must leave no GL error behind.
class OffscreenTest : public ::testing::Test {
protected:
    void SetUp() override {
        if (IsCoreRun())
            coreShaders_.emplace();
        context_ = std::make_unique<ORU::OGL::ContextOffscreen>();
        context_->makeCurrent();
    }

    void TearDown() override {
        if (ORU::OGL::Context::CurrentContext()) {
            EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
        }
        context_.reset();
        coreShaders_.reset();
    }

    ORU::OGL::ContextOffscreen &context() { return *context_; }

private:
    ORU::OGL::AutoInitializer library_;
    ORU::OGL::ExtensionManager::ScopedInitOptions options_{RunOptions()};
    std::optional<ORU::OGL::InterceptorScope<CoreShaders>> coreShaders_;
    std::unique_ptr<ORU::OGL::ContextOffscreen> context_;
};

} // namespace oru_test
