// Computes light in a floating-point texture, reads the numbers back and exposes them like a photo.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <cmath>
#include <vector>

using namespace ORU::OGL;

namespace {

unsigned int const kWidth = 320, kHeight = 200;

char const *const kVertexShader = "attribute vec2 corner;"
                                  "void main() { gl_Position = vec4(corner, 0.0, 1.0); }";

// Three lamps hang 20 pixels above a table: x, y and power of each. Their light falls off with the
// square of the distance, from far beyond white to nearly nothing.
char const *const kFragmentShader = "uniform vec3 lamps[3];"
                                    "void main() {"
                                    "    float light = 0.0;"
                                    "    for (int i = 0; i < 3; ++i) {"
                                    "        vec2 way = gl_FragCoord.xy - lamps[i].xy;"
                                    "        light += lamps[i].z / (dot(way, way) + 400.0);"
                                    "    }"
                                    "    gl_FragColor = vec4(light);"
                                    "}";

float const kLamps[] = {80, 60, 8000, 200, 140, 1500, 270, 50, 100};
float const kCorners[] = {-1, -1, 1, -1, -1, 1, 1, 1};

/// The light at every pixel, from the bottom row to the top.
std::vector<float> ComputeLight() {
    Texture2D light(Texture::INTERNALFORMAT_R32F, kWidth, kHeight, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&light, 0, 0);
    ORU_GL(Viewport, 0, 0, static_cast<GLsizei>(kWidth), static_cast<GLsizei>(kHeight));

    Program program;
    program.loadVertexShader(1, &kVertexShader, nullptr);
    program.loadFragmentShader(1, &kFragmentShader, nullptr);
    program.link(true);
    VertexBuffer everything(
        {{"corner", VertexBuffer::ATTRIBUTETYPE_FLOAT2, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
        4, VertexBuffer::PRIMITIVETYPE_TRIANGLE_STRIP);
    everything.setField("corner", example::Bytes(kCorners), false, 0, 0);
    everything.setupWithProgram(&program);
    everything.marshallData();
    {
        ProgramEnabledScope const scope(&program);
        program.setUniform3("lamps", 3, kLamps);
        everything.drawPrimitives();
    }

    std::vector<float> values(std::size_t{kWidth} * kHeight);
    ORU_GL(BindTexture, light.target(), light.objectID());
    light.getPixelData(values.data(), 0, Texture::FORMAT_RED, Texture::TYPE_FLOAT, 4);
    return values;
}

void Expose(std::filesystem::path const &file) {
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();
    std::vector<float> const light = ComputeLight();
    auto const range = std::minmax_element(light.begin(), light.end());
    std::cout << "from " << *range.first << " to " << *range.second << " times white\n";

    // The whole range on paper: v / (1 + v) tames the highlights, the root is the paper's gamma.
    App::Image photo({kWidth, kHeight, 1, 8});
    for (std::size_t y = 0; y < kHeight; ++y) {
        for (std::size_t x = 0; x < kWidth; ++x) {
            float const v = light[(kHeight - 1 - y) * kWidth + x];
            photo.row(y)[x] = static_cast<unsigned char>(std::lround(255 * std::sqrt(v / (1 + v))));
        }
    }
    App::WriteImage(file, photo);
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, Expose);
}
