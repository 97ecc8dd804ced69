// Buffer textures: a buffer that shaders read as a long row of texels.
#include "oru/oru_ogl/ogl/buffertexture.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/internal/objects/boundobjectscope.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

void RequireSupported() {
    if (!BufferTexture::IsSupported())
        ORU_THROW_INTERNAL("Buffer textures need OpenGL 3.1 or GL_ARB_texture_buffer_object: use a "
                           "texture of another kind");
}

} // namespace

BufferTexture::BufferTexture(InternalFormat format, Buffer const &buffer)
    : Texture(TARGET_TEXTURE_BUFFER, TARGETBINDING_TEXTURE_BINDING_BUFFER, format,
              buffer.size() / SizeInBytes(format, 1, 1, 1), 1, 1) {
    RequireSupported();
    internal::BoundObjectScope bound(*this, ORU_BINDER(BindTexture));
    if (internal::Supports(GL_VERSION_3_1))
        ORU_GL(TexBuffer, target(), InternalFormat2GL(format), buffer.checkedID());
    else
        ORU_GL(TexBufferARB, target(), InternalFormat2GL(format), buffer.checkedID());
    bound.restore();
}

BufferTexture::BufferTexture(unsigned int name, ownership_tag ownership)
    : Texture(TARGET_TEXTURE_BUFFER, TARGETBINDING_TEXTURE_BINDING_BUFFER, name, ownership) {}

BufferTexture::~BufferTexture() = default;

std::uint64_t BufferTexture::MaxTexels() {
    RequireSupported();
    GLint most = 0;
    ORU_GL(GetIntegerv, GL_MAX_TEXTURE_BUFFER_SIZE, &most);
    return static_cast<std::uint64_t>(most);
}

bool BufferTexture::IsSupported() {
    return internal::Supports(GL_VERSION_3_1) || internal::Supports(GL_ARB_TEXTURE_BUFFER_OBJECT);
}

} // namespace ORU::OGL
