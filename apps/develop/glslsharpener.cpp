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

std::unique_ptr<Texture2D> TextureLike(Texture2D const &texture) {
    return std::make_unique<Texture2D>(texture.format(), texture.width(0), texture.height(0),
                                       false);
}

void SetBlur(Program &program, std::vector<float> const &weights) {
    auto const taps = static_cast<int>(weights.size());
    program.setUniform("taps", taps);
    program.setUniform("weights", taps, weights.data());
}

} // namespace

GlslSharpener::GlslSharpener(std::string const &reason)
    : reason_(reason), blurRows_(kBlurRowsShader), sharpenColumns_(kSharpenColumnsShader) {}

void GlslSharpener::sharpen(std::unique_ptr<Texture2D> &light, std::size_t channels,
                            Sharpening const &sharpening) {
    std::vector<float> const weights = GaussianWeights(sharpening.sigma);
    auto const rows = TextureLike(*light);
    {
        ProgramEnabledScope const enabled(&blurRows_.program());
        SetBlur(blurRows_.program(), weights);
        TextureScope const source(*light);
        blurRows_.draw(*rows);
    }
    auto sharpened = TextureLike(*light);
    {
        Program &program = sharpenColumns_.program();
        ProgramEnabledScope const enabled(&program);
        SetBlur(program, weights);
        SetColourMask(program, channels);
        program.setUniform("amount", static_cast<float>(sharpening.amount));
        program.setUniformSampler2D("light", 0);
        program.setUniformSampler2D("rows", 1);
        TextureScope const original(*light, 0);
        TextureScope const blurred(*rows, 1);
        sharpenColumns_.draw(*sharpened);
    }
    light = std::move(sharpened); // a pass cannot write what it reads
}

} // namespace Develop
