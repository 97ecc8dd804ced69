// Finds out by drawing whether an implementation filters floating-point textures linearly.
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/contextservices.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/platformgl.h"

#include <array>
#include <cstddef>

namespace ORU::OGL::internal {

namespace {

constexpr GLsizei kTestedSize = 16;
constexpr GLsizei kShownSize = 32;
constexpr std::size_t kChannels = 3;

/// A rectangle from the origin to (right, 1), with texture coordinates that equal the positions.
void DrawRectangle(GLfloat right, bool textured) {
    ORU_GL(Begin, GL_QUADS);
    try {
        ORU_GL(Color3f, 1, 1, 1);
        GLfloat const corners[][2] = {{0, 0}, {0, 1}, {right, 1}, {right, 0}};
        for (auto const &corner : corners) {
            if (textured)
                ORU_GL(TexCoord2f, corner[0], corner[1]);
            ORU_GL(Vertex2f, corner[0], corner[1]);
        }
    } catch (...) {
        // The error checker is one for all contexts: left inside, it would check no call any more.
        DropExceptions([] { ORU_GL0(End); });
        throw;
    }
    ORU_GL0(End);
}

/// The left half white, the right half black.
void DrawEdge() {
    ORU_GL(MatrixMode, GL_PROJECTION);
    ORU_GL0(LoadIdentity);
    ORU_GL(Ortho, 0, 1, 0, 1, -1, 1);
    ORU_GL(Viewport, 0, 0, kTestedSize, kTestedSize);
    ORU_GL(ClearColor, 0, 0, 0, 0);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    DrawRectangle(0.5f, false);
}

/// The texture at twice its size, so that filtering shows between its texels.
void DrawEnlarged(Texture2D &tested) {
    ORU_GL(Viewport, 0, 0, kShownSize, kShownSize);
    ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    ORU_GL(ActiveTexture, GL_TEXTURE0);
    ORU_GL(BindTexture, GL_TEXTURE_2D, tested.objectID());
    ORU_GL(Enable, GL_TEXTURE_2D);
    tested.setFilter(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR);
    DrawRectangle(1, true);
}

/// Whether the bottom row has anything between black and white: a linear filter smears the edge.
bool HasGrey(Texture2D const &shown) {
    std::array<unsigned char, kChannels * kShownSize * kShownSize> pixels{};
    ORU_GL(BindTexture, GL_TEXTURE_2D, shown.objectID());
    shown.getPixelData(pixels.data(), 0, Texture::FORMAT_RGB, Texture::TYPE_UNSIGNED_BYTE, 1);
    for (std::size_t x = 0; x < kShownSize; ++x) {
        unsigned char const red = pixels[x * kChannels];
        if (red > 0 && red < 255)
            return true;
    }
    return false;
}

/// Draws in a context of its own, so that nothing of the current one changes.
bool FiltersLinearly(Texture::InternalFormat format) {
    ScopedContextWrapper const restoreCurrent;
    ContextWrapped const wrapped;
    // It draws by fixed functions, whatever the host wants of its own contexts.
    ExtensionManager::ScopedInitOptions const anyContext{ExtensionManager::InitOptions()};
    ContextOffscreen const offscreen(&wrapped);
    offscreen.makeCurrent();

    Texture2D tested(format, kTestedSize, kTestedSize, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&tested, 0, 0);
    DrawEdge();

    Texture2D shown(Texture::INTERNALFORMAT_RGBA8, kShownSize, kShownSize, false);
    framebuffer.attach(&shown, 0, 0);
    DrawEnlarged(tested);
    framebuffer.detach(&shown, 0);
    ORU_GL(Disable, GL_TEXTURE_2D);
    return HasGrey(shown);
}

} // namespace

bool FiltersFloatsLinearly() {
    return FiltersLinearly(Texture::INTERNALFORMAT_RGBA32F_ARB);
}

bool FiltersHalvesLinearly() {
    return FiltersLinearly(Texture::INTERNALFORMAT_RGBA16F_ARB);
}

} // namespace ORU::OGL::internal
