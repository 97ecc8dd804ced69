// Uses of the textures, samplers and framebuffers of OpenGL 3 and 4.
#include "bench/sweep/faults.h"
#include "bench/sweep/opengl3.h"

#include "oru/core/utility/integerrect.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/buffertexture.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelview.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/samplerbindscope.h"
#include "oru/oru_ogl/ogl/texture1.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture2dmultisample.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "oru/oru_ogl/ogl/texturecube.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/platformgl.h"

#include <array>
#include <stdexcept>
#include <vector>

namespace sweep {

using namespace ORU::OGL;

namespace {

constexpr auto kRGBA8 = Texture::INTERNALFORMAT_RGBA8;
constexpr auto kRGBA = Texture::FORMAT_RGBA;
constexpr auto kBytes = Texture::TYPE_UNSIGNED_BYTE;

} // namespace

void LaterTextures() {
    std::vector<unsigned char> pixels(1024);
    PixelUnpackParameters const plain;
    TextureCube sky(kRGBA8, 8, true);
    TextureUnit::Unit(0)->bind(&sky);
    auto const face = TextureCube::FACE_NEGATIVE_Z;
    sky.subImage(face, 0, 0, 0, 8, 8, kRGBA, kBytes, pixels.data(), plain);
    sky.generateMipmap();
    sky.getPixelData(face, pixels.data(), 0, kRGBA, kBytes, 1);
    sky.setLevelRange(0, 2);
    sky.setSwizzle(Texture::SWIZZLE_RED, Texture::SWIZZLE_RED, Texture::SWIZZLE_RED,
                   Texture::SWIZZLE_ONE);
    sky.setCompare(Texture::COMPARE_NONE);
    sky.setMaxAnisotropy(2);
    TextureCubeArray const rooms(kRGBA8, 4, 2, false);
    Texture2D blocks(Texture::INTERNALFORMAT_COMPRESSED_RED_RGTC1, 8, 8, false);
    TextureUnit::Unit(0)->bind(&blocks);
    blocks.compressedSubImage(0, 0, 0, 8, 8, pixels.data(), 32);
    blocks.getCompressedData(pixels.data(), 32, 0);
    Texture2DArray layers(Texture::INTERNALFORMAT_COMPRESSED_RED_RGTC1, 8, 8, 2, false);
    TextureUnit::Unit(0)->bind(&layers);
    layers.compressedSubImage(0, 0, 0, 0, 8, 8, 2, pixels.data(), 64);
    Texture3D volume(kRGBA8, 8, 8, 2, false);
    TextureUnit::Unit(0)->bind(&volume);
    volume.copyTexSubImage(0, 0, 0, 1, 0, 0, 8, 8);
    Buffer buffer(256, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
    BufferTexture const row(kRGBA8, buffer);
    Sampler smooth(Texture::FILTER_LINEAR, Texture::FILTER_LINEAR, Texture::WRAPMODE_REPEAT);
    float const border[4] = {};
    smooth.setBorderColor(border);
    smooth.setMaxAnisotropy(2);
    smooth.setCompare(Texture::COMPARE_NONE);
    smooth.setLevelOfDetailRange(0, 2);
    smooth.setLevelOfDetailBias(0);
    smooth.bind(1);
    Sampler::BindDefault(1);
    SamplerBindScope const scope(smooth, 1);
    BeginEnd();
}

void FramebufferTransfers() {
    ORU::IntegerRect const all({0, 0}, ORU::size2(8, 8));
    std::array<unsigned char, 256> pixels = {};
    float const colour[4] = {};
    Texture2D picture(kRGBA8, 8, 8, false);
    Texture2DMultisample const samples(kRGBA8, 8, 8, 4);
    Renderbuffer const depth(GL_DEPTH24_STENCIL8, 8, 8, 4);
    Framebuffer several;
    several.bind();
    several.attachTexture(samples, 0, Framebuffer::ATTACHMENT_COLOR0);
    several.attachRenderbuffer(depth, Framebuffer::ATTACHMENT_DEPTH_AND_STENCIL);
    several.setDrawBuffers({Framebuffer::ATTACHMENT_COLOR0});
    Framebuffer one;
    one.bind();
    one.attachTexture(picture, 0, Framebuffer::ATTACHMENT_COLOR0);
    if (!one.incompleteness().empty())
        throw std::logic_error("the framebuffer is not complete");
    one.setReadBuffer(Framebuffer::ATTACHMENT_COLOR0);
    Framebuffer::BindDefault();
    Framebuffer::ClearColor(&several, 0, colour, &all);
    Framebuffer::Resolve(&several, &one, all.size());
    Framebuffer::Read(&one, all, kRGBA, kBytes, pixels.data(), 1);
    Framebuffer::Read(&one, 0, 0, MutablePixelView(pixels.data(), 256, {kRGBA, kBytes, 8, 8}));
    Framebuffer::ClearDepth(&several, 1, nullptr);
    Framebuffer::ClearStencil(&several, 1, nullptr);
    Framebuffer::ClearDepthAndStencil(&several, 1, 1, nullptr);
    BeginEnd();
}

void FramebufferImages() {
    Texture1D const line(kRGBA8, 8, false);
    Texture3D const volume(Texture::INTERNALFORMAT_RGBA32I, 8, 8, 2, false);
    Texture2D const counts(Texture::INTERNALFORMAT_RGBA32UI, 8, 8, false);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attachTexture(line, 0, Framebuffer::Color(0));
    framebuffer.attachTexture(volume, 0, Framebuffer::Color(1));
    if (framebuffer.incompleteness().empty())
        throw std::logic_error("one image has layers, the other has none");
    framebuffer.detachFrom(Framebuffer::Color(0));
    framebuffer.attachLayer(volume, 0, 1, Framebuffer::Color(1));
    framebuffer.attachTexture(counts, 0, Framebuffer::Color(0));
    framebuffer.setDrawBuffers({Framebuffer::Color(0), Framebuffer::Color(1)});
    Framebuffer::BindDefault();
    unsigned int const large[4] = {};
    int const small[4] = {};
    Framebuffer::ClearColor(&framebuffer, 0, large, nullptr);
    Framebuffer::ClearColor(&framebuffer, 1, small, nullptr);
    BeginEnd();
}

} // namespace sweep
