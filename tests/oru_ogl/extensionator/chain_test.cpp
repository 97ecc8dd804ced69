// The interceptor chain and the error checker at its end.
#include "tests/support/failure.h"
#include "tests/support/glfixture.h"

#include "oru/oru_ogl/extensionator/openglerrorchecker.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"

using namespace ORU::OGL;

namespace {

/// The error of a call and its place.
template<class Call>
std::string ErrorOf(Call call) {
    oru_test::Failure const failure = oru_test::FailureOf(call);
    return failure.text + ' ' + failure.file + ':' + std::to_string(failure.line);
}

OpenGLInterceptor &First() {
    return *OpenGLInterceptor::Instance();
}

} // namespace

class ChainTest : public oru_test::OffscreenTest {};

TEST_F(ChainTest, StartsWithTheLastPushed) {
    OpenGLForwarder a, b;
    ExtensionManager &record = *ExtensionManager::Instance();
    OpenGLInterceptor *const checker = &First();
    checker->addInterceptor(&a);
    record.addInterceptor(&b);
    EXPECT_EQ(&b, &First());
    EXPECT_EQ(&a, b.interceptor());
    EXPECT_EQ(checker, a.interceptor());
    EXPECT_FAILURE("Enforce dynamic_cast<OpenGLErrorChecker *>(sInterceptor_) != NULL",
                   OpenGLInterceptor::Destroy());
    EXPECT_EQ(&b, record.popInterceptor());
    EXPECT_EQ(&a, First().popInterceptor());
    EXPECT_EQ(nullptr, First().popInterceptor());
    OpenGLInterceptor::Destroy();
    OpenGLInterceptor::Destroy(); // an empty chain has nothing to destroy
}

TEST_F(ChainTest, ThrowsAtTheCallersFileAndLine) {
    EXPECT_EQ("GL_INVALID_VALUE host.cpp:42",
              ErrorOf([] { First().cgmUseProgram("host.cpp", 42, 999); }));
    EXPECT_EQ("GL_INVALID_ENUM host.cpp:43",
              ErrorOf([] { First().cgmIsEnabled("host.cpp", 43, 0x1234); }));
    EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError()) << "the error was taken";
    ::glEnable(0x1234);
    EXPECT_EQ(static_cast<GLenum>(GL_INVALID_ENUM), ORU_GL0(GetError)) << "pending: the result";
}

TEST_F(ChainTest, NamesErrors) {
    for (GLenum error = 0; error < 0x10000; ++error) {
        bool const known = (error >= 0x0500 && error <= 0x0506) || error == 0x8031;
        std::string const name = known             ? ORUOGLTokenName(error)
                                 : error == 0x0507 ? "GL_CONTEXT_LOST"
                                                   : "Unspecified GL error";
        EXPECT_EQ(name,
                  reinterpret_cast<char const *>(OpenGLErrorChecker::GetOpenGLErrorString(error)));
    }
}

TEST_F(ChainTest, BalancesBeginAndEnd) {
    EXPECT_EQ("Unbalanced glEnd()! f:1", ErrorOf([] { First().cgmEnd("f", 1); }));
    ORU_GL(Begin, GL_POINTS);
    EXPECT_EQ("Unbalanced glBegin()! f:2", ErrorOf([] { First().cgmBegin("f", 2, GL_LINES); }));
    // No query is allowed here, so the error of this call waits for glEnd.
    EXPECT_NO_THROW(ORU_GL(Enable, 0x1234));
    EXPECT_EQ("GL_INVALID_OPERATION f:3", ErrorOf([] { First().cgmEnd("f", 3); }));
    EXPECT_EQ("Unbalanced glEnd()! f:4", ErrorOf([] { First().cgmEnd("f", 4); }));
}
