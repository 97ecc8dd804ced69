// What a host of Microsoft's compiler uses of the binary package: functions of C, through oru.lib.
// It has no run-time library, so that Clang and LLVM's linker can make it on any machine.
#include <oru/oru_ogl/extensionator/opengltokenname.h>

extern "C" int Start() {
    char const *name = ORUOGLTokenName(0x0DE1);
    for (char const *expected = "GL_TEXTURE_2D"; *expected != 0 || *name != 0; ++expected, ++name)
        if (*expected != *name)
            return 1;
    return 0;
}
