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

/// One row per enumerator, in the enumeration's order, which starts at 0 and has no gaps.
template<class Enumeration, std::size_t Count, class Row = TranslationRow<Enumeration>>
struct Translation {
    char const *file; ///< position and text of the failure, those of the table
    int line;
    char const *failure;
    Row rows[Count];

    /// For a static_assert beside the table: each row is where the look-up by value expects it.
    constexpr bool isInOrder() const {
        for (std::size_t i = 0; i < Count; ++i) {
            if (static_cast<std::size_t>(rows[i].value) != i)
                return false;
        }
        return true;
    }

    /// The row of a value, or null for a number that is no enumerator.
    constexpr Row const *find(Enumeration value) const {
        auto const index = static_cast<std::size_t>(value);
        return index < Count ? &rows[index] : nullptr;
    }

    /// @throws InternalException for a number that is no enumerator
    unsigned int toGL(Enumeration value) const {
        if (Row const *row = find(value))
            return row->gl;
        ORU_private::ThrowInternal(file, line, failure);
    }

    /// @throws InternalException for a GL value without an enumerator
    Enumeration fromGL(unsigned int gl) const {
        for (Row const &row : rows) {
            if (row.gl == gl)
                return row.value;
        }
        ORU_private::ThrowInternal(file, line, failure);
    }
};

} // namespace ORU::OGL::internal

/// The first three fields of a table, with the text that the check of a negated literal has.
#define ORU_TRANSLATION_FAILURE(text) __FILE__, __LINE__, "!\"" text "\""
