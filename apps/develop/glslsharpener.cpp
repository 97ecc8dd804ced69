// Sharpening by OpenGL itself.
#include "apps/develop/glslsharpener.h"

#include "apps/develop/gaussian.h"
#include "apps/develop/pixelformat.h"
#include "apps/develop/shaders.h"
#include "apps/develop/texturescope.h"

#include "oru/oru_ogl/ogl/programenabledscope.h"

namespace Develop {

using namespace ORU::OGL;

namespace {

/// @param side of the texture in the direction of the blur
void SetBlur(Program &program, std::vector<float> const &weights, std::size_t side) {
    auto const taps = static_cast<int>(weights.size());
    program.setUniform("taps", taps);
    program.setUniform("weights", taps, weights.data());
    program.setUniform("last", static_cast<int>(side) - 1);
}

} // namespace

GlslSharpener::GlslSharpener(std::string const &reason)
    : reason_(reason), blurRows_(kBlurRowsShader), sharpenColumns_(kSharpenColumnsShader) {}

Texture2D &GlslSharpener::light(std::size_t width, std::size_t height) {
    return light_.reserve(kLightFormat.storage, width, height);
}

Texture2D const &GlslSharpener::sharpen(std::size_t width, std::size_t height, std::size_t channels,
                                        Sharpening const &sharpening) {
    std::vector<float> const weights = GaussianWeights(sharpening.sigma);
    Texture2D &rows = rows_.reserve(kLightFormat.storage, width, height);
    {
        ProgramEnabledScope const enabled(&blurRows_.program());
        SetBlur(blurRows_.program(), weights, width);
        TextureScope const source(light_.get());
        blurRows_.draw(rows, width, height);
    }
    // A pass cannot write what it reads.
    Texture2D &sharpened = sharpened_.reserve(kLightFormat.storage, width, height);
    Program &program = sharpenColumns_.program();
    ProgramEnabledScope const enabled(&program);
    SetBlur(program, weights, height);
    SetColourMask(program, channels);
    program.setUniform("amount", static_cast<float>(sharpening.amount));
    program.setUniformSampler2D("light", 0);
    program.setUniformSampler2D("rows", 1);
    TextureScope const original(light_.get(), 0);
    TextureScope const blurred(rows, 1);
    sharpenColumns_.draw(sharpened, width, height);
    return sharpened;
}

} // namespace Develop
