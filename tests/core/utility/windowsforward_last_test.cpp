// Compiles only when windowsforward.h agrees with the platform's headers that come before it.
#include <windows.h>

#include <GL/gl.h>
#include <GL/wglext.h>

#include "oru/core/utility/windowsforward.h"
