// The scopes of blend and line state: what they set, what they put back, and the calls they spare.
#include "objecttest.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ogl/exceptionogl.h"
#include "oru/oru_ogl/ogl/blendscope.h"
#include "oru/oru_ogl/ogl/linescope.h"

#include <memory>

using namespace ORU::OGL;
using oru_test::CountingForwarder;
using oru_test::MessageOf;
using oru_test::Pushed;

namespace {

std::vector<int> Blending() {
    std::vector<int> values;
    GLenum const names[] = {
        GL_BLEND,           GL_BLEND_SRC_RGB,      GL_BLEND_DST_RGB,       GL_BLEND_SRC_ALPHA,
        GL_BLEND_DST_ALPHA, GL_BLEND_EQUATION_RGB, GL_BLEND_EQUATION_ALPHA};
    for (GLenum const name : names) {
        GLint value = -1;
        ::glGetIntegerv(name, &value);
        values.push_back(value);
    }
    return values;
}

std::vector<int> Stippling() {
    GLint factor = -1, pattern = -1;
    ::glGetIntegerv(GL_LINE_STIPPLE_REPEAT, &factor);
    ::glGetIntegerv(GL_LINE_STIPPLE_PATTERN, &pattern);
    return {::glIsEnabled(GL_LINE_STIPPLE), factor, pattern};
}

float Width() {
    float width = -1;
    ::glGetFloatv(GL_LINE_WIDTH, &width);
    return width;
}

/// The calls that change state, in order, without those that ask.
class Changes : public OpenGLForwarder {
public:
    std::string log;

#define ORU_NOTE(Name, Parameters, ...)                                                            \
    void cgm##Name Parameters override {                                                           \
        log += #Name " ";                                                                          \
        OpenGLForwarder::cgm##Name(f, l, __VA_ARGS__);                                             \
    }
    ORU_NOTE(Enable, (char const *f, unsigned l, GLenum a), a)
    ORU_NOTE(Disable, (char const *f, unsigned l, GLenum a), a)
    ORU_NOTE(LineWidth, (char const *f, unsigned l, GLfloat a), a)
    ORU_NOTE(LineStipple, (char const *f, unsigned l, GLint a, GLushort b), a, b)
    ORU_NOTE(BlendFunc, (char const *f, unsigned l, GLenum a, GLenum b), a, b)
    ORU_NOTE(BlendEquation, (char const *f, unsigned l, GLenum a), a)
    ORU_NOTE(BlendEquationSeparate, (char const *f, unsigned l, GLenum a, GLenum b), a, b)
    ORU_NOTE(BlendFuncSeparate, (char const *f, unsigned l, GLenum a, GLenum b, GLenum c, GLenum d),
             a, b, c, d)
#undef ORU_NOTE

    /// What was noted since the last time.
    std::string take() {
        std::string taken;
        taken.swap(log);
        return taken;
    }
};

class ScopesTest : public oru_test::ObjectTest {
protected:
    Pushed<Changes> changes_;
};

} // namespace

TEST_F(ScopesTest, BlendStateIsWhatTheContextHas) {
    BlendState state;
    EXPECT_FALSE(state.enabled);
    EXPECT_EQ(GL_ONE, state.dstAlpha + state.dstRGB + state.srcAlpha + state.srcRGB - 3);
    EXPECT_EQ(GL_FUNC_ADD, state.equationAlpha);
    ORU_GL(Enable, GL_BLEND);
    ORU_GL(BlendFuncSeparate, GL_SRC_COLOR, GL_DST_COLOR, GL_SRC_ALPHA, GL_DST_ALPHA);
    ORU_GL(BlendEquationSeparate, GL_FUNC_SUBTRACT, GL_MAX);
    state.setToCurrentGLValues();
    EXPECT_EQ((std::vector<int>{state.enabled, state.srcRGB, state.dstRGB, state.srcAlpha,
                                state.dstAlpha, state.equationRGB, state.equationAlpha}),
              Blending());
    EXPECT_EQ(GL_FUNC_SUBTRACT, state.equationRGB);

    ::glEnable(0x1234); // an error of nobody here
    EXPECT_THROW(TemporaryBlendScope(), ORU::LogicalException);
}

// With each single value away from what the scope sets, the end makes the one call that it needs.
TEST_F(ScopesTest, AlphaBlendScopePutsBackWhatDiffers) {
    auto const standard = [] {
        ORU_GL(Enable, GL_BLEND);
        ORU_GL(BlendFunc, GL_SRC_ALPHA, GL_ONE_MINUS_SRC_ALPHA);
        ORU_GL(BlendEquation, GL_FUNC_ADD);
    };
    struct Case {
        void (*change)();
        char const *calls;
    } const cases[] = {
        {[] {}, ""},
        {[] { ORU_GL(Disable, GL_BLEND); }, "Disable "},
        {[] { ORU_GL(BlendFuncSeparate, 1, 0x303, 0x302, 0x303); }, "BlendFuncSeparate "},
        {[] { ORU_GL(BlendFuncSeparate, 0x302, 1, 0x302, 0x303); }, "BlendFuncSeparate "},
        {[] { ORU_GL(BlendFuncSeparate, 0x302, 0x303, 1, 0x303); }, "BlendFuncSeparate "},
        {[] { ORU_GL(BlendFuncSeparate, 0x302, 0x303, 0x302, 1); }, "BlendFuncSeparate "},
        {[] { ORU_GL(BlendEquationSeparate, GL_MIN, GL_FUNC_ADD); }, "BlendEquationSeparate "},
        {[] { ORU_GL(BlendEquationSeparate, GL_FUNC_ADD, GL_MIN); }, "BlendEquationSeparate "},
        {[] {
             ORU_GL(Disable, GL_BLEND);
             ORU_GL(BlendFunc, GL_ONE, GL_ZERO);
             ORU_GL(BlendEquation, GL_MAX);
         },
         "Disable BlendFuncSeparate BlendEquationSeparate "}};
    standard();
    std::vector<int> const wanted = Blending();
    for (Case const &c : cases) {
        standard();
        c.change();
        std::vector<int> const found = Blending();
        {
            TemporaryAlphaBlendScope const scope;
            EXPECT_EQ(wanted, Blending());
            changes_->take();
        }
        EXPECT_EQ(c.calls, changes_->take());
        EXPECT_EQ(found, Blending());
    }
}

