// The check macros: a failed check throws InternalException with the checked text.
#pragma once

#include "oru/core/exceptions/internalexception.h"

#include <string>

// The macros are variadic only so that an expression may hold commas (template arguments). A
// passing check costs its comparison: what throws is one function, out of line and marked cold.

/// A function that is called on failures only: never inline, and out of the way of the rest.
#if defined(_MSC_VER)
#define ORU_COLD __declspec(noinline)
#else
#define ORU_COLD __attribute__((cold, noinline))
#endif

/// A condition that nearly always holds: its branch is laid out to be fallen into.
#if defined(_MSC_VER)
#define ORU_LIKELY(...) (__VA_ARGS__)
#else
#define ORU_LIKELY(...) __builtin_expect(static_cast<bool>(__VA_ARGS__), 1)
#endif

namespace ORU_private {

/// Throws `ORU::InternalException(file, line, message)`.
[[noreturn]] ORU_API ORU_COLD void ThrowInternal(char const *file, int line, char const *message);

[[noreturn]] ORU_API ORU_COLD void ThrowInternal(char const *file, int line,
                                                 std::string const &message);

/// The same with a note.
[[noreturn]] ORU_API ORU_COLD void
ThrowInternalNoted(char const *file, int line, std::string const &message, std::string const &note);

/// A failure with a note more, to be thrown.
template<class Failure>
Failure Noted(Failure failure, std::string const &note) {
    failure.addNote(note);
    return failure;
}

} // namespace ORU_private

/// Throws `InternalException` with the expression's source text when the expression is false; with
/// a negated literal (`ORU_ASSERT(!"Unknown target.")`) it marks a branch that nothing reaches.
#define ORU_ASSERT(...)                                                                            \
    ((__VA_ARGS__) ? void(0) : ::ORU_private::ThrowInternal(__FILE__, __LINE__, #__VA_ARGS__))

/// As `ORU_ASSERT`, the text prefixed "Enforce ": for demands on the caller.
#define ORU_ENFORCE(...)                                                                           \
    ((__VA_ARGS__) ? void(0)                                                                       \
                   : ::ORU_private::ThrowInternal(__FILE__, __LINE__, "Enforce " #__VA_ARGS__))

/// As `ORU_ASSERT`, with the given text instead of the expression's: for a text that hosts know and
/// that the code would no longer spell so. `text` is a literal.
#define ORU_ASSERT_TEXT(text, ...)                                                                 \
    ((__VA_ARGS__) ? void(0) : ::ORU_private::ThrowInternal(__FILE__, __LINE__, text))

/// As `ORU_ASSERT_TEXT`, with a note (see `LogicalException::note`); both are composed only when it
/// fails.
#define ORU_ASSERT_NOTED(text, note, ...)                                                          \
    ((__VA_ARGS__) ? void(0) : ::ORU_private::ThrowInternalNoted(__FILE__, __LINE__, text, note))

/// As `ORU_ENFORCE`, with the given text behind "Enforce ".
#define ORU_ENFORCE_TEXT(text, ...) ORU_ASSERT_TEXT("Enforce " text, __VA_ARGS__)

/// Throws `InternalException` with the call's source text when its HRESULT is negative.
#define ORU_ASSERT_SUCCEEDED(...)                                                                  \
    ((__VA_ARGS__) >= 0 ? void(0) : ::ORU_private::ThrowInternal(__FILE__, __LINE__, #__VA_ARGS__))

/// Throws `InternalException` with a text: a literal, or a string. Several pieces are put together
/// as `ComposeText` does, for which composetext.h is included:
/// `ORU_THROW_INTERNAL("Unknown mode ", mode)`.
#define ORU_THROW_INTERNAL(...) ::ORU_private::ThrowInternal(__FILE__, __LINE__, __VA_ARGS__)
