// The pixel formats of a device context.
#pragma once

#include "oru/core/utility/windowsforward.h"

#include <string>
#include <vector>

namespace OruInfo {

/// What windows can be drawn into with. Two formats that differ in nothing of this look the same to
/// a host.
struct PixelFormat {
    int red = 0, green = 0, blue = 0, alpha = 0;
    std::string type;         ///< "RGBA", "RGBA float" or "colour index"
    std::string acceleration; ///< "full", "generic" or "none"
    bool toWindow = false, toBitmap = false, toPbuffer = false;
    int depth = 0, stencil = 0, accumulation = 0;
    int samples = 0;
    bool isDoubleBuffered = false, isStereo = false, isSRGB = false;
};

/// All formats that OpenGL supports, by their number, which counts from 1. Numbers that it does not
/// support are left out.
struct NumberedFormat {
    int number;
    PixelFormat format;
};

/// By WGL_ARB_pixel_format where the current context has it, and otherwise by GDI, which knows of
/// neither floating-point, multisampled nor sRGB formats.
/// @throws InternalException when the system does not describe a format
std::vector<NumberedFormat> ListPixelFormats(HDC dc);

} // namespace OruInfo
