// The kinds of textures as rows of a table, so that one test covers them all.
#pragma once

#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"

#include <algorithm>
#include <array>
#include <memory>
#include <vector>

namespace oru_test {

using namespace ORU::OGL;

/// Width, height (or layers), depth (or layers); the sides a kind lacks are 1.
using Sides = std::array<int, 3>;

/// A part of a level.
struct Box {
    Sides at;
    Sides size;
};

/// A pixel in memory.
struct Pixel {
    Texture::Format format;
    Texture::Type type;
};

PixelUnpackParameters const kTight;

struct TextureKind {
    char const *name;
    GLenum target;
    GLenum binding;
    std::size_t sides;
    std::size_t layers; ///< the side that counts layers, 3 for none
    std::unique_ptr<Texture> (*make)(Texture::InternalFormat format, Sides const &size,
                                     bool mipmapped);

    bool mipmaps() const { return target != GL_TEXTURE_RECTANGLE; }

    /// Makes the sides 1 that the kind lacks.
    Sides cut(Sides size) const {
        std::fill(size.begin() + static_cast<int>(sides), size.end(), 1);
        return size;
    }

    /// The size of the level below.
    Sides halved(Sides size) const {
        for (std::size_t side = 0; side < sides; ++side)
            size[side] = side == layers ? size[side] : std::max(1, size[side] / 2);
        return size;
    }
};

inline std::uint64_t Size(int side) {
    return static_cast<std::uint64_t>(side);
}

#define ORU_KIND(Class, gl, sides, layers, ...)                                                    \
    {                                                                                              \
#Class, GL_TEXTURE_##gl, GL_TEXTURE_BINDING_##gl, sides, layers,                           \
            [](Texture::InternalFormat format, Sides const &size,                                  \
               [[maybe_unused]] bool mipmapped) -> std::unique_ptr < Texture>                      \
        { return std::make_unique<Class>(format, __VA_ARGS__); }                                   \
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

/// A texture that is bound while it lives.
struct BoundTexture {
    std::unique_ptr<Texture> const texture;

    explicit BoundTexture(std::unique_ptr<Texture> t) : texture(std::move(t)) { bind(); }
    ~BoundTexture() { ORU_GL(BindTexture, texture->target(), 0u); }
    void bind() const { ORU_GL(BindTexture, texture->target(), texture->objectID()); }
    Texture &operator*() const { return *texture; }
    Texture *operator->() const { return texture.get(); }
};

/// Filters and wrap modes of the texture bound to a target, as many of these as it has sides.
inline std::vector<GLint> Sampling(GLenum target, std::size_t sides) {
    GLenum const names[] = {GL_TEXTURE_MIN_FILTER, GL_TEXTURE_MAG_FILTER, GL_TEXTURE_WRAP_S,
                            GL_TEXTURE_WRAP_T, GL_TEXTURE_WRAP_R};
    std::vector<GLint> values(2 + sides);
    for (std::size_t i = 0; i < values.size(); ++i)
        ORU_GL(GetTexParameteriv, target, names[i], &values[i]);
    return values;
}

/// `subImage` of whichever class, from memory or (with an offset behind it) from a buffer.
template<class... Source>
void Upload(Texture &texture, int level, Box const &box, Pixel pixel,
            PixelUnpackParameters const &params, Source... source) {
    auto const [x, y, z] = box.at;
    auto const [format, type] = pixel;
    std::uint64_t const w = Size(box.size[0]), h = Size(box.size[1]), d = Size(box.size[2]);
    if (auto *const one = dynamic_cast<Texture1 *>(&texture))
        one->subImage(level, x, w, format, type, source..., params);
    else if (auto *const two = dynamic_cast<Texture2 *>(&texture))
        two->subImage(level, x, y, w, h, format, type, source..., params);
    else
        dynamic_cast<Texture3 &>(texture).subImage(level, x, y, z, w, h, d, format, type, source...,
                                                   params);
}

/// `copyTexSubImage` of whichever class, from (1, 3) in the framebuffer.
inline void Copy(Texture &texture, int level, Sides const &at, std::uint64_t w, std::uint64_t h) {
    auto const [x, y, z] = at;
    if (auto *const one = dynamic_cast<Texture1 *>(&texture))
        one->copyTexSubImage(level, x, 1, 3, w);
    else if (auto *const two = dynamic_cast<Texture2 *>(&texture))
        two->copyTexSubImage(level, x, y, 1, 3, w, h);
    else
        dynamic_cast<Texture3 &>(texture).copyTexSubImage(level, x, y, z, 1, 3, w, h);
}

/// `getPixelData` of whichever class, into memory or (with an offset behind it) into a buffer.
template<class... Offset, class Destination>
void Download(Texture const &texture, int level, Pixel pixel, unsigned int alignment,
              Destination *destination, Offset... offset) {
    auto const [format, type] = pixel;
    if (auto *const one = dynamic_cast<Texture1 const *>(&texture)) {
        ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, static_cast<GLint>(alignment));
        one->getPixelData(destination, offset..., level, Texture::Format2GL(format),
                          Texture::Type2GL(type));
    } else if (auto *const two = dynamic_cast<Texture2 const *>(&texture)) {
        two->getPixelData(destination, static_cast<std::size_t>(offset)..., level, format, type,
                          alignment);
    } else {
        dynamic_cast<Texture3 const &>(texture).getPixelData(destination, offset..., level, format,
                                                             type, alignment);
    }
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

    /// Runs `visit(x, y, z)` for every texel of an image of a size.
    template<class Visit>
    static void ForEach(Sides const &size, Visit visit) {
        for (int z = 0; z < size[2]; ++z)
            for (int y = 0; y < size[1]; ++y)
                for (int x = 0; x < size[0]; ++x)
                    visit(x, y, z);
    }

    void upload(Texture &texture, Pixel pixel, int level = 0, Sides const &at = {}) const {
        void const *const data = texels.data();
        Upload(texture, level, {at, size}, pixel, kTight, data);
    }

    /// A level of a texture, in an image of the same size and components.
    std::vector<T> read(Texture const &texture, Pixel pixel, int level = 0) const {
        std::vector<T> result(texels.size());
        Download(texture, level, pixel, 1, static_cast<void *>(result.data()));
        return result;
    }
};

} // namespace oru_test
