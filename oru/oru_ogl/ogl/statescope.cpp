// State of drawing changed for a scope: viewport, scissor, depth, stencil, culling, colour mask.
#include "oru/oru_ogl/ogl/statescope.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstring>
#include <iterator>

namespace ORU::OGL {

namespace {

/// Values of a state that one call sets, in the order of the state's members.
struct Piece {
    StateKind kind;
    GLenum queries[3]; ///< one for all values, or one for each of several
    std::size_t count; ///< of values
    void (*set)(GLint const *values);
};

template<GLenum Capability>
void Switch(GLint const *on) {
    if (*on)
        ORU_GL(Enable, Capability);
    else
        ORU_GL(Disable, Capability);
}

template<GLenum Side>
void SetStencilFunction(GLint const *values) {
    ORU_GL(StencilFuncSeparate, Side, static_cast<GLenum>(values[0]), values[1],
           static_cast<GLuint>(values[2]));
}

template<GLenum Side>
void SetStencilOperations(GLint const *values) {
    ORU_GL(StencilOpSeparate, Side, static_cast<GLenum>(values[0]), static_cast<GLenum>(values[1]),
           static_cast<GLenum>(values[2]));
}

template<GLenum Side>
void SetStencilMask(GLint const *mask) {
    ORU_GL(StencilMaskSeparate, Side, static_cast<GLuint>(*mask));
}

GLboolean Flag(GLint value) {
    return value ? GL_TRUE : GL_FALSE;
}

constexpr Piece kPieces[] = {
    {StateKind::Viewport,
     {GL_VIEWPORT},
     4,
     [](GLint const *v) { ORU_GL(Viewport, v[0], v[1], v[2], v[3]); }},
    {StateKind::Scissor, {GL_SCISSOR_TEST}, 1, Switch<GL_SCISSOR_TEST>},
    {StateKind::Scissor,
     {GL_SCISSOR_BOX},
     4,
     [](GLint const *v) { ORU_GL(Scissor, v[0], v[1], v[2], v[3]); }},
    {StateKind::Depth, {GL_DEPTH_TEST}, 1, Switch<GL_DEPTH_TEST>},
    {StateKind::Depth,
     {GL_DEPTH_WRITEMASK},
     1,
     [](GLint const *v) { ORU_GL(DepthMask, Flag(*v)); }},
    {StateKind::Depth,
     {GL_DEPTH_FUNC},
     1,
     [](GLint const *v) { ORU_GL(DepthFunc, static_cast<GLenum>(*v)); }},
    {StateKind::Stencil, {GL_STENCIL_TEST}, 1, Switch<GL_STENCIL_TEST>},
    {StateKind::Stencil,
     {GL_STENCIL_FUNC, GL_STENCIL_REF, GL_STENCIL_VALUE_MASK},
     3,
     SetStencilFunction<GL_FRONT>},
    {StateKind::Stencil,
     {GL_STENCIL_FAIL, GL_STENCIL_PASS_DEPTH_FAIL, GL_STENCIL_PASS_DEPTH_PASS},
     3,
     SetStencilOperations<GL_FRONT>},
    {StateKind::Stencil, {GL_STENCIL_WRITEMASK}, 1, SetStencilMask<GL_FRONT>},
    {StateKind::Stencil,
     {GL_STENCIL_BACK_FUNC, GL_STENCIL_BACK_REF, GL_STENCIL_BACK_VALUE_MASK},
     3,
     SetStencilFunction<GL_BACK>},
    {StateKind::Stencil,
     {GL_STENCIL_BACK_FAIL, GL_STENCIL_BACK_PASS_DEPTH_FAIL, GL_STENCIL_BACK_PASS_DEPTH_PASS},
     3,
     SetStencilOperations<GL_BACK>},
    {StateKind::Stencil, {GL_STENCIL_BACK_WRITEMASK}, 1, SetStencilMask<GL_BACK>},
    {StateKind::Cull, {GL_CULL_FACE}, 1, Switch<GL_CULL_FACE>},
    {StateKind::Cull,
     {GL_CULL_FACE_MODE},
     1,
     [](GLint const *v) { ORU_GL(CullFace, static_cast<GLenum>(*v)); }},
    {StateKind::Cull,
     {GL_FRONT_FACE},
     1,
     [](GLint const *v) { ORU_GL(FrontFace, static_cast<GLenum>(*v)); }},
    {StateKind::ColorMask,
     {GL_COLOR_WRITEMASK},
     4,
     [](GLint const *v) { ORU_GL(ColorMask, Flag(v[0]), Flag(v[1]), Flag(v[2]), Flag(v[3])); }},
};

/// The members of a state, as many as the largest has.
using Values = std::array<GLint, 15>;

/// Calls `each(piece, first value)` for the pieces of a kind.
/// @return how many values they have
template<class Each>
std::size_t ForEachPiece(StateKind kind, Each each) {
    std::size_t first = 0;
    for (Piece const &piece : kPieces) {
        if (piece.kind != kind)
            continue;
        each(piece, first);
        first += piece.count;
    }
    return first;
}

Values ValuesOf(StateKind kind, void const *state) {
    Values values = {};
    std::size_t const count = ForEachPiece(kind, [](Piece const &, std::size_t) {});
    std::memcpy(values.data(), state, count * sizeof(GLint));
    return values;
}

/// Calls `set(piece, values)` for each piece in which two states differ.
template<class Set>
void ForEachDifference(StateKind kind, void const *from, void const *to, Set set) {
    Values const old = ValuesOf(kind, from), wanted = ValuesOf(kind, to);
    ForEachPiece(kind, [&](Piece const &piece, std::size_t first) {
        GLint const *const values = &wanted[first];
        if (!std::equal(values, values + piece.count, &old[first]))
            set(piece, values);
    });
}

} // namespace

void StateAccess::Read(StateKind kind, void *state) {
    Values values = {};
    std::size_t const count = ForEachPiece(kind, [&values](Piece const &piece, std::size_t first) {
        ORU_GL(GetIntegerv, piece.queries[0], &values[first]);
        for (std::size_t i = 1; i < std::size(piece.queries) && piece.queries[i]; ++i)
            ORU_GL(GetIntegerv, piece.queries[i], &values[first + i]);
    });
    std::memcpy(state, values.data(), count * sizeof(GLint));
}

void StateAccess::Set(StateKind kind, void const *from, void const *to) {
    try {
        ForEachDifference(kind, from, to,
                          [](Piece const &piece, GLint const *values) { piece.set(values); });
    } catch (...) {
        PutBack(kind, to, from);
        throw;
    }
}

void StateAccess::PutBack(StateKind kind, void const *from, void const *to) noexcept {
    ForEachDifference(kind, from, to, [](Piece const &piece, GLint const *values) {
        internal::Release([&] { piece.set(values); });
    });
}

} // namespace ORU::OGL
