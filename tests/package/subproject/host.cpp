// Sees the library's headers, the generated ones too.
#include <oru/oru_ocl/commandqueue.h>
#include <oru/oru_ogl/extensionator/glcall.h>

void Draw() {
    ORU_GL(DrawArrays, 0x0004u, 0, 3);
}
