// Textures that are used again and again.
#pragma once

#include "oru/oru_ogl/ogl/texture2.h"

#include <algorithm>
#include <cstddef>
#include <memory>

namespace Develop {

/// A texture that is made anew only when more is needed, or another format.
class ReusedTexture {
public:
    /// A texture of at least this size, with any content, not bound.
    ORU::OGL::Texture2D &reserve(ORU::OGL::Texture::InternalFormat format, std::size_t width,
                                 std::size_t height) {
        if (texture_ && format_ == format) {
            if (texture_->width(0) >= width && texture_->height(0) >= height)
                return *texture_;
            // For both, unless that is much more than what either takes.
            std::size_t const wide = std::max<std::size_t>(width, texture_->width(0));
            std::size_t const high = std::max<std::size_t>(height, texture_->height(0));
            if (wide * high <= 2 * width * height) {
                width = wide;
                height = high;
            }
        }
        texture_.reset(); // first, that both are not there at once
        texture_ = std::make_unique<ORU::OGL::Texture2D>(format, width, height, false);
        format_ = format;
        return *texture_;
    }

    ORU::OGL::Texture2D &get() { return *texture_; }

private:
    std::unique_ptr<ORU::OGL::Texture2D> texture_;
    ORU::OGL::Texture::InternalFormat format_ = ORU::OGL::Texture::INTERNALFORMAT_RGBA8;
};

} // namespace Develop
