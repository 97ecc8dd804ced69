// One line of the tracer's output, composed in a buffer and written at once.
#pragma once

#include "oru/oru_ogl/gltypes.h"

#include <cstddef>
#include <iosfwd>

namespace ORU::OGL::internal {

/// Composes the line of one traced call: the constructor its beginning, each further operation an
/// argument, `write` its end.
///
///     TraceLine(stream, file, line, "glAccum(").token(op).single(value).write();
///
/// What arrives in the stream is what inserting the pieces one after the other would give, whatever
/// the stream's flags, precision, fill, width and locale are; but it arrives in one write, and with
/// the flags that a stream has from the start no number passes through the stream's facets. Nothing
/// is allocated. Only a line that does not fit the buffer arrives in several writes.
class TraceLine {
public:
    /// @param call the function's name and the opening parenthesis
    template<std::size_t Size>
    TraceLine(std::ostream &stream, char const *file, unsigned int line, char const (&call)[Size])
        : stream_(stream) {
        begin(file, line);
        append(call, Size - 1);
    }

    TraceLine(TraceLine const &) = delete;
    TraceLine &operator=(TraceLine const &) = delete;

    TraceLine &token(GLenum value);
    TraceLine &boolean(GLboolean value);
    TraceLine &handle(GLhandleARB value);
    /// @tparam Integer one of OpenGL's integer types of 16, 32 or 64 bits
    template<class Integer>
    TraceLine &integer(Integer value) {
        separate();
        number(value);
        return *this;
    }
    TraceLine &byte(GLbyte value) { return byte(static_cast<GLubyte>(value)); }
    TraceLine &byte(GLubyte value);
    /// A float as its bit pattern and, in a comment, its value.
    TraceLine &single(GLfloat value);
    TraceLine &real(GLdouble value);
    TraceLine &address(void const *value);
    /// A text that ends with a zero byte; its address, as for other pointers, when it is null.
    TraceLine &text(char const *value);

    /// Ends the line and hands it to the stream.
    void write();

private:
    class Buffer;

    static constexpr std::size_t kCapacity = 1024;
    /// More than any number has without the stream's facets.
    static constexpr std::size_t kLongestNumber = 40;

    void begin(char const *file, unsigned int line);
    void separate();
    void append(char const *text, std::size_t length);
    void appendPadded(char const *text, std::size_t length);
    void spill();
    void reserveNumber();

    template<class Integer>
    void number(Integer value);
    void number(GLdouble value);
    template<class Value>
    void throughFacet(Value value);

    std::ostream &stream_;
    char *position_ = buffer_;
    bool plain_;        // numbers come out as from a new stream
    bool first_ = true; // no argument yet
    char buffer_[kCapacity];
};

} // namespace ORU::OGL::internal
