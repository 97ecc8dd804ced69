// Vertices with named attributes, and drawing them with a program.
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <utility>

namespace ORU::OGL {

namespace {

constexpr unsigned int kNoField = 0xFFFFFFFF;

unsigned int ComponentCount(VertexBuffer::AttributeType type) {
    if (type < VertexBuffer::ATTRIBUTETYPE_FLOAT || type > VertexBuffer::ATTRIBUTETYPE_FLOAT4)
        ORU_THROW_INTERNAL("Unexpected field type");
    return type;
}

} // namespace

VertexBuffer::Field::Field(std::string const &name, AttributeType type, ExpectedUsage usage)
    : type_(type), name_(name), usage_(usage), componentType_(GL_FLOAT),
      byteSize_(ComponentCount(type) * sizeof(GLfloat)), componentCount_(ComponentCount(type)) {}

VertexBuffer::VertexBuffer(std::vector<Field> const &fields, unsigned int vertexCount,
                           PrimitiveType primitiveType)
    : fields_(fields), vertexCount_(vertexCount), primitiveType_(primitiveType) {
    prepareHostSideResources();
}

VertexBuffer::VertexBuffer(VertexBuffer const &other)
    : fields_(other.fields_), vertexSize_(other.vertexSize_), vertexCount_(other.vertexCount_),
      totalSize_(other.totalSize_), primitiveType_(other.primitiveType_),
      hostData_(other.hostData_) {}

VertexBuffer::VertexBuffer(VertexBuffer &&other) noexcept {
    swap(other);
}

VertexBuffer &VertexBuffer::operator=(VertexBuffer other) noexcept {
    swap(other);
    return *this;
}

VertexBuffer::~VertexBuffer() {
    internal::Release([this] { deleteDeviceSideResources(); });
}

void VertexBuffer::swap(VertexBuffer &other) noexcept {
    fields_.swap(other.fields_);
    std::swap(vertexSize_, other.vertexSize_);
    std::swap(vertexCount_, other.vertexCount_);
    std::swap(totalSize_, other.totalSize_);
    std::swap(primitiveType_, other.primitiveType_);
    attributeBuffers_.swap(other.attributeBuffers_);
    std::swap(vertexBuffer_, other.vertexBuffer_);
    hostData_.swap(other.hostData_);
}

unsigned int VertexBuffer::fieldIndex(std::string const &name) const {
    for (unsigned int i = 0; i < fields_.size(); ++i) {
        if (fields_[i].name_ == name)
            return i;
    }
    return kNoField;
}

void VertexBuffer::setField(std::string const &name, unsigned char const *data,
                            bool ignoreMissingFields, unsigned int stride, std::size_t count) {
    unsigned int const index = fieldIndex(name);
    if (index != kNoField)
        setField(index, data, stride, count);
    else
        ORU_ASSERT(ignoreMissingFields);
}

void VertexBuffer::setField(unsigned int index, unsigned char const *data, unsigned int stride,
                            std::size_t count) {
    std::size_t const vertices = count ? count : vertexCount_;
    std::size_t const size = fields_[index].byteSize_;
    unsigned char *target = hostData_[index].data();
    if (stride == 0 || stride == size) {
        std::copy_n(data, size * vertices, target);
        return;
    }
    for (std::size_t i = 0; i < vertices; ++i, data += stride)
        target = std::copy_n(data, size, target);
}

void VertexBuffer::prepareHostSideResources() {
    vertexSize_ = 0;
    hostData_.resize(fields_.size());
    for (std::size_t i = 0; i < fields_.size(); ++i) {
        vertexSize_ += fields_[i].byteSize_;
        hostData_[i].resize(std::size_t{fields_[i].byteSize_} * vertexCount_);
    }
    totalSize_ = vertexCount_ * vertexSize_;
}

void VertexBuffer::prepareDeviceSideResources() {
    ORU_ASSERT_SUPPORTED(GL_VERSION_2_0);
    ORU_ASSERT_SUPPORTED(GL_ARB_VERTEX_ARRAY_OBJECT);
    deleteDeviceSideResources();
    ORU_GL(GenVertexArrays, 1, &vertexBuffer_);
    attributeBuffers_.resize(fields_.size());
    ORU_GL(GenBuffers, static_cast<GLsizei>(fields_.size()), attributeBuffers_.data());
}

void VertexBuffer::deleteDeviceSideResources() {
    if (vertexBuffer_ == 0)
        return;
    // The names are given up first: a call that fails, for an error that was pending before, has
    // deleted them all the same.
    std::vector<unsigned int> const buffers = std::exchange(attributeBuffers_, {});
    unsigned int const array = std::exchange(vertexBuffer_, 0);
    internal::Ending deleteArray([&] { ORU_GL(DeleteVertexArrays, 1, &array); });
    ORU_GL(DeleteBuffers, static_cast<GLsizei>(buffers.size()), buffers.data());
    deleteArray.now();
}

void VertexBuffer::requireFound(Field const &field) {
    ORU_ASSERT_NOTED("f.resolvedSlot_ >= 0",
                     "the program has no active attribute \"" + field.name_ + '"',
                     field.resolvedSlot_ >= 0);
}

void VertexBuffer::setupWithProgram(unsigned int programID) {
    setup();
    for (Field &field : fields_) {
        field.resolvedSlot_ = ORU_GL(GetAttribLocation, programID, field.name_.c_str());
        requireFound(field);
    }
}

void VertexBuffer::setupWithProgram(Program *program) {
    setup();
    useWithProgram(program);
}

void VertexBuffer::useWithProgram(Program *program) {
    ORU_ENFORCE_TEXT("oglProgram != NULL", program);
    for (Field &field : fields_) {
        field.resolvedSlot_ = program->getAttributeLocation(field.name_.c_str());
        requireFound(field);
    }
}

void VertexBuffer::marshallData(std::size_t count) {
    ORU_ASSERT(vertexBuffer_ != 0);
    ORU_ASSERT(attributeBuffers_.size() == fields_.size());
    ORU_GL(BindVertexArray, vertexBuffer_);
    for (std::size_t i = 0; i < fields_.size(); ++i) {
        Field const &field = fields_[i];
        GLuint const slot = static_cast<GLuint>(field.resolvedSlot_);
        ORU_GL(BindBuffer, GL_ARRAY_BUFFER, attributeBuffers_[i]);
        ORU_GL(BufferData, GL_ARRAY_BUFFER, static_cast<GLsizeiptr>(field.byteSize_ * count),
               hostData_[i].data(), field.usage_);
        ORU_GL(VertexAttribPointer, slot, static_cast<GLint>(field.componentCount_),
               field.componentType_, GL_FALSE, 0, nullptr);
        ORU_GL(EnableVertexAttribArray, slot);
    }
    ORU_GL(BindVertexArray, 0);
}

void VertexBuffer::drawPrimitives(std::size_t count) {
    bool const isDeprecated =
        primitiveType_ >= PRIMITIVETYPE_QUADS && primitiveType_ <= PRIMITIVETYPE_POLYGON;
    if (isDeprecated && internal::IsCoreContext())
        ORU_THROW_INTERNAL(
            "Quadrilaterals and polygons need a compatibility context: in a core one "
            "draw triangles");
    ORU_GL(BindVertexArray, vertexBuffer_);
    ORU_GL(DrawArrays, primitiveType_, 0, static_cast<GLsizei>(count));
    ORU_GL(BindVertexArray, 0);
}

} // namespace ORU::OGL
