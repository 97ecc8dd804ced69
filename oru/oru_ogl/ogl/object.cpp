// The base of the classes that own an OpenGL object.
#include "oru/oru_ogl/ogl/object.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"

#include <utility>

namespace ORU::OGL {

namespace {

constexpr unsigned int kBindingBits = (1u << 30) - 1;

} // namespace

Object::Object(unsigned int target, unsigned int targetBinding)
    : target_(target), targetBinding_(targetBinding & kBindingBits), isBorrowed_(0), isEmpty_(0) {}

Object::Object(unsigned int target, unsigned int targetBinding, unsigned int name,
               ownership_tag ownership)
    : Object(target, targetBinding) {
    if (name == 0)
        ORU_THROW_INTERNAL("The name 0 is no OpenGL object: give one that was made, and is not "
                           "deleted yet");
    objectID_ = name;
    isBorrowed_ = !ownership.isOwner;
}

Object::Object(Object &&other) noexcept
    : objectID_(std::exchange(other.objectID_, 0)), target_(other.target_),
      targetBinding_(other.targetBinding_), isBorrowed_(other.isBorrowed_),
      isEmpty_(other.isEmpty_) {
    other.isEmpty_ = 1;
}

Object &Object::operator=(Object &&other) noexcept {
    if (this == &other)
        return *this;
    objectID_ = std::exchange(other.objectID_, 0);
    target_ = other.target_;
    targetBinding_ = other.targetBinding_;
    isBorrowed_ = other.isBorrowed_;
    isEmpty_ = other.isEmpty_;
    other.isEmpty_ = 1;
    return *this;
}

Object::~Object() = default;

unsigned int Object::disown() {
    requireObject();
    isEmpty_ = 1;
    return std::exchange(objectID_, 0);
}

void Object::ThrowEmpty() {
    ORU_THROW_INTERNAL("This OpenGL object is empty: it was moved from, or has given up its name. "
                       "Use the one it was moved to, or assign a new one to it");
}

unsigned int Object::getBoundID() const {
    requireObject();
    GLint bound = 0;
    ORU_GL(GetIntegerv, targetBinding_, &bound);
    return static_cast<unsigned int>(bound);
}

void Object::changeTarget(unsigned int target, unsigned int targetBinding) {
    target_ = target;
    targetBinding_ = targetBinding & kBindingBits;
}

} // namespace ORU::OGL
