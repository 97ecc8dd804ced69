// Streams frames into a texture through two pixel buffers, and saves a contact sheet of them.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/ogl/texture2.h"

using namespace ORU::OGL;

namespace {

unsigned int const kSide = 80;              ///< pixels of a frame, which is square
unsigned int const kColumns = 4, kRows = 3; ///< frames of the contact sheet

/// What a camera would deliver: rings that run outwards, from the bottom row to the top.
void WriteFrame(unsigned int number, unsigned char *pixels) {
    for (unsigned int y = 0; y < kSide; ++y) {
        for (unsigned int x = 0; x < kSide; ++x) {
            unsigned int const dx = 2 * x + 1 > kSide ? 2 * x + 1 - kSide : kSide - 2 * x - 1;
            unsigned int const dy = 2 * y + 1 > kSide ? 2 * y + 1 - kSide : kSide - 2 * y - 1;
            unsigned int const ring = (dx * dx + dy * dy) / 32 - 20 * number;
            *pixels++ = static_cast<unsigned char>(ring);
            *pixels++ = static_cast<unsigned char>(3 * x);
            *pixels++ = static_cast<unsigned char>(3 * y);
            *pixels++ = 255;
        }
    }
}

void Stream(std::filesystem::path const &file) {
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();

    unsigned int const bytes = 4 * kSide * kSide;
    // While OpenGL still reads one buffer, the next frame is written into the other.
    Buffer first(bytes, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    Buffer second(bytes, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);

    unsigned int const width = kColumns * kSide, height = kRows * kSide;
    Texture2D sheet(Texture::INTERNALFORMAT_RGBA8, width, height, false);
    ORU_GL(BindTexture, sheet.target(), sheet.objectID());
    for (unsigned int i = 0; i < kColumns * kRows; ++i) {
        Buffer &buffer = i % 2 == 0 ? first : second;
        buffer.bind();
        WriteFrame(i, static_cast<unsigned char *>(buffer.map(GL_WRITE_ONLY)));
        buffer.unmap();
        Buffer::BindDefaultUnpackBuffer();
        // The frames run like text: from the upper left to the lower right.
        int const x = static_cast<int>(i % kColumns * kSide);
        int const y = static_cast<int>((kRows - 1 - i / kColumns) * kSide);
        sheet.subImage(0, x, y, kSide, kSide, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                       &buffer, 0, PixelUnpackParameters());
    }
    ORU_GL(BindTexture, sheet.target(), 0u);

    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&sheet, 0, 0);
    example::SavePicture(file, width, height);
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, Stream);
}
