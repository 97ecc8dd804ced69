// The stages of developing a picture on the GPU.
#include "apps/develop/developer.h"

#include "apps/develop/boundtexture.h"
#include "apps/develop/gaussian.h"
#include "apps/develop/pixelformat.h"
#include "apps/develop/shaders.h"

#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"

#include <array>
#include <cmath>

namespace Develop {

using namespace ORU::OGL;
using ORU::IntegerRect;

namespace {

std::unique_ptr<Texture2D> MakeTexture(PixelFormat const &format, IntegerRect const &area) {
    return std::make_unique<Texture2D>(format.storage, area.width(), area.height(), false);
}

/// The part of a picture that a result depends on.
IntegerRect SourceOf(IntegerRect const &area, Recipe const &recipe, IntegerRect const &frame) {
    if (!recipe.sharpening.isOn())
        return area;
    auto const corner = [](int first, std::size_t size) {
        return static_cast<float>(first) + static_cast<float>(size);
    };
    ORU::BoundingRegion const region(
        {static_cast<float>(area.offset().x), static_cast<float>(area.offset().y)},
        {corner(area.offset().x, area.width()), corner(area.offset().y, area.height())});
    return PixelsAround(region, GaussianReach(recipe.sharpening.sigma), frame);
}

void SetOffset(Program &program, IntegerRect const &target, IntegerRect const &source) {
    std::array<int, 2> const offset = {target.offset().x - source.offset().x,
                                       target.offset().y - source.offset().y};
    program.setUniform2("offset", 1, offset.data());
}

} // namespace

Developer::Developer(std::unique_ptr<Sharpener> sharpener)
    : sharpener_(std::move(sharpener)), decode_(DevelopShader(Steps::Decode)),
      encode_(DevelopShader(Steps::Encode)),
      decodeAndEncode_(DevelopShader(Steps::DecodeAndEncode)) {}

void Developer::upload(App::Image const &photo, IntegerRect const &area, Recipe const &recipe) {
    shape_ = photo;
    shape_.width = area.width();
    shape_.height = area.height();
    area_ = area;
    source_ = SourceOf(area, recipe, Frame(photo.width, photo.height));

    PixelFormat const format = PixelFormat::Of(photo);
    photo_ = MakeTexture(format, source_);
    light_.reset();
    developed_ = MakeTexture(format, area_);

    PixelUnpackParameters part;
    part.setRowLength(photo.width);
    part.setSkipPixels(static_cast<std::size_t>(source_.offset().x));
    part.setSkipRows(static_cast<std::size_t>(source_.offset().y));
    BoundTexture const bound(*photo_);
    photo_->subImage(0, 0, 0, source_.width(), source_.height(), format.layout, format.type,
                     photo.pixels.data(), part);
}

void Developer::sharpen(Recipe const &recipe) {
    if (!recipe.sharpening.isOn())
        return;
    light_ = MakeTexture(cLightFormat, source_);
    {
        ProgramEnabledScope const enabled(&decode_.program());
        SetColourMask(decode_.program(), shape_.channels);
        BoundTexture const bound(*photo_);
        decode_.draw(*light_);
    }
    sharpener_->sharpen(light_, shape_.channels, recipe.sharpening);
}

void Developer::develop(Recipe const &recipe) {
    bool const hasSpots = !RegionOf(recipe.spots).isEmpty();
    std::unique_ptr<Texture2D> const spots =
        hasSpots ? spotPainter_.paint(recipe.spots, area_) : nullptr;
    Texture2D const &source = light_ ? *light_ : *photo_;
    CoverPass &pass = light_ ? encode_ : decodeAndEncode_;
    Program &program = pass.program();
    ProgramEnabledScope const enabled(&program);
    SetOffset(program, area_, source_);
    SetColourMask(program, shape_.channels);
    program.setUniform("exposure", static_cast<float>(recipe.exposure));
    program.setUniform("gain", static_cast<float>(std::exp2(recipe.exposure)));
    program.setUniform("levels", shape_.bitsPerChannel == 16 ? 65535.0f : 255.0f);
    program.setUniform("hasSpots", hasSpots);
    program.setUniformSampler2D("source", 0);
    program.setUniformSampler2D("spots", 1);
    BoundTexture const boundSource(source, 0);
    BoundTexture const boundSpots(spots ? *spots : source, 1);
    pass.draw(*developed_);
}

App::Image Developer::readBack() {
    App::Image developed(shape_);
    PixelFormat const format = PixelFormat::Of(shape_);
    BoundTexture const bound(*developed_);
    developed_->getPixelData(developed.pixels.data(), 0, format.layout, format.type, 1);
    return developed;
}

} // namespace Develop
