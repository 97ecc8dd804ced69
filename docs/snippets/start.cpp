// The program of the start page.
// [start]
#include <oru/oru_ogl/extensionator/glcall.h>
#include <oru/oru_ogl/libraryogl.h>
#include <oru/oru_ogl/ogl/contextoffscreen_win.h>
#include <oru/oru_ogl/ogl/framebuffer.h>
#include <oru/oru_ogl/ogl/oruopengl.h>
#include <oru/oru_ogl/ogl/programogl.h>
#include <oru/oru_ogl/ogl/texture2.h>
#include <oru/oru_ogl/ogl/vertexbufferogl.h>
#include <oru/oru_ogl/platformgl.h>

#include <fstream>
#include <iostream>
#include <vector>

using namespace ORU::OGL;

int const kWidth = 320, kHeight = 240;

char const *const kVertexShader = R"(
    attribute vec2 position;
    varying vec2 place;
    void main() {
        place = position;
        gl_Position = vec4(position, 0.0, 1.0);
    })";
char const *const kFragmentShader = R"(
    varying vec2 place;
    void main() { gl_FragColor = vec4(0.5 + 0.5 * place, 0.5, 1.0); })";
float const kCorners[] = {-0.8f, -0.8f, 0.8f, -0.8f, 0.0f, 0.8f};

// OpenGL's pixels from the bottom row up, blue first, are those of a bitmap file.
void save(char const *name, std::vector<char> const &pixels) {
    BITMAPINFOHEADER format = {};
    format.biSize = sizeof format;
    format.biWidth = kWidth;
    format.biHeight = kHeight;
    format.biPlanes = 1;
    format.biBitCount = 24;
    BITMAPFILEHEADER file = {};
    file.bfType = 0x4D42; // "BM"
    file.bfOffBits = sizeof file + sizeof format;
    file.bfSize = file.bfOffBits + static_cast<DWORD>(pixels.size());
    std::ofstream stream(name, std::ios::binary);
    stream.write(reinterpret_cast<char const *>(&file), sizeof file)
        .write(reinterpret_cast<char const *>(&format), sizeof format)
        .write(pixels.data(), static_cast<std::streamsize>(pixels.size()));
}

int main() {
    try {
        AutoInitializer library;  // opens the layer for as long as it lives
        ContextOffscreen context; // on the primary display's adapter, without a window to be seen
        context.makeCurrent();

        Texture2D picture(Texture::INTERNALFORMAT_RGBA8, kWidth, kHeight, false);
        Framebuffer framebuffer; // draws into the texture
        framebuffer.bind();
        framebuffer.attach(&picture, 0, 0);
        ORU_GL(Viewport, 0, 0, kWidth, kHeight);
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);

        Program program;
        program.loadVertexShader(1, &kVertexShader, nullptr);
        program.loadFragmentShader(1, &kFragmentShader, nullptr);
        program.link(true); // a mistake in a shader is an exception with the compiler's log
        program.enable();

        VertexBuffer triangle({{"position", VertexBuffer::ATTRIBUTETYPE_FLOAT2,
                                VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
                              3, VertexBuffer::PRIMITIVETYPE_TRIANGLES);
        triangle.setField("position", reinterpret_cast<unsigned char const *>(kCorners), false, 0,
                          0);
        triangle.setupWithProgram(&program);
        triangle.marshallData();
        triangle.drawPrimitives();

        std::vector<char> pixels(kWidth * kHeight * 3);
        ORU_GL(ReadPixels, 0, 0, kWidth, kHeight, GL_BGR, GL_UNSIGNED_BYTE, pixels.data());
        save("picture.bmp", pixels);
        std::cout << "picture.bmp: " << kWidth << " x " << kHeight << " pixels, drawn by "
                  << GetGLString(GL_RENDERER) << " (OpenGL " << GetGLString(GL_VERSION) << ")\n";
    } catch (ORU::ExceptionBase const &failure) {
        std::cerr << failure << '\n'; // what failed, where in the source, and why
        return 1;
    }
}
// [start]
