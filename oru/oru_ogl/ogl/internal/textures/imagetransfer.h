// What the image transfers of all textures share: checks, bindings and client state.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/textures/pixelstorage.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/ogl/texture.h"
#include "oru/oru_ogl/platformgl.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <optional>

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

/// Runs an upload with the unpack state that the parameters describe, and puts the state back, or
/// after a failure what PixelStorageScope says.
template<class Upload>
void WithUnpackState(PixelUnpackParameters const &parameters, Upload upload) {
    PixelStorageScope saved(kUnpackStorage);
    parameters.apply();
    upload();
    saved.restore();
}

/// The part of the texture bound to a target that an upload writes.
template<std::size_t Sides>
struct Part {
    GLenum target;
    GLint level;
    std::array<GLint, Sides> first;   ///< texel of the part
    std::array<GLsizei, Sides> sides; ///< texels in each direction
};

/// The call that uploads of so many sides end in. `pixels` is an address, or an offset into the
/// pixel unpack buffer.
template<std::size_t Sides>
using SendPart = void (*)(Part<Sides> const &part, GLenum format, GLenum type, void const *pixels);

/// Whether the current context, which there is, has textures of a format; see
/// Texture::IsFormatSupported.
bool IsFormatSupported(Texture::InternalFormat format);

/// @throws InternalException in a core context for a format that it lacks, and in any for a later
///         format that it lacks
void RequireFormat(Texture::InternalFormat format);

/// @throws InternalException unless the current context filters so
void RequireAnisotropy(float ratio);

/// The slow part of `RequireSameKind`.
void CheckSameKind(Texture::InternalFormat format, Texture::Format pixels);

/// @throws InternalException when texels and pixels are of different kinds and one of them is of a
///         later format: integers on one side only, say
inline void RequireSameKind(Texture::InternalFormat format, Texture::Format pixels) {
    if (format >= Texture::INTERNALFORMAT_R8 || pixels >= Texture::FORMAT_RED_INTEGER)
        CheckSameKind(format, pixels);
}

/// The type of pixels that storage of a format is allocated with.
GLenum StorageType(Texture::InternalFormat format);

/// A format and a type of pixels in memory, as OpenGL takes them.
struct PixelLayout {
    GLenum format;
    GLenum type;
};

/// @throws InternalException for values outside the enumerations, and in a core context for those
///         that it lacks
PixelLayout LayoutOf(Texture::Format format, Texture::Type type);

/// Uploads pixels from memory. Checks the formats only; `CheckPart` comes before it.
template<std::size_t Sides>
void Upload(SendPart<Sides> send, Part<Sides> const &part, Texture::Format format,
            Texture::Type type, void const *data, PixelUnpackParameters const &parameters) {
    PixelLayout const layout = LayoutOf(format, type);
    WithUnpackState(parameters, [&] { send(part, layout.format, layout.type, data); });
}

/// Uploads pixels from a buffer, which becomes a pixel unpack buffer; checks buffer and formats.
template<std::size_t Sides>
void Upload(SendPart<Sides> send, Part<Sides> const &part, Texture::Format format,
            Texture::Type type, Buffer *buffer, std::uint64_t offset,
            PixelUnpackParameters const &parameters) {
    CheckUnpackBuffer(buffer, offset);
    PixelLayout const layout = LayoutOf(format, type);
    if (!buffer->isUnpackBuffer())
        buffer->convertToUnpackBuffer();
    // Hosts that record the calls know 1-D uploads to put the unpack state back first.
    constexpr bool kStateFirst = Sides == 1;
    std::optional<BoundObjectScope> bound;
    WithUnpackState(parameters, [&] {
        bound.emplace(*buffer, ORU_BINDER(BindBuffer));
        send(part, layout.format, layout.type, BufferOffset(offset));
        if (!kStateFirst)
            bound->restore();
    });
    if (kStateFirst)
        bound->restore();
}

/// Runs a download into rows of an alignment in bytes, which is checked, and puts the state back,
/// or after a failure what PixelStorageScope says.
template<class Download>
void WithPackAlignment(unsigned int bytes, Download download) {
    CheckByteAlignment(bytes);
    PixelStorageScope saved(kPackAlignment);
    ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, static_cast<GLint>(bytes));
    download();
    saved.restore();
}

/// The same for what leaves nothing behind: the state is put back also after a failure.
template<class Download>
void KeepingPackAlignment(unsigned int bytes, Download download) {
    CheckByteAlignment(bytes);
    PixelStorageScope saved(kPackAlignment);
    Ending restore([&saved] { saved.restore(); });
    ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, static_cast<GLint>(bytes));
    download();
    restore.now();
}

/// Makes a buffer one that can be bound for `ReadInto`.
inline void BecomePackBuffer(Buffer &buffer) {
    if (!buffer.isPackBuffer())
        buffer.convertToPackBuffer();
}

/// Runs `read(pixels)` with a pixel pack buffer bound, in which `pixels` is the offset.
template<class Read>
void ReadInto(Buffer const &buffer, std::uint64_t offset, Read read) {
    BoundObjectScope bound(buffer, ORU_BINDER(BindBuffer));
    read(BufferOffset(offset));
    bound.restore();
}

} // namespace ORU::OGL::internal
