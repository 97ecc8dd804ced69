// Scopes of viewport, scissor, depth, stencil, culling and colour mask: each value by itself, which
// calls a difference takes, and what is left after failures.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/switchscope.h"

#include <cstring>
#include <stdexcept>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

/// A state as numbers, in the order of its members.
template<class State>
std::vector<GLint> Numbers(State const &state) {
    std::vector<GLint> numbers(sizeof state / sizeof(GLint));
    std::memcpy(numbers.data(), &state, sizeof state);
    return numbers;
}

} // namespace

class StateScopeTest : public ObjectTest {
protected:
    /// Changes each value of a state by itself, from `one` to `other` and back.
    /// @param names of the queries that tell the values, four of one query once
    /// @param calls that each value takes; back from `other` switches take the opposite
    template<class State>
    void expectEach(State const &one, State const &other, std::vector<GLenum> const &names,
                    std::vector<std::string> const &calls) {
        auto const read = [&names] {
            std::vector<GLint> values;
            for (GLenum const name : names) {
                GLint several[4] = {};
                ORU_GL(GetIntegerv, name, several);
                bool const isFour =
                    name == GL_VIEWPORT || name == GL_SCISSOR_BOX || name == GL_COLOR_WRITEMASK;
                values.insert(values.end(), several, several + (isFour ? 4 : 1));
            }
            return values;
        };
        TemporaryStateScope<State> const outer(one);
        ASSERT_EQ(calls.size(), Numbers(one).size());
        for (std::size_t i = 0; i < calls.size(); ++i) {
            SCOPED_TRACE(calls[i] + std::to_string(i));
            auto wanted = Numbers(one);
            wanted[i] = Numbers(other)[i];
            State state;
            std::memcpy(static_cast<void *>(&state), wanted.data(), sizeof state);
            calls_->reset();
            try {
                TemporaryStateScope<State> const scope(state);
                EXPECT_EQ(calls[i], calls_->takeChanges());
                EXPECT_EQ(wanted, read());
                EXPECT_EQ(wanted, Numbers(CurrentState<State>()));
                throw std::runtime_error("ends the scope");
            } catch (std::runtime_error const &) {
            }
            EXPECT_EQ(calls[i] == "Enable "    ? "Disable "
                      : calls[i] == "Disable " ? "Enable "
                                               : calls[i],
                      calls_->takeChanges());
            EXPECT_EQ(Numbers(one), read());
            {
                TemporaryStateScope<State> const same([](State &) {});
            }
            EXPECT_EQ("", calls_->takeChanges());
        }
    }

    InterceptorScope<CountingForwarder> calls_;
};

