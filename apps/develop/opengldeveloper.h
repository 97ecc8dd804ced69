// Developing by OpenGL.
#pragma once

#include "apps/develop/developer.h"
#include "apps/develop/pass.h"
#include "apps/develop/reusedtexture.h"
#include "apps/develop/shaders.h"
#include "apps/develop/sharpener.h"
#include "apps/develop/spotpainter.h"

#include "oru/oru_ogl/ogl/framebuffer.h"

#include <map>
#include <memory>

namespace Develop {

/// Passes of shaders, on the context that was current when it was made.
class OpenGLDeveloper : public Developer {
public:
    /// @param sharpener how to sharpen; null when no recipe will ask for it
    explicit OpenGLDeveloper(std::unique_ptr<Sharpener> sharpener);

    std::string description() const override;
    std::size_t sizeLimit() const override;
    void begin(Task const &task) override;
    void develop(Band const &photo, Tile const &tile, Band &developed) override;

private:
    CoverPass &pass(Steps steps);
    void setCurves(ORU::OGL::Program &program) const;
    void upload(Band const &photo, Tile const &tile);
    ORU::OGL::Texture2D const *sharpen(Tile const &tile);
    void encode(Tile const &tile, ORU::OGL::Texture2D const *light);
    void readBack(Tile const &tile, Band &developed);

    std::unique_ptr<Sharpener> sharpener_;
    std::map<Steps, CoverPass> passes_;
    SpotPainter spotPainter_;
    ORU::OGL::Framebuffer framebuffer_; ///< to read back from

    Task const *task_ = nullptr;
    ReusedTexture lights_, index_, thresholds_; ///< of the picture
    ReusedTexture photo_, developed_;
};

} // namespace Develop
