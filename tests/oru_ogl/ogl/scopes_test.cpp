// The scopes of blend and line state: what they set, what they put back, and the calls they spare.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/blendscope.h"
#include "oru/oru_ogl/ogl/linescope.h"

#include <memory>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

using Values = std::vector<GLint>;

/// What an alpha blend scope sets, and other values than those, of no two alike.
constexpr GLint kOneMinusAlpha = GL_ONE_MINUS_SRC_ALPHA, kAdd = GL_FUNC_ADD;
Values const kAlpha = {1, kOneMinusAlpha, kOneMinusAlpha, GL_SRC_ALPHA, GL_SRC_ALPHA, kAdd, kAdd};
Values const kOther = {0, GL_ZERO, GL_ONE, GL_DST_COLOR, GL_DST_ALPHA, GL_MIN, GL_MAX};

Values Blending() {
    return Get({GL_BLEND, GL_BLEND_DST_ALPHA, GL_BLEND_DST_RGB, GL_BLEND_SRC_ALPHA,
                GL_BLEND_SRC_RGB, GL_BLEND_EQUATION_ALPHA, GL_BLEND_EQUATION_RGB});
}

/// Factor and pattern count while stippling is on.
Values Stippling() {
    Values const all = Get({GL_LINE_STIPPLE, GL_LINE_STIPPLE_REPEAT, GL_LINE_STIPPLE_PATTERN});
    return all[0] ? all : Values{0, 0, 0};
}

void Switch(GLenum capability, GLint on) {
    if (on)
        ORU_GL(Enable, capability);
    else
        ORU_GL(Disable, capability);
}

void SetBlending(Values const &v) {
    std::vector<GLenum> const gl(v.begin(), v.end());
    Switch(GL_BLEND, v[0]);
    ORU_GL(BlendFuncSeparate, gl[4], gl[2], gl[3], gl[1]);
    ORU_GL(BlendEquationSeparate, gl[6], gl[5]);
}

} // namespace

class ScopesTest : public ObjectTest {
protected:
    /// Expects a state within a scope and the state before it after it, and which calls change it.
    template<class Scope, class... Arguments>
    void expectScope(Values (*state)(), Values const &within, std::string const &begin,
                     std::string const &end, Arguments... arguments) {
        Values const before = state();
        calls_->reset();
        {
            Scope const scope(arguments...);
            EXPECT_EQ(begin, calls_->takeChanges());
            EXPECT_EQ(within, state());
        }
        EXPECT_EQ(end, calls_->takeChanges());
        EXPECT_EQ(before, state());
    }

    InterceptorScope<CountingForwarder> calls_;
};

// With each single value away from what the scope sets, the end makes the one call that it needs.
TEST_F(ScopesTest, AlphaBlendScopePutsBackWhatDiffers) {
    std::string const factors = "BlendFuncSeparate ", equations = "BlendEquationSeparate ";
    auto const expect = [&](Values const &found, std::string const &end) {
        SetBlending(found);
        expectScope<TemporaryAlphaBlendScope>(Blending, kAlpha, "BlendEquation BlendFunc Enable ",
                                              end);
    };
    expect(kAlpha, "");
    for (std::size_t i = 0; i < kAlpha.size(); ++i) {
        Values found = kAlpha;
        found[i] = kOther[i];
        expect(found, i == 0 ? "Disable " : i < 5 ? factors : equations);
    }
    expect(kOther, equations + factors + "Disable ");

    struct Failing : OpenGLForwarder {
        void cgmBlendEquation(char const *file, unsigned int line, GLenum) override {
            OpenGLForwarder::cgmBlendEquation(file, line, 0x1234);
        }
    };
    InterceptorScope<Failing> failing;
    EXPECT_FAILURE("GL_INVALID_ENUM", TemporaryAlphaBlendScope());
    EXPECT_EQ(kOther, Blending());
}

TEST_F(ScopesTest, BlendScopeEndsWithoutAnError) {
    Values changed = Blending();
    {
        TemporaryBlendScope const plain;
        EXPECT_EQ("", calls_->takeChanges());
        ORU_GL(Enable, GL_BLEND); // the caller's own change, which stays
        changed[0] = 1;
        std::unique_ptr<TemporaryBlendScope> nested = std::make_unique<TemporaryAlphaBlendScope>();
        ::glEnable(0x1234); // an error of nobody here
        EXPECT_FAILURE("GL_INVALID_ENUM", TemporaryBlendScope());
        ::glEnable(0x1234);
        nested.reset();
        EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
        EXPECT_EQ(changed, Blending()) << "restored although the first call reported an error";
    }
    EXPECT_EQ(changed, Blending());
}

TEST_F(ScopesTest, LineScopesChangeWhatIsNotAsWanted) {
    auto const width = [] { return Get(std::vector<GLenum>{GL_LINE_WIDTH}); };
    auto const smooth = [] { return Get(std::vector<GLenum>{GL_LINE_SMOOTH}); };
    for (bool const already : {false, true}) {
        ORU_GL(LineWidth, already ? 2.f : 1.f);
        std::string const change = already ? "" : "LineWidth ";
        expectScope<TemporaryLineWidthScope>(width, {2}, change, change, 2.f);
        Switch(GL_LINE_SMOOTH, already);
        expectScope<TemporaryLineSmoothScope>(smooth, {1}, already ? "" : "Enable ",
                                              already ? "" : "Disable ");
    }
}

TEST_F(ScopesTest, StippleScopeOverEveryState) {
    if (IsCoreRun()) {
        std::string const text = MessageOf([] { TemporaryLineStippleScope(1, 2, 0xAAAA); });
        EXPECT_EQ(0u, text.find("Line stippling needs a compatibility context")) << text;
        return;
    }
    Values const stipples[] = {{0, 0, 0}, {1, 3, 0x00FF}, {1, 4, 0x00FF}, {1, 3, 0x0F0F}};
    auto const calls = [](Values const &to) { return to[0] ? "Enable LineStipple " : "Disable "; };
    for (Values const &found : stipples) {
        for (Values const &wanted : stipples) {
            Switch(GL_LINE_STIPPLE, found[0]);
            ORU_GL(LineStipple, found[1], static_cast<GLushort>(found[2]));
            bool const same = found == wanted;
            expectScope<TemporaryLineStippleScope>(Stippling, wanted, same ? "" : calls(wanted),
                                                   same ? "" : calls(found),
                                                   static_cast<unsigned char>(wanted[0]), wanted[1],
                                                   static_cast<unsigned short>(wanted[2]));
        }
    }
}
