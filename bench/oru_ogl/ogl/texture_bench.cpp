// Uploads and read-backs of textures against the raw calls.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/texture2.h"

#include <vector>

using namespace ORU::OGL;
using oru_bench::Compare;
using oru_bench::EntryPoint;
using oru_bench::ThreadContext;

namespace {

/// A square texture of four bytes a texel, bound, and as much memory.
struct Square {
    explicit Square(benchmark::State const &state)
        : side(static_cast<GLsizei>(state.range(0))),
          texture(Texture::INTERNALFORMAT_RGBA8, sizes(), sizes(), false),
          pixels(sizes() * sizes() * 4, 100) {
        ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID());
        ::glPixelStorei(GL_UNPACK_ALIGNMENT, 1);
        ::glPixelStorei(GL_PACK_ALIGNMENT, 1);
    }

    std::uint64_t sizes() const { return static_cast<std::uint64_t>(side); }

    ThreadContext context;
    GLsizei side;
    Texture2D texture;
    std::vector<unsigned char> pixels;
};

/// As many calls in a turn as move some megabytes.
int Calls(Square const &square) {
    return square.side <= 256 ? 64 : 1;
}

/// What an upload takes besides the call itself: a layout of its own that does not outlive it.
template<class Upload>
void WithPlainUnpackState(Upload upload) {
    ORU_PLAIN(::glPushClientAttrib(GL_CLIENT_PIXEL_STORE_BIT));
    for (int const parameter :
         {GL_UNPACK_SWAP_BYTES, GL_UNPACK_LSB_FIRST, GL_UNPACK_ROW_LENGTH, GL_UNPACK_SKIP_PIXELS,
          GL_UNPACK_SKIP_ROWS, GL_UNPACK_IMAGE_HEIGHT, GL_UNPACK_SKIP_IMAGES})
        ORU_PLAIN(::glPixelStorei(static_cast<GLenum>(parameter), 0));
    ORU_PLAIN(::glPixelStorei(GL_UNPACK_ALIGNMENT, 1));
    upload();
    ORU_PLAIN(::glPopClientAttrib());
}

/// Uploads the whole texture from memory, or from the bound buffer.
void PlainUpload(Square const &square, void const *pixels) {
    ORU_PLAIN(::glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, square.side, square.side, GL_RGBA,
                                GL_UNSIGNED_BYTE, pixels));
}

void LibraryUpload(Square &square) {
    static PixelUnpackParameters const kTight;
    square.texture.subImage(0, 0, 0, square.sizes(), square.sizes(), Texture::FORMAT_RGBA,
                            Texture::TYPE_UNSIGNED_BYTE, square.pixels.data(), kTight);
}

void Upload(benchmark::State &state) {
    Square square(state);
    Compare(
        state, Calls(square),
        [&] { WithPlainUnpackState([&] { PlainUpload(square, square.pixels.data()); }); },
        [&] { LibraryUpload(square); });
}

/// Against nothing but the upload call, for a caller whose unpack state is right already.
void UploadAgainstOneCall(benchmark::State &state) {
    Square square(state);
    Compare(
        state, Calls(square), [&] { PlainUpload(square, square.pixels.data()); },
        [&] { LibraryUpload(square); });
}

void UploadFromBuffer(benchmark::State &state) {
    Square square(state);
    Buffer buffer(static_cast<std::int64_t>(square.pixels.size()), Buffer::TYPE_PIXEL_UNPACK_BUFFER,
                  Buffer::USAGE_STREAM_DRAW, square.pixels.data());
    auto const bindBuffer = EntryPoint<PFNGLBINDBUFFERPROC>("glBindBuffer");
    PixelUnpackParameters const tight;
    Compare(
        state, Calls(square),
        [&] {
            WithPlainUnpackState([&] {
                GLint previous = 0;
                ORU_PLAIN(::glGetIntegerv(GL_PIXEL_UNPACK_BUFFER_BINDING, &previous));
                ORU_PLAIN(bindBuffer(GL_PIXEL_UNPACK_BUFFER, buffer.objectID()));
                PlainUpload(square, nullptr);
                ORU_PLAIN(bindBuffer(GL_PIXEL_UNPACK_BUFFER, static_cast<GLuint>(previous)));
            });
        },
        [&] {
            square.texture.subImage(0, 0, 0, square.sizes(), square.sizes(), Texture::FORMAT_RGBA,
                                    Texture::TYPE_UNSIGNED_BYTE, &buffer, 0, tight);
        });
}

void ReadBack(benchmark::State &state) {
    Square square(state);
    Compare(
        state, Calls(square),
        [&] {
            GLint bound = 0;
            ORU_PLAIN(::glGetIntegerv(GL_TEXTURE_BINDING_2D, &bound));
            ORU_PLAIN(::glPushClientAttrib(GL_CLIENT_PIXEL_STORE_BIT));
            ORU_PLAIN(::glPixelStorei(GL_PACK_ALIGNMENT, 1));
            ORU_PLAIN(
                ::glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_UNSIGNED_BYTE, square.pixels.data()));
            ORU_PLAIN(::glPopClientAttrib());
        },
        [&] {
            square.texture.getPixelData(square.pixels.data(), 0, Texture::FORMAT_RGBA,
                                        Texture::TYPE_UNSIGNED_BYTE, 1);
        });
}

void Sizes(benchmark::internal::Benchmark *benchmark) {
    benchmark->ArgName("side")->Arg(256)->Arg(2048)->Arg(4096);
    benchmark->UseManualTime()->MinTime(0.5)->Unit(benchmark::kMicrosecond);
}

BENCHMARK(Upload)->Apply(Sizes);
BENCHMARK(UploadAgainstOneCall)->Apply(Sizes);
BENCHMARK(UploadFromBuffer)->Apply(Sizes);
BENCHMARK(ReadBack)->Apply(Sizes);

} // namespace
