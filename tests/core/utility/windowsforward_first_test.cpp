// Compiles only when windowsforward.h agrees with the platform's headers that come after it.
#include "oru/core/utility/windowsforward.h"

#include <windows.h>

#include <GL/gl.h>
#include <GL/wglext.h>
