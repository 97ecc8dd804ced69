// A part of a buffer, mapped for a scope.
#pragma once

#include "oru/core/utility/export.h"

#include <cstdint>

namespace ORU::OGL {

class Buffer;

/// Maps a part of a buffer into memory until `unmap()`, or until the block ends first.
///
/// ```cpp
/// MappedRange range(buffer, 0, size, MappedRange::ACCESS_WRITE |
///                                    MappedRange::ACCESS_INVALIDATE_BUFFER);
/// std::memcpy(range.data(), vertices, size);
/// range.unmap();
/// ```
///
/// Meanwhile the buffer is bound to its target; at the end what was bound there before is bound
/// again. The target of element arrays is the bound vertex array's own: bind no other one
/// meanwhile. OpenGL 3.0 or GL_ARB_map_buffer_range.
class ORU_API MappedRange {
public:
    /// What the mapping is for; combine them with `|`. The values are OpenGL's.
    enum Access : unsigned int {
        ACCESS_READ = 0x1,              ///< GL_MAP_READ_BIT
        ACCESS_WRITE = 0x2,             ///< GL_MAP_WRITE_BIT
        ACCESS_INVALIDATE_RANGE = 0x4,  ///< GL_MAP_INVALIDATE_RANGE_BIT: all of it is written anew
        ACCESS_INVALIDATE_BUFFER = 0x8, ///< GL_MAP_INVALIDATE_BUFFER_BIT: the rest may go, too
        ACCESS_FLUSH_EXPLICIT = 0x10,   ///< GL_MAP_FLUSH_EXPLICIT_BIT: `flush()` says what was
                                        ///< written
        ACCESS_UNSYNCHRONIZED = 0x20    ///< GL_MAP_UNSYNCHRONIZED_BIT: do not wait for commands
                                        ///< that use it; the host has made sure with a Fence
    };

    /// Binds the buffer and maps.
    /// @param buffer outlives the scope and stays where it is
    /// @param offset, size bytes
    /// @param access one or several of Access
    /// @throws InternalException when the buffer is mapped already, or for a range that leaves it;
    ///         ExceptionOGL for bits that do not go together
    /// @note glGetIntegerv, glBindBuffer, glMapBufferRange
    MappedRange(Buffer &buffer, std::int64_t offset, std::int64_t size, unsigned int access);

    /// As `unmap()`, unless that was called; a failure is dropped.
    ~MappedRange();

    MappedRange(MappedRange const &) = delete;
    MappedRange &operator=(MappedRange const &) = delete;

    /// The mapped bytes; null after `unmap()`.
    void *data() const { return data_; }

    /// Bytes of the mapping.
    std::int64_t size() const { return size_; }

    /// Hands over a part that was written, with ACCESS_FLUSH_EXPLICIT.
    /// @param offset, size bytes, counted from `data()`
    /// @throws InternalException after `unmap()`; ExceptionOGL for a part that leaves the mapping,
    ///         and for another access
    /// @note glBindBuffer, glFlushMappedBufferRange
    void flush(std::int64_t offset, std::int64_t size);

    /// Ends the mapping and binds what was bound before.
    /// @throws InternalException when called again, or when the system has lost the contents;
    ///         ExceptionOGL when OpenGL refuses
    /// @note glBindBuffer, glUnmapBuffer
    void unmap();

    /// Whether the current context can map parts; false without a context.
    static bool IsSupported();

private:
    void requireMapping() const;
    void bindPrevious() const;

    Buffer &buffer_;
    unsigned int target_;
    unsigned int previous_; ///< what was bound to the target
    void *data_ = nullptr;
    std::int64_t size_;
};

} // namespace ORU::OGL
