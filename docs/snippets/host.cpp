// The program that the readme shows.
// [host]
#include <oru/oru_ogl/extensionator/glcall.h>
#include <oru/oru_ogl/libraryogl.h>
#include <oru/oru_ogl/ogl/contextoffscreen_win.h>

#include <iostream>

int main() {
    try {
        ORU::OGL::AutoInitializer library;
        ORU::OGL::ContextOffscreen context; // on the primary display's adapter
        context.makeCurrent();

        auto const &gpu = *ORU::OGL::ExtensionManager::Instance();
        std::cout << context.displayDeviceKey().adapterName << ": OpenGL " << gpu.majorVersion()
                  << '.' << gpu.minorVersion() << ", " << gpu.supportedExtensions().size()
                  << " capabilities\n";

        if (gpu.supportsFloatingPointTextures())
            std::cout << gpu.numberOfTextureUnits() << " texture units, float textures\n";

        ORU_GL(BindTexture, 0x1234, 1u); // not a texture target
    } catch (ORU::ExceptionBase const &failure) {
        // ORU logical exception main.cpp:21 (GL_INVALID_ENUM) in glBindTexture
        std::cerr << failure << '\n';
        return 1;
    }
}
// [host]
