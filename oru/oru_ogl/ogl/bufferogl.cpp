// Buffer objects: storage of the OpenGL implementation for pixels and vertices.
#include "oru/oru_ogl/ogl/bufferogl.h"

#include "oru/core/utility/composetext.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/objects/translation.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

namespace {

struct TypeRow {
    Buffer::Type value;
    unsigned int gl;
    unsigned int binding;
};

#define ORU_TYPE(Name)                                                                             \
    { Buffer::TYPE_##Name, GL_##Name, GL_##Name##_BINDING }
constexpr internal::Translation<Buffer::Type, 4, TypeRow> kTypes = {
    ORU_TRANSLATION_FAILURE("Buffer type enums are not all properly translated."),
    {ORU_TYPE(PIXEL_UNPACK_BUFFER), ORU_TYPE(PIXEL_PACK_BUFFER), ORU_TYPE(ARRAY_BUFFER),
     ORU_TYPE(ELEMENT_ARRAY_BUFFER)}};
#undef ORU_TYPE

#define ORU_USAGE(Name)                                                                            \
    { Buffer::USAGE_##Name, GL_##Name }
constexpr internal::Translation<Buffer::Usage, 9> kUsages = {
    ORU_TRANSLATION_FAILURE("Buffer type enums are not all properly translated."),
    {ORU_USAGE(STREAM_DRAW), ORU_USAGE(STREAM_READ), ORU_USAGE(STREAM_COPY), ORU_USAGE(STATIC_DRAW),
     ORU_USAGE(STATIC_READ), ORU_USAGE(STATIC_COPY), ORU_USAGE(DYNAMIC_DRAW),
     ORU_USAGE(DYNAMIC_READ), ORU_USAGE(DYNAMIC_COPY)}};
#undef ORU_USAGE

} // namespace

Buffer::Buffer(std::int64_t size, Type type, Usage usage, void const *data)
    : Object(GL_PIXEL_UNPACK_BUFFER, GL_PIXEL_UNPACK_BUFFER_BINDING), size_(size),
      usagePolicy_(usage) {
    ORU_ASSERT_SUPPORTED(GL_ARB_PIXEL_BUFFER_OBJECT);
    ORU_ASSERT_SUPPORTED(GL_ARB_VERTEX_BUFFER_OBJECT);
    if (size < 1) // the check's text is what hosts see
        ORU_THROW_INTERNAL("Range error: nSize > 0");
    // A context may name both extensions and be too old for the entry points that are called here.
    ORU_ASSERT_SUPPORTED(GL_VERSION_1_5);
    try {
        // An error that the host left pending ends the call, too, after the name was made.
        ORU_GL(GenBuffers, 1, &objectID_);
        ORU_ASSERT(objectID_ != 0);
        setTarget(type);
        fill(data);
    } catch (...) {
        deleteObject();
        throw;
    }
}

Buffer::Buffer(unsigned int name, Type type, ownership_tag ownership)
    : Object(GL_PIXEL_UNPACK_BUFFER, GL_PIXEL_UNPACK_BUFFER_BINDING, name, ownership) {
    ORU_ASSERT_SUPPORTED(GL_VERSION_1_5);
    internal::RequireName(ORU_GL(IsBuffer, name), name, "buffer");
    if (TypeRow const *row = kTypes.find(type))
        changeTarget(row->gl, row->binding);
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindBuffer));
    auto const parameter = [this](GLenum query) {
        GLint value = 0;
        ORU_GL(GetBufferParameteriv, target(), query, &value);
        return value;
    };
    usagePolicy_ = GL2Usage(static_cast<unsigned int>(parameter(GL_BUFFER_USAGE)));
    mapped_ = parameter(GL_BUFFER_MAPPED) != 0;
    if (internal::Supports(GL_VERSION_3_2)) // for stores of 2 GiB and more
        ORU_GL(GetBufferParameteri64v, target(), GL_BUFFER_SIZE, &size_);
    else
        size_ = parameter(GL_BUFFER_SIZE);
    bound.restore();
}

Buffer &Buffer::operator=(Buffer &&other) noexcept {
    if (this == &other)
        return *this;
    deleteObject();
    size_ = other.size_;
    usagePolicy_ = other.usagePolicy_;
    mapped_ = other.mapped_;
    Object::operator=(std::move(other));
    return *this;
}

Buffer::~Buffer() {
    deleteObject();
}

