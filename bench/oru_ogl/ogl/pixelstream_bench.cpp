// Pixel views and streams against the raw calls.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelreadstream.h"
#include "oru/oru_ogl/ogl/pixeluploadstream.h"
#include "oru/oru_ogl/ogl/texture2.h"

#include <cstring>
#include <vector>

using namespace ORU::OGL;
using oru_bench::Compare;
using oru_bench::ThreadContext;

namespace {

/// A texture of four bytes a texel, bound, and a frame for it.
struct Picture {
    explicit Picture(benchmark::State const &state)
        : width(static_cast<GLsizei>(state.range(0))),
          height(static_cast<GLsizei>(state.range(1))), shape{Texture::FORMAT_RGBA,
                                                              Texture::TYPE_UNSIGNED_BYTE,
                                                              size(width), size(height)},
          texture(Texture::INTERNALFORMAT_RGBA8, shape.width, shape.height, false),
          frame(shape.bytes(), 100), memory(frame) {
        ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
    }

    static std::uint64_t size(GLsizei side) { return static_cast<std::uint64_t>(side); }
    int calls() const { return frame.size() <= 1 << 18 ? 64 : 4; }

    /// What a host does with a frame anyway: it writes one from what it has, or reads one.
    static void Copy(void *to, void const *from, std::size_t bytes) {
        std::memcpy(to, from, bytes);
    }

    ThreadContext context;
    GLsizei width, height;
    PixelShape shape;
    Texture2D texture;
    std::vector<unsigned char> frame, memory;
};

/// A transfer with a layout of its own that does not outlive it.
template<class Transfer>
void WithPlainState(std::initializer_list<GLenum> zeros, GLenum alignment, Transfer transfer) {
    ORU_PLAIN(::glPushClientAttrib(GL_CLIENT_PIXEL_STORE_BIT));
    for (GLenum const parameter : zeros)
        ORU_PLAIN(::glPixelStorei(parameter, 0));
    ORU_PLAIN(::glPixelStorei(alignment, 1));
    transfer();
    ORU_PLAIN(::glPopClientAttrib());
}

void PlainUpload(Picture const &picture, void const *pixels) {
    WithPlainState(
        {GL_UNPACK_SWAP_BYTES, GL_UNPACK_LSB_FIRST, GL_UNPACK_ROW_LENGTH, GL_UNPACK_SKIP_PIXELS,
         GL_UNPACK_SKIP_ROWS, GL_UNPACK_IMAGE_HEIGHT, GL_UNPACK_SKIP_IMAGES},
        GL_UNPACK_ALIGNMENT, [&] {
            ORU_PLAIN(::glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, picture.width, picture.height,
                                        GL_RGBA, GL_UNSIGNED_BYTE, pixels));
        });
}

template<class Read>
void PlainRead(Read read) {
    WithPlainState({GL_PACK_SWAP_BYTES, GL_PACK_LSB_FIRST, GL_PACK_ROW_LENGTH, GL_PACK_SKIP_PIXELS,
                    GL_PACK_SKIP_ROWS},
                   GL_PACK_ALIGNMENT, read);
}

void UploadView(benchmark::State &state) {
    Picture picture(state);
    Compare(
        state, picture.calls(), [&] { PlainUpload(picture, picture.frame.data()); },
        [&] {
            picture.texture.subImage(
                0, 0, 0, PixelView(picture.frame.data(), picture.frame.size(), picture.shape));
        });
}

void ReadView(benchmark::State &state) {
    Picture picture(state);
    Compare(
        state, picture.calls(),
        [&] {
            GLint bound = 0;
            ORU_PLAIN(::glGetIntegerv(GL_TEXTURE_BINDING_2D, &bound));
            PlainRead([&] {
                ORU_PLAIN(::glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_UNSIGNED_BYTE,
                                          picture.frame.data()));
            });
        },
        [&] {
            picture.texture.getPixelData(
                MutablePixelView(picture.frame.data(), picture.frame.size(), picture.shape), 0);
        });
}

void UploadStream(benchmark::State &state) {
    Picture picture(state);
    PixelUploadStream stream(picture.shape);
    Compare(
        state, picture.calls(),
        [&] {
            Picture::Copy(picture.memory.data(), picture.frame.data(), picture.frame.size());
            PlainUpload(picture, picture.memory.data());
        },
        [&] {
            MutablePixelView const frame = stream.begin();
            Picture::Copy(frame.data(), picture.frame.data(), frame.bytes());
            stream.upload(picture.texture, 0, 0, 0);
        });
}

void ReadStream(benchmark::State &state) {
    Picture picture(state);
    Framebuffer framebuffer;
    ORU_GL(BindTexture, GL_TEXTURE_2D, 0u);
    framebuffer.bind();
    framebuffer.attach(&picture.texture, 0, 0);
    PixelReadStream stream(picture.shape);
    Compare(
        state, picture.calls(),
        [&] {
            PlainRead([&] {
                ORU_PLAIN(::glReadPixels(0, 0, picture.width, picture.height, GL_RGBA,
                                         GL_UNSIGNED_BYTE, picture.memory.data()));
            });
            Picture::Copy(picture.frame.data(), picture.memory.data(), picture.frame.size());
        },
        [&] {
            if (stream.isFull() || stream.isReady()) {
                PixelView const frame = stream.begin();
                Picture::Copy(picture.frame.data(), frame.data(), frame.bytes());
                stream.end();
            }
            stream.read(0, 0);
        });
    framebuffer.unbind();
}

void Sizes(benchmark::internal::Benchmark *benchmark) {
    benchmark->ArgNames({"width", "height"})->Args({256, 256})->Args({1920, 1080});
    benchmark->UseManualTime()->MinTime(0.5)->Unit(benchmark::kMicrosecond);
}

BENCHMARK(UploadView)->Apply(Sizes);
BENCHMARK(ReadView)->Apply(Sizes);
BENCHMARK(UploadStream)->Apply(Sizes);
BENCHMARK(ReadStream)->Apply(Sizes);

} // namespace
