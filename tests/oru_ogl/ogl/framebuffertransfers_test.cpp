// Framebuffers: attachments at any point, copying, clearing and reading rectangles, and what each
// failing call leaves behind.
#include "tests/support/textof.h"
#include "tests/support/texturekinds.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/ogl/buffertexture.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelview.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/samplerbindscope.h"
#include "oru/oru_ogl/ogl/texture2dmultisample.h"
#include "oru/oru_ogl/ogl/texturecube.h"

#include <functional>

using namespace oru_test;
using ORU::IntegerRect;
using ORU::size2;

namespace {

using F = Framebuffer;
using T = Texture;
using Bytes = Image<unsigned char>;
using Colour = std::array<float, 4>;

constexpr Colour kRed = {1, 0, 0, 1}, kBlue = {0, 0, 1, 1}, kWhite = {1, 1, 1, 1};

/// An image of one colour.
Bytes Plain(Sides const &size, Colour const &colour) {
    Bytes image(size, 4);
    for (std::size_t i = 0; i < image.texels.size(); ++i)
        image.texels[i] = colour[i % 4] > 0 ? 255 : 0;
    return image;
}

IntegerRect Rect(int x, int y, std::size_t width, std::size_t height) {
    return IntegerRect({x, y}, size2(width, height));
}

std::vector<unsigned char> ReadAll(F const *framebuffer, std::size_t width, std::size_t height) {
    std::vector<unsigned char> pixels(width * height * 4);
    F::Read(framebuffer, Rect(0, 0, width, height), kBytes.format, kBytes.type, pixels.data(), 1);
    return pixels;
}

/// What the operations here must leave as it was.
std::vector<GLint> State() {
    std::vector<GLint> state =
        Get({GL_READ_FRAMEBUFFER_BINDING, GL_DRAW_FRAMEBUFFER_BINDING, GL_RENDERBUFFER_BINDING,
             GL_TEXTURE_BINDING_2D, GL_TEXTURE_BINDING_CUBE_MAP, GL_TEXTURE_BINDING_BUFFER,
             GL_TEXTURE_BINDING_2D_MULTISAMPLE, GL_PIXEL_PACK_BUFFER_BINDING, GL_PACK_ALIGNMENT,
             GL_UNPACK_ROW_LENGTH, GL_ACTIVE_TEXTURE, GL_SCISSOR_TEST, GL_SAMPLER_BINDING});
    state.resize(state.size() + 4);
    ::glGetIntegerv(GL_SCISSOR_BOX, &state[state.size() - 4]);
    return state;
}

/// Refuses one call, counted from 1, of those that a destructor does not put right.
class FailingCall : public OpenGLInterceptorDecorator {
public:
    int at = 0; ///< 0 for none
    int made = 0;
    std::string refused;

#define ORU_GL_OPERATION(Result, Name, Parameters, Arguments)                                      \
    Result cgm##Name Parameters override {                                                         \
        noteCall(#Name);                                                                           \
        return interceptor()->cgm##Name Arguments;                                                 \
    }
#include "oru/oru_ogl/extensionator/gloperations.inc"

private:
    void noteCall(std::string const &name) {
        for (char const *const undoing : {"Bind", "Delete", "PopClient", "Enable", "Disable",
                                          "Scissor", "PixelStore", "ActiveTexture"}) {
            if (name.rfind(undoing, 0) == 0)
                return;
        }
        if (++made == at) {
            refused = name;
            ORU_private::ThrowInternal("test", 1, "refused");
        }
    }
};

} // namespace

class FramebufferTransfersTest : public ObjectTest {};

