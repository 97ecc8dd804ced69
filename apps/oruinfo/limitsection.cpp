// The numbers that OpenGL keeps within.
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/failuretext.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <cctype>

namespace OruInfo {

namespace {

struct Limit {
    char const *name; ///< of the constant, without its GL_
    char const *unit; ///< empty for a count of things that the name says
    GLenum value;
    int numbers; ///< 1 or 2
};

#define ORU_LIMIT(Name, Unit)                                                                      \
    { #Name, Unit, GL_##Name, 1 }
constexpr Limit kLimits[] = {ORU_LIMIT(MAX_TEXTURE_SIZE, "texels"),
                             ORU_LIMIT(MAX_3D_TEXTURE_SIZE, "texels"),
                             ORU_LIMIT(MAX_CUBE_MAP_TEXTURE_SIZE, "texels"),
                             ORU_LIMIT(MAX_RECTANGLE_TEXTURE_SIZE, "texels"),
                             ORU_LIMIT(MAX_ARRAY_TEXTURE_LAYERS, ""),
                             ORU_LIMIT(MAX_TEXTURE_BUFFER_SIZE, "texels"),
                             ORU_LIMIT(MAX_RENDERBUFFER_SIZE, "pixels"),
                             {"MAX_VIEWPORT_DIMS", "pixels", GL_MAX_VIEWPORT_DIMS, 2},
                             ORU_LIMIT(MAX_VIEWPORTS, ""),
                             ORU_LIMIT(MAX_COLOR_ATTACHMENTS, ""),
                             ORU_LIMIT(MAX_DRAW_BUFFERS, ""),
                             ORU_LIMIT(MAX_DUAL_SOURCE_DRAW_BUFFERS, ""),
                             ORU_LIMIT(MAX_SAMPLES, ""),
                             ORU_LIMIT(MAX_COLOR_TEXTURE_SAMPLES, ""),
                             ORU_LIMIT(MAX_DEPTH_TEXTURE_SAMPLES, ""),
                             ORU_LIMIT(MAX_INTEGER_SAMPLES, ""),
                             ORU_LIMIT(MAX_TEXTURE_UNITS, ""),
                             ORU_LIMIT(MAX_TEXTURE_COORDS, ""),
                             ORU_LIMIT(MAX_TEXTURE_IMAGE_UNITS, ""),
                             ORU_LIMIT(MAX_VERTEX_TEXTURE_IMAGE_UNITS, ""),
                             ORU_LIMIT(MAX_GEOMETRY_TEXTURE_IMAGE_UNITS, ""),
                             ORU_LIMIT(MAX_COMBINED_TEXTURE_IMAGE_UNITS, ""),
                             ORU_LIMIT(MAX_TEXTURE_MAX_ANISOTROPY_EXT, ""),
                             ORU_LIMIT(MAX_VERTEX_ATTRIBS, ""),
                             ORU_LIMIT(MAX_VERTEX_UNIFORM_COMPONENTS, ""),
                             ORU_LIMIT(MAX_GEOMETRY_UNIFORM_COMPONENTS, ""),
                             ORU_LIMIT(MAX_FRAGMENT_UNIFORM_COMPONENTS, ""),
                             ORU_LIMIT(MAX_VARYING_COMPONENTS, ""),
                             ORU_LIMIT(MAX_UNIFORM_BLOCK_SIZE, "bytes"),
                             ORU_LIMIT(MAX_UNIFORM_BUFFER_BINDINGS, ""),
                             ORU_LIMIT(UNIFORM_BUFFER_OFFSET_ALIGNMENT, "bytes"),
                             ORU_LIMIT(MAX_VERTEX_UNIFORM_BLOCKS, ""),
                             ORU_LIMIT(MAX_FRAGMENT_UNIFORM_BLOCKS, ""),
                             ORU_LIMIT(MAX_COMBINED_UNIFORM_BLOCKS, ""),
                             ORU_LIMIT(MAX_GEOMETRY_OUTPUT_VERTICES, ""),
                             ORU_LIMIT(MAX_GEOMETRY_SHADER_INVOCATIONS, ""),
                             ORU_LIMIT(MAX_PATCH_VERTICES, ""),
                             ORU_LIMIT(MAX_TESS_GEN_LEVEL, ""),
                             ORU_LIMIT(MAX_TRANSFORM_FEEDBACK_BUFFERS, ""),
                             ORU_LIMIT(MAX_TRANSFORM_FEEDBACK_SEPARATE_ATTRIBS, ""),
                             ORU_LIMIT(MAX_ELEMENTS_VERTICES, ""),
                             ORU_LIMIT(MAX_ELEMENTS_INDICES, ""),
                             ORU_LIMIT(MAX_PROGRAM_TEXEL_OFFSET, "texels"),
                             ORU_LIMIT(MIN_PROGRAM_TEXEL_OFFSET, "texels"),
                             ORU_LIMIT(MAX_CLIP_PLANES, ""),
                             ORU_LIMIT(MAX_LIGHTS, ""),
                             ORU_LIMIT(MAX_LIST_NESTING, ""),
                             ORU_LIMIT(MAX_MODELVIEW_STACK_DEPTH, ""),
                             ORU_LIMIT(MAX_ATTRIB_STACK_DEPTH, ""),
                             ORU_LIMIT(MAX_CLIENT_ATTRIB_STACK_DEPTH, ""),
                             ORU_LIMIT(NUM_COMPRESSED_TEXTURE_FORMATS, ""),
                             ORU_LIMIT(NUM_PROGRAM_BINARY_FORMATS, ""),
                             ORU_LIMIT(SUBPIXEL_BITS, "bits")};
#undef ORU_LIMIT

Value Ask(Limit const &limit) {
    GLint numbers[2] = {0, 0};
    ORU_GL(GetIntegerv, limit.value, numbers);
    if (limit.numbers == 1)
        return {std::int64_t{numbers[0]}, limit.unit};
    return {Numbers{static_cast<std::uint64_t>(numbers[0]), static_cast<std::uint64_t>(numbers[1])},
            limit.unit};
}

std::string LowerCase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return text;
}

} // namespace

void GatherLimits(Drivers &drivers, Group &section) {
    drivers.openGL();
    for (Limit const &limit : kLimits)
        section.add(LowerCase(limit.name), std::string("GL_") + limit.name,
                    Told([&limit] { return Ask(limit); }));
}

} // namespace OruInfo
