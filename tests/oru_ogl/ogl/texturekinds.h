// The kinds of textures as rows of a table, so that one test covers them all.
#pragma once

#include "objecttest.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"

#include <array>
#include <memory>
#include <vector>

namespace oru_test {

/// Width, height (or layers), depth (or layers); the sides a kind lacks are 1.
using Sides = std::array<int, 3>;

/// A part of a level.
struct Box {
    Sides at;
    Sides size;
};

struct TextureKind {
    char const *name;
    GLenum target;
    GLenum binding;
    std::size_t sides;
    std::size_t layers; ///< the side that counts layers, 3 for none
    bool mipmaps;
    std::unique_ptr<ORU::OGL::Texture> (*make)(ORU::OGL::Texture::InternalFormat format,
                                               Sides const &size, bool mipmapped);

    /// Makes the sides 1 that the kind lacks.
    Sides cut(Sides size) const {
        for (std::size_t i = sides; i < size.size(); ++i)
            size[i] = 1;
        return size;
    }
};

inline std::uint64_t Size(int side) {
    return static_cast<std::uint64_t>(side);
}

#define ORU_KIND(Class, gl, sides, layers, ...)                                                    \
    {                                                                                              \
#Class, GL_TEXTURE_##gl, GL_TEXTURE_BINDING_##gl, sides, layers,                           \
            GL_TEXTURE_##gl != GL_TEXTURE_RECTANGLE,                                               \
            [](ORU::OGL::Texture::InternalFormat format, Sides const &size,                        \
               [[maybe_unused]] bool mipmapped) -> std::unique_ptr < ORU::OGL::Texture>            \
        { return std::make_unique<ORU::OGL::Class>(format, __VA_ARGS__); }                         \
    }
inline TextureKind const kTextureKinds[] = {
    ORU_KIND(Texture1D, 1D, 1, 3, Size(size[0]), mipmapped),
    ORU_KIND(Texture2D, 2D, 2, 3, Size(size[0]), Size(size[1]), mipmapped),
    ORU_KIND(TextureRECT, RECTANGLE, 2, 3, Size(size[0]), Size(size[1])),
    ORU_KIND(Texture1DArray, 1D_ARRAY, 2, 1, Size(size[0]), Size(size[1]), mipmapped),
    ORU_KIND(Texture3D, 3D, 3, 3, Size(size[0]), Size(size[1]), Size(size[2]), mipmapped),
    ORU_KIND(Texture2DArray, 2D_ARRAY, 3, 2, Size(size[0]), Size(size[1]), Size(size[2]),
             mipmapped),
};
#undef ORU_KIND

/// `subImage` of whichever class, from memory or (with an offset behind it) from a buffer.
template<class... Source>
void Upload(ORU::OGL::Texture &texture, int level, Box const &box, ORU::OGL::Texture::Format format,
            ORU::OGL::Texture::Type type, ORU::OGL::PixelUnpackParameters const &params,
            Source... source) {
    using namespace ORU::OGL;
    auto const [x, y, z] = box.at;
    std::uint64_t const w = Size(box.size[0]), h = Size(box.size[1]), d = Size(box.size[2]);
    if (auto *const one = dynamic_cast<Texture1 *>(&texture))
        one->subImage(level, x, w, format, type, source..., params);
    else if (auto *const two = dynamic_cast<Texture2 *>(&texture))
        two->subImage(level, x, y, w, h, format, type, source..., params);
    else
        dynamic_cast<Texture3 &>(texture).subImage(level, x, y, z, w, h, d, format, type, source...,
                                                   params);
}

/// `getPixelData` into memory of whichever class.
inline void Download(ORU::OGL::Texture const &texture, void *dst, int level,
                     ORU::OGL::Texture::Format format, ORU::OGL::Texture::Type type,
                     unsigned int alignment) {
    using namespace ORU::OGL;
    if (auto *const one = dynamic_cast<Texture1 const *>(&texture)) {
        ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, static_cast<GLint>(alignment));
        one->getPixelData(dst, level, Texture::Format2GL(format), Texture::Type2GL(type));
    } else if (auto *const two = dynamic_cast<Texture2 const *>(&texture)) {
        two->getPixelData(dst, level, format, type, alignment);
    } else {
        dynamic_cast<Texture3 const &>(texture).getPixelData(dst, level, format, type, alignment);
    }
}

/// The same into a buffer.
inline void Download(ORU::OGL::Texture const &texture, ORU::OGL::Buffer &buffer, int offset,
                     int level, ORU::OGL::Texture::Format format, ORU::OGL::Texture::Type type) {
    using namespace ORU::OGL;
    if (auto *const one = dynamic_cast<Texture1 const *>(&texture))
        one->getPixelData(&buffer, offset, level, Texture::Format2GL(format),
                          Texture::Type2GL(type));
    else if (auto *const two = dynamic_cast<Texture2 const *>(&texture))
        two->getPixelData(&buffer, static_cast<std::size_t>(offset), level, format, type, 1);
    else
        dynamic_cast<Texture3 const &>(texture).getPixelData(&buffer, offset, level, format, type,
                                                             1);
}

inline std::size_t PixelDataSize(ORU::OGL::Texture const &texture, ORU::OGL::Texture::Format format,
                                 ORU::OGL::Texture::Type type) {
    using namespace ORU::OGL;
    if (auto *const one = dynamic_cast<Texture1 const *>(&texture))
        return one->pixelDataSize(3, format, type);
    if (auto *const two = dynamic_cast<Texture2 const *>(&texture))
        return two->pixelDataSize(3, format, type);
    return dynamic_cast<Texture3 const &>(texture).pixelDataSize(3, format, type);
}

inline void Bind(ORU::OGL::Texture const &texture) {
    ORU_GL(BindTexture, texture.target(), texture.objectID());
}

inline void Unbind(ORU::OGL::Texture const &texture) {
    ORU_GL(BindTexture, texture.target(), 0);
}

/// The texels of an image, a few components each, x fastest.
template<class T>
struct Image {
    Sides size;
    std::size_t channels;
    std::vector<T> texels;

    Image(Sides const &s, std::size_t c, T value = T())
        : size(s), channels(c), texels(Size(s[0]) * Size(s[1]) * Size(s[2]) * c, value) {}

    T *at(int x, int y, int z) {
        return &texels[(Size(z) * Size(size[1]) + Size(y)) * Size(size[0]) * channels +
                       Size(x) * channels];
    }

    /// Runs `visit(x, y, z)` for every texel of a box.
    template<class Visit>
    static void ForEach(Box const &box, Visit visit) {
        for (int z = box.at[2]; z < box.at[2] + box.size[2]; ++z)
            for (int y = box.at[1]; y < box.at[1] + box.size[1]; ++y)
                for (int x = box.at[0]; x < box.at[0] + box.size[0]; ++x)
                    visit(x, y, z);
    }

    /// Writes another image at a place of this one.
    void paste(Sides const &at, Image &part) {
        ForEach({{0, 0, 0}, part.size}, [&](int x, int y, int z) {
            std::copy_n(part.at(x, y, z), channels, this->at(at[0] + x, at[1] + y, at[2] + z));
        });
    }
};

} // namespace oru_test
