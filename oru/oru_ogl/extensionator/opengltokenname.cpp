// Names of OpenGL values, as the tracer writes them.
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include "oru/oru_ogl/extensionator/internal/opengltoken.h"

#include <array>
#include <cstddef>
#include <iterator>

namespace ORU::OGL::internal {

namespace {

constexpr OpenGLToken kTokens[] = {
#define ORU_GL_TOKEN(Value, Name) {Value, sizeof(Name) - 1, Name},
#include "oru/oru_ogl/extensionator/internal/opengltokens.inc"
};

constexpr OpenGLToken kUnknown = {0, sizeof("Unknown Token") - 1, "Unknown Token"};

// Nearly all values have 16 bits and lie close together, so the row of a 16-bit value is found by
// indexing: its upper byte chooses a page, its lower byte the place in the page. The few longer
// values are at the end of the sorted table.

constexpr std::size_t kPageSize = 256;
constexpr GLenum kPagedValues = 0x10000;

constexpr std::size_t CountPages() {
    std::size_t pages = 1; // page 0 has no rows: it serves all values of the other upper bytes
    GLenum last = kPagedValues;
    for (OpenGLToken const &token : kTokens) {
        if (token.value < kPagedValues && token.value / kPageSize != last) {
            last = token.value / kPageSize;
            ++pages;
        }
    }
    return pages;
}

constexpr std::size_t kPages = CountPages();
static_assert(kPages <= kPageSize, "a page's number is one byte");

struct TokenIndex {
    std::array<std::uint8_t, kPageSize> pageOf{};
    std::array<std::uint16_t, kPages * kPageSize> rowPlusOne{}; // 0: no row
    std::size_t pagedRows = 0;

    constexpr TokenIndex() {
        std::uint8_t pages = 0;
        for (; pagedRows < std::size(kTokens) && kTokens[pagedRows].value < kPagedValues;
             ++pagedRows) {
            GLenum const value = kTokens[pagedRows].value;
            std::uint8_t &page = pageOf[value / kPageSize];
            if (page == 0)
                page = ++pages;
            rowPlusOne[page * kPageSize + value % kPageSize] =
                static_cast<std::uint16_t>(pagedRows + 1);
        }
    }
};

constexpr TokenIndex kIndex;

} // namespace

OpenGLToken const &FindOpenGLToken(GLenum value) {
    if (value < kPagedValues) {
        std::size_t const page = kIndex.pageOf[value / kPageSize];
        std::size_t const row = kIndex.rowPlusOne[page * kPageSize + value % kPageSize];
        return row ? kTokens[row - 1] : kUnknown;
    }
    for (std::size_t row = kIndex.pagedRows; row < std::size(kTokens); ++row)
        if (kTokens[row].value == value)
            return kTokens[row];
    return kUnknown;
}

} // namespace ORU::OGL::internal

char const *ORUOGLTokenName(GLenum value) {
    return ORU::OGL::internal::FindOpenGLToken(value).name;
}

char const *ORUOGLBoolToString(GLboolean value) {
    return value ? "GL_TRUE" : "GL_FALSE";
}
