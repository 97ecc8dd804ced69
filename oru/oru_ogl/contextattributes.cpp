// What a new rendering context is asked for besides its pixel format.
#include "oru/oru_ogl/contextattributes.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"

namespace ORU::OGL {

ContextAttributes &ContextAttributes::setVersion(unsigned int major, unsigned int minor) {
    if (major > 15 || minor > 15)
        ORU_THROW_INTERNAL("ContextAttributes::setVersion takes numbers up to 15, not ", major,
                           " and ", minor);
    major_ = static_cast<unsigned short>(major & 15);
    minor_ = static_cast<unsigned short>(minor & 15);
    return *this;
}

} // namespace ORU::OGL
