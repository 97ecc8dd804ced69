// The stages of developing a picture on the GPU.
#include "apps/develop/developer.h"

#include "apps/develop/pixelformat.h"
#include "apps/develop/shaders.h"
#include "apps/develop/texturescope.h"

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

void Developer::upload(App::Image const &photo, Areas const &areas) {
    shape_ = photo;
    shape_.width = areas.target.width();
    shape_.height = areas.target.height();
    areas_ = areas;
    IntegerRect const &source = areas_.source;

    PixelFormat const format = PixelFormat::Of(photo);
    photo_ = MakeTexture(format, source);
    light_.reset();
    developed_ = MakeTexture(format, areas_.target);

    PixelUnpackParameters part;
    part.setRowLength(photo.width);
    part.setSkipPixels(static_cast<std::size_t>(source.offset().x));
    part.setSkipRows(static_cast<std::size_t>(source.offset().y));
    TextureScope const bound(*photo_);
    photo_->subImage(0, 0, 0, source.width(), source.height(), format.layout, format.type,
                     photo.pixels.data(), part);
}

void Developer::sharpen(Recipe const &recipe) {
    if (!recipe.sharpening.isOn())
        return;
    light_ = MakeTexture(kLightFormat, areas_.source);
    {
        ProgramEnabledScope const enabled(&decode_.program());
        SetColourMask(decode_.program(), shape_.channels);
        TextureScope const bound(*photo_);
        decode_.draw(*light_);
    }
    sharpener_->sharpen(light_, shape_.channels, recipe.sharpening);
}

void Developer::develop(Recipe const &recipe) {
    std::unique_ptr<Texture2D> const spots = spotPainter_.paint(recipe.spots, areas_.target);
    Texture2D const &source = light_ ? *light_ : *photo_;
    CoverPass &pass = light_ ? encode_ : decodeAndEncode_;
    Program &program = pass.program();
    ProgramEnabledScope const enabled(&program);
    SetOffset(program, areas_.target, areas_.source);
    SetColourMask(program, shape_.channels);
    program.setUniform("exposure", static_cast<float>(recipe.exposure));
    program.setUniform("gain", static_cast<float>(std::exp2(recipe.exposure)));
    program.setUniform("levels", shape_.bitsPerChannel == 16 ? 65535.0f : 255.0f);
    program.setUniform("hasSpots", spots != nullptr);
    program.setUniformSampler2D("source", 0);
    program.setUniformSampler2D("spots", 1);
    TextureScope const boundSource(source, 0);
    TextureScope const boundSpots(spots ? *spots : source, 1);
    pass.draw(*developed_);
}

App::Image Developer::readBack() {
    App::Image developed(shape_);
    PixelFormat const format = PixelFormat::Of(shape_);
    TextureScope const bound(*developed_);
    developed_->getPixelData(developed.pixels.data(), 0, format.layout, format.type, 1);
    return developed;
}

} // namespace Develop
