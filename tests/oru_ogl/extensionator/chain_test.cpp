// The interceptor chain and the error checker at its end.
#include "../glfixture.h"
#include "tests/messageof.h"

#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/openglerrorchecker.h"

using namespace ORU::OGL;
using oru_test::MessageOf;

namespace {

/// Writes its letter down when a call passes.
class Marker : public OpenGLForwarder {
public:
    Marker(char letter, std::string &log) : letter_(letter), log_(log) {}
    void cgmFlush(char const *file, unsigned int line) override {
        log_ += letter_;
        OpenGLForwarder::cgmFlush(file, line);
    }

private:
    char letter_;
    std::string &log_;
};

/// Runs a call that must fail and gives the exception.
template<class Call>
ExceptionOGL Failure(Call call) {
    try {
        call();
    } catch (ExceptionOGL const &e) {
        return e;
    }
    ADD_FAILURE() << "nothing was thrown";
    return ExceptionOGL("", 0, "", 0);
}

} // namespace

class ChainTest : public oru_test::OffscreenTest {};

TEST_F(ChainTest, CallsTheLastPushedFirst) {
    std::string log;
    Marker a('a', log), b('b', log);
    ExtensionManager &record = *ExtensionManager::Instance();
    OpenGLInterceptor *const checker = OpenGLInterceptor::Instance();
    ASSERT_NE(nullptr, dynamic_cast<OpenGLErrorChecker *>(checker));
    checker->addInterceptor(&a);
    record.addInterceptor(&b);
    EXPECT_EQ(&a, b.interceptor());
    ORU_GL0(Flush);
    EXPECT_EQ("ba", log);
    EXPECT_EQ("Enforce dynamic_cast<OpenGLErrorChecker *>(sInterceptor_) != NULL",
              MessageOf([] { OpenGLInterceptor::Destroy(); }));
    EXPECT_EQ(&b, record.popInterceptor());
    EXPECT_EQ(&a, OpenGLInterceptor::Instance()->popInterceptor());
    EXPECT_EQ(nullptr, OpenGLInterceptor::Instance()->popInterceptor());
    EXPECT_EQ(checker, OpenGLInterceptor::Instance());
    OpenGLInterceptor::Destroy();
    OpenGLInterceptor::Destroy(); // an empty chain has nothing to destroy
    EXPECT_NE(nullptr, dynamic_cast<OpenGLErrorChecker *>(OpenGLInterceptor::Instance()));
}

TEST_F(ChainTest, ThrowsAtTheCallersFileAndLine) {
    GLuint name = 0;
    ORU_GL(GenTextures, 1, &name);
    int const line = __LINE__ + 1;
    ExceptionOGL const core = Failure([&] { ORU_GL(BindTexture, 0x1234, name); });
    EXPECT_STREQ("GL_INVALID_ENUM", core.message());
    EXPECT_EQ(0x0500u, core.errorNumber());
    EXPECT_STREQ("tests/oru_ogl/extensionator/chain_test.cpp", core.file());
    EXPECT_EQ(line, core.line());
    ORU_GL(DeleteTextures, 1, &name);

    ExceptionOGL const extended =
        Failure([] { OpenGLInterceptor::Instance()->cgmUseProgram("host.cpp", 42, 999); });
    EXPECT_STREQ("GL_INVALID_VALUE", extended.message());
    EXPECT_STREQ("host.cpp", extended.file());
    EXPECT_EQ(42, extended.line());
    EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError()) << "the error was taken";
}

TEST_F(ChainTest, ReturnsResults) {
    GLuint const program = ORU_GL0(CreateProgram);
    EXPECT_NE(0u, program);
    EXPECT_EQ(GL_TRUE, ORU_GL(IsProgram, program));
    ORU_GL(DeleteProgram, program);
    EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ORU_GL0(GetError));
    ::glEnable(0x1234);
    EXPECT_EQ(static_cast<GLenum>(GL_INVALID_ENUM), ORU_GL0(GetError))
        << "a pending error is the result";
}

TEST_F(ChainTest, BalancesBeginAndEnd) {
    ExceptionOGL const end = Failure([] { ORU_GL0(End); });
    EXPECT_STREQ("Unbalanced glEnd()!", end.message());
    EXPECT_EQ(0u, end.errorNumber());
    ASSERT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError()) << "glEnd was not called";

    ORU_GL(Begin, GL_POINTS);
    ExceptionOGL const begin = Failure([] { ORU_GL(Begin, GL_LINES); });
    EXPECT_STREQ("Unbalanced glBegin()!", begin.message());
    // No query is allowed here, so the error of this call waits for glEnd.
    EXPECT_NO_THROW(ORU_GL(Enable, 0x1234));
    EXPECT_NO_THROW(ORU_GL(Vertex2f, 0.f, 0.f));
    EXPECT_NE(0u, Failure([] { ORU_GL0(End); }).errorNumber());
    EXPECT_STREQ("Unbalanced glEnd()!", Failure([] { ORU_GL0(End); }).message());
}
