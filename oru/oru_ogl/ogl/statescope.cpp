// State of drawing changed for a scope: viewport, scissor, depth, stencil, culling, colour mask.
#include "oru/oru_ogl/ogl/statescope.h"

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/currentcontext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <functional>
#include <iterator>
#include <type_traits>
#include <utility>

namespace ORU::OGL {

namespace {

/// Values of a state that one call sets, in the order of the state's members.
struct Piece {
    StateKind kind;
    GLenum queries[3]; ///< one for all values, or one for each of three
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
    {STATEKIND_VIEWPORT,
     {GL_VIEWPORT},
     4,
     [](GLint const *v) { ORU_GL(Viewport, v[0], v[1], v[2], v[3]); }},
    {STATEKIND_SCISSOR, {GL_SCISSOR_TEST}, 1, Switch<GL_SCISSOR_TEST>},
    {STATEKIND_SCISSOR,
     {GL_SCISSOR_BOX},
     4,
     [](GLint const *v) { ORU_GL(Scissor, v[0], v[1], v[2], v[3]); }},
    {STATEKIND_DEPTH, {GL_DEPTH_TEST}, 1, Switch<GL_DEPTH_TEST>},
    {STATEKIND_DEPTH, {GL_DEPTH_WRITEMASK}, 1, [](GLint const *v) { ORU_GL(DepthMask, Flag(*v)); }},
    {STATEKIND_DEPTH,
     {GL_DEPTH_FUNC},
     1,
     [](GLint const *v) { ORU_GL(DepthFunc, static_cast<GLenum>(*v)); }},
    {STATEKIND_STENCIL, {GL_STENCIL_TEST}, 1, Switch<GL_STENCIL_TEST>},
    {STATEKIND_STENCIL,
     {GL_STENCIL_FUNC, GL_STENCIL_REF, GL_STENCIL_VALUE_MASK},
     3,
     SetStencilFunction<GL_FRONT>},
    {STATEKIND_STENCIL,
     {GL_STENCIL_FAIL, GL_STENCIL_PASS_DEPTH_FAIL, GL_STENCIL_PASS_DEPTH_PASS},
     3,
     SetStencilOperations<GL_FRONT>},
    {STATEKIND_STENCIL, {GL_STENCIL_WRITEMASK}, 1, SetStencilMask<GL_FRONT>},
    {STATEKIND_STENCIL,
     {GL_STENCIL_BACK_FUNC, GL_STENCIL_BACK_REF, GL_STENCIL_BACK_VALUE_MASK},
     3,
     SetStencilFunction<GL_BACK>},
    {STATEKIND_STENCIL,
     {GL_STENCIL_BACK_FAIL, GL_STENCIL_BACK_PASS_DEPTH_FAIL, GL_STENCIL_BACK_PASS_DEPTH_PASS},
     3,
     SetStencilOperations<GL_BACK>},
    {STATEKIND_STENCIL, {GL_STENCIL_BACK_WRITEMASK}, 1, SetStencilMask<GL_BACK>},
    {STATEKIND_CULL, {GL_CULL_FACE}, 1, Switch<GL_CULL_FACE>},
    {STATEKIND_CULL,
     {GL_CULL_FACE_MODE},
     1,
     [](GLint const *v) { ORU_GL(CullFace, static_cast<GLenum>(*v)); }},
    {STATEKIND_CULL,
     {GL_FRONT_FACE},
     1,
     [](GLint const *v) { ORU_GL(FrontFace, static_cast<GLenum>(*v)); }},
    {STATEKIND_COLORMASK,
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

/// Where the values of a piece begin among those of its state.
constexpr std::size_t PlaceOf(std::size_t piece) {
    std::size_t place = 0;
    for (std::size_t i = RangeOf(kPieces[piece].kind).begin; i < piece; ++i)
        place += kPieces[i].count;
    return place;
}

/// What is done with the states of a kind. All about the pieces is known when this is compiled.
template<StateKind Kind>
class Access {
public:
    static void Read(GLint *values) {
        ForEachPiece([values](auto piece) {
            constexpr GLenum const(&kQueries)[3] = kPieces[piece].queries;
            GLint *const place = values + PlaceOf(piece);
            ORU_GL(GetIntegerv, kQueries[0], place);
            if constexpr (kQueries[1] != 0) {
                ORU_GL(GetIntegerv, kQueries[1], place + 1);
                ORU_GL(GetIntegerv, kQueries[2], place + 2);
            }
        });
    }

    static void Set(GLint const *from, GLint const *to) {
        try {
            ForEachPiece([=](auto piece) { SetDifference(piece, from, to); });
        } catch (...) {
            PutBack(to, from);
            throw;
        }
    }

    static void PutBack(GLint const *from, GLint const *to) noexcept {
        ForEachPiece([=](auto piece) {
            DropExceptions([=] {
                if (ORU_CURRENT_CONTEXT())
                    SetDifference(piece, from, to);
            });
        });
    }

private:
    static constexpr Range kRange = RangeOf(Kind);

    /// Calls `each(piece)` with the index of each piece as a std::integral_constant.
    template<class Each>
    static void ForEachPiece(Each each) {
        ForEachOf(each, std::make_index_sequence<kRange.end - kRange.begin>());
    }
    template<class Each, std::size_t... Index>
    static void ForEachOf(Each each, std::index_sequence<Index...>) {
        (each(std::integral_constant<std::size_t, kRange.begin + Index>()), ...);
    }

    template<class Index>
    static void SetDifference(Index piece, GLint const *from, GLint const *to) {
        constexpr std::size_t kPlace = PlaceOf(piece), kEnd = kPlace + kPieces[piece].count;
        // One by one, as the driver wrote them: two at once would have to wait for both.
        if (!std::equal(from + kPlace, from + kEnd, to + kPlace, std::equal_to<>()))
            kPieces[piece].set(to + kPlace);
    }
};

/// The functions of a kind.
struct Functions {
    void (*read)(GLint *values);
    void (*set)(GLint const *from, GLint const *to);
    void (*putBack)(GLint const *from, GLint const *to) noexcept;
};

template<StateKind... Kinds>
constexpr std::array<Functions, sizeof...(Kinds)> FunctionsOf() {
    return {Functions{Access<Kinds>::Read, Access<Kinds>::Set, Access<Kinds>::PutBack}...};
}

constexpr auto kFunctions = FunctionsOf<STATEKIND_VIEWPORT, STATEKIND_SCISSOR, STATEKIND_DEPTH,
                                        STATEKIND_STENCIL, STATEKIND_CULL, STATEKIND_COLORMASK>();

Functions const &FunctionsFor(StateKind kind) {
    return kFunctions[static_cast<std::size_t>(kind)];
}

GLint const *Values(void const *state) {
    return static_cast<GLint const *>(state);
}

} // namespace

void StateAccess::Read(StateKind kind, void *state) {
    FunctionsFor(kind).read(static_cast<GLint *>(state));
}

void StateAccess::Change(StateKind kind, void *found, void const *wanted) {
    Read(kind, found);
    Set(kind, found, wanted);
}

void StateAccess::Set(StateKind kind, void const *from, void const *to) {
    FunctionsFor(kind).set(Values(from), Values(to));
}

void StateAccess::PutBack(StateKind kind, void const *from, void const *to) noexcept {
    FunctionsFor(kind).putBack(Values(from), Values(to));
}

} // namespace ORU::OGL
