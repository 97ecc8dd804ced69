// The exposure that spots add to each pixel, as a texture.
#pragma once

#include "apps/develop/pass.h"
#include "apps/develop/reusedtexture.h"
#include "apps/develop/spots.h"

#include "oru/core/utility/integerrect.h"

#include <vector>

namespace Develop {

/// Draws each spot as a square around it and lets blending add them up, so that the work is that of
/// the squares, however many spots there are.
class SpotPainter {
public:
    SpotPainter();

    /// Paints the stops that spots add to the pixels of an area of the picture into the beginning
    /// of a texture, which the next call changes; null when none of them changes anything.
    ORU::OGL::Texture2D const *paint(std::vector<Spot> const &spots, ORU::IntegerRect const &area);

private:
    Pass pass_;
    ReusedTexture stops_;
};

} // namespace Develop