// Each kind of texture at each kind of point: every layer or face by itself, and all at once.
TEST_F(FramebufferTransfersTest, EveryImageIsAttachedAndCleared) {
    F framebuffer;
    framebuffer.bind();
    F::ClearColor(nullptr, 0, kRed.data(), nullptr);
    std::pair<std::unique_ptr<Texture>, unsigned int> const textures[] = {
        {std::make_unique<Texture1D>(kRGBA8, 4, true), 0},
        {std::make_unique<Texture2D>(kRGBA8, 4, 4, true), 0},
        {std::make_unique<TextureRECT>(kRGBA8, 4, 4), 0},
        {std::make_unique<Texture2DMultisample>(kRGBA8, 4, 4, 4), 0},
        {std::make_unique<Texture3D>(kRGBA8, 4, 4, 4, true), 4},
        {std::make_unique<Texture1DArray>(kRGBA8, 4, 3, true), 3},
        {std::make_unique<Texture2DArray>(kRGBA8, 4, 4, 3, true), 3},
        {std::make_unique<TextureCube>(kRGBA8, 4, true), 6},
        {std::make_unique<TextureCubeArray>(kRGBA8, 4, 2, true), 12}};
    for (auto const &row : textures) {
        Texture const *const texture = row.first.get();
        unsigned int const layers = row.second;
        SCOPED_TRACE(texture->target());
        framebuffer.attachTexture(*texture, 0, F::ATTACHMENT_COLOR0);
        EXPECT_EQ("", framebuffer.incompleteness());
        F::ClearColor(&framebuffer, 0, kWhite.data(), nullptr); // all layers
        for (unsigned int layer = 0; layer < layers; ++layer) {
            framebuffer.attachLayer(*texture, 0, layer, F::ATTACHMENT_COLOR0);
            std::size_t const height = texture->target() == GL_TEXTURE_1D_ARRAY ? 1 : 4;
            EXPECT_EQ(Plain({4, static_cast<int>(height), 1}, kWhite).texels,
                      ReadAll(&framebuffer, 4, height));
            Colour const own = {static_cast<float>(layer & 1), static_cast<float>(layer & 2),
                                static_cast<float>(layer & 4), static_cast<float>(layer & 8)};
            F::ClearColor(&framebuffer, 0, own.data(), nullptr);
            EXPECT_EQ(Plain({4, static_cast<int>(height), 1}, own).texels,
                      ReadAll(&framebuffer, 4, height));
        }
        EXPECT_FAILURE(ORU::ComposeText("There is no layer ", layers, " in a texture of ", layers,
                                        ": they count from 0, and textures without any are "
                                        "attached by attachTexture"),
                       framebuffer.attachLayer(*texture, 0, layers, F::ATTACHMENT_COLOR0));
    }
    framebuffer.detachFrom(F::ATTACHMENT_COLOR0);
    EXPECT_EQ(std::string(F::StatusText(GL_FRAMEBUFFER_INCOMPLETE_MISSING_ATTACHMENT)),
              framebuffer.incompleteness());
    F::BindDefault();
    EXPECT_FAILURE("Framebuffer Objects must be bound to attach objects",
                   framebuffer.attachTexture(*textures[1].first, 0, F::ATTACHMENT_COLOR0));
    EXPECT_EQ(Plain({2, 2, 1}, kRed).texels, ReadAll(nullptr, 2, 2)) << "the window's own";
}

