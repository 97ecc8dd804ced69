// Framebuffer transfers, cube maps and samplers against the plain calls with their error queries.
#include "bench/comparison.h"
#include "bench/glcontext.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/buffertexture.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/samplerbindscope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texturecube.h"

#include <array>
#include <vector>

using namespace ORU::OGL;
using oru_bench::Compare;
using oru_bench::EntryPoint;
using oru_bench::ThreadContext;

namespace {

GLsizei const kSide = 256;
ORU::IntegerRect const kAll({0, 0}, ORU::size2(kSide, kSide));
auto const kRGBA8 = Texture::INTERNALFORMAT_RGBA8;

/// Two textures with a framebuffer each, neither bound, and the entry points.
struct Fixture {
    Fixture() {
        for (std::size_t i = 0; i < 2; ++i) {
            framebuffers[i].bind();
            framebuffers[i].attachTexture(textures[i], 0, Framebuffer::ATTACHMENT_COLOR0);
        }
        Framebuffer::BindDefault();
    }

    /// A framebuffer bound for one call, with what was bound before bound again.
    template<class Call>
    void with(GLenum target, GLenum query, std::size_t framebuffer, Call call) const {
        GLint previous = 0;
        ORU_PLAIN(::glGetIntegerv(query, &previous));
        ORU_PLAIN(bind(target, framebuffers[framebuffer].objectID()));
        call();
        ORU_PLAIN(bind(target, static_cast<GLuint>(previous)));
    }

