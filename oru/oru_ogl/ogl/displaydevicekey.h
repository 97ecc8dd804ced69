// The name of a display device, at the path where hosts look for it.
#pragma once

#include "oru/oru_ogl/displaydevicekey.h"
