// Vertex arrays: which buffers the attributes of vertices come from, and drawing them.
#include "oru/oru_ogl/ogl/vertexarray.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

namespace {

/// OpenGL takes offsets into buffers as pointers.
void const *AsPointer(std::int64_t offset) {
    return reinterpret_cast<void const *>(offset);
}

/// Bytes of an index; 0 for a type that indices cannot have.
std::int64_t SizeOfIndex(GLenum type) {
    switch (type) {
    case GL_UNSIGNED_BYTE:
        return 1;
    case GL_UNSIGNED_SHORT:
        return 2;
    case GL_UNSIGNED_INT:
        return 4;
    default:
        return 0;
    }
}

GLuint RequireLocation(int location) {
    if (location < 0)
        ORU_THROW_INTERNAL("A vertex array has no attribute below 0: the program does not use the "
                           "attribute whose location was asked");
    return static_cast<GLuint>(location);
}

/// Sets a state, runs a step and puts back what the state was before.
template<class Set, class Step>
void WithState(GLenum query, GLuint value, Set set, Step step) {
    GLint previous = 0;
    ORU_GL(GetIntegerv, query, &previous);
    internal::Ending restore([&] { set(static_cast<GLuint>(previous)); });
    set(value);
    step();
    restore.now();
}

template<class Step>
void WithBuffer(GLenum target, GLenum binding, GLuint name, Step step) {
    WithState(
        binding, name, [=](GLuint buffer) { ORU_GL(BindBuffer, target, buffer); }, step);
}

template<class Step>
void WithPatches(int vertices, Step step) {
    ORU_ASSERT_SUPPORTED(GL_ARB_TESSELLATION_SHADER);
    WithState(
        GL_PATCH_VERTICES, static_cast<GLuint>(vertices),
        [](GLuint count) { ORU_GL(PatchParameteri, GL_PATCH_VERTICES, static_cast<GLint>(count)); },
        step);
}

/// Runs a draw with the buffer bound that has its numbers.
template<class Draw>
void WithCommands(Buffer const &commands, std::int64_t offset, std::int64_t size, Draw draw) {
    ORU_ASSERT_SUPPORTED(GL_ARB_DRAW_INDIRECT);
    if (offset < 0 || offset % 4 != 0 || offset > static_cast<std::int64_t>(commands.size()) - size)
        ORU_THROW_INTERNAL("A draw of ", size, " bytes in the buffer of ", commands.size(),
                           " cannot stand at ", offset,
                           ": it has to lie in the buffer, at a multiple of 4");
    WithBuffer(GL_DRAW_INDIRECT_BUFFER, GL_DRAW_INDIRECT_BUFFER_BINDING, commands.objectID(),
               [=] { draw(AsPointer(offset)); });
}

} // namespace

VertexArray::VertexArray() : Object(GL_VERTEX_ARRAY, GL_VERTEX_ARRAY_BINDING) {
    ORU_ASSERT_SUPPORTED(GL_VERSION_2_0);
    ORU_ASSERT_SUPPORTED(GL_ARB_VERTEX_ARRAY_OBJECT);
    try {
        // An error that the host left pending ends the call, too, after the name was made.
        ORU_GL(GenVertexArrays, 1, &objectID_);
        ORU_ASSERT(objectID_ != 0);
        whileBound([] {}); // until then the name stands for none yet
    } catch (...) {
        deleteObject();
        throw;
    }
}

VertexArray::VertexArray(unsigned int name, ownership_tag ownership)
    : Object(GL_VERTEX_ARRAY, GL_VERTEX_ARRAY_BINDING, name, ownership) {
    ORU_ASSERT_SUPPORTED(GL_VERSION_2_0);
    ORU_ASSERT_SUPPORTED(GL_ARB_VERTEX_ARRAY_OBJECT);
    internal::RequireName(ORU_GL(IsVertexArray, name), name, "vertex array");
}

VertexArray &VertexArray::operator=(VertexArray &&other) noexcept {
    if (this == &other)
        return *this;
    deleteObject();
    indexType_ = other.indexType_;
    indexCount_ = other.indexCount_;
    Object::operator=(std::move(other));
    return *this;
}

VertexArray::~VertexArray() {
    deleteObject();
}

void VertexArray::deleteObject() noexcept {
    if (ownsName())
        internal::Release([this] { ORU_GL(DeleteVertexArrays, 1, &objectID_); });
}

void VertexArray::bind() const {
    ORU_GL(BindVertexArray, checkedID());
}

void VertexArray::BindDefault() {
    ORU_GL(BindVertexArray, 0);
}

template<class Step>
void VertexArray::whileBound(Step step) const {
    if (isHeld_)
        return step();
    unsigned int const previous = getBoundID();
    if (previous == objectID_)
        return step();
    internal::Ending restore([previous] { ORU_GL(BindVertexArray, previous); });
    bind();
    step();
    restore.now();
}

