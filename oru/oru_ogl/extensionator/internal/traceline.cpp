// One line of the tracer's output, composed in a buffer and written at once.
#include "oru/oru_ogl/extensionator/internal/traceline.h"

#include "oru/oru_ogl/extensionator/internal/floattext.h"
#include "oru/oru_ogl/extensionator/internal/opengltoken.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <locale>
#include <ostream>
#include <streambuf>
#include <type_traits>

namespace ORU::OGL::internal {

namespace {

/// Whether numbers come out as with the flags, precision and locale of a new stream.
bool IsPlain(std::ostream const &stream) {
    constexpr auto kNumberFlags = std::ios_base::basefield | std::ios_base::floatfield |
                                  std::ios_base::showbase | std::ios_base::showpoint |
                                  std::ios_base::showpos | std::ios_base::uppercase;
    return (stream.flags() & kNumberFlags) == std::ios_base::dec && stream.precision() == 6 &&
           stream.getloc() == std::locale::classic();
}

/// Writes an address as a stream does with any flags: the standard leaves the form to the library.
char *WriteAddress(char *out, std::uintptr_t address) {
#if defined(__GLIBCXX__)
    if (address) {
        *out++ = '0';
        *out++ = 'x';
    }
    return std::to_chars(out, out + 2 * sizeof address, address, 16).ptr;
#else
    for (int shift = 8 * sizeof address - 4; shift >= 0; shift -= 4)
        *out++ = "0123456789ABCDEF"[address >> shift & 15];
    return out;
#endif
}

} // namespace

/// The free part of a line as a stream buffer, for the facets that format numbers.
class TraceLine::Buffer : public std::streambuf {
public:
    explicit Buffer(TraceLine &line) : line_(line) { useFreePart(); }
    ~Buffer() override { line_.position_ = pptr(); }
    Buffer(Buffer const &) = delete;
    Buffer &operator=(Buffer const &) = delete;

protected:
    int_type overflow(int_type c) override {
        line_.position_ = pptr();
        line_.spill();
        useFreePart();
        return traits_type::eq_int_type(c, traits_type::eof())
                   ? traits_type::not_eof(c)
                   : sputc(traits_type::to_char_type(c));
    }

private:
    void useFreePart() { setp(line_.position_, line_.buffer_ + kCapacity); }

    TraceLine &line_;
};

void TraceLine::begin(char const *file, unsigned int line) {
    plain_ = IsPlain(stream_);
    if (!file)
        file = "";
    // The width of a stream holds for the next insertion only, and this is the line's first.
    if (stream_.width() == 0)
        append(file, std::strlen(file));
    else
        appendPadded(file, std::strlen(file));
    append(":", 1);
    number(line);
    append(": ", 2);
}

void TraceLine::write() {
    append(")\n", 2);
    spill();
}

void TraceLine::spill() {
    stream_.write(buffer_, position_ - buffer_);
    position_ = buffer_;
}

void TraceLine::reserveNumber() {
    if (static_cast<std::size_t>(buffer_ + kCapacity - position_) < kLongestNumber)
        spill();
}

void TraceLine::separate() {
    if (!first_)
        append(", ", 2);
    first_ = false;
}

void TraceLine::append(char const *text, std::size_t length) {
    auto const room = static_cast<std::size_t>(buffer_ + kCapacity - position_);
    if (length > room) {
        spill();
        if (length > kCapacity) {
            stream_.write(text, static_cast<std::streamsize>(length));
            return;
        }
    }
    std::memcpy(position_, text, length);
    position_ += length;
}

void TraceLine::appendPadded(char const *text, std::size_t length) {
    auto const width = static_cast<std::size_t>(std::max<std::streamsize>(stream_.width(0), 0));
    bool const left = (stream_.flags() & std::ios_base::adjustfield) == std::ios_base::left;
    char const fill = stream_.fill();
    if (left)
        append(text, length);
    for (std::size_t i = length; i < width; ++i)
        append(&fill, 1);
    if (!left)
        append(text, length);
}

template<class Value>
void TraceLine::throughFacet(Value value) {
    Buffer buffer(*this);
    auto const &facet = std::use_facet<std::num_put<char>>(stream_.getloc());
    facet.put(std::ostreambuf_iterator<char>(&buffer), stream_, stream_.fill(), value);
}

template<class Integer>
void TraceLine::number(Integer value) {
    if (plain_) {
        reserveNumber();
        position_ = std::to_chars(position_, position_ + kLongestNumber, value).ptr;
        return;
    }
    // As the stream's own inserters do: in octal and hexadecimal a signed number is its bit pattern
    // of the value's own size.
    using Unsigned = std::make_unsigned_t<Integer>;
    using Wide = std::conditional_t<(sizeof(Integer) > sizeof(long)), long long, long>;
    using UnsignedWide = std::make_unsigned_t<Wide>;
    auto const base = stream_.flags() & std::ios_base::basefield;
    if constexpr (std::is_unsigned<Integer>::value)
        throughFacet(static_cast<UnsignedWide>(value));
    else if (base == std::ios_base::oct || base == std::ios_base::hex)
        throughFacet(static_cast<Wide>(static_cast<Unsigned>(value)));
    else
        throughFacet(static_cast<Wide>(value));
}

template void TraceLine::number(GLshort);
template void TraceLine::number(GLushort);
template void TraceLine::number(GLint);
template void TraceLine::number(GLuint);
template void TraceLine::number(GLint64);
template void TraceLine::number(GLuint64);

void TraceLine::number(GLdouble value) {
    // Infinities and what is no number have names that libraries do not agree on.
    if (!plain_ || !std::isfinite(value)) {
        throughFacet(value);
        return;
    }
    reserveNumber();
    position_ = WriteNumber(position_, value);
}

TraceLine &TraceLine::token(GLenum value) {
    OpenGLToken const &row = FindOpenGLToken(value);
    separate();
    append(row.name, row.length);
    return *this;
}

TraceLine &TraceLine::boolean(GLboolean value) {
    char const *const name = ORUOGLBoolToString(value);
    separate();
    append(name, std::strlen(name));
    return *this;
}

TraceLine &TraceLine::handle(GLhandleARB value) {
    separate();
    append("(GLhandleARB)", 13);
    number(value);
    return *this;
}

TraceLine &TraceLine::byte(GLubyte value) {
    auto const character = static_cast<char>(value);
    separate();
    append(&character, 1);
    return *this;
}

TraceLine &TraceLine::single(GLfloat value) {
    GLint pattern;
    static_assert(sizeof pattern == sizeof value, "a float has 32 bits");
    std::memcpy(&pattern, &value, sizeof pattern);
    separate();
    append("makeFloat(", 10);
    number(pattern);
    append(") /* ", 5);
    number(static_cast<GLdouble>(value));
    append(" */", 3);
    return *this;
}

TraceLine &TraceLine::real(GLdouble value) {
    separate();
    number(value);
    return *this;
}

TraceLine &TraceLine::address(void const *value) {
    separate();
    if (!plain_) {
        throughFacet(value);
        return *this;
    }
    reserveNumber();
    position_ = WriteAddress(position_, reinterpret_cast<std::uintptr_t>(value));
    return *this;
}

TraceLine &TraceLine::text(char const *value) {
    if (!value)
        return address(value);
    separate();
    append(value, std::strlen(value));
    return *this;
}

} // namespace ORU::OGL::internal
