// Sharpening by OpenGL itself.
#pragma once

#include "apps/develop/pass.h"
#include "apps/develop/sharpener.h"

namespace Develop {

/// Two passes of a fragment shader; needs nothing beside OpenGL.
class GlslSharpener : public Sharpener {
public:
    /// @param reason why not by OpenCL, for people
    explicit GlslSharpener(std::string const &reason);

    void sharpen(std::unique_ptr<ORU::OGL::Texture2D> &light, std::size_t channels,
                 Sharpening const &sharpening) override;
    std::string description() const override { return "GLSL: " + reason_; }

private:
    std::string reason_;
    CoverPass blurRows_;
    CoverPass sharpenColumns_;
};

} // namespace Develop