void VertexArray::setAttribute(int location, Buffer const &buffer, Attribute const &attribute) {
    GLuint const index = RequireLocation(location);
    if (attribute.offset_ < 0)
        ORU_THROW_INTERNAL("VertexArray::setAttribute: the offset must not be negative");
    auto const components = static_cast<GLint>(attribute.components_);
    void const *const offset = AsPointer(attribute.offset_);
    whileBound([&] {
        WithBuffer(GL_ARRAY_BUFFER, GL_ARRAY_BUFFER_BINDING, buffer.checkedID(), [&] {
            switch (attribute.kind_) {
            case Attribute::KIND_INTEGER:
                ORU_GL(VertexAttribIPointer, index, components, attribute.type_, attribute.stride_,
                       offset);
                break;
            case Attribute::KIND_DOUBLE:
                ORU_GL(VertexAttribLPointer, index, components, attribute.type_, attribute.stride_,
                       offset);
                break;
            case Attribute::KIND_FLOAT:
            case Attribute::KIND_NORMALIZED:
                ORU_GL(VertexAttribPointer, index, components, attribute.type_,
                       attribute.kind_ == Attribute::KIND_NORMALIZED, attribute.stride_, offset);
            }
        });
        // Where there are no divisors, all attributes are for each vertex already.
        if (attribute.divisor_ != 0 || internal::Supports(GL_VERSION_3_3))
            ORU_GL(VertexAttribDivisor, index, attribute.divisor_);
        ORU_GL(EnableVertexAttribArray, index);
    });
}

void VertexArray::disableAttribute(int location) {
    GLuint const index = RequireLocation(location);
    whileBound([index] { ORU_GL(DisableVertexAttribArray, index); });
}

void VertexArray::setIndices(Buffer const &buffer, unsigned int type) {
    std::int64_t const size = SizeOfIndex(type);
    if (size == 0)
        ORU_THROW_INTERNAL("Indices are of GL_UNSIGNED_BYTE, GL_UNSIGNED_SHORT or GL_UNSIGNED_INT");
    GLuint const name = buffer.checkedID();
    // Unlike other bindings this one belongs to the vertex array, and stays.
    whileBound([name] { ORU_GL(BindBuffer, GL_ELEMENT_ARRAY_BUFFER, name); });
    indexType_ = type;
    indexCount_ = static_cast<std::int64_t>(buffer.size()) / size;
}

void VertexArray::requireIndices() const {
    requireObject();
    if (indexType_ == 0)
        ORU_THROW_INTERNAL("The vertex array has no indices to draw by: call setIndices() first");
}

void const *VertexArray::placeOfIndices(int count, std::int64_t first) const {
    requireIndices();
    if (first < 0 || first > indexCount_ || count > indexCount_ - first)
        ORU_THROW_INTERNAL("The vertex array has ", indexCount_, " indices, not ", count, " from ",
                           first, " on");
    return AsPointer(first * SizeOfIndex(indexType_));
}

void VertexArray::drawArrays(unsigned int mode, int first, int count) const {
    whileBound([=] { ORU_GL(DrawArrays, mode, first, count); });
}

void VertexArray::drawArraysInstanced(unsigned int mode, int first, int count,
                                      int instances) const {
    whileBound([=] { ORU_GL(DrawArraysInstanced, mode, first, count, instances); });
}

void VertexArray::drawRanges(unsigned int mode, int const *firsts, int const *counts,
                             int ranges) const {
    whileBound([=] { ORU_GL(MultiDrawArrays, mode, firsts, counts, ranges); });
}

void VertexArray::drawArraysIndirect(unsigned int mode, Buffer const &commands,
                                     std::int64_t offset) const {
    whileBound([&] {
        WithCommands(commands, offset, 4 * sizeof(GLuint),
                     [mode](void const *place) { ORU_GL(DrawArraysIndirect, mode, place); });
    });
}

void VertexArray::drawPatches(int patchVertices, int first, int count) const {
    WithPatches(patchVertices, [=] { drawArrays(GL_PATCHES, first, count); });
}

void VertexArray::drawElements(unsigned int mode, int count, std::int64_t first,
                               int baseVertex) const {
    void const *const place = placeOfIndices(count, first);
    whileBound([=] {
        if (baseVertex == 0)
            ORU_GL(DrawElements, mode, count, indexType_, place);
        else
            ORU_GL(DrawElementsBaseVertex, mode, count, indexType_, place, baseVertex);
    });
}

void VertexArray::drawElementsInstanced(unsigned int mode, int count, int instances,
                                        std::int64_t first, int baseVertex) const {
    void const *const place = placeOfIndices(count, first);
    whileBound([=] {
        if (baseVertex == 0)
            ORU_GL(DrawElementsInstanced, mode, count, indexType_, place, instances);
        else
            ORU_GL(DrawElementsInstancedBaseVertex, mode, count, indexType_, place, instances,
                   baseVertex);
    });
}

void VertexArray::drawRangeElements(unsigned int mode, unsigned int smallest, unsigned int largest,
                                    int count, std::int64_t first, int baseVertex) const {
    void const *const place = placeOfIndices(count, first);
    whileBound([=] {
        if (baseVertex == 0)
            ORU_GL(DrawRangeElements, mode, smallest, largest, count, indexType_, place);
        else
            ORU_GL(DrawRangeElementsBaseVertex, mode, smallest, largest, count, indexType_, place,
                   baseVertex);
    });
}

void VertexArray::drawElementsIndirect(unsigned int mode, Buffer const &commands,
                                       std::int64_t offset) const {
    requireIndices();
    whileBound([&] {
        WithCommands(commands, offset, 5 * sizeof(GLuint), [&](void const *place) {
            ORU_GL(DrawElementsIndirect, mode, indexType_, place);
        });
    });
}

void VertexArray::drawPatchElements(int patchVertices, int count, std::int64_t first) const {
    WithPatches(patchVertices, [=] { drawElements(GL_PATCHES, count, first); });
}

bool VertexArray::IsSupported() {
    return internal::Supports(GL_VERSION_2_0) && internal::Supports(GL_ARB_VERTEX_ARRAY_OBJECT);
}

} // namespace ORU::OGL
