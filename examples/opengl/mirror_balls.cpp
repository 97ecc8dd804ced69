// A cube map with mipmaps: balls that mirror a room, from polished to rough.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/samplerbindscope.h"
#include "oru/oru_ogl/ogl/switchscope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texturecube.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <cmath>
#include <vector>

using namespace ORU::OGL;

namespace {

unsigned int const kWidth = 400, kHeight = 100, kSide = 64;

char const *const kVertexShader = "attribute vec2 corner;"
                                  "void main() { gl_Position = vec4(corner, 0.0, 1.0); }";

// Four balls in a row, each rougher than the one before: a coarser level of the room stands for
// the light from all around a direction.
char const *const kFragmentShader =
    "#version 120\n#extension GL_ARB_shader_texture_lod : enable\n"
    "uniform samplerCube room;"
    "void main() {"
    "    float ball = floor(gl_FragCoord.x / 100.0);"
    "    vec2 place = (gl_FragCoord.xy - vec2(100.0 * ball + 50.0, 50.0)) / 46.0;"
    "    float inside = 1.0 - dot(place, place);"
    "    vec3 normal = vec3(place, sqrt(max(inside, 0.0)));"
    "    vec3 light = textureCubeLod(room, reflect(vec3(0.0, 0.0, -1.0), normal),"
    "                                1.5 * ball).rgb;"
    "    gl_FragColor = vec4(inside > 0.0 ? light : vec3(0.15), 1.0);"
    "}";

float const kCorners[] = {-1, -1, 1, -1, -1, 1, 1, 1};

/// A wall of the room: tiles of a colour of its own, with a lamp in the middle.
std::vector<unsigned char> Wall(TextureCube::Face face) {
    std::vector<unsigned char> texels;
    for (unsigned int y = 0; y < kSide; ++y) {
        for (unsigned int x = 0; x < kSide; ++x) {
            int const dx = 2 * static_cast<int>(x) - 63, dy = 2 * static_cast<int>(y) - 63;
            bool const isLamp = dx * dx + dy * dy < 400;
            bool const isTile = (x / 8 + y / 8) % 2 == 0;
            for (unsigned int channel = 0; channel < 3; ++channel) {
                bool const isOwn = ((face / 2 + 1 + face % 2 * 3) >> channel & 1) != 0;
                unsigned int const tile = (isOwn ? 200u : 60u) / (isTile ? 1 : 2);
                texels.push_back(static_cast<unsigned char>(isLamp ? 255 : tile));
            }
        }
    }
    return texels;
}

void Mirror(std::filesystem::path const &file) {
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();

    TextureCube room(Texture::INTERNALFORMAT_RGB8, kSide, true);
    TextureUnit::Unit(0)->bind(&room);
    for (TextureCube::Face const face : kCubeFaces)
        room.subImage(face, 0, 0, 0, kSide, kSide, Texture::FORMAT_RGB, Texture::TYPE_UNSIGNED_BYTE,
                      Wall(face).data(), PixelUnpackParameters());
    room.generateMipmap();
    Sampler const smooth(Texture::FILTER_LINEAR_MIPMAP_LINEAR, Texture::FILTER_LINEAR,
                         Texture::WRAPMODE_CLAMP_TO_EDGE);

    Texture2D picture(Texture::INTERNALFORMAT_RGBA8, kWidth, kHeight, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attachTexture(picture, 0, Framebuffer::ATTACHMENT_COLOR0);
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
    ProgramEnabledScope const enabled(&program);
    SamplerBindScope const sampled(smooth, 0);
    // Filters across the edges of the walls.
    TemporarySwitchScope const seamless(GL_TEXTURE_CUBE_MAP_SEAMLESS, true);
    everything.drawPrimitives();
    example::SavePicture(file, kWidth, kHeight);
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, Mirror);
}