TEST_F(ScopesTest, BlendScopeEndsWithoutAnError) {
    {
        TemporaryBlendScope const plain;
        EXPECT_EQ("", changes_->take());
        ORU_GL(Enable, GL_BLEND); // the caller's own change
        {
            std::unique_ptr<TemporaryBlendScope> const nested =
                std::make_unique<TemporaryAlphaBlendScope>();
            ORU_GL(BlendColor, 1.f, 1.f, 1.f, 1.f);
            ::glEnable(0x1234);
        }
        EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
        EXPECT_EQ((std::vector<int>{1, 1, 0, 1, 0, GL_FUNC_ADD, GL_FUNC_ADD}), Blending())
            << "restored although the first call of the end reported somebody else's error";
    }
    EXPECT_TRUE(::glIsEnabled(GL_BLEND)) << "the caller's change stays";
}

TEST_F(ScopesTest, LineScopesChangeNothingThatIsAsWanted) {
    ORU_GL(LineWidth, 2.f);
    ORU_GL(Enable, GL_LINE_SMOOTH);
    ORU_GL(Enable, GL_LINE_STIPPLE);
    ORU_GL(LineStipple, 3, GLushort{0x00FF});
    changes_->take();
    {
        TemporaryLineWidthScope const width(2);
        TemporaryLineSmoothScope const smooth;
        TemporaryLineStippleScope const stipple(1, 3, 0x00FF);
        EXPECT_EQ("", changes_->take());
    }
    EXPECT_EQ("", changes_->take());
}

TEST_F(ScopesTest, LineScopesPutBackWhatTheyFound) {
    {
        TemporaryLineWidthScope const width(2);
        EXPECT_EQ(2, Width());
        TemporaryLineWidthScope const inner(3.5f);
        TemporaryLineSmoothScope const smooth;
        EXPECT_TRUE(::glIsEnabled(GL_LINE_SMOOTH));
        EXPECT_EQ("LineWidth LineWidth Enable ", changes_->take());
    }
    EXPECT_EQ("Disable LineWidth LineWidth ", changes_->take());
    EXPECT_EQ(1, Width());
    EXPECT_FALSE(::glIsEnabled(GL_LINE_SMOOTH));
    LineWidthState widthState;
    LineSmoothState smoothState;
    ORU_GL(LineWidth, 4.f);
    ORU_GL(Enable, GL_LINE_SMOOTH);
    widthState.setToCurrentGLValues();
    smoothState.getLineSmoothState();
    EXPECT_EQ(4, widthState.width);
    EXPECT_TRUE(smoothState.enabled);
}

TEST_F(ScopesTest, StippleScopeOverEveryState) {
    struct Stipple {
        unsigned char on;
        int factor;
        unsigned short pattern;
    };
    Stipple const stipples[] = {{0, 1, 0xFFFF}, {1, 3, 0x00FF}, {1, 4, 0x00FF}, {1, 3, 0x0F0F}};
    for (Stipple const &found : stipples) {
        for (Stipple const &wanted : stipples) {
            if (found.on)
                ORU_GL(Enable, GL_LINE_STIPPLE);
            else
                ORU_GL(Disable, GL_LINE_STIPPLE);
            ORU_GL(LineStipple, found.factor, found.pattern);
            std::vector<int> const before = Stippling();
            changes_->take();
            {
                TemporaryLineStippleScope const scope(wanted.on, wanted.factor, wanted.pattern);
                std::vector<int> const now = Stippling();
                EXPECT_EQ(wanted.on, now[0]);
                if (wanted.on) {
                    EXPECT_EQ((std::vector<int>{1, wanted.factor, wanted.pattern}), now);
                }
                bool const same = &found == &wanted;
                EXPECT_EQ(same        ? ""
                          : wanted.on ? "Enable LineStipple "
                                      : "Disable ",
                          changes_->take());
            }
            EXPECT_EQ(before[0], Stippling()[0]);
            if (found.on) {
                EXPECT_EQ(before, Stippling());
            }
        }
    }
    LineStippleState state;
    ORU_GL(Enable, GL_LINE_STIPPLE);
    ORU_GL(LineStipple, 5, GLushort{0xF00F});
    state.setToCurrentGLValues();
    EXPECT_TRUE(state == (LineStippleState{true, 5, 0xF00F}));
    ORU_GL(Disable, GL_LINE_STIPPLE);
    ORU_GL(LineStipple, 1, GLushort{0xFFFF});
    state.setToCurrentGLValues();
    EXPECT_TRUE(state == (LineStippleState{false, 5, 0xF00F})) << "not read while off";
}

TEST_F(ScopesTest, EndsWithoutAContextChangeNothing) {
    ScopedContextWrapper const restore;
    TemporaryAlphaBlendScope const blend;
    TemporaryLineWidthScope const width(3);
    TemporaryLineSmoothScope const smooth;
    TemporaryLineStippleScope const stipple(1, 2, 0xAAAA);
    changes_->take();
    ::wglMakeCurrent(nullptr, nullptr);
}
