// Buffer objects: storage of the OpenGL implementation for pixels and vertices.
#pragma once

#include "oru/oru_ogl/ogl/object.h"

#include <cstdint>

namespace ORU::OGL {

/// One OpenGL buffer object, used as pixel unpack, pixel pack, array or element array buffer.
///
/// `map`, `unmap`, `subData` and `getSubData` act on what is bound to the buffer's target and do
/// not bind: call `bind()` first.
///
/// ```cpp
/// Buffer pixels(width * height * 4, Buffer::TYPE_PIXEL_UNPACK_BUFFER,
///               Buffer::USAGE_STREAM_DRAW, nullptr);
/// pixels.bind();
/// std::memcpy(pixels.map(GL_WRITE_ONLY), source, pixels.size());
/// pixels.unmap();
/// Buffer::BindDefaultUnpackBuffer();
/// ```
///
/// OpenGL 2.1, or 1.5 with GL_ARB_vertex_buffer_object and GL_ARB_pixel_buffer_object.
class ORU_API Buffer : public Object {
public:
    /// What the buffer is bound to.
    enum Type : unsigned int {
        TYPE_PIXEL_UNPACK_BUFFER = 0, ///< pixels on their way into a texture
        TYPE_PIXEL_PACK_BUFFER,       ///< pixels on their way out of a texture or framebuffer
        TYPE_ARRAY_BUFFER,            ///< vertices
        TYPE_ELEMENT_ARRAY_BUFFER     ///< vertex indices
    };

    /// How often the store changes, and who reads it.
    enum Usage : unsigned int {
        USAGE_STREAM_DRAW = 0, ///< GL_STREAM_DRAW: filled for each use, read by OpenGL
        USAGE_STREAM_READ,     ///< GL_STREAM_READ: filled by OpenGL, read by the host once
        USAGE_STREAM_COPY,     ///< GL_STREAM_COPY
        USAGE_STATIC_DRAW,     ///< GL_STATIC_DRAW: filled once, used often
        USAGE_STATIC_READ,     ///< GL_STATIC_READ
        USAGE_STATIC_COPY,     ///< GL_STATIC_COPY
        USAGE_DYNAMIC_DRAW,    ///< GL_DYNAMIC_DRAW: changed and used often
        USAGE_DYNAMIC_READ,    ///< GL_DYNAMIC_READ
        USAGE_DYNAMIC_COPY     ///< GL_DYNAMIC_COPY
    };

    /// Makes a buffer and its store. What was bound to the target stays bound.
    /// @param size bytes, at least 1
    /// @param type a number that is no Type makes a pixel unpack buffer
    /// @param data `size` bytes to fill the store with, or null for one without contents
    /// @throws InternalException without the two extensions or OpenGL 1.5, and for a size below 1;
    ///         ExceptionOGL when there is no memory
    /// @note glGenBuffers, glBufferData
    Buffer(std::int64_t size, Type type, Usage usage, void const *data);

    /// A buffer that was made elsewhere; size, usage and whether it is mapped are what OpenGL
    /// tells. After a failure the name is the caller's as before.
    /// @param type a number that is no Type makes a pixel unpack buffer
    /// @throws InternalException for a name that is no buffer
    /// @note glIsBuffer, glBindBuffer, glGetBufferParameteriv, with OpenGL 3.2
    ///       glGetBufferParameteri64v
    Buffer(unsigned int name, Type type, ownership_tag ownership);

    Buffer(Buffer &&other) noexcept = default;
    Buffer &operator=(Buffer &&other) noexcept;

    /// Deletes the buffer that the object owns, which need not be unmapped. @note glDeleteBuffers
    ~Buffer() override;

    /// Binds the buffer to its target.
    /// @note glBindBuffer
    void bind();

    /// @name Bind no buffer to a target
    /// @note glBindBuffer
    /// @{
    static void BindDefaultArrayBuffer();
    static void BindDefaultElementArrayBuffer();
    static void BindDefaultPackBuffer();
    static void BindDefaultUnpackBuffer();
    /// @}

    /// @name Change the target the buffer is used with
    /// The store stays as it is.
    /// @throws InternalException while the buffer is bound to its present target
    /// @note glGetIntegerv
    /// @{
    void convertToArrayBuffer();
    void convertToElementArrayBuffer();
    void convertToPackBuffer();
    void convertToUnpackBuffer();
    /// @}

    /// Maps the whole store into memory.
    /// @param access GL_READ_ONLY, GL_WRITE_ONLY or GL_READ_WRITE
    /// @return `size()` bytes, valid until `unmap()`
    /// @throws InternalException when mapped already; ExceptionOGL when OpenGL refuses, the buffer
    ///         not being bound say
    /// @note glMapBuffer
    void *map(unsigned int access);

    /// Ends the mapping; what was written is the store's now.
    /// @throws InternalException when not mapped, or when the system has lost the contents, after
    ///         which the buffer still counts as mapped; ExceptionOGL when OpenGL refuses
    /// @note glUnmapBuffer
    void unmap();

    /// Whether `map()` was called and `unmap()` not yet.
    bool isMapped() const {
        requireObject();
        return mapped_;
    }

    /// Writes a range of the store.
    /// @param offset, size bytes; a range that leaves the store is an ExceptionOGL
    /// @param data `size` bytes
    /// @throws InternalException while mapped, for a null pointer or a negative offset
    /// @note glBufferSubData
    void subData(std::int64_t offset, std::int64_t size, void const *data);

    /// Reads a range of the store; parameters and failures as `subData`.
    /// @note glGetBufferSubData
    void getSubData(std::int64_t offset, std::int64_t size, void *data);

    /// @name What the buffer is bound to
    /// One of them is true.
    /// @{
    bool isArrayBuffer() const;
    bool isElementArrayBuffer() const;
    bool isPackBuffer() const;
    bool isUnpackBuffer() const;
    /// @}

    /// Size of the store in bytes.
    std::uint64_t size() const {
        requireObject();
        return static_cast<std::uint64_t>(size_);
    }
    /// As given to the constructor.
    Usage usagePolicy() const {
        requireObject();
        return usagePolicy_;
    }

    /// Kept for hosts that call it; there is nothing to verify.
    void verifyCurrentBufferObject() const {}

    /// @name Translations to and from GL targets and usages
    /// @throws InternalException for a value outside the enumeration
    /// @{
    static unsigned int Type2GL(Type type);
    static Type GL2Type(unsigned int target);
    static unsigned int Usage2GL(Usage usage);
    static Usage GL2Usage(unsigned int usage);
    /// @}

    /// Whether the current context has pixel and vertex buffer objects; false without a context.
    static bool IsSupported();

private:
    void setTarget(Type type);
    void convertTo(Type type, char const *failure);
    void fill(void const *data);
    void deleteObject() noexcept;

    /// After a map or unmap that failed: an error that was pending before ends them, too, when they
    /// are done. @note glGetBufferParameteriv
    void askWhetherMapped() noexcept;
    void checkTransfer(char const *operation, std::int64_t offset, void const *data) const;

    std::int64_t size_;
    Usage usagePolicy_;
    bool mapped_ = false;
};

} // namespace ORU::OGL
