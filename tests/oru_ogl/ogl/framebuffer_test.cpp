// Framebuffers and renderbuffers: attachments, status, bindings, and what they refuse.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"

#include <array>
#include <functional>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

GLint Attachment(GLenum point, GLenum parameter) {
    GLint value = 0;
    ORU_GL(GetFramebufferAttachmentParameterivEXT, GL_FRAMEBUFFER_EXT, point, parameter, &value);
    return value;
}

/// The name of what is attached at a point of the bound framebuffer, 0 for nothing.
unsigned int AttachedAt(GLenum point) {
    if (Attachment(point, GL_FRAMEBUFFER_ATTACHMENT_OBJECT_TYPE_EXT) == GL_NONE)
        return 0;
    return static_cast<unsigned int>(Attachment(point, GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME_EXT));
}

} // namespace

class FramebufferTest : public ObjectTest {};

TEST_F(FramebufferTest, BindsAndUnbinds) {
    Framebuffer first, second;
    EXPECT_FALSE(first.isBound()) << "making one does not bind it";
    first.bind();
    EXPECT_TRUE(first.isBound());
    unsigned int status = 0;
    EXPECT_FALSE(first.statusOkay(&status));
    EXPECT_EQ(GL_FRAMEBUFFER_INCOMPLETE_MISSING_ATTACHMENT_EXT, status);
    second.bind();
    EXPECT_FAILURE("Framebuffer object must be bound before calling unbind()", first.unbind());
    second.unbind();
    EXPECT_FAILURE("Framebuffer object must be bound before calling statusOkay()",
                   second.statusOkay(nullptr));
}

TEST_F(FramebufferTest, AttachesAndDetachesEveryKind) {
    Framebuffer framebuffer;
    framebuffer.bind();
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 8, 4, false);
    unsigned int const last = Framebuffer::MaxColorAttachments() - 1;
    GLenum const first = GL_COLOR_ATTACHMENT0_EXT;
    framebuffer.attach(&texture, 0, last);
    framebuffer.attach(texture.objectID(), GL_TEXTURE_2D, 0, 2);
    Texture2DArray layers(Texture::INTERNALFORMAT_RGBA8, 8, 4, 3, true);
    framebuffer.attach(&layers, 2, 1, 1);
    EXPECT_EQ(texture.objectID(), AttachedAt(first + last));
    EXPECT_EQ(texture.objectID(), AttachedAt(first + 2));
    EXPECT_EQ(layers.objectID(), AttachedAt(first + 1));
    EXPECT_EQ(2, Attachment(first + 1, GL_FRAMEBUFFER_ATTACHMENT_TEXTURE_LAYER));
    EXPECT_EQ(1, Attachment(first + 1, GL_FRAMEBUFFER_ATTACHMENT_TEXTURE_LEVEL_EXT));
    framebuffer.detach(&texture, last);
    framebuffer.detach(GL_TEXTURE_2D, GL_FRAMEBUFFER_EXT, 2);
    EXPECT_EQ(0u, AttachedAt(first + last));
    EXPECT_EQ(0u, AttachedAt(first + 2));

    std::pair<GLenum, std::vector<GLenum>> const formats[] = {
        {GL_COLOR_ATTACHMENT0_EXT, {GL_RGBA8}},
        {GL_DEPTH_ATTACHMENT_EXT,
         {GL_DEPTH_COMPONENT, GL_DEPTH_COMPONENT16, GL_DEPTH_COMPONENT24, GL_DEPTH_COMPONENT32,
          GL_DEPTH_STENCIL_EXT}},
        {GL_STENCIL_ATTACHMENT_EXT,
         {GL_STENCIL_INDEX1_EXT, GL_STENCIL_INDEX4_EXT, GL_STENCIL_INDEX8_EXT,
          GL_STENCIL_INDEX16_EXT}}};
    for (auto const &[point, all] : formats) {
        for (GLenum const format : all) {
            Renderbuffer renderbuffer(format, 8, 4);
            framebuffer.attach(&renderbuffer, 0);
            EXPECT_EQ(renderbuffer.objectID(), AttachedAt(point));
            framebuffer.detach(&renderbuffer, 0);
            EXPECT_EQ(0u, AttachedAt(point));
            // The stencil of a combined one stays attached.
            EXPECT_EQ(format == GL_DEPTH_STENCIL_EXT, AttachedAt(GL_STENCIL_ATTACHMENT_EXT) != 0);
        }
    }
}