    ThreadContext context;
    std::array<Texture2D, 2> textures = {Texture2D(kRGBA8, kSide, kSide, false),
                                         Texture2D(kRGBA8, kSide, kSide, false)};
    std::array<Framebuffer, 2> framebuffers;
    PFNGLBINDFRAMEBUFFERPROC bind = EntryPoint<PFNGLBINDFRAMEBUFFERPROC>("glBindFramebuffer");
    std::vector<unsigned char> pixels = std::vector<unsigned char>(std::size_t{4} * kSide * kSide);
};

void Blit(benchmark::State &state) {
    Fixture fixture;
    auto const blit = EntryPoint<PFNGLBLITFRAMEBUFFERPROC>("glBlitFramebuffer");
    Compare(
        state, 16,
        [&] {
            fixture.with(GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING, 0, [&] {
                fixture.with(GL_DRAW_FRAMEBUFFER, GL_DRAW_FRAMEBUFFER_BINDING, 1, [&] {
                    ORU_PLAIN(blit(0, 0, kSide, kSide, 0, 0, kSide, kSide, GL_COLOR_BUFFER_BIT,
                                   GL_NEAREST));
                });
            });
        },
        [&] {
            Framebuffer::Blit(&fixture.framebuffers[0], kAll, &fixture.framebuffers[1], kAll,
                              Framebuffer::CONTENTS_COLOR, Texture::FILTER_NEAREST);
        });
}

void ClearPart(benchmark::State &state) {
    Fixture fixture;
    auto const clear = EntryPoint<PFNGLCLEARBUFFERFVPROC>("glClearBufferfv");
    auto const enable = EntryPoint<PFNGLENABLEIPROC>("glEnablei");
    auto const disable = EntryPoint<PFNGLDISABLEIPROC>("glDisablei");
    auto const scissor = EntryPoint<PFNGLSCISSORINDEXEDPROC>("glScissorIndexed");
    float const colour[4] = {1, 0.5f, 0, 1};
    Compare(
        state, 16,
        [&] {
            fixture.with(GL_DRAW_FRAMEBUFFER, GL_DRAW_FRAMEBUFFER_BINDING, 0, [&] {
                GLint box[4];
                ORU_PLAIN(::glIsEnabled(GL_SCISSOR_TEST));
                ORU_PLAIN(::glGetIntegerv(GL_SCISSOR_BOX, box));
                ORU_PLAIN(scissor(0, 0, 0, kSide, kSide));
                ORU_PLAIN(enable(GL_SCISSOR_TEST, 0));
                ORU_PLAIN(clear(GL_COLOR, 0, colour));
                ORU_PLAIN(disable(GL_SCISSOR_TEST, 0));
                ORU_PLAIN(scissor(0, box[0], box[1], box[2], box[3]));
            });
        },
        [&] { Framebuffer::ClearColor(&fixture.framebuffers[0], 0, colour, &kAll); });
}

void ReadPart(benchmark::State &state) {
    Fixture fixture;
    Compare(
        state, 16,
        [&] {
            fixture.with(GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING, 0, [&] {
                ORU_PLAIN(::glPushClientAttrib(GL_CLIENT_PIXEL_STORE_BIT));
                ORU_PLAIN(::glPixelStorei(GL_PACK_ALIGNMENT, 1));
                ORU_PLAIN(::glReadPixels(0, 0, kSide, kSide, GL_RGBA, GL_UNSIGNED_BYTE,
                                         fixture.pixels.data()));
                ORU_PLAIN(::glPopClientAttrib());
            });
        },
        [&] {
            Framebuffer::Read(&fixture.framebuffers[0], kAll, Texture::FORMAT_RGBA,
                              Texture::TYPE_UNSIGNED_BYTE, fixture.pixels.data(), 1);
        });
}

void UploadFace(benchmark::State &state) {
    Fixture fixture;
    TextureCube cube(kRGBA8, kSide, false);
    ORU_GL(BindTexture, GL_TEXTURE_CUBE_MAP, cube.objectID());
    PixelUnpackParameters const tight;
    Compare(
        state, 16,
        [&] {
            ORU_PLAIN(::glPushClientAttrib(GL_CLIENT_PIXEL_STORE_BIT));
            for (int const parameter :
                 {GL_UNPACK_SWAP_BYTES, GL_UNPACK_LSB_FIRST, GL_UNPACK_ROW_LENGTH,
                  GL_UNPACK_SKIP_PIXELS, GL_UNPACK_SKIP_ROWS, GL_UNPACK_IMAGE_HEIGHT,
                  GL_UNPACK_SKIP_IMAGES})
                ORU_PLAIN(::glPixelStorei(static_cast<GLenum>(parameter), 0));
            ORU_PLAIN(::glPixelStorei(GL_UNPACK_ALIGNMENT, 1));
            ORU_PLAIN(::glTexSubImage2D(GL_TEXTURE_CUBE_MAP_NEGATIVE_Z, 0, 0, 0, kSide, kSide,
                                        GL_RGBA, GL_UNSIGNED_BYTE, fixture.pixels.data()));
            ORU_PLAIN(::glPopClientAttrib());
        },
        [&] {
            cube.subImage(TextureCube::FACE_NEGATIVE_Z, 0, 0, 0, kSide, kSide, Texture::FORMAT_RGBA,
                          Texture::TYPE_UNSIGNED_BYTE, fixture.pixels.data(), tight);
        });
}

void BindSampler(benchmark::State &state) {
    Fixture fixture;
    Sampler const sampler(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR, Texture::WRAPMODE_REPEAT);
    auto const bindSampler = EntryPoint<PFNGLBINDSAMPLERPROC>("glBindSampler");
    Compare(
        state, 500,
        [&] {
            GLint active = 0, previous = 0;
            ORU_PLAIN(::glGetIntegerv(GL_ACTIVE_TEXTURE, &active));
            ORU_PLAIN(::glGetIntegerv(GL_SAMPLER_BINDING, &previous));
            ORU_PLAIN(bindSampler(0, sampler.objectID()));
            ORU_PLAIN(bindSampler(0, static_cast<GLuint>(previous)));
        },
        [&] { SamplerBindScope const scope(sampler, 0); });
}

void MakeBufferTexture(benchmark::State &state) {
    Fixture fixture;
    Buffer const buffer(1024, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
    auto const texBuffer = EntryPoint<PFNGLTEXBUFFERPROC>("glTexBuffer");
    Compare(
        state, 100,
        [&] {
            GLuint name = 0;
            GLint previous = 0;
            ORU_PLAIN(::glGenTextures(1, &name));
            ORU_PLAIN(::glGetIntegerv(GL_TEXTURE_BINDING_BUFFER, &previous));
            ORU_PLAIN(::glBindTexture(GL_TEXTURE_BUFFER, name));
            ORU_PLAIN(texBuffer(GL_TEXTURE_BUFFER, GL_RGBA8, buffer.objectID()));
            ORU_PLAIN(::glBindTexture(GL_TEXTURE_BUFFER, static_cast<GLuint>(previous)));
            ORU_PLAIN(::glDeleteTextures(1, &name));
        },
        [&] { BufferTexture const texture(kRGBA8, buffer); });
}

void Times(benchmark::internal::Benchmark *benchmark) {
    benchmark->UseManualTime()->MinTime(0.5)->Unit(benchmark::kMicrosecond);
}

BENCHMARK(Blit)->Apply(Times);
BENCHMARK(ClearPart)->Apply(Times);
BENCHMARK(ReadPart)->Apply(Times);
BENCHMARK(UploadFace)->Apply(Times);
BENCHMARK(BindSampler)->Apply(Times);
BENCHMARK(MakeBufferTexture)->Apply(Times);

} // namespace
