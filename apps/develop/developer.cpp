// The stages of developing a picture on the GPU.
#include "apps/develop/developer.h"

#include "apps/develop/pixelformat.h"
#include "apps/develop/shaders.h"

#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/textureunit.h"

#include <algorithm>
#include <cmath>

namespace Develop {

using namespace ORU::OGL;

namespace {

// Beyond this many stops every stored value is black or white, and floats would overflow.
constexpr double cMaxStops = 100;

float Gain(double stops) {
    return static_cast<float>(std::exp2(std::clamp(stops, -cMaxStops, cMaxStops)));
}

/// A 2-D texture bound to the active unit for a scope.
class Bound {
public:
    explicit Bound(Texture2D const &texture) { TextureUnit::Unit(0)->bind(&texture); }
    ~Bound() { TextureUnit::Unit(0)->bind2DDefault(); }
    Bound(Bound const &) = delete;
    Bound &operator=(Bound const &) = delete;
};

} // namespace

Developer::Developer() : pass_(cDevelopShader) {}

void Developer::upload(App::Image const &photo) {
    shape_ = photo;
    PixelFormat const format = PixelFormat::Of(shape_);
    photo_ = std::make_unique<Texture2D>(format.storage, shape_.width, shape_.height, false);
    developed_ = std::make_unique<Texture2D>(format.storage, shape_.width, shape_.height, false);
    Bound const bound(*photo_);
    photo_->subImage(0, 0, 0, shape_.width, shape_.height, format.layout, format.type,
                     photo.pixels.data(), PixelUnpackParameters());
}

void Developer::develop(Recipe const &recipe) {
    Program &program = pass_.program();
    ProgramEnabledScope const enabled(&program);
    program.setUniform("gain", Gain(recipe.exposure));
    program.setUniform("levels", shape_.bitsPerChannel == 16 ? 65535.0f : 255.0f);
    float const ifColour = shape_.channels >= 3 ? 1.0f : 0.0f; // green may be grey's alpha
    program.setUniform("colours", 1.0f, ifColour, ifColour, 0.0f);
    Bound const bound(*photo_);
    pass_.draw(*developed_);
}

App::Image Developer::readBack() {
    App::Image developed(shape_);
    PixelFormat const format = PixelFormat::Of(shape_);
    Bound const bound(*developed_);
    developed_->getPixelData(developed.pixels.data(), 0, format.layout, format.type, 1);
    return developed;
}

} // namespace Develop
