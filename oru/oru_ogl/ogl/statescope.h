// State of drawing changed for a scope: viewport, scissor, depth, stencil, culling, colour mask.
#pragma once

#include "oru/core/utility/export.h"

#include <type_traits>

namespace ORU::OGL {

/// The kinds of state that a TemporaryStateScope holds.
enum StateKind : unsigned int {
    STATEKIND_VIEWPORT = 0, ///< ViewportState
    STATEKIND_SCISSOR,      ///< ScissorState
    STATEKIND_DEPTH,        ///< DepthState
    STATEKIND_STENCIL,      ///< StencilState
    STATEKIND_CULL,         ///< CullState
    STATEKIND_COLORMASK     ///< ColorMaskState
};

// The members of the states are OpenGL's values as it tells them; 1 and 0 say on and off. They
// begin as a new context has them, but rectangles empty.

/// The rectangle that drawing is mapped to. Of several viewports the first one's is read, and all
/// are set. @note glViewport
struct ViewportState {
    static constexpr StateKind kKind = STATEKIND_VIEWPORT; ///< its row of the table

    int x = 0;      ///< pixels from the left
    int y = 0;      ///< pixels from the bottom
    int width = 0;  ///< pixels
    int height = 0; ///< pixels
};

/// The rectangle outside which nothing is drawn or cleared. Of several viewports the first one's is
/// read, and all are set. @note glScissor; glEnable or glDisable
struct ScissorState {
    static constexpr StateKind kKind = STATEKIND_SCISSOR; ///< its row of the table

    int enabled = 0; ///< GL_SCISSOR_TEST
    int x = 0;       ///< pixels from the left
    int y = 0;       ///< pixels from the bottom
    int width = 0;   ///< pixels
    int height = 0;  ///< pixels
};

/// The depth test. @note glDepthMask, glDepthFunc; glEnable or glDisable
struct DepthState {
    static constexpr StateKind kKind = STATEKIND_DEPTH; ///< its row of the table

    int enabled = 0;       ///< GL_DEPTH_TEST
    int writes = 1;        ///< whether depths that pass are written
    int function = 0x0201; ///< what passes: GL_LESS and the like
};

/// The stencil test for one side of the triangles.
struct StencilFace {
    int function = 0x0207;     ///< what passes: GL_ALWAYS and the like
    int reference = 0;         ///< what stencils are compared with
    unsigned int mask = ~0u;   ///< the bits that are compared
    int fail = 0x1E00;         ///< what becomes of a stencil that fails, GL_KEEP and the like
    int depthFail = 0x1E00;    ///< … that passes where the depth test fails
    int pass = 0x1E00;         ///< … that passes both
    unsigned int writes = ~0u; ///< the bits that are written
};

/// The stencil test. OpenGL 2.0. It tells masks and references as what the stencil buffer that is
/// bound has bits for: let `change` alter what is found, and no more is set than that. @note
/// glStencilFuncSeparate, glStencilOpSeparate, glStencilMaskSeparate; glEnable or glDisable
struct StencilState {
    static constexpr StateKind kKind = STATEKIND_STENCIL; ///< its row of the table

    int enabled = 0;   ///< GL_STENCIL_TEST
    StencilFace front; ///< of triangles that face the viewer, of lines and points
    StencilFace back;  ///< of triangles that face away
};

/// Which triangles are left out. @note glCullFace, glFrontFace; glEnable or glDisable
struct CullState {
    static constexpr StateKind kKind = STATEKIND_CULL; ///< its row of the table

    int enabled = 0;    ///< GL_CULL_FACE
    int side = 0x0405;  ///< the one that is left out: GL_BACK, GL_FRONT or GL_FRONT_AND_BACK
    int front = 0x0901; ///< how the corners of one run that faces the viewer: GL_CCW or GL_CW
};

/// Which components of a colour are written. Of several colour buffers with masks of their own the
/// first one's is read, and all are set. @note glColorMask
struct ColorMaskState {
    static constexpr StateKind kKind = STATEKIND_COLORMASK; ///< its row of the table

    int red = 1;   ///< whether written
    int green = 1; ///< whether written
    int blue = 1;  ///< whether written
    int alpha = 1; ///< whether written
};

/// What the scopes of all kinds share; use TemporaryStateScope and CurrentState.
class ORU_API StateAccess {
public:
    /// Reads a state of the current context. @note glGetIntegerv
    static void Read(StateKind kind, void *state);

    /// Reads a state, and makes the calls for what differs from the one that is wanted.
    static void Change(StateKind kind, void *found, void const *wanted);

    /// Makes the calls for what differs between two states; what was set before one of them fails
    /// is put back.
    static void Set(StateKind kind, void const *from, void const *to);

    /// The same for destructors: one failure does not keep the other calls from being made.
    static void PutBack(StateKind kind, void const *from, void const *to) noexcept;
};

/// A state of the current context: `CurrentState<DepthState>().function`.
/// @throws ExceptionOGL when an error is pending
/// @note glGetIntegerv
template<class State>
State CurrentState() {
    State state;
    StateAccess::Read(State::kKind, &state);
    return state;
}

/// Changes a state for a scope.
///
/// ```cpp
/// TemporaryViewportScope const viewport({0, 0, 512, 512});
/// TemporaryDepthScope const depth([](DepthState &state) { state.writes = 0; });
/// ```
///
/// It reads the state, sets what differs from what is wanted, and at its end puts that back, also
/// when an exception ends the scope. Changes that the caller makes itself meanwhile stay where the
/// scope set nothing.
template<class State>
class TemporaryStateScope {
public:
    /// Sets all of a state.
    /// @throws ExceptionOGL for values that OpenGL does not know; nothing is changed then
    explicit TemporaryStateScope(State const &wanted) : set_(wanted) {
        StateAccess::Change(State::kKind, &found_, &set_);
    }

    /// Sets what `change` makes of the state that is found.
    /// @param change called with a State &
    /// @throws as the other, and what `change` throws
    template<class Change, class = std::enable_if_t<std::is_invocable_v<Change &, State &>>>
    explicit TemporaryStateScope(Change change) : found_(CurrentState<State>()), set_(found_) {
        change(set_);
        StateAccess::Set(State::kKind, &found_, &set_);
    }

    TemporaryStateScope(TemporaryStateScope const &) = delete;
    TemporaryStateScope &operator=(TemporaryStateScope const &) = delete;

    /// Puts back what the scope changed.
    ~TemporaryStateScope() { StateAccess::PutBack(State::kKind, &set_, &found_); }

    State const &found() const { return found_; } ///< What was there before.

private:
    static_assert(std::is_trivially_copyable_v<State>);

    State found_;
    State set_;
};

using TemporaryViewportScope = TemporaryStateScope<ViewportState>;   ///< Draws elsewhere.
using TemporaryScissorScope = TemporaryStateScope<ScissorState>;     ///< Draws in a rectangle only.
using TemporaryDepthScope = TemporaryStateScope<DepthState>;         ///< Tests depths otherwise.
using TemporaryStencilScope = TemporaryStateScope<StencilState>;     ///< Tests stencils otherwise.
using TemporaryCullScope = TemporaryStateScope<CullState>;           ///< Leaves triangles out.
using TemporaryColorMaskScope = TemporaryStateScope<ColorMaskState>; ///< Writes some components.

} // namespace ORU::OGL
