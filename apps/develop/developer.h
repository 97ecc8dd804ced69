// The stages of developing a picture on the GPU.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/areas.h"
#include "apps/develop/colourspace.h"
#include "apps/develop/pass.h"
#include "apps/develop/sharpener.h"
#include "apps/develop/spotpainter.h"

#include "oru/oru_ogl/ogl/texture2.h"

#include <memory>
#include <optional>
#include <vector>

namespace Develop {

/// What is done to a picture.
struct Recipe {
    double exposure = 0; ///< stops
    Sharpening sharpening;
    std::vector<Spot> spots;
    std::optional<ColourSpace> convertTo; ///< another colour space than the photo's own
    int quality = 90;                     ///< of JPEG files, 1 to 100
};

/// Takes a picture, or the part of it that is to be developed, through the stages, one after the
/// other:
///
///     developer.upload(photo, WholePicture(photo));
///     developer.sharpen(recipe);
///     developer.develop(recipe);
///     Image const result = developer.readBack();
///
/// The GPU may still be at work when a stage returns. Works on the context that was current when it
/// was made.
class Developer {
public:
    /// @param sharpener how to sharpen; null when no recipe will ask for it
    explicit Developer(std::unique_ptr<Sharpener> sharpener);

    /// Takes the source area of a picture to the GPU.
    /// @param areas not empty, within the picture
    void upload(App::Image const &photo, Areas const &areas);

    /// Decodes to linear light and sharpens, if the recipe asks for it.
    void sharpen(Recipe const &recipe);

    /// Computes the developed pixels of the target area.
    void develop(Recipe const &recipe);

    /// The developed target area, of the same kind as the picture.
    App::Image readBack();

private:
    std::unique_ptr<Sharpener> sharpener_;
    CoverPass decode_;
    CoverPass encode_;
    CoverPass decodeAndEncode_;
    SpotPainter spotPainter_;

    App::Shape shape_; ///< of the target area
    Areas areas_;
    std::unique_ptr<ORU::OGL::Texture2D> photo_;
    std::unique_ptr<ORU::OGL::Texture2D> light_; ///< sharpened; null without sharpening
    std::unique_ptr<ORU::OGL::Texture2D> developed_;
};

} // namespace Develop