void Buffer::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteBuffers, 1, &objectID_); });
}

void Buffer::setTarget(Type type) {
    switch (type) {
    case TYPE_PIXEL_UNPACK_BUFFER:
        return convertToUnpackBuffer();
    case TYPE_PIXEL_PACK_BUFFER:
        return convertToPackBuffer();
    case TYPE_ARRAY_BUFFER:
        return convertToArrayBuffer();
    case TYPE_ELEMENT_ARRAY_BUFFER:
        return convertToElementArrayBuffer();
    }
}

void Buffer::fill(void const *data) {
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindBuffer));
    ORU_GL(BufferData, target(), size_, data, Usage2GL(usagePolicy_));
    bound.restore();
}

void Buffer::bind() {
    ORU_GL(BindBuffer, target(), objectID_);
}

void Buffer::BindDefaultArrayBuffer() {
    ORU_GL(BindBuffer, GL_ARRAY_BUFFER, 0);
}

void Buffer::BindDefaultElementArrayBuffer() {
    ORU_GL(BindBuffer, GL_ELEMENT_ARRAY_BUFFER, 0);
}

void Buffer::BindDefaultPackBuffer() {
    ORU_GL(BindBuffer, GL_PIXEL_PACK_BUFFER, 0);
}

void Buffer::BindDefaultUnpackBuffer() {
    ORU_GL(BindBuffer, GL_PIXEL_UNPACK_BUFFER, 0);
}

void Buffer::convertTo(Type type, char const *failure) {
    if (isBound())
        ORU_THROW_INTERNAL(failure);
    TypeRow const &row = *kTypes.find(type);
    changeTarget(row.gl, row.binding);
}

void Buffer::convertToArrayBuffer() {
    convertTo(TYPE_ARRAY_BUFFER,
              "Buffer::convertToArrayBuffer cannot convert buffer target while bound");
}

void Buffer::convertToElementArrayBuffer() {
    convertTo(TYPE_ELEMENT_ARRAY_BUFFER,
              "Buffer::convertToElementArrayBuffer cannot convert buffer target while bound");
}

void Buffer::convertToPackBuffer() {
    convertTo(TYPE_PIXEL_PACK_BUFFER,
              "Buffer::convertToPackBuffer cannot convert buffer target while bound");
}

void Buffer::convertToUnpackBuffer() {
    convertTo(TYPE_PIXEL_UNPACK_BUFFER,
              "Buffer::convertToUnpackBuffer cannot convert buffer target while bound");
}

template<class Call>
void *Buffer::mapBy(Call call) {
    if (isMapped())
        ORU_THROW_INTERNAL("Buffer is already mapped (this will cause a GL error)");
    try {
        void *const address = call();
        mapped_ = true;
        return address;
    } catch (...) {
        askWhetherMapped();
        throw;
    }
}

void *Buffer::map(unsigned int access) {
    return mapBy([&] { return ORU_GL(MapBuffer, target(), access); });
}

void *Buffer::mapRange(std::int64_t offset, std::int64_t size, unsigned int access) {
    requireRange("mapRange", offset, size);
    return mapBy([&] { return ORU_GL(MapBufferRange, target(), offset, size, access); });
}

void Buffer::flushMappedRange(std::int64_t offset, std::int64_t size) {
    if (!isMapped())
        ORU_THROW_INTERNAL("Buffer::flushMappedRange: the buffer is not mapped");
    ORU_GL(FlushMappedBufferRange, target(), offset, size);
}

void Buffer::askWhetherMapped() noexcept {
    DropExceptions([this] {
        GLint isMapped = 0;
        ORU_GL(GetBufferParameteriv, target(), GL_BUFFER_MAPPED, &isMapped);
        mapped_ = isMapped != 0;
    });
}

void Buffer::unmap() {
    if (!isMapped()) // the check's text is what hosts see, with its slip
        ORU_THROW_INTERNAL("Buffer must be mapped before umapping it (this will cause a GL error)");
    bool isIntact = false;
    try {
        isIntact = ORU_GL(UnmapBuffer, target());
    } catch (...) {
        askWhetherMapped();
        throw;
    }
    if (!isIntact)
        ORU_THROW_INTERNAL("Cannot unmap buffer");
    mapped_ = false;
}

void Buffer::requireUnmapped(char const *operation) const {
    if (isMapped())
        ORU_THROW_INTERNAL("Buffer::", operation, " buffer cannot be mapped");
}

