// Tables that translate an enumeration of the library to an API's constants and back.
#pragma once

#include "oru/core/exceptions/checks.h"

#include <cstddef>

namespace ORU {

/// An enumerator and the constant of the API that it stands for.
template<class Enumeration, class Constant>
struct EnumRow {
    Enumeration value; ///< of the library
    Constant constant; ///< of the API
};

/// Where and with what text a translation fails; `ORU_ENUM_FAILURE` makes one.
struct EnumFailure {
    char const *file; ///< source file that the exception names
    int line;         ///< source line
    char const *text; ///< the message
};

/// One row per enumerator, in the enumeration's order, which starts at 0 and has no gaps.
template<class Enumeration, class Constant, std::size_t Count>
struct EnumTable {
    EnumRow<Enumeration, Constant> rows[Count]; ///< in order

    /// For a static_assert beside the table: each row is where the look-up by value expects it.
    constexpr bool isInOrder() const {
        for (std::size_t i = 0; i < Count; ++i)
            if (static_cast<std::size_t>(rows[i].value) != i)
                return false;
        return true;
    }

    /// The row of a value; null for a number that is no enumerator.
    constexpr EnumRow<Enumeration, Constant> const *find(Enumeration value) const {
        auto const index = static_cast<std::size_t>(value);
        return index < Count ? &rows[index] : nullptr;
    }

    /// The constant of a value; `otherwise` for a number that is no enumerator.
    constexpr Constant constantOr(Enumeration value, Constant otherwise) const {
        auto const *const row = find(value);
        return row ? row->constant : otherwise;
    }

    /// The value of a constant; `otherwise` for one without an enumerator.
    constexpr Enumeration valueOr(Constant constant, Enumeration otherwise) const {
        for (auto const &row : rows)
            if (row.constant == constant)
                return row.value;
        return otherwise;
    }

    /// The constant of a value.
    /// @throws InternalException for a number that is no enumerator
    Constant constant(Enumeration value, EnumFailure const &failure) const {
        if (auto const *const row = find(value))
            return row->constant;
        ORU_private::ThrowInternal(failure.file, failure.line, failure.text);
    }

    /// The value of a constant.
    /// @throws InternalException for one without an enumerator
    Enumeration value(Constant constant, EnumFailure const &failure) const {
        for (auto const &row : rows)
            if (row.constant == constant)
                return row.value;
        ORU_private::ThrowInternal(failure.file, failure.line, failure.text);
    }
};

} // namespace ORU

/// A failure at this source position. `text` is a literal.
#define ORU_ENUM_FAILURE(text)                                                                     \
    ::ORU::EnumFailure {                                                                           \
        __FILE__, __LINE__, text                                                                   \
    }
