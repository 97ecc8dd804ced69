// Transfers of pixels that know how much memory they have.
#pragma once

#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/objects/pendingerror.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/bands.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/ogl/pixelview.h"

namespace ORU::OGL::internal {

/// @throws InternalException for pixels of more sides than a texture has
void CheckSides(PixelShape const &pixels, std::size_t sides);

/// Checks pixels that receive a whole level of a texture.
/// @param image the target, or the face of a cube map
/// @throws InternalException unless the pixels have the level's sides and kind; also for a texture
///         that is not bound and for a negative level
void CheckLevel(Texture const &texture, GLenum image, PixelShape const &pixels, int level);

/// Runs a read-back into rows and images that lie as the shape says, and puts the state back, also
/// after a failure.
template<class Read>
void WithPackState(PixelShape const &pixels, Read read) {
    ReportPendingError(__FILE__, __LINE__, "glPushClientAttrib");
    PixelStorageScope saved(kPackStorage);
    Ending restore([&saved] { saved.restore(); });
    auto const set = [](GLenum parameter, std::uint64_t value) {
        ORU_GL(PixelStorei, parameter, static_cast<GLint>(value));
    };
    set(GL_PACK_SWAP_BYTES, 0);
    set(GL_PACK_LSB_FIRST, 0);
    set(GL_PACK_ROW_LENGTH, pixels.rowLength);
    set(GL_PACK_SKIP_PIXELS, 0);
    set(GL_PACK_SKIP_ROWS, 0);
    // Also for one image: the host's values count for every texture of three sides, and drivers
    // take the layers of a 1-D array for images.
    if (CurrentRecord(&ExtensionManager::supportsTexture3D)) {
        set(GL_PACK_IMAGE_HEIGHT, pixels.depth > 1 ? pixels.imageHeight : 0);
        set(GL_PACK_SKIP_IMAGES, 0);
    }
    set(GL_PACK_ALIGNMENT, pixels.alignment);
    read();
    restore.now();
}

/// Runs an upload with the unpack state that the parameters describe, and puts the state back, also
/// after a failure.
template<class Send>
void KeepingUnpackState(PixelUnpackParameters const &parameters, Send send) {
    ReportPendingError(__FILE__, __LINE__, "glPushClientAttrib");
    PixelStorageScope saved(kUnpackStorage);
    Ending restore([&saved] { saved.restore(); });
    parameters.apply();
    send();
    restore.now();
}

/// Uploads pixels, and puts the state back, also after a failure. `CheckPart` comes before it.
/// @param format of the texture
/// @param pixels null for those that the pixel unpack buffer begins with, which go in bands
template<std::size_t Sides>
void Upload(SendPart<Sides> send, Part<Sides> const &part, Texture::InternalFormat format,
            PixelShape const &shape, void const *pixels) {
    CheckSides(shape, Sides);
    RequireSameKind(format, shape.format);
    PixelLayout const layout = LayoutOf(shape.format, shape.type);
    KeepingUnpackState(shape.unpackParameters(), [&] {
        if (pixels || Sides == 1)
            return send(part, layout.format, layout.type, pixels);
        std::uint64_t const unit = Sides == 2 ? shape.rowBytes() : shape.imageBytes();
        ForEachBand(static_cast<std::uint64_t>(part.sides[Sides - 1]), unit,
                    [&](std::uint64_t first, std::uint64_t count) {
                        Part<Sides> band = part;
                        band.first[Sides - 1] += static_cast<GLint>(first);
                        band.sides[Sides - 1] = static_cast<GLsizei>(count);
                        send(band, layout.format, layout.type, BufferOffset(first * unit));
                    });
    });
}

/// Reads the compressed blocks of a level of the texture bound to a target.
/// @param image the target, or the face of a cube map
/// @param pixels an address, or an offset into the pixel pack buffer
/// @throws InternalException unless OpenGL has as many bytes there
void ReadBlocks(GLenum image, int level, void *pixels, std::size_t bytes);

/// Reads a level of the texture bound to a target, which `CheckLevel` has seen.
/// @param image the target, or the face of a cube map
/// @param pixels an address, or an offset into the pixel pack buffer
void ReadLevel(GLenum image, int level, PixelShape const &shape, void *pixels);

} // namespace ORU::OGL::internal
