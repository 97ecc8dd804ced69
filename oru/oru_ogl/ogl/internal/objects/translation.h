// Tables that translate an enumeration of the library to GL values and back.
#pragma once

#include "oru/core/exceptions/checks.h"

#include <cstddef>

namespace ORU::OGL::internal {

template<class Enumeration>
struct TranslationRow {
    Enumeration value;
    unsigned int gl;
};

/// One row per enumerator, in the enumeration's order, which has no gaps.
template<class Enumeration, std::size_t Count, class Row = TranslationRow<Enumeration>>
struct Translation {
    char const *failure; ///< text of the failure
    Row rows[Count];
    std::size_t first = 0; ///< the value of the first enumerator

    /// For a static_assert: each row is where the look-up by value expects it.
    constexpr bool isInOrder() const {
        for (std::size_t i = 0; i < Count; ++i) {
            if (static_cast<std::size_t>(rows[i].value) != first + i)
                return false;
        }
        return true;
    }

    /// The row of a value, or null for a number that is no enumerator.
    constexpr Row const *find(Enumeration value) const {
        auto const index = static_cast<std::size_t>(value) - first; // wraps around below it
        return index < Count ? &rows[index] : nullptr;
    }

    /// @param file, line position of the failure
    /// @throws InternalException for a number that is no enumerator
    unsigned int toGL(Enumeration value, char const *file, int line) const {
        if (Row const *row = find(value))
            return row->gl;
        ORU_private::ThrowInternal(file, line, failure);
    }

    /// The row of a GL value, or null for one without an enumerator.
    constexpr Row const *findGL(unsigned int gl) const {
        for (Row const &row : rows) {
            if (row.gl == gl)
                return &row;
        }
        return nullptr;
    }

    /// @param file, line position of the failure
    /// @throws InternalException for a GL value without an enumerator
    Enumeration fromGL(unsigned int gl, char const *file, int line) const {
        if (Row const *row = findGL(gl))
            return row->value;
        ORU_private::ThrowInternal(file, line, failure);
    }
};

} // namespace ORU::OGL::internal

/// The failure of a table, with the text that the check of a negated literal has.
#define ORU_TRANSLATION_FAILURE(text) "!\"" text "\""

/// Defines the two functions of a class that translate one of its enumerations by a table:
/// `ORU_TRANSLATED(Buffer, Usage, kUsages)` defines Buffer::Usage2GL and Buffer::GL2Usage.
#define ORU_TRANSLATED(Class, Enumeration, table)                                                  \
    static_assert(table.isInOrder());                                                              \
    unsigned int Class::Enumeration##2GL(Enumeration value) {                                      \
        return table.toGL(value, __FILE__, __LINE__);                                              \
    }                                                                                              \
    Class::Enumeration Class::GL2##Enumeration(unsigned int gl) {                                  \
        return table.fromGL(gl, __FILE__, __LINE__);                                               \
    }

/// The same for an enumeration with a second table, of the enumerators that came later.
#define ORU_TRANSLATED_IN_TWO(Class, Enumeration, table, later)                                    \
    static_assert(table.isInOrder() && later.isInOrder());                                         \
    unsigned int Class::Enumeration##2GL(Enumeration value) {                                      \
        auto const *const row = later.find(value);                                                 \
        return row ? row->gl : table.toGL(value, __FILE__, __LINE__);                              \
    }                                                                                              \
    Class::Enumeration Class::GL2##Enumeration(unsigned int gl) {                                  \
        auto const *const row = later.findGL(gl);                                                  \
        return row ? row->value : table.fromGL(gl, __FILE__, __LINE__);                            \
    }
