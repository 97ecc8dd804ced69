// What the image transfers of all textures share: checks, bindings and client state.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/platformgl.h"

#include <cstddef>
#include <cstdint>
#include <initializer_list>

namespace ORU::OGL::internal {

/// One side of the part of an image that a transfer writes.
struct Side {
    char const *name;
    char const *padded; ///< the name as it stands within the messages
    std::uint64_t size;
    std::uint64_t limit; ///< the same side of the texture's level 0
};

/// Throws the InternalException of the first rule that a part breaks; see `CheckPart`.
[[noreturn]] ORU_COLD void ThrowPart(char const *operation, int level,
                                     std::initializer_list<Side> sides);

/// @param operation "subimage" or "copySubimage", for the messages
/// @throws InternalException for an empty side, a negative level or a side over its limit
template<class... Sides>
void CheckPart(char const *operation, int level, Sides const &...sides) {
    // An empty side wraps around and so is over its limit, too.
    bool const fits = ((sides.size - 1 < sides.limit) && ...);
    if (!fits || level < 0)
        ThrowPart(operation, level, {sides...});
}

/// @throws InternalException unless a transfer can use the buffer: there is one, and not mapped
void CheckBuffer(Buffer const *buffer);

/// The same for an upload, which must also begin within the buffer.
void CheckUnpackBuffer(Buffer const *buffer, std::uint64_t offset);

/// @throws InternalException for other alignments than 1, 2, 4 or 8 bytes
void CheckByteAlignment(unsigned int bytes);

/// An offset into the bound buffer in the form that the pixel functions take.
inline void *BufferOffset(std::uint64_t offset) {
    return reinterpret_cast<void *>(static_cast<std::uintptr_t>(offset));
}

/// Binds a buffer to its target until `restore()`, or until an exception ends the scope.
class BoundBuffer {
public:
    explicit BoundBuffer(Buffer &buffer) : restore_(Restore{buffer.target(), buffer.getBoundID()}) {
        buffer.bind();
    }
    void restore() { restore_.now(); }

private:
    struct Restore {
        unsigned int target;
        unsigned int previous;
        void operator()() const { ORU_GL(BindBuffer, target, previous); }
    };
    Ending<Restore> restore_;
};

/// Runs an upload with the unpack state that the parameters describe, and puts the state back. When
/// the upload fails, the state stays as the upload had it, on the client attribute stack above what
/// it was before: the caller looks at it, or drops it with glPopClientAttrib.
template<class Upload>
void WithUnpackState(PixelUnpackParameters const &parameters, Upload upload) {
    ORU_GL(PushClientAttrib, GL_CLIENT_PIXEL_STORE_BIT);
    parameters.apply();
    upload();
    ORU_GL0(PopClientAttrib);
}

} // namespace ORU::OGL::internal
