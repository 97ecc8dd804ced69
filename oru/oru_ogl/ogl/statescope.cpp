// State of drawing changed for a scope: viewport, scissor, depth, stencil, culling, colour mask.
#include "oru/oru_ogl/ogl/statescope.h"

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/platformgl.h"

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

/// Where the pieces of a kind stand, which follow each other.
struct Range {
    std::size_t begin;
    std::size_t end;
};

constexpr Range RangeOf(StateKind kind) {
    std::size_t begin = 0;
    while (kPieces[begin].kind != kind)
        ++begin;
    std::size_t end = begin;
    while (end < std::size(kPieces) && kPieces[end].kind == kind)
        ++end;
    return {begin, end};
}

constexpr Range kRanges[] = {RangeOf(StateKind::Viewport), RangeOf(StateKind::Scissor),
                             RangeOf(StateKind::Depth),    RangeOf(StateKind::Stencil),
                             RangeOf(StateKind::Cull),     RangeOf(StateKind::ColorMask)};

/// Calls `each(piece, offset)` for the pieces of a kind.
/// @param each the offset is that of the piece's values in the state, in bytes
template<class Each>
void ForEachPiece(StateKind kind, Each each) {
    Range const range = kRanges[static_cast<std::size_t>(kind)];
    std::size_t offset = 0;
    for (std::size_t i = range.begin; i < range.end; ++i) {
        each(kPieces[i], offset);
        offset += kPieces[i].count * sizeof(GLint);
    }
}

/// As many values as a piece can have.
using Values = std::array<GLint, 4>;

/// Calls `set(piece, values)` for each piece in which two states differ.
template<class Set>
void ForEachDifference(StateKind kind, void const *from, void const *to, Set set) {
    auto const *const old = static_cast<char const *>(from);
    auto const *const wanted = static_cast<char const *>(to);
    ForEachPiece(kind, [&](Piece const &piece, std::size_t offset) {
        std::size_t const size = piece.count * sizeof(GLint);
        if (std::memcmp(old + offset, wanted + offset, size) == 0)
            return;
        Values values;
        std::memcpy(values.data(), wanted + offset, size);
        set(piece, values.data());
    });
}

} // namespace

void StateAccess::Read(StateKind kind, void *state) {
    ForEachPiece(kind, [state](Piece const &piece, std::size_t offset) {
        Values values = {};
        ORU_GL(GetIntegerv, piece.queries[0], values.data());
        for (std::size_t i = 1; i < std::size(piece.queries) && piece.queries[i]; ++i)
            ORU_GL(GetIntegerv, piece.queries[i], &values[i]);
        std::memcpy(static_cast<char *>(state) + offset, values.data(),
                    piece.count * sizeof(GLint));
    });
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
    internal::Release([&] {
        ForEachDifference(kind, from, to, [](Piece const &piece, GLint const *values) {
            DropExceptions([&] { piece.set(values); });
        });
    });
}

} // namespace ORU::OGL