TEST_F(StateScopeTest, EachValueComesAndGoesByItself) {
    std::string const viewport = "Viewport ", scissor = "Scissor ", mask = "ColorMask ";
    expectEach<ViewportState>({1, 2, 3, 4}, {5, 6, 7, 8}, {GL_VIEWPORT},
                              {viewport, viewport, viewport, viewport});
    expectEach<ScissorState>({0, 1, 2, 3, 4}, {1, 5, 6, 7, 8}, {GL_SCISSOR_TEST, GL_SCISSOR_BOX},
                             {"Enable ", scissor, scissor, scissor, scissor});
    expectEach<DepthState>({1, 1, GL_LESS}, {0, 0, GL_GEQUAL},
                           {GL_DEPTH_TEST, GL_DEPTH_WRITEMASK, GL_DEPTH_FUNC},
                           {"Disable ", "DepthMask ", "DepthFunc "});
    expectEach<CullState>({0, GL_BACK, GL_CCW}, {1, GL_FRONT, GL_CW},
                          {GL_CULL_FACE, GL_CULL_FACE_MODE, GL_FRONT_FACE},
                          {"Enable ", "CullFace ", "FrontFace "});
    expectEach<ColorMaskState>({1, 1, 1, 1}, {0, 0, 0, 0}, {GL_COLOR_WRITEMASK},
                               {mask, mask, mask, mask});
    StencilFace const zero = {GL_LESS, 1, 0x0F, GL_ZERO, GL_INCR, GL_DECR, 0x33};
    StencilFace const other = {GL_GEQUAL, 2, 0xF0, GL_KEEP, GL_REPLACE, GL_INVERT, 0xCC};
    Renderbuffer colours(GL_RGBA8, 8, 8), stencils(GL_DEPTH24_STENCIL8, 8, 8);
    Framebuffer framebuffer; // references are told as what the stencil buffer has bits for
    framebuffer.bind();
    framebuffer.attach(&colours, 0);
    framebuffer.attachRenderbuffer(stencils, Framebuffer::ATTACHMENT_DEPTH_AND_STENCIL);
    ASSERT_EQ("", framebuffer.incompleteness());
    std::string const function = "StencilFuncSeparate ", operation = "StencilOpSeparate ",
                      writes = "StencilMaskSeparate ";
    expectEach<StencilState>(
        {0, zero, zero}, {1, other, other},
        {GL_STENCIL_TEST, GL_STENCIL_FUNC, GL_STENCIL_REF, GL_STENCIL_VALUE_MASK, GL_STENCIL_FAIL,
         GL_STENCIL_PASS_DEPTH_FAIL, GL_STENCIL_PASS_DEPTH_PASS, GL_STENCIL_WRITEMASK,
         GL_STENCIL_BACK_FUNC, GL_STENCIL_BACK_REF, GL_STENCIL_BACK_VALUE_MASK,
         GL_STENCIL_BACK_FAIL, GL_STENCIL_BACK_PASS_DEPTH_FAIL, GL_STENCIL_BACK_PASS_DEPTH_PASS,
         GL_STENCIL_BACK_WRITEMASK},
        {"Enable ", function, function, function, operation, operation, operation, writes, function,
         function, function, operation, operation, operation, writes});
}

TEST_F(StateScopeTest, AFailureLeavesWhatWasThere) {
    DepthState const before = CurrentState<DepthState>();
    auto const expectBefore = [&] {
        EXPECT_EQ(Numbers(before), Numbers(CurrentState<DepthState>()));
    };
    EXPECT_FAILURE("GL_INVALID_ENUM", TemporaryDepthScope({!before.enabled, 0, 0x1234}));
    expectBefore();
    EXPECT_FAILURE("mine", TemporaryDepthScope([](DepthState &state) {
                       state.writes = 0;
                       throw std::runtime_error("mine");
                   }));
    expectBefore();
    {
        TemporaryDepthScope const scope({!before.enabled, !before.writes, GL_ALWAYS});
        EXPECT_EQ(Numbers(before), Numbers(scope.found()));
        ::glEnable(0x1234); // the first call of the end finds it and is made all the same
    }
    expectBefore();
}

TEST_F(StateScopeTest, SwitchesComeAndGo) {
    for (bool const before : {false, true}) {
        TemporarySwitchScope const outer(GL_DITHER, before);
        for (bool const on : {false, true}) {
            auto const callTo = [&](bool state) -> std::string {
                return before == on ? "" : state ? "Enable " : "Disable ";
            };
            calls_->reset();
            {
                TemporarySwitchScope const scope(GL_DITHER, on);
                EXPECT_EQ(before, scope.found());
                EXPECT_EQ(callTo(on) + "IsEnabled ", calls_->takeChanges());
                EXPECT_EQ(on, ::glIsEnabled(GL_DITHER) == GL_TRUE);
                ::glEnable(0x1234); // the call of the end finds it and is made all the same
            }
            ::glGetError(); // where the scope has nothing to do at its end
            EXPECT_EQ(callTo(before), calls_->takeChanges());
            EXPECT_EQ(before, ::glIsEnabled(GL_DITHER) == GL_TRUE);
        }
    }
    EXPECT_FAILURE("GL_INVALID_ENUM", TemporarySwitchScope(0x1234, true));
}
