// Sharpening by OpenGL itself.
#pragma once

#include "apps/develop/pass.h"
#include "apps/develop/reusedtexture.h"
#include "apps/develop/sharpener.h"

namespace Develop {

/// Two passes of a fragment shader; needs nothing beside OpenGL.
class GlslSharpener : public Sharpener {
public:
    /// @param reason why not by OpenCL, for people
    explicit GlslSharpener(std::string const &reason);

    ORU::OGL::Texture2D &light(std::size_t width, std::size_t height) override;
    ORU::OGL::Texture2D const &sharpen(std::size_t width, std::size_t height, std::size_t channels,
                                       Sharpening const &sharpening) override;
    std::string description() const override { return "GLSL: " + reason_; }

private:
    std::string reason_;
    CoverPass blurRows_;
    CoverPass sharpenColumns_;
    ReusedTexture light_, rows_, sharpened_;
};

} // namespace Develop
