// The scopes of blend and line state: what they set, what they put back, and the calls they spare.
#include "tests/support/objecttest.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/ogl/blendscope.h"
#include "oru/oru_ogl/ogl/linescope.h"

#include <array>
#include <memory>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

using Values = std::vector<int>;

/// In the order of BlendState's members.
Values Blending() {
    return {Get(GL_BLEND),
            Get(GL_BLEND_DST_ALPHA),
            Get(GL_BLEND_DST_RGB),
            Get(GL_BLEND_SRC_ALPHA),
            Get(GL_BLEND_SRC_RGB),
            Get(GL_BLEND_EQUATION_ALPHA),
            Get(GL_BLEND_EQUATION_RGB)};
}

Values Blending(BlendState const &s) {
    return {s.enabled, s.dstAlpha, s.dstRGB, s.srcAlpha, s.srcRGB, s.equationAlpha, s.equationRGB};
}

Values Stippling() {
    return {Get(GL_LINE_STIPPLE), Get(GL_LINE_STIPPLE_REPEAT), Get(GL_LINE_STIPPLE_PATTERN)};
}

void SetStippling(int on, int factor, int pattern) {
    if (on)
        ORU_GL(Enable, GL_LINE_STIPPLE);
    else
        ORU_GL(Disable, GL_LINE_STIPPLE);
    ORU_GL(LineStipple, factor, static_cast<GLushort>(pattern));
}

} // namespace

class ScopesTest : public ObjectTest {
protected:
    Pushed<CountingForwarder> calls_;
};

TEST_F(ScopesTest, BlendStateIsWhatTheContextHas) {
    BlendState state;
    EXPECT_EQ((Values{0, GL_ONE, GL_ONE, GL_ONE, GL_ONE, GL_FUNC_ADD, GL_FUNC_ADD}),
              Blending(state));
    ORU_GL(Enable, GL_BLEND);
    ORU_GL(BlendFuncSeparate, GL_SRC_COLOR, GL_DST_COLOR, GL_SRC_ALPHA, GL_DST_ALPHA);
    ORU_GL(BlendEquationSeparate, GL_FUNC_SUBTRACT, GL_MAX);
    state.setToCurrentGLValues();
    EXPECT_EQ(Blending(), Blending(state));
    EXPECT_EQ(GL_FUNC_SUBTRACT, state.equationRGB);
    ::glEnable(0x1234); // an error of nobody here
    EXPECT_THROW(TemporaryBlendScope(), ORU::LogicalException);
}

// With each single value away from what the scope sets, the end makes the one call that it needs.
TEST_F(ScopesTest, AlphaBlendScopePutsBackWhatDiffers) {
    struct Case {
        bool enabled;
        std::array<GLenum, 6> values; ///< factors, as glBlendFuncSeparate takes them, and equations
        char const *calls;
    } const cases[] = {
        {true, {0x302, 0x303, 0x302, 0x303, GL_FUNC_ADD, GL_FUNC_ADD}, ""},
        {false, {0x302, 0x303, 0x302, 0x303, GL_FUNC_ADD, GL_FUNC_ADD}, "Disable "},
        {true, {1, 0x303, 0x302, 0x303, GL_FUNC_ADD, GL_FUNC_ADD}, "BlendFuncSeparate "},
        {true, {0x302, 1, 0x302, 0x303, GL_FUNC_ADD, GL_FUNC_ADD}, "BlendFuncSeparate "},
        {true, {0x302, 0x303, 1, 0x303, GL_FUNC_ADD, GL_FUNC_ADD}, "BlendFuncSeparate "},
        {true, {0x302, 0x303, 0x302, 1, GL_FUNC_ADD, GL_FUNC_ADD}, "BlendFuncSeparate "},
        {true, {0x302, 0x303, 0x302, 0x303, GL_MIN, GL_FUNC_ADD}, "BlendEquationSeparate "},
        {true, {0x302, 0x303, 0x302, 0x303, GL_FUNC_ADD, GL_MIN}, "BlendEquationSeparate "},
        {false, {1, 0, 1, 0, GL_MAX, GL_MAX}, "BlendEquationSeparate BlendFuncSeparate Disable "}};
    for (auto const &[enabled, v, calls] : cases) {
        if (enabled)
            ORU_GL(Enable, GL_BLEND);
        else
            ORU_GL(Disable, GL_BLEND);
        ORU_GL(BlendFuncSeparate, v[0], v[1], v[2], v[3]);
        ORU_GL(BlendEquationSeparate, v[4], v[5]);
        Values const found = Blending();
        {
            TemporaryAlphaBlendScope const scope;
            EXPECT_EQ((Values{1, 0x303, 0x303, 0x302, 0x302, GL_FUNC_ADD, GL_FUNC_ADD}),
                      Blending());
            calls_->reset();
        }
        EXPECT_EQ(calls, calls_->takeChanges());
        EXPECT_EQ(found, Blending());
    }
}

