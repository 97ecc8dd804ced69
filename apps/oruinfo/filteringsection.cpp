// Whether floating-point textures are filtered.
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

namespace OruInfo {

using namespace ORU::OGL;

namespace {

/// Why a probe answered no: it was not made, or it was made in vain.
Value WhyNot(bool isFiltered, bool hasTextures, std::string const &missing) {
    if (isFiltered)
        return Unavailable{};
    if (!hasTextures)
        return "there are no such textures: " + missing;
    return ExtensionManager::Instance()->supportsRenderToTexture()
               ? std::string("the test picture shows none, or could not be drawn")
               : std::string("not tested, as WGL_ARB_render_texture is missing");
}

} // namespace

void GatherFiltering(Drivers &drivers, Group &section) {
    drivers.openGL();
    ExtensionManager &record = *ExtensionManager::Instance();
    bool const floats = record.supportsFloatFiltering();
    bool const halves = record.supportsHalfFiltering();
    Table probes{{{"texels", "Texels"}, {"is_filtered", "Filtered"}, {"why_not", "Why not"}}, {}};
    probes.rows.push_back({std::string("32-bit floats"), floats,
                           WhyNot(floats, record.supportsFloatingPointTextures(),
                                  "GL_ARB_texture_float is missing")});
    bool const hasHalves = record.isSupported(GL_EXT_GPU_SHADER4) && record.supports16BitFloat();
    probes.rows.push_back(
        {std::string("16-bit floats"), halves,
         WhyNot(halves, hasHalves, "GL_EXT_gpu_shader4 or GL_ARB_half_float_pixel is missing")});
    section.add("probes", "Linear filtering", probes);
}

} // namespace OruInfo
