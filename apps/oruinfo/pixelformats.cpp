// The pixel formats of a device context.
#include "apps/oruinfo/pixelformats.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"
#include "oru/oru_ogl/platformgl.h"

#include <map>

namespace OruInfo {

using namespace ORU::OGL;

namespace {

/// What to ask of each format. A driver refuses a question with an attribute that it does not know.
std::vector<int> Attributes() {
    ExtensionManager const &record = *ExtensionManager::Instance();
    std::vector<int> attributes = {
        WGL_SUPPORT_OPENGL_ARB, WGL_RED_BITS_ARB,   WGL_GREEN_BITS_ARB,   WGL_BLUE_BITS_ARB,
        WGL_ALPHA_BITS_ARB,     WGL_PIXEL_TYPE_ARB, WGL_ACCELERATION_ARB, WGL_DRAW_TO_WINDOW_ARB,
        WGL_DRAW_TO_BITMAP_ARB, WGL_DEPTH_BITS_ARB, WGL_STENCIL_BITS_ARB, WGL_ACCUM_BITS_ARB,
        WGL_DOUBLE_BUFFER_ARB,  WGL_STEREO_ARB};
    if (record.isSupported(WGL_ARB_PBUFFER))
        attributes.push_back(WGL_DRAW_TO_PBUFFER_ARB);
    if (record.isSupported(WGL_ARB_MULTISAMPLE))
        attributes.push_back(WGL_SAMPLES_ARB);
    return attributes;
}

std::string TypeName(int type) {
    switch (type) {
    case WGL_TYPE_RGBA_ARB:
        return "RGBA";
    case WGL_TYPE_RGBA_FLOAT_ARB:
        return "RGBA float";
    case WGL_TYPE_RGBA_UNSIGNED_FLOAT_EXT:
        return "RGBA unsigned float";
    case WGL_TYPE_COLORINDEX_ARB:
        return "colour index";
    default:
        return "type " + std::to_string(type);
    }
}

std::string AccelerationName(int acceleration) {
    return acceleration == WGL_FULL_ACCELERATION_ARB      ? "full"
           : acceleration == WGL_GENERIC_ACCELERATION_ARB ? "generic"
                                                          : "none";
}

bool KnowsSRGB(HDC dc) {
    char const *const names =
        _wcgmGetExtensionsStringARB ? _wcgmGetExtensionsStringARB(dc) : nullptr;
    return names && std::string(names).find("_framebuffer_sRGB") != std::string::npos;
}

std::vector<NumberedFormat> ListByARB(HDC dc) {
    std::vector<int> attributes = Attributes();
    if (KnowsSRGB(dc))
        attributes.push_back(WGL_FRAMEBUFFER_SRGB_CAPABLE_ARB);
    auto const ask = [dc](int number, std::vector<int> const &about) {
        std::vector<int> values(about.size());
        if (!_wcgmGetPixelFormatAttribivARB(dc, number, 0, static_cast<UINT>(about.size()),
                                            about.data(), values.data()))
            ORU_THROW_INTERNAL("wglGetPixelFormatAttribivARB refuses pixel format " +
                               std::to_string(number));
        return values;
    };
    int const count = ask(1, {WGL_NUMBER_PIXEL_FORMATS_ARB})[0];
    std::vector<NumberedFormat> formats;
    for (int number = 1; number <= count; ++number) {
        std::vector<int> const values = ask(number, attributes);
        std::map<int, int> of; // what was not asked is 0
        for (std::size_t i = 0; i < values.size(); ++i)
            of[attributes[i]] = values[i];
        if (!of[WGL_SUPPORT_OPENGL_ARB])
            continue;
        PixelFormat format;
        format.red = of[WGL_RED_BITS_ARB];
        format.green = of[WGL_GREEN_BITS_ARB];
        format.blue = of[WGL_BLUE_BITS_ARB];
        format.alpha = of[WGL_ALPHA_BITS_ARB];
        format.type = TypeName(of[WGL_PIXEL_TYPE_ARB]);
        format.acceleration = AccelerationName(of[WGL_ACCELERATION_ARB]);
        format.toWindow = of[WGL_DRAW_TO_WINDOW_ARB] != 0;
        format.toBitmap = of[WGL_DRAW_TO_BITMAP_ARB] != 0;
        format.toPbuffer = of[WGL_DRAW_TO_PBUFFER_ARB] != 0;
        format.depth = of[WGL_DEPTH_BITS_ARB];
        format.stencil = of[WGL_STENCIL_BITS_ARB];
        format.accumulation = of[WGL_ACCUM_BITS_ARB];
        format.samples = of[WGL_SAMPLES_ARB];
        format.isDoubleBuffered = of[WGL_DOUBLE_BUFFER_ARB] != 0;
        format.isStereo = of[WGL_STEREO_ARB] != 0;
        format.isSRGB = of[WGL_FRAMEBUFFER_SRGB_CAPABLE_ARB] != 0;
        formats.push_back({number, format});
    }
    return formats;
}

std::vector<NumberedFormat> ListByGDI(HDC dc) {
    std::vector<NumberedFormat> formats;
    int count = 1;
    for (int number = 1; number <= count; ++number) {
        PIXELFORMATDESCRIPTOR told = {};
        count = ::DescribePixelFormat(dc, number, sizeof told, &told);
        if (count == 0)
            ORU_THROW_INTERNAL("DescribePixelFormat refuses pixel format " +
                               std::to_string(number));
        auto const has = [&told](DWORD flag) { return (told.dwFlags & flag) != 0; };
        if (!has(PFD_SUPPORT_OPENGL))
            continue;
        PixelFormat format;
        format.red = told.cRedBits;
        format.green = told.cGreenBits;
        format.blue = told.cBlueBits;
        format.alpha = told.cAlphaBits;
        format.type = told.iPixelType == PFD_TYPE_RGBA ? "RGBA" : "colour index";
        format.acceleration = !has(PFD_GENERIC_FORMAT)       ? "full"
                              : has(PFD_GENERIC_ACCELERATED) ? "generic"
                                                             : "none";
        format.toWindow = has(PFD_DRAW_TO_WINDOW);
        format.toBitmap = has(PFD_DRAW_TO_BITMAP);
        format.depth = told.cDepthBits;
        format.stencil = told.cStencilBits;
        format.accumulation = told.cAccumBits;
        format.isDoubleBuffered = has(PFD_DOUBLEBUFFER);
        format.isStereo = has(PFD_STEREO);
        formats.push_back({number, format});
    }
    return formats;
}

} // namespace

std::vector<NumberedFormat> ListPixelFormats(HDC dc) {
    return ExtensionManager::Instance()->isSupported(WGL_ARB_PIXEL_FORMAT) ? ListByARB(dc)
                                                                           : ListByGDI(dc);
}

} // namespace OruInfo
