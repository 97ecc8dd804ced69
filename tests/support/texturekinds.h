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
#include <type_traits>
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

auto const kRGBA8 = Texture::INTERNALFORMAT_RGBA8;
Pixel const kBytes{Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE};
PixelUnpackParameters const kTight;

struct TextureKind {
    char const *name;
    GLenum target;
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

template<class Kind, std::size_t... Side>
std::unique_ptr<Texture> Make(Texture::InternalFormat format, Sides const &size, bool mipmapped) {
    if constexpr (std::is_same_v<Kind, TextureRECT>)
        return std::make_unique<Kind>(format, Size(size[Side])...);
    else
        return std::make_unique<Kind>(format, Size(size[Side])..., mipmapped);
}

inline TextureKind const kTextureKinds[] = {
    {"Texture1D", GL_TEXTURE_1D, 1, 3, Make<Texture1D, 0>},
    {"Texture2D", GL_TEXTURE_2D, 2, 3, Make<Texture2D, 0, 1>},
    {"TextureRECT", GL_TEXTURE_RECTANGLE, 2, 3, Make<TextureRECT, 0, 1>},
    {"Texture1DArray", GL_TEXTURE_1D_ARRAY, 2, 1, Make<Texture1DArray, 0, 1>},
    {"Texture3D", GL_TEXTURE_3D, 3, 3, Make<Texture3D, 0, 1, 2>},
    {"Texture2DArray", GL_TEXTURE_2D_ARRAY, 3, 2, Make<Texture2DArray, 0, 1, 2>},
};

/// A texture that is bound while it lives.
struct BoundTexture {
    std::unique_ptr<Texture> const texture;

    explicit BoundTexture(std::unique_ptr<Texture> t) : texture(std::move(t)) { bind(); }
    ~BoundTexture() { ORU_GL(BindTexture, texture->target(), 0u); }
    void bind() const { ORU_GL(BindTexture, texture->target(), texture->objectID()); }
    Texture &operator*() const { return *texture; }
    Texture *operator->() const { return texture.get(); }
};

/// Filters of the texture bound to a target, and a wrap mode for each side.
inline std::vector<GLint> Sampling(GLenum target, std::size_t sides) {
    GLenum const names[] = {GL_TEXTURE_MIN_FILTER, GL_TEXTURE_MAG_FILTER, GL_TEXTURE_WRAP_S,
                            GL_TEXTURE_WRAP_T, GL_TEXTURE_WRAP_R};
    std::vector<GLint> values(2 + sides);
    for (std::size_t i = 0; i < values.size(); ++i)
        ORU_GL(GetTexParameteriv, target, names[i], &values[i]);
    return values;
}

/// Calls `call` with a texture as the class that it is, and with the numbers of its sides.
template<class Call>
void AsItsClass(Texture &texture, Call call) {
    if (auto *const one = dynamic_cast<Texture1 *>(&texture))
        call(*one, 0u);
    else if (auto *const two = dynamic_cast<Texture2 *>(&texture))
        call(*two, 0u, 1u);
    else
        call(dynamic_cast<Texture3 &>(texture), 0u, 1u, 2u);
}

/// `subImage` from memory, or (with an offset behind it) from a buffer.
template<class... Source>
void Upload(Texture &texture, int level, Box const &box, Pixel pixel,
            PixelUnpackParameters const &params, Source... source) {
    AsItsClass(texture, [&](auto &as, auto... side) {
        as.subImage(level, box.at[side]..., Size(box.size[side])..., pixel.format, pixel.type,
                    source..., params);
    });
}

/// `copyTexSubImage` from (1, 3) in the framebuffer.
inline void Copy(Texture &texture, int level, Sides const &at, std::uint64_t w, std::uint64_t h) {
    AsItsClass(texture, [&](auto &as, auto... side) {
        if constexpr (sizeof...(side) == 1)
            as.copyTexSubImage(level, at[side]..., 1, 3, w);
        else
            as.copyTexSubImage(level, at[side]..., 1, 3, w, h);
    });
}

/// `getPixelData` into memory, or (with an offset behind it) into a buffer.
template<class Destination, class... Offset>
void Download(Texture &texture, int level, Pixel pixel, unsigned int alignment,
              Destination *destination, Offset... offset) {
    AsItsClass(texture, [&](auto &as, auto... side) {
        if constexpr (sizeof...(side) > 1) {
            as.getPixelData(destination, offset..., level, pixel.format, pixel.type, alignment);
        } else {
            ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, static_cast<GLint>(alignment));
            as.getPixelData(destination, offset..., level, Texture::Format2GL(pixel.format),
                            Texture::Type2GL(pixel.type));
        }
    });
}

/// The texels of an image, a few components each, x fastest.
template<class T>
struct Image {
    Sides size;
    std::size_t channels;
    std::vector<T> texels;

    Image(Sides const &s, std::size_t c, T value = T())
        : size(s), channels(c), texels(Size(s[0]) * Size(s[1]) * Size(s[2]) * c, value) {}

    /// Where a texel begins.
    std::size_t index(int x, int y, int z) const {
        return ((Size(z) * Size(size[1]) + Size(y)) * Size(size[0]) + Size(x)) * channels;
    }

    /// Takes a part of another image, from a corner on.
    void paste(Image const &from, Box const &to, Sides const &corner = {}) {
        for (int z = 0; z < to.size[2]; ++z)
            for (int y = 0; y < to.size[1]; ++y)
                std::copy_n(&from.texels[from.index(corner[0], corner[1] + y, corner[2] + z)],
                            Size(to.size[0]) * channels,
                            &texels[index(to.at[0], to.at[1] + y, to.at[2] + z)]);
    }

    void upload(Texture &texture, Pixel pixel, int level = 0) const {
        void const *const data = texels.data();
        Upload(texture, level, {{}, size}, pixel, kTight, data);
    }

    /// A level of a texture, in an image of the same size and components.
    std::vector<T> read(Texture &texture, Pixel pixel, int level = 0) const {
        std::vector<T> result(texels.size());
        Download(texture, level, pixel, 1, static_cast<void *>(result.data()));
        return result;
    }
};

} // namespace oru_test
