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

// Curves are tables in rows of 256 texels, whose channels are those of the picture. The value is
// rounded here, not by the driver's conversion to the texture's format.
char const *const kDevelopSource = R"(
uniform sampler2D source;
uniform ivec2 offset; // of the target's first pixel in the source
uniform vec4 colours; // 1 for channels that hold colours, 0 for alpha
uniform int levels;   // entries of a curve
uniform bool isFloat; // whether the codes are floats

out vec4 result;

vec4 Entry(sampler2D table, int place) {
    return texelFetch(table, ivec2(place & 255, place >> 8), 0);
}

vec4 Entries(sampler2D table, ivec4 place) {
    return vec4(Entry(table, place.r).r, Entry(table, place.g).g, Entry(table, place.b).b, 0.0);
}

#ifdef DECODE

uniform sampler2D lights; // of codes
uniform bool isLinear;    // whether floats are the light itself

vec4 Decode(vec4 stored) {
    if (!isFloat)
        return Entries(lights, ivec4(stored * float(levels - 1) + 0.5));
    if (isLinear)
        return stored;
    // A curve is continued beyond 1 by its last line.
    vec4 place = max(stored, 0.0) * float(levels - 1);
    ivec4 below = ivec4(min(place, float(levels - 2)));
    vec4 light = Entries(lights, below);
    return light + (place - vec4(below)) * (Entries(lights, below + 1) - light);
}

#endif
#ifdef ENCODE

uniform sampler2D light;      // sharpened
uniform sampler2D thresholds; // where one code ends and the next begins; lights of float codes
uniform sampler2D index;      // thresholds that are reached for certain, by the light's root
uniform int indices;          // entries of the index
uniform int steps;            // thresholds that may be reached beside
uniform bool becomesLinear;   // whether floats are the light itself
uniform bool hasMatrix;
uniform mat3 matrix;          // to another colour space
uniform sampler2D spots;      // stops that the spots add
uniform bool hasSpots;
uniform float exposure;       // stops
uniform float gain;           // 2^exposure

vec4 EncodeFloat(vec4 light) {
    if (becomesLinear)
        return light;
    ivec4 below = ivec4(0);
    for (int span = levels / 2; span > 0; span /= 2) {
        ivec4 next = min(below + span, levels - 2);
        bvec4 reached = lessThanEqual(Entries(thresholds, next), light);
        below += (next - below) * ivec4(reached);
    }
    vec4 first = Entries(thresholds, below);
    vec4 rise = Entries(thresholds, below + 1) - first;
    vec4 part = (light - first) / max(rise, 1e-30) * vec4(greaterThan(rise, vec4(0.0)));
    return (vec4(below) + part) / float(levels - 1);
}

vec4 Encode(vec4 light) {
    if (isFloat)
        return EncodeFloat(light);
    light = min(light, 1.0);
    ivec4 code = ivec4(Entries(index, ivec4(sqrt(light) * float(indices - 1))));
    for (int s = 0; s < steps; ++s)
        code += ivec4(greaterThanEqual(light, Entries(thresholds, code)));
    return vec4(code) / float(levels - 1);
}

// Where no spot adds anything the result must be that of a picture without spots, to the last bit.
float Gain() {
    float added = hasSpots ? texelFetch(spots, ivec2(gl_FragCoord.xy), 0).r : 0.0;
    return added == 0.0 ? gain : exp2(clamp(exposure + added, -100.0, 100.0));
}

#endif

void main() {
    ivec2 pixel = ivec2(gl_FragCoord.xy) + offset;
    vec4 stored = texelFetch(source, pixel, 0);
#ifdef DECODE
    vec4 value = Decode(stored);
#else
    vec4 value = texelFetch(light, pixel, 0);
#endif
#ifdef ENCODE
    value *= Gain();
    if (hasMatrix)
        value.rgb = matrix * value.rgb;
    value = Encode(max(value, 0.0));
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
uniform int last; // pixel of a row
uniform int taps;
uniform float weights[61];

out vec4 result;

void main() {
    ivec2 pixel = ivec2(gl_FragCoord.xy);
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
uniform int last;       // row
uniform int taps;
uniform float weights[61];
uniform float amount;
uniform vec4 colours; // 1 for channels that hold colours, 0 for alpha

out vec4 result;

void main() {
    ivec2 pixel = ivec2(gl_FragCoord.xy);
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
