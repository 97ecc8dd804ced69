// The exposure that spots add to each pixel, as a texture.
#pragma once

#include "apps/develop/pass.h"
#include "apps/develop/spots.h"

#include "oru/core/utility/integerrect.h"
#include "oru/oru_ogl/ogl/texture2.h"

#include <memory>

namespace Develop {

/// Draws each spot as a square around it and lets blending add them up, so that the work is that of
/// the squares, however many spots there are.
class SpotPainter {
public:
    SpotPainter();

    /// Makes a texture of the stops that spots add to the pixels of an area of the picture; null
    /// when none of them changes anything.
    std::unique_ptr<ORU::OGL::Texture2D> paint(std::vector<Spot> const &spots,
                                               ORU::IntegerRect const &area);

private:
    Pass pass_;
};

} // namespace Develop