// Each refusal, in the order of the checks, and no call that changes anything.
TEST_F(FramebufferTest, RefusesBeforeItCalls) {
    Framebuffer framebuffer;
    Texture2D image(Texture::INTERNALFORMAT_RGBA8, 8, 4, false);
    Texture2DArray layers(Texture::INTERNALFORMAT_RGBA8, 8, 4, 3, false);
    Renderbuffer depth(GL_DEPTH_COMPONENT24, 8, 4);
    unsigned int const over = Framebuffer::MaxColorAttachments();
    InterceptorScope<CountingForwarder> calls;
    auto const expect = [&](std::string const &beginning, std::function<void()> const &operation) {
        calls->reset();
        EXPECT_EQ(beginning, MessageOf(operation).substr(0, beginning.size()));
        EXPECT_EQ(calls->count("GetIntegerv"), calls->total());
    };
    // Layer, texture and renderbuffer attached, texture and renderbuffer detached.
    auto const each = [&](std::array<std::string, 5> const &beginnings, bool null = false) {
        expect(beginnings[0], [&] { framebuffer.attach(null ? nullptr : &layers, 9, 0, over); });
        expect(beginnings[1], [&] { framebuffer.attach(null ? nullptr : &image, 0, over); });
        expect(beginnings[2], [&] { framebuffer.attach(null ? nullptr : &depth, over); });
        expect(beginnings[3], [&] { framebuffer.detach(null ? nullptr : &image, over); });
        expect(beginnings[4], [&] { framebuffer.detach(null ? nullptr : &depth, over); });
    };
    std::string const attachUnbound = "Framebuffer Objects must be bound",
                      detachUnbound = "Framebuffer Object must be bound",
                      bound = "Texture cannot be bound", invalid = "Invalid color buffer",
                      null = "Enforce po", noIndex = "Color buffer index is not supported";
    each({null, null, null, null, null}, true);
    each({attachUnbound, attachUnbound, attachUnbound, detachUnbound, detachUnbound});
    ORU_GL(BindTexture, GL_TEXTURE_2D, image.objectID());
    ORU_GL(BindTexture, GL_TEXTURE_2D_ARRAY, layers.objectID());
    each({bound, bound, attachUnbound, detachUnbound, detachUnbound});
    framebuffer.bind();
    each({bound, bound, invalid, invalid, invalid});
    ORU_GL(BindTexture, GL_TEXTURE_2D, 0u);
    ORU_GL(BindTexture, GL_TEXTURE_2D_ARRAY, 0u);
    each({invalid, invalid, invalid, invalid, invalid});
    expect(invalid, [&] { framebuffer.attach(image.objectID(), GL_TEXTURE_2D, 0, over); });
    expect("Array Index too large", [&] { framebuffer.attach(&layers, 3, 0, 0); });
    expect(noIndex, [&] { framebuffer.attach(&depth, 1); });
    expect(noIndex, [&] { framebuffer.detach(&depth, 1); });
}

TEST_F(FramebufferTest, RenderbufferLeavesTheBinding) {
    Renderbuffer outer(GL_RGBA8, 3, 5);
    outer.bind();
    Renderbuffer const inner(GL_RGBA8, 1, 1);
    EXPECT_TRUE(outer.isBound());
    int const size = Renderbuffer::MaxSize();
    std::string const text = "Can't create renderbuffer of width " + std::to_string(size + 1);
    EXPECT_EQ(0u, MessageOf([&] { Renderbuffer(GL_RGBA8, size + 1, 16); }).find(text));
    EXPECT_EQ(0u, MessageOf([&] { Renderbuffer(GL_RGBA8, 16, size + 1); }).find(text));
    EXPECT_FAILURE("GL_INVALID_ENUM", Renderbuffer(GL_BLEND, 1, 1));
    EXPECT_TRUE(outer.isBound()) << "also after a failure";
    outer.unbind();
    EXPECT_FAILURE("Framebuffer object must be bound before calling unbind()", outer.unbind());
}
