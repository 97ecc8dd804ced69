// How the pixels of an upload lie in the caller's memory.
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

void PixelUnpackParameters::setAlignment(unsigned int bytes) {
    switch (bytes) {
    case 1:
        alignment_ = ALIGNMENT_1;
        return;
    case 2:
        alignment_ = ALIGNMENT_2;
        return;
    case 4:
        alignment_ = ALIGNMENT_4;
        return;
    case 8:
        alignment_ = ALIGNMENT_8;
        return;
    default: // the check's text is what hosts see, with its slip
        ORU_ASSERT(!"Unsupported aligment in PixelUnpackParameters::setAlignment!");
    }
}

void PixelUnpackParameters::apply() const {
    auto const set = [](GLenum parameter, std::size_t value) {
        ORU_GL(PixelStorei, parameter, static_cast<GLint>(value));
    };
    set(GL_UNPACK_SWAP_BYTES, swapBytes_);
    set(GL_UNPACK_LSB_FIRST, firstLSB_);
    set(GL_UNPACK_ROW_LENGTH, rowLength_);
    set(GL_UNPACK_SKIP_PIXELS, skipPixels_);
    set(GL_UNPACK_SKIP_ROWS, skipRows_);
    if (internal::CurrentRecord(&ExtensionManager::supportsTexture3D)) {
        set(GL_UNPACK_IMAGE_HEIGHT, imageHeight_);
        set(GL_UNPACK_SKIP_IMAGES, skipImages_);
    }
    if (alignment_ > ALIGNMENT_8)
        ORU_THROW_INTERNAL("Enum value not recognized");
    set(GL_UNPACK_ALIGNMENT, std::size_t(1) << alignment_);
}

} // namespace ORU::OGL
