// Puts the values of a uniform block where the implementation wants them.
#include "oru/oru_ogl/ogl/uniformblockwriter.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <cstring>

namespace ORU::OGL {

namespace {

/// What a GL type is made of.
struct TypeRow {
    GLenum type;
    GLenum component;
    unsigned int columns;
    unsigned int rows;
};

// OpenGL 4.5 core specification, table 7.3, without what cannot be in a block.
#define ORU_VECTORS(Type)                                                                          \
    {GL_##Type, GL_##Type, 1, 1}, {GL_##Type##_VEC2, GL_##Type, 1, 2},                             \
        {GL_##Type##_VEC3, GL_##Type, 1, 3}, {                                                     \
        GL_##Type##_VEC4, GL_##Type, 1, 4                                                          \
    }
#define ORU_MATRICES(Type)                                                                         \
    {GL_##Type##_MAT2, GL_##Type, 2, 2}, {GL_##Type##_MAT3, GL_##Type, 3, 3},                      \
        {GL_##Type##_MAT4, GL_##Type, 4, 4}, {GL_##Type##_MAT2x3, GL_##Type, 2, 3},                \
        {GL_##Type##_MAT2x4, GL_##Type, 2, 4}, {GL_##Type##_MAT3x2, GL_##Type, 3, 2},              \
        {GL_##Type##_MAT3x4, GL_##Type, 3, 4}, {GL_##Type##_MAT4x2, GL_##Type, 4, 2}, {            \
        GL_##Type##_MAT4x3, GL_##Type, 4, 3                                                        \
    }
constexpr TypeRow kTypes[] = {ORU_VECTORS(FLOAT),  ORU_MATRICES(FLOAT), // found first
                              ORU_VECTORS(INT),    ORU_VECTORS(UNSIGNED_INT), ORU_VECTORS(BOOL),
                              ORU_VECTORS(DOUBLE), ORU_MATRICES(DOUBLE)};
#undef ORU_VECTORS
#undef ORU_MATRICES

TypeRow const &RowOf(UniformBlock::Member const &member) {
    auto const *const found =
        std::find_if(std::begin(kTypes), std::end(kTypes),
                     [&](TypeRow const &row) { return row.type == member.type; });
    if (found == std::end(kTypes))
        ORU_THROW_INTERNAL("The uniform \"", member.name, "\" is of the type ",
                           ORUOGLTokenName(member.type),
                           ", which UniformBlockWriter does not know");
    return *found;
}

constexpr GLenum kComponents[] = {GL_FLOAT, GL_DOUBLE, GL_INT, GL_UNSIGNED_INT};

bool Takes(GLenum component, GLenum kind) {
    return component == kind ||
           (component == GL_BOOL && (kind == GL_INT || kind == GL_UNSIGNED_INT));
}

/// Bytes from the block's beginning to the end of an element of a member.
std::size_t EndOf(UniformBlock::Member const &member, TypeRow const &row, std::size_t number,
                  unsigned int element) {
    bool const isInRows = member.isRowMajor;
    std::size_t const lines = isInRows ? row.rows : row.columns;
    return member.offset + std::size_t{element} * member.arrayStride +
           (lines - 1) * member.matrixStride + number * (isInRows ? row.columns : row.rows);
}

/// Copies a multiple of 4 bytes, so few that a call would take as long again.
void Copy(unsigned char *to, unsigned char const *from, std::size_t bytes) {
    constexpr std::size_t kVector = 4 * sizeof(GLfloat);
    for (; bytes >= kVector; bytes -= kVector, to += kVector, from += kVector)
        std::memcpy(to, from, kVector);
    for (; bytes > 0; bytes -= sizeof(GLfloat), to += sizeof(GLfloat), from += sizeof(GLfloat))
        std::memcpy(to, from, sizeof(GLfloat));
}

/// Puts the columns of a matrix where its rows are `stride` bytes apart.
void PutRows(unsigned char *to, unsigned char const *from, TypeRow const &matrix,
             std::size_t number, std::size_t stride) {
    for (unsigned int column = 0; column < matrix.columns; ++column) {
        for (unsigned int row = 0; row < matrix.rows; ++row, from += number)
            Copy(to + row * stride + column * number, from, number);
    }
}

} // namespace

UniformBlockWriter::UniformBlockWriter(UniformBlock const &block)
    : block_(block), bytes_(block.size()) {}

void UniformBlockWriter::putNumbers(UniformBlock::Member const &member, Kind kind,
                                    void const *numbers, std::size_t amount, unsigned int first) {
    TypeRow const &row = RowOf(member);
    std::size_t const each = std::size_t{row.columns} * row.rows;
    if (amount % each != 0)
        ORU_THROW_INTERNAL("The uniform \"", member.name, "\" takes ", each,
                           " numbers for each element, and was given ", amount);
    put(member, kind, numbers, static_cast<unsigned int>(amount / each), first);
}

void UniformBlockWriter::put(UniformBlock::Member const &member, Kind kind, void const *values,
                             unsigned int count, unsigned int first) {
    TypeRow const &row = RowOf(member);
    if (!Takes(row.component, kComponents[kind]))
        ORU_THROW_INTERNAL("The uniform \"", member.name, "\" is of the type ",
                           ORUOGLTokenName(member.type), ", and was given values of ",
                           ORUOGLTokenName(kComponents[kind]));
    if (first > member.count || count > member.count - first)
        ORU_THROW_INTERNAL("The uniform \"", member.name, "\" has ", member.count,
                           " elements, and was given ", count, " from ", first, " on");
    std::size_t const number = kind == DOUBLE ? sizeof(GLdouble) : sizeof(GLfloat);
    if (count > 0 && EndOf(member, row, number, first + count - 1) > bytes_.size())
        ORU_THROW_INTERNAL("The uniform \"", member.name, "\" is of another block than \"",
                           block_.name(), "\": it would lie behind it");
    auto const *from = static_cast<unsigned char const *>(values);
    unsigned char *element =
        bytes_.data() + member.offset + std::size_t{first} * member.arrayStride;
    std::size_t const column = number * row.rows;
    for (; count > 0; --count, element += member.arrayStride, from += column * row.columns) {
        if (member.isRowMajor)
            PutRows(element, from, row, number, member.matrixStride);
        else if (row.columns == 1 || member.matrixStride == column)
            Copy(element, from, column * row.columns);
        else
            for (std::size_t i = 0; i < row.columns; ++i)
                Copy(element + i * member.matrixStride, from + i * column, column);
    }
}

void UniformBlockWriter::upload(Buffer &buffer, std::int64_t offset) const {
    auto const size = static_cast<std::int64_t>(bytes_.size());
    auto const room = static_cast<std::int64_t>(buffer.size());
    if (offset > room || size > room - offset)
        ORU_THROW_INTERNAL("The uniform block \"", block_.name(), "\" of ", size,
                           " bytes does not fit into the buffer of ", room, " from ", offset,
                           " on");
    internal::BoundObjectScope bound(buffer, ORU_BINDER(BindBuffer));
    buffer.subData(offset, size, bytes_.data());
    bound.restore();
}

} // namespace ORU::OGL