void Buffer::requireRange(char const *operation, std::int64_t offset, std::int64_t size) const {
    requireObject();
    if (offset < 0)
        ORU_THROW_INTERNAL("Buffer::", operation, " offset must not be negative");
    if (size < 1)
        ORU_THROW_INTERNAL("Buffer::", operation, " size must be at least 1");
    if (offset > size_ || size > size_ - offset)
        ORU_THROW_INTERNAL("Buffer::", operation, " the range of ", size, " bytes from ", offset,
                           " on leaves the buffer, which has ", size_);
}

void Buffer::checkTransfer(char const *operation, std::int64_t offset, void const *data) const {
    requireUnmapped(operation);
    if (!data)
        ORU_THROW_INTERNAL("Buffer::", operation, " pointer to data must not be NULL");
    if (offset < 0)
        ORU_THROW_INTERNAL("Buffer::", operation, " offset must not be negative");
}

void Buffer::subData(std::int64_t offset, std::int64_t size, void const *data) {
    checkTransfer("subData", offset, data);
    ORU_GL(BufferSubData, target(), offset, size, data);
}

void Buffer::getSubData(std::int64_t offset, std::int64_t size, void *data) {
    checkTransfer("getSubData", offset, data);
    ORU_GL(GetBufferSubData, target(), offset, size, data);
}

void Buffer::orphan() {
    requireUnmapped("orphan");
    ORU_GL(BufferData, target(), size_, nullptr, Usage2GL(usagePolicy_));
}

void Buffer::copySubData(Buffer const &source, std::int64_t sourceOffset, std::int64_t offset,
                         std::int64_t size) {
    ORU_ASSERT_SUPPORTED(GL_ARB_COPY_BUFFER);
    requireUnmapped("copySubData");
    source.requireUnmapped("copySubData");
    source.requireRange("copySubData", sourceOffset, size);
    requireRange("copySubData", offset, size);
    GLint reader = 0, writer = 0;
    // The names of these two targets ask for what is bound to them, too.
    ORU_GL(GetIntegerv, GL_COPY_READ_BUFFER, &reader);
    ORU_GL(GetIntegerv, GL_COPY_WRITE_BUFFER, &writer);
    internal::Ending restoreReader(
        [=] { ORU_GL(BindBuffer, GL_COPY_READ_BUFFER, static_cast<GLuint>(reader)); });
    ORU_GL(BindBuffer, GL_COPY_READ_BUFFER, source.objectID_);
    internal::Ending restoreWriter(
        [=] { ORU_GL(BindBuffer, GL_COPY_WRITE_BUFFER, static_cast<GLuint>(writer)); });
    ORU_GL(BindBuffer, GL_COPY_WRITE_BUFFER, objectID_);
    ORU_GL(CopyBufferSubData, GL_COPY_READ_BUFFER, GL_COPY_WRITE_BUFFER, sourceOffset, offset,
           size);
    restoreWriter.now();
    restoreReader.now();
}

void Buffer::bindBase(unsigned int target, unsigned int index) const {
    ORU_GL(BindBufferBase, target, index, checkedID());
}

void Buffer::bindRange(unsigned int target, unsigned int index, std::int64_t offset,
                       std::int64_t size) const {
    requireRange("bindRange", offset, size);
    ORU_GL(BindBufferRange, target, index, objectID_, offset, size);
}

void Buffer::BindDefaultBase(unsigned int target, unsigned int index) {
    ORU_GL(BindBufferBase, target, index, 0);
}

bool Buffer::isArrayBuffer() const {
    return target() == GL_ARRAY_BUFFER;
}

bool Buffer::isElementArrayBuffer() const {
    return target() == GL_ELEMENT_ARRAY_BUFFER;
}

bool Buffer::isPackBuffer() const {
    return target() == GL_PIXEL_PACK_BUFFER;
}

bool Buffer::isUnpackBuffer() const {
    return target() == GL_PIXEL_UNPACK_BUFFER;
}

ORU_TRANSLATED(Buffer, Type, kTypes)
ORU_TRANSLATED(Buffer, Usage, kUsages)

bool Buffer::IsSupported() {
    return internal::Supports(GL_ARB_PIXEL_BUFFER_OBJECT) &&
           internal::Supports(GL_ARB_VERTEX_BUFFER_OBJECT);
}

} // namespace ORU::OGL
