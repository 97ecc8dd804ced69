// The GLSL programs of develop.
#include "apps/develop/shaders.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/ogl/programogl.h"

namespace Develop {

char const *const kCoverVertexShader = R"(
in vec2 position;

void main() {
    gl_Position = vec4(position, 0.0, 1.0);
}
)";

namespace {

// The transfer functions are those of IEC 61966-2-1. Drivers compute pow by approximations of
// different quality, so one step of Newton's method follows it: on z^5 = t^12, and on y^12 = x^5.
// The value is rounded here, not by the driver's conversion to the texture's format.
char const *const kDevelopSource = R"(
uniform sampler2D source;
uniform ivec2 offset; // of the target's first pixel in the source
uniform vec4 colours; // 1 for channels that hold colours, 0 for alpha

out vec4 result;

#ifdef DECODE

vec4 PowerOf2_4(vec4 t) {
    vec4 z = pow(t, vec4(2.4));
    vec4 t2 = t * t;
    vec4 t4 = t2 * t2;
    vec4 z2 = z * z;
    return (4.0 * z + t4 * t4 * t4 / (z2 * z2)) / 5.0;
}

vec4 Decode(vec4 code) {
    return mix(code / 12.92, PowerOf2_4((code + 0.055) / 1.055),
               greaterThan(code, vec4(0.04045)));
}

#endif
#ifdef ENCODE

uniform sampler2D spots; // stops that the spots add
uniform bool hasSpots;
uniform float exposure;  // stops
uniform float gain;      // 2^exposure
uniform float levels;    // largest stored value

vec4 RootOf2_4(vec4 x) {
    vec4 y = pow(x, vec4(1.0 / 2.4));
    vec4 x2 = x * x;
    vec4 y2 = y * y;
    vec4 y4 = y2 * y2;
    return (11.0 * y + x2 * x2 * x / (y4 * y4 * y2 * y)) / 12.0;
}

vec4 Encode(vec4 light) {
    vec4 curve = 1.055 * RootOf2_4(max(light, 0.0031308)) - 0.055;
    return mix(light * 12.92, curve, greaterThan(light, vec4(0.0031308)));
}

// Where no spot adds anything the result must be that of a picture without spots, to the last bit.
float Gain() {
    float added = hasSpots ? texelFetch(spots, ivec2(gl_FragCoord.xy), 0).r : 0.0;
    return added == 0.0 ? gain : exp2(clamp(exposure + added, -100.0, 100.0));
}

#endif

void main() {
    vec4 stored = texelFetch(source, ivec2(gl_FragCoord.xy) + offset, 0);
    vec4 value = stored;
#ifdef DECODE
    value = Decode(value);
#endif
#ifdef ENCODE
    value = floor(Encode(clamp(value * Gain(), 0.0, 1.0)) * levels + 0.5) / levels;
#endif
    result = mix(stored, value, colours);
}
)";

} // namespace

std::string DevelopShader(Steps steps) {
    std::string const decode = steps != Steps::Encode ? "#define DECODE\n" : "";
    std::string const encode = steps != Steps::Decode ? "#define ENCODE\n" : "";
    return decode + encode + kDevelopSource;
}

char const *const kBlurRowsShader = R"(
uniform sampler2D source;
uniform int taps;
uniform float weights[61];

out vec4 result;

void main() {
    ivec2 pixel = ivec2(gl_FragCoord.xy);
    int last = textureSize(source, 0).x - 1;
    vec4 sum = weights[0] * texelFetch(source, pixel, 0);
    for (int k = 1; k < taps; ++k)
        sum += weights[k] * (texelFetch(source, ivec2(max(pixel.x - k, 0), pixel.y), 0) +
                             texelFetch(source, ivec2(min(pixel.x + k, last), pixel.y), 0));
    result = sum;
}
)";

char const *const kSharpenColumnsShader = R"(
uniform sampler2D light;
uniform sampler2D rows; // light, its rows blurred
uniform int taps;
uniform float weights[61];
uniform float amount;
uniform vec4 colours; // 1 for channels that hold colours, 0 for alpha

out vec4 result;

void main() {
    ivec2 pixel = ivec2(gl_FragCoord.xy);
    int last = textureSize(rows, 0).y - 1;
    vec4 sum = weights[0] * texelFetch(rows, pixel, 0);
    for (int k = 1; k < taps; ++k)
        sum += weights[k] * (texelFetch(rows, ivec2(pixel.x, max(pixel.y - k, 0)), 0) +
                             texelFetch(rows, ivec2(pixel.x, min(pixel.y + k, last)), 0));
    vec4 v = texelFetch(light, pixel, 0);
    result = mix(v, max(v + amount * (v - sum), 0.0), colours);
}
)";

// Attributes as whole pixels and a rest: differences from pixel centres then stay exact far from
// the origin. Flat, since interpolation would not keep even equal values exact.
char const *const kSpotVertexShader = R"(
in vec2 position;
in vec4 centre; // whole pixels, and the rest
in vec2 spot;   // radius in pixels, stops

flat out vec4 spotCentre;
flat out vec2 spotSize;

void main() {
    spotCentre = centre;
    spotSize = spot;
    gl_Position = vec4(position, 0.0, 1.0);
}
)";

char const *const kSpotShader = R"(
uniform ivec2 offset; // of the target's first pixel in the picture

flat in vec4 spotCentre;
flat in vec2 spotSize;

out vec4 result;

// 1 - smoothstep(0, radius, d), written without the difference of nearly equal numbers.
void main() {
    vec2 away = gl_FragCoord.xy + vec2(offset) - spotCentre.xy - spotCentre.zw;
    float inside = 1.0 - min(length(away) / spotSize.x, 1.0);
    result = vec4(spotSize.y * inside * inside * (3.0 - 2.0 * inside), 0.0, 0.0, 0.0);
}
)";

std::string ShadingLanguageLine() {
    auto const &record = *ORU::OGL::ExtensionManager::Instance();
    unsigned int const version = record.majorVersion() * 10 + record.minorVersion();
    char const *const language = version >= 32 ? "150" : version == 31 ? "140" : "130";
    return std::string("#version ") + language + "\n";
}

std::array<float, 4> ColourMask(std::size_t channels) {
    float const ifColour = channels >= 3 ? 1.0f : 0.0f; // green holds grey's alpha
    return {1.0f, ifColour, ifColour, 0.0f};
}

void SetColourMask(ORU::OGL::Program &program, std::size_t channels) {
    program.setUniform4("colours", 1, ColourMask(channels).data());
}

} // namespace Develop
