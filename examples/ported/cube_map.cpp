// A cube map with mipmaps, read by a sampler object: balls that mirror a room, more and more rough.
#include "examples/ported/plaingl.h"
#include "examples/ported/ported.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelview.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/samplerbindscope.h"
#include "oru/oru_ogl/ogl/switchscope.h"
#include "oru/oru_ogl/ogl/texturecube.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

using namespace ORU::OGL;
using ported::Picture;

namespace {

constexpr int kRoom = 32; ///< texels of a wall's side

// A triangle that covers everything.
char const *const kVertexShader = R"(#version 330
    void main() { gl_Position = vec4(vec2(gl_VertexID % 2, gl_VertexID / 2) * 4.0 - 1.0, 0.0, 1.0); })";

// Two rows of two balls; a coarser level stands for the light from all around a direction.
char const *const kFragmentShader = R"(#version 330
    uniform samplerCube room;
    out vec4 colour;
    void main() {
        vec2 ball = floor(gl_FragCoord.xy / 48.0);
        vec2 place = (gl_FragCoord.xy - 48.0 * ball - 24.0) / 22.0;
        float inside = 1.0 - dot(place, place);
        vec3 normal = vec3(place, sqrt(max(inside, 0.0)));
        vec3 seen = reflect(vec3(0.0, 0.0, -1.0), normal);
        vec3 light = textureLod(room, seen, ball.x + 2.0 * ball.y).rgb;
        colour = vec4(inside > 0.0 ? light : vec3(0.15), 1.0);
    })";

/// The texels of a wall: tiles of a colour of its own, and a lamp.
std::vector<unsigned char> Wall(unsigned int face) {
    std::vector<unsigned char> texels;
    for (int y = 0; y < kRoom; ++y) {
        for (int x = 0; x < kRoom; ++x) {
            int const dx = 2 * x - kRoom + 1, dy = 2 * y - kRoom + 1;
            bool const isLamp = dx * dx + dy * dy < 120;
            unsigned int const shade = (x / 4 + y / 4) % 2 == 0 ? 200 : 120;
            for (unsigned int channel = 0; channel < 3; ++channel) {
                bool const isOwn = ((face + 1) >> channel & 1) != 0;
                texels.push_back(static_cast<unsigned char>(isLamp  ? 255u
                                                            : isOwn ? shade
                                                                    : shade / 4));
            }
        }
    }
    return texels;
}

constexpr int kPlainMark = __LINE__;
Picture DrawPlain(GLuint target) {
    GLuint room = 0, sampler = 0;
    glGenTextures(1, &room);
    glBindTexture(GL_TEXTURE_CUBE_MAP, room);
    glPixelStorei(GL_UNPACK_ALIGNMENT, 1);
    for (unsigned int face = 0; face < 6; ++face)
        glTexImage2D(GL_TEXTURE_CUBE_MAP_POSITIVE_X + face, 0, GL_RGB8, kRoom, kRoom, 0, GL_RGB,
                     GL_UNSIGNED_BYTE, Wall(face).data());
    glPixelStorei(GL_UNPACK_ALIGNMENT, 4);
    glGenerateMipmap(GL_TEXTURE_CUBE_MAP);
    glGenSamplers(1, &sampler);
    glSamplerParameteri(sampler, GL_TEXTURE_MIN_FILTER, GL_LINEAR_MIPMAP_LINEAR);
    glSamplerParameteri(sampler, GL_TEXTURE_MAG_FILTER, GL_LINEAR);
    glSamplerParameteri(sampler, GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE);
    glSamplerParameteri(sampler, GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE);
    glSamplerParameteri(sampler, GL_TEXTURE_WRAP_R, GL_CLAMP_TO_EDGE);
    plain::Check("room");

    GLuint array = 0;
    glGenVertexArrays(1, &array);
    glBindVertexArray(array);

    GLuint const mirror = plain::MakeProgram(kVertexShader, kFragmentShader);
    glUseProgram(mirror);
    glBindSampler(0, sampler);
    glEnable(GL_TEXTURE_CUBE_MAP_SEAMLESS);
    glDrawArrays(GL_TRIANGLES, 0, 3);
    glDisable(GL_TEXTURE_CUBE_MAP_SEAMLESS);
    glBindSampler(0, 0);
    Picture picture = ported::ReadBack(target);
    plain::Check("picture");

    glUseProgram(0);
    glDeleteProgram(mirror);
    glDeleteVertexArrays(1, &array);
    glDeleteTextures(1, &room);
    glDeleteSamplers(1, &sampler);
    return picture;
}

constexpr int kPortedMark = __LINE__;
Picture DrawPorted(Framebuffer &target) {
    TextureCube room(Texture::INTERNALFORMAT_RGB8, kRoom, true);
    TextureUnit::Unit(0)->bind(&room);
    for (TextureCube::Face const face : kCubeFaces) {
        auto const texels = Wall(face);
        room.subImage(face, 0, 0, 0,
                      PixelView(texels.data(), texels.size(),
                                {Texture::FORMAT_RGB, Texture::TYPE_UNSIGNED_BYTE, kRoom, kRoom}));
    }
    room.generateMipmap();
    Sampler const smooth(Texture::FILTER_LINEAR_MIPMAP_LINEAR, Texture::FILTER_LINEAR,
                         Texture::WRAPMODE_CLAMP_TO_EDGE);

    Program mirror = ported::MakeProgram(kVertexShader, kFragmentShader);
    ProgramEnabledScope const enabled(&mirror);
    SamplerBindScope const sampled(smooth, 0);
    TemporarySwitchScope const seamless(GL_TEXTURE_CUBE_MAP_SEAMLESS, true);
    VertexArray().drawArrays(GL_TRIANGLES, 0, 3);
    return ported::ReadBack(target.objectID());
}

constexpr int kEndMark = __LINE__;

} // namespace

ported::Comparison const ported::kCubeMap = {
    "cube_map", DrawPlain, DrawPorted, {kPlainMark, kPortedMark, kEndMark}};