// Rectangles: cleared whatever the scissor, read from memory and buffers, copied and scaled.
TEST_F(FramebufferTransfersTest, RectanglesAreClearedReadAndCopied) {
    Texture2D picture(kRGBA8, 8, 6, false), copied(kRGBA8, 16, 12, false);
    F source, destination;
    for (auto const &[framebuffer, texture] :
         {std::pair(&source, &picture), std::pair(&destination, &copied)}) {
        framebuffer->bind();
        framebuffer->attachTexture(*texture, 0, F::ATTACHMENT_COLOR0);
    }
    F::BindDefault();
    ORU_GL(Enable, GL_SCISSOR_TEST);
    ORU_GL(Scissor, 1, 2, 3, 4);
    std::vector<GLint> const before = State();
    IntegerRect const part = Rect(2, 1, 3, 4);
    F::ClearColor(&source, 0, kRed.data(), nullptr);
    F::ClearColor(&source, 0, kBlue.data(), &part);
    EXPECT_EQ(before, State());
    Bytes expected = Plain({8, 6, 1}, kRed);
    expected.paste(Plain({3, 4, 1}, kBlue), {{2, 1, 0}, {3, 4, 1}});
    EXPECT_EQ(expected.texels, ReadAll(&source, 8, 6));
    Buffer buffer(8 * 6 * 4 + 4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    F::Read(&source, Rect(0, 0, 8, 6), kBytes.format, kBytes.type, &buffer, 4, 1);
    PixelShape shape = {kBytes.format, kBytes.type, 3, 4};
    shape.rowLength = 8;
    Bytes view({8, 6, 1}, 4), blue({8, 6, 1}, 4);
    std::size_t const first = view.index(2, 1, 0);
    F::Read(&source, 2, 1,
            MutablePixelView(&view.texels[first], view.texels.size() - first, shape));
    blue.paste(Plain({3, 4, 1}, kBlue), {{2, 1, 0}, {3, 4, 1}});
    EXPECT_EQ(blue.texels, view.texels);
    EXPECT_EQ(before, State());
    std::vector<unsigned char> back(8 * 6 * 4);
    buffer.bind();
    buffer.getSubData(4, 8 * 6 * 4, back.data());
    Buffer::BindDefaultPackBuffer();
    EXPECT_EQ(expected.texels, back);

    ORU_GL(Disable, GL_SCISSOR_TEST);
    F::ClearColor(&destination, 0, kWhite.data(), nullptr);
    F::Blit(&source, Rect(1, 0, 4, 6), &destination, Rect(4, 0, 8, 12), F::CONTENTS_COLOR,
            T::FILTER_NEAREST);
    Bytes scaled = Plain({16, 12, 1}, kWhite);
    for (int y = 0; y < 12; ++y)
        for (int x = 0; x < 8; ++x)
            scaled.paste(expected, {{4 + x, y, 0}, {1, 1, 1}}, {1 + x / 2, y / 2, 0});
    EXPECT_EQ(scaled.texels, ReadAll(&destination, 16, 12));
    char const *const filters =
        "Framebuffer::Blit takes FILTER_NEAREST, or FILTER_LINEAR for colours alone";
    auto const blit = [&](IntegerRect const &from, unsigned int contents, T::Filter filter) {
        return MessageOf([&] { F::Blit(&source, from, nullptr, from, contents, filter); });
    };
    EXPECT_EQ(filters, blit(part, F::CONTENTS_COLOR | F::CONTENTS_DEPTH, T::FILTER_LINEAR));
    EXPECT_EQ(filters, blit(part, F::CONTENTS_COLOR, T::FILTER_LINEAR_MIPMAP_LINEAR));
    EXPECT_EQ("Framebuffer::Blit copies colour, depth and stencil, and 8 is none of them joined",
              blit(part, 8, T::FILTER_NEAREST));
    char const *const empty = "A framebuffer's rectangle is empty: give it a width and a height";
    IntegerRect const nothing = Rect(1, 1, 0, 4), huge = Rect(2, 2, 0x80000000, 1);
    EXPECT_EQ(
        "A framebuffer's rectangle cannot reach 2147483648 pixels beyond 2: no framebuffer does",
        blit(huge, F::CONTENTS_COLOR, T::FILTER_NEAREST));
    EXPECT_EQ(empty, blit(nothing, F::CONTENTS_COLOR, T::FILTER_NEAREST));
    EXPECT_FAILURE(empty, F::ClearColor(&source, 0, kRed.data(), &nothing));
    EXPECT_FAILURE(empty, F::Read(&source, nothing, kBytes.format, kBytes.type, back.data(), 1));
}

// Depth, stencil and integers, by clearing, blitting and reading; samples by resolving.
TEST_F(FramebufferTransfersTest, OtherContentsAreClearedCopiedAndResolved) {
    Texture2D depth(T::INTERNALFORMAT_DEPTH24_STENCIL8, 4, 4, false),
        numbers(T::INTERNALFORMAT_RGBA32I, 4, 4, false),
        counts(T::INTERNALFORMAT_RGBA32UI, 4, 4, false);
    F framebuffer, copy;
    framebuffer.bind();
    framebuffer.attachTexture(depth, 0, F::ATTACHMENT_DEPTH_AND_STENCIL);
    framebuffer.attachTexture(numbers, 0, F::Color(1));
    framebuffer.attachTexture(counts, 0, F::Color(2));
    framebuffer.setDrawBuffers({F::ATTACHMENT_NONE, F::Color(2), F::Color(1)});
    framebuffer.setReadBuffer(F::Color(1));
    EXPECT_EQ("", framebuffer.incompleteness());
    F::ClearDepth(&framebuffer, 1, nullptr);
    F::ClearStencil(&framebuffer, 7, nullptr);
    IntegerRect const part = Rect(1, 1, 1, 1);
    F::ClearDepthAndStencil(&framebuffer, 0, 9, &part);
    int const negative[] = {-1, -2, -3, -4};
    unsigned int const large[] = {4000000000u, 2, 3, 4};
    F::ClearColor(&framebuffer, 1, large, nullptr);
    F::ClearColor(&framebuffer, 2, negative, nullptr);
    Renderbuffer renderbuffer(GL_DEPTH24_STENCIL8, 4, 4);
    copy.bind();
    copy.attachRenderbuffer(renderbuffer, F::ATTACHMENT_DEPTH_AND_STENCIL);
    copy.setDrawBuffers({F::ATTACHMENT_NONE});
    copy.setReadBuffer(F::ATTACHMENT_NONE);
    F::Blit(&framebuffer, Rect(0, 0, 4, 4), &copy, Rect(0, 0, 4, 4),
            F::CONTENTS_DEPTH | F::CONTENTS_STENCIL, T::FILTER_NEAREST);
    std::array<unsigned int, 4> packed = {};
    F::Read(&copy, Rect(1, 0, 2, 2), T::FORMAT_DEPTH_STENCIL, T::TYPE_UNSIGNED_INT_24_8,
            packed.data(), 1);
    EXPECT_EQ((std::array<unsigned int, 4>{0xFFFFFF07, 0xFFFFFF07, 9, 0xFFFFFF07}), packed);
    std::array<int, 4> read = {};
    F::Read(&framebuffer, part, T::FORMAT_RGBA_INTEGER, T::TYPE_INT, read.data(), 1);
    EXPECT_TRUE(std::equal(read.begin(), read.end(), negative));
    framebuffer.bind();
    framebuffer.setReadBuffer(F::Color(2));
    F::Read(&framebuffer, part, T::FORMAT_RGBA_INTEGER, T::TYPE_UNSIGNED_INT, packed.data(), 1);
    EXPECT_TRUE(std::equal(packed.begin(), packed.end(), large));
    EXPECT_FAILURE("Depth and stencil are no draw or read buffers: name colours, or "
                   "ATTACHMENT_NONE",
                   framebuffer.setDrawBuffers({F::ATTACHMENT_DEPTH}));
    ORU_GL(BindFramebuffer, GL_READ_FRAMEBUFFER, copy.objectID());
    EXPECT_FAILURE("Another framebuffer is bound to be read from: bind() this one before its read "
                   "buffer is set",
                   framebuffer.setReadBuffer(F::Color(1)));
    framebuffer.bind();
    for (unsigned int const index : {256u, 257u, 258u, 259u, 100000u})
        EXPECT_NE("", MessageOf([&] { framebuffer.attachTexture(numbers, 0, F::Color(index)); }));
    EXPECT_FAILURE("Nothing can be attached at ATTACHMENT_NONE: name a colour, depth or stencil",
                   framebuffer.detachFrom(F::ATTACHMENT_NONE));

    int const most = Renderbuffer::MaxSamples();
    EXPECT_FAILURE(ORU::ComposeText("Can't create renderbuffer of ", most + 1, " samples, at most ",
                                    most, " are supported"),
                   Renderbuffer(GL_RGBA8, 4, 4, most + 1));
    EXPECT_FAILURE(ORU::ComposeText("A texel cannot have 0 samples: ask for 1 to ", most),
                   Texture2DMultisample(kRGBA8, 4, 4, 0));
    Texture2DMultisample const samples(kRGBA8, 4, 4, 4);
    EXPECT_LE(4u, samples.samples());
    Renderbuffer const sampled(GL_RGBA8, 4, 4, 4);
    Texture2D resolved(kRGBA8, 4, 4, false);
    F one, several;
    one.bind();
    one.attachTexture(resolved, 0, F::ATTACHMENT_COLOR0);
    several.bind();
    several.attachTexture(samples, 0, F::Color(0));
    several.attachRenderbuffer(sampled, F::Color(1));
    several.setDrawBuffers({F::Color(0), F::Color(1)});
    EXPECT_EQ("", several.incompleteness());
    F::ClearColor(&several, 0, kRed.data(), nullptr);
    F::ClearColor(&several, 1, kBlue.data(), nullptr);
    for (unsigned int i = 0; i < 2; ++i) {
        several.bind();
        several.setReadBuffer(F::Color(i));
        F::Resolve(&several, &one, size2(4, 4));
        EXPECT_EQ(Plain({4, 4, 1}, i == 0 ? kRed : kBlue).texels, ReadAll(&one, 4, 4));
    }
    several.attachTexture(resolved, 0, F::Color(0));
    EXPECT_EQ(std::string(F::StatusText(GL_FRAMEBUFFER_INCOMPLETE_MULTISAMPLE)) +
                  "; GL_COLOR_ATTACHMENT0 has texture " + std::to_string(resolved.objectID()) +
                  " level 0; GL_COLOR_ATTACHMENT1 has renderbuffer " +
                  std::to_string(sampled.objectID()),
              several.incompleteness());
    F::BindDefault();
}

// Whichever call of an operation fails: the state is as before, and no name is left (which the
// fixture counts).
TEST_F(FramebufferTransfersTest, FailingCallsLeaveNothingBehind) {
    Texture2D picture(kRGBA8, 4, 4, false);
    F framebuffer;
    framebuffer.bind();
    framebuffer.attachTexture(picture, 0, F::ATTACHMENT_COLOR0);
    F::BindDefault();
    Buffer buffer(64, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    TextureCube cube(kRGBA8, 4, false);
    ORU_GL(BindTexture, GL_TEXTURE_CUBE_MAP, cube.objectID());
    Sampler const sampler(T::FILTER_LINEAR, T::FILTER_LINEAR, T::WRAPMODE_REPEAT);
    Texture2DMultisample samples(kRGBA8, 4, 4, 2);
    unsigned int const names[] = {sampler.objectID(), cube.objectID(), samples.disown()};
    IntegerRect const part = Rect(1, 1, 2, 2);
    std::vector<unsigned char> pixels(64);
    MutablePixelView const view(pixels.data(), pixels.size(), {kBytes.format, kBytes.type, 4, 4});
    std::function<void()> const operations[] = {
        [&] { F::ClearColor(&framebuffer, 0, kRed.data(), &part); },
        [&] { F::Blit(&framebuffer, part, nullptr, part, F::CONTENTS_COLOR, T::FILTER_NEAREST); },
        [&] { F::Read(&framebuffer, part, kBytes.format, kBytes.type, pixels.data(), 1); },
        [&] { F::Read(&framebuffer, part, kBytes.format, kBytes.type, &buffer, 0, 1); },
        [&] { F::Read(&framebuffer, 0, 0, view); },
        [&] { TextureCube(kRGBA8, 4, true); },
        [&] { TextureCube(names[1], borrow_name_tag()); },
        [&] { TextureCubeArray(kRGBA8, 4, 2, true); },
        [&] { Texture2DMultisample(kRGBA8, 4, 4, 2); },
        [&] { Texture2DMultisample(names[2], take_name_tag()).disown(); },
        [&] { BufferTexture(kRGBA8, buffer); },
        [&] { BufferTexture::MaxTexels(); },
        [&] { Renderbuffer(GL_RGBA8, 4, 4, 2); },
        [&] { Sampler(T::FILTER_LINEAR, T::FILTER_LINEAR, T::WRAPMODE_REPEAT); },
        [&] { Sampler(names[0], borrow_name_tag()); },
        [&] { SamplerBindScope(sampler, 2); },
        [&] {
            cube.getPixelData(TextureCube::FACE_POSITIVE_X, &buffer, 0, 0, kBytes.format,
                              kBytes.type, 1);
        },
        [&] {
            cube.subImage(TextureCube::FACE_POSITIVE_X, 0, 0, 0, 4, 4, kBytes.format, kBytes.type,
                          pixels.data(), kTight);
        }};
    InterceptorScope<FailingCall> calls;
    for (auto const &operation : operations) {
        std::vector<GLint> const before = State();
        for (calls->at = 1;; ++calls->at) {
            calls->made = 0;
            calls->refused.clear();
            std::string const said = MessageOf(operation);
            EXPECT_EQ(calls->refused.empty() ? "" : "refused", said);
            if (calls->refused.empty())
                break;
            bool const isUpload = &operation == std::end(operations) - 1;
            if (!IsCoreRun() && isUpload && Get(GL_CLIENT_ATTRIB_STACK_DEPTH) > 0)
                ORU_GL0(PopClientAttrib); // what uploads leave to be looked at
            EXPECT_EQ(0, IsCoreRun() ? 0 : Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
            EXPECT_EQ(before, State())
                << calls->refused << " of operation " << &operation - operations;
        }
        EXPECT_GT(calls->at, 1) << "no call at all";
        calls->at = 0;
    }
    ORU_GL(BindTexture, GL_TEXTURE_CUBE_MAP, 0u);
    Texture2DMultisample const again(names[2], take_name_tag());
}
