// Buffer objects: storage of the OpenGL implementation for pixels and vertices.
#pragma once

#include "oru/oru_ogl/ogl/object.h"

#include <cstdint>

namespace ORU::OGL {

/// One OpenGL buffer object, used as pixel unpack, pixel pack, array or element array buffer.
///
/// `map`, `mapRange`, `flushMappedRange`, `unmap`, `subData`, `getSubData` and `orphan` act on what
/// is bound to the buffer's target and do not bind: call `bind()` first. A MappedRange binds by
/// itself.
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

    /// Maps a part of the store into memory; `unmap()` ends that. A MappedRange does both.
    /// @param offset, size bytes
    /// @param access bits: GL_MAP_READ_BIT and its kin
    /// @return `size` bytes, valid until `unmap()`
    /// @throws InternalException when mapped already, or for a range that leaves the store;
    ///         ExceptionOGL when OpenGL refuses, the buffer not being bound say
    /// @note glMapBufferRange; needs OpenGL 3.0 or GL_ARB_map_buffer_range
    void *mapRange(std::int64_t offset, std::int64_t size, unsigned int access);

    /// Hands over what was written to a part of the mapping that was made with
    /// GL_MAP_FLUSH_EXPLICIT_BIT.
    /// @param offset, size bytes, counted from the beginning of the mapping
    /// @throws InternalException when not mapped; ExceptionOGL for a range that leaves the mapping
    /// @note glFlushMappedBufferRange; needs OpenGL 3.0 or GL_ARB_map_buffer_range
    void flushMappedRange(std::int64_t offset, std::int64_t size);

    /// Gives the store up to the commands that still read it and makes a new one of the same size
    /// and usage, without contents: what is written next waits for nobody.
    /// @throws InternalException while mapped; ExceptionOGL when there is no memory
    /// @note glBufferData
    void orphan();

    /// Copies a part of another buffer, or of this one, without a way through the host's memory.
    /// @param source may be this buffer, for ranges that do not meet
    /// @param sourceOffset, offset, size bytes
    /// @throws InternalException while one of the two is mapped, or for a range that leaves its
    ///         store; ExceptionOGL for ranges of one buffer that meet
    /// @note glGetIntegerv, glBindBuffer, glCopyBufferSubData; needs OpenGL 3.1 or
    ///       GL_ARB_copy_buffer
    void copySubData(Buffer const &source, std::int64_t sourceOffset, std::int64_t offset,
                     std::int64_t size);

    /// @name Numbered binding points
    /// Where a program finds uniform blocks, and feedback is written to. OpenGL binds the buffer to
    /// the target itself too. OpenGL 3.0, for uniform blocks 3.1 or GL_ARB_uniform_buffer_object.
    /// @param target GL_UNIFORM_BUFFER or GL_TRANSFORM_FEEDBACK_BUFFER
    /// @param index which binding point
    /// @throws ExceptionOGL for a target that has no such point
    /// @{

    /// Binds the whole buffer. @note glBindBufferBase
    void bindBase(unsigned int target, unsigned int index) const;

    /// Binds a part of the buffer.
    /// @param offset, size bytes; of a uniform block the offset is a multiple of
    ///        UniformBlock::OffsetAlignment()
    /// @throws InternalException for a range that leaves the store
    /// @note glBindBufferRange
    void bindRange(unsigned int target, unsigned int index, std::int64_t offset,
                   std::int64_t size) const;

    /// Binds no buffer. @note glBindBufferBase
    static void BindDefaultBase(unsigned int target, unsigned int index);
    /// @}

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

    /// Maps by a call that returns the address.
    template<class Call>
    void *mapBy(Call call);

    /// After a map or unmap that failed: an error that was pending before ends them, too, when they
    /// are done. @note glGetBufferParameteriv
    void askWhetherMapped() noexcept;
    void requireRange(char const *operation, std::int64_t offset, std::int64_t size) const;
    void requireUnmapped(char const *operation) const;
    void checkTransfer(char const *operation, std::int64_t offset, void const *data) const;

    std::int64_t size_;
    Usage usagePolicy_;
    bool mapped_ = false;
};

} // namespace ORU::OGL