TEST_F(ScopesTest, AlphaBlendScopeThatFailsPutsBlendingBack) {
    struct Failing : OpenGLForwarder {
        void cgmBlendEquation(char const *file, unsigned int line, GLenum) override {
            OpenGLForwarder::cgmBlendEquation(file, line, 0x1234);
        }
    };
    ORU_GL(BlendFunc, GL_DST_COLOR, GL_ONE);
    Values const found = Blending();
    Pushed<Failing> failing;
    EXPECT_FAILURE("GL_INVALID_ENUM", TemporaryAlphaBlendScope());
    EXPECT_EQ(found, Blending());
}

TEST_F(ScopesTest, BlendScopeEndsWithoutAnError) {
    {
        TemporaryBlendScope const plain;
        EXPECT_EQ("", calls_->takeChanges());
        ORU_GL(Enable, GL_BLEND); // the caller's own change
        {
            std::unique_ptr<TemporaryBlendScope> const nested =
                std::make_unique<TemporaryAlphaBlendScope>();
            ::glEnable(0x1234);
        }
        EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
        EXPECT_EQ((Values{1, 0, 0, 1, 1, GL_FUNC_ADD, GL_FUNC_ADD}), Blending())
            << "restored although the first call of the end reported somebody else's error";
    }
    EXPECT_TRUE(::glIsEnabled(GL_BLEND)) << "the caller's change stays";
}

TEST_F(ScopesTest, LineScopesChangeWhatIsNotAsWantedAndPutItBack) {
    for (bool const found : {false, true}) {
        float const width = found ? 2 : 1;
        if (found)
            ORU_GL(Enable, GL_LINE_SMOOTH);
        ORU_GL(LineWidth, width);
        calls_->reset();
        LineWidthState widthState;
        LineSmoothState smoothState;
        {
            TemporaryLineWidthScope const two(2);
            TemporaryLineSmoothScope const smooth;
            EXPECT_EQ(found ? "" : "Enable LineWidth ", calls_->takeChanges());
            widthState.setToCurrentGLValues();
            smoothState.getLineSmoothState();
            EXPECT_EQ(2, widthState.width);
            EXPECT_TRUE(smoothState.enabled);
            TemporaryLineWidthScope const inner(3.5f);
            calls_->reset();
        }
        EXPECT_EQ(found ? "LineWidth " : "Disable LineWidth LineWidth ", calls_->takeChanges());
        widthState.setToCurrentGLValues();
        smoothState.getLineSmoothState();
        EXPECT_EQ(width, widthState.width);
        EXPECT_EQ(found, smoothState.enabled);
    }
}

TEST_F(ScopesTest, StippleScopeOverEveryState) {
    Values const stipples[] = {{0, 1, 0xFFFF}, {1, 3, 0x00FF}, {1, 4, 0x00FF}, {1, 3, 0x0F0F}};
    for (Values const &found : stipples) {
        for (Values const &wanted : stipples) {
            SetStippling(found[0], found[1], found[2]);
            calls_->reset();
            {
                TemporaryLineStippleScope const scope(static_cast<unsigned char>(wanted[0]),
                                                      wanted[1],
                                                      static_cast<unsigned short>(wanted[2]));
                Values const now = Stippling();
                EXPECT_EQ(wanted[0] ? wanted : Values({0, now[1], now[2]}), now);
                EXPECT_EQ(&found == &wanted ? ""
                          : wanted[0]       ? "Enable LineStipple "
                                            : "Disable ",
                          calls_->takeChanges());
            }
            Values const after = Stippling();
            EXPECT_EQ(found[0] ? found : Values({0, after[1], after[2]}), after);
            EXPECT_TRUE(!found[0] || &found != &wanted || calls_->takeChanges().empty());
        }
    }
    LineStippleState state;
    SetStippling(1, 5, 0xF00F);
    state.setToCurrentGLValues();
    EXPECT_TRUE(state == (LineStippleState{true, 5, 0xF00F}));
    SetStippling(0, 1, 0xFFFF);
    state.setToCurrentGLValues();
    EXPECT_TRUE(state == (LineStippleState{false, 5, 0xF00F})) << "not read while off";
}
