// The base of the classes that own an OpenGL object.
#include "oru/oru_ogl/ogl/object.h"

#include "oru/oru_ogl/extensionator/glcall.h"

namespace ORU::OGL {

Object::Object(unsigned int target, unsigned int targetBinding)
    : target_(target), targetBinding_(targetBinding) {}

Object::~Object() = default;

unsigned int Object::getBoundID() const {
    GLint bound = 0;
    ORU_GL(GetIntegerv, targetBinding_, &bound);
    return static_cast<unsigned int>(bound);
}

void Object::changeTarget(unsigned int target, unsigned int targetBinding) {
    target_ = target;
    targetBinding_ = targetBinding;
}

} // namespace ORU::OGL
