// The GLSL programs of develop.
#include "apps/develop/shaders.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

namespace Develop {

char const *const cCoverVertexShader = R"(
in vec2 position;

void main() {
    gl_Position = vec4(position, 0.0, 1.0);
}
)";

// The transfer functions are those of IEC 61966-2-1. Drivers compute pow by approximations of
// different quality, so one step of Newton's method follows it: on z^5 = t^12, and on y^12 = x^5.
char const *const cDevelopShader = R"(
uniform sampler2D photo;
uniform vec4 colours; // 1 for channels that hold colours, 0 for alpha
uniform float gain;   // 2^exposure
uniform float levels; // largest stored value

out vec4 developed;

vec4 PowerOf2_4(vec4 t) {
    vec4 z = pow(t, vec4(2.4));
    vec4 t2 = t * t;
    vec4 t4 = t2 * t2;
    vec4 z2 = z * z;
    return (4.0 * z + t4 * t4 * t4 / (z2 * z2)) / 5.0;
}

vec4 RootOf2_4(vec4 x) {
    vec4 y = pow(x, vec4(1.0 / 2.4));
    vec4 x2 = x * x;
    vec4 y2 = y * y;
    vec4 y4 = y2 * y2;
    return (11.0 * y + x2 * x2 * x / (y4 * y4 * y2 * y)) / 12.0;
}

vec4 Decode(vec4 code) {
    return mix(code / 12.92, PowerOf2_4((code + 0.055) / 1.055),
               greaterThan(code, vec4(0.04045)));
}

vec4 Encode(vec4 light) {
    vec4 curve = 1.055 * RootOf2_4(max(light, 0.0031308)) - 0.055;
    return mix(light * 12.92, curve, greaterThan(light, vec4(0.0031308)));
}

void main() {
    vec4 stored = texelFetch(photo, ivec2(gl_FragCoord.xy), 0);
    vec4 light = clamp(Decode(stored) * gain, 0.0, 1.0);
    developed = mix(stored, floor(Encode(light) * levels + 0.5) / levels, colours);
}
)";

std::string ShadingLanguageLine() {
    auto const &record = *ORU::OGL::ExtensionManager::Instance();
    unsigned int const version = record.majorVersion() * 10 + record.minorVersion();
    char const *const language = version >= 32 ? "150" : version == 31 ? "140" : "130";
    return std::string("#version ") + language + "\n";
}

} // namespace Develop
