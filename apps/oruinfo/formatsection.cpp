// What can be done with each internal format.
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/formatprobe.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/platformgl.h"

namespace OruInfo {

using ORU::OGL::Texture;

namespace {

/// Those of the library's textures, then others that programs draw into or read.
std::vector<GLenum> Formats() {
    std::vector<GLenum> formats;
    for (unsigned int value = 0; value <= Texture::INTERNALFORMAT_LUMINANCE_ALPHA16F_ARB; ++value)
        formats.push_back(Texture::InternalFormat2GL(static_cast<Texture::InternalFormat>(value)));
    formats.insert(formats.end(),
                   {GL_R8, GL_RG8, GL_SRGB8, GL_SRGB8_ALPHA8, GL_R11F_G11F_B10F, GL_RGB9_E5,
                    GL_DEPTH_COMPONENT16, GL_DEPTH_COMPONENT24, GL_DEPTH_COMPONENT32,
                    GL_DEPTH_COMPONENT32F, GL_DEPTH24_STENCIL8, GL_DEPTH32F_STENCIL8});
    return formats;
}

} // namespace

void GatherFormats(Drivers &drivers, Group &section) {
    drivers.openGL();
    FormatProbe probe;
    Table table{{{"name", "Format"},
                 {"is_texture", "Texture"},
                 {"is_renderable", "Drawn into"},
                 {"is_filtered", "Filtered"},
                 {"samples", "Samples"}},
                {}};
    for (GLenum const format : Formats()) {
        FormatAnswers const answers = probe.ask(format);
        Value const filtered =
            FormatProbe::HasDepth(format) ? Value(Unavailable{}) : Value(answers.isFiltered);
        table.rows.push_back({std::string(ORUOGLTokenName(format)), answers.isTexture,
                              answers.isRenderable, filtered, std::uint64_t{answers.samples}});
    }
    section.add("formats", "As tried, one after the other", table);
}

} // namespace OruInfo
