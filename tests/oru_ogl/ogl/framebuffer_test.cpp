// Framebuffers and renderbuffers: attachments, completeness, bindings, and what they refuse.
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

/// Expects an object, or null for nothing, at a point of the bound framebuffer.
void ExpectAttached(Object const *object, GLenum point) {
    GLint const type = !object                                   ? GL_NONE
                       : object->target() == GL_RENDERBUFFER_EXT ? GL_RENDERBUFFER_EXT
                                                                 : GL_TEXTURE;
    EXPECT_EQ(type, Attachment(point, GL_FRAMEBUFFER_ATTACHMENT_OBJECT_TYPE_EXT)) << point;
    if (object) {
        EXPECT_EQ(static_cast<GLint>(object->objectID()),
                  Attachment(point, GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME_EXT));
    }
}

unsigned int StatusOf(Framebuffer const &framebuffer) {
    unsigned int status = 0;
    bool const okay = framebuffer.statusOkay(&status);
    EXPECT_EQ(okay, framebuffer.statusOkay(nullptr));
    EXPECT_EQ(okay, status == GL_FRAMEBUFFER_COMPLETE_EXT);
    return status;
}

} // namespace

class FramebufferTest : public ObjectTest {};

TEST_F(FramebufferTest, BindsAndUnbinds) {
    Framebuffer first, second;
    EXPECT_FALSE(first.isBound()) << "making one does not bind it";
    first.bind();
    EXPECT_TRUE(first.isBound());
    second.bind();
    char const unbound[] = "Framebuffer object must be bound before calling unbind()";
    EXPECT_FAILURE(unbound, first.unbind());
    second.unbind();
    EXPECT_EQ(0u, second.getBoundID());
    EXPECT_FAILURE(unbound, second.unbind());
    EXPECT_FAILURE("Framebuffer object must be bound before calling statusOkay()",
                   second.statusOkay(nullptr));
}

TEST_F(FramebufferTest, IsIncompleteByEveryCause) {
    Framebuffer framebuffer;
    framebuffer.bind();
    EXPECT_EQ(GL_FRAMEBUFFER_INCOMPLETE_MISSING_ATTACHMENT_EXT, StatusOf(framebuffer));
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 8, 4, false);
    framebuffer.attach(&texture, 1, 0); // a level without an image
    EXPECT_EQ(GL_FRAMEBUFFER_INCOMPLETE_ATTACHMENT_EXT, StatusOf(framebuffer));

    framebuffer.attach(&texture, 0, 0);
    Renderbuffer depth(GL_DEPTH_COMPONENT24, 8, 4);
    framebuffer.attach(&depth, 0);
    EXPECT_EQ(GL_FRAMEBUFFER_COMPLETE_EXT, StatusOf(framebuffer));
    depth.bind();
    ORU_GL(RenderbufferStorageMultisample, GL_RENDERBUFFER_EXT, 4, GL_DEPTH_COMPONENT24, 8, 4);
    EXPECT_EQ(GL_FRAMEBUFFER_INCOMPLETE_MULTISAMPLE_EXT, StatusOf(framebuffer));
    framebuffer.detach(&depth, 0);

    ORU_GL(BindTexture, GL_TEXTURE_2D, texture.objectID()); // a format that is not drawn into
    ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, GL_RGB9_E5, 8, 4, 0, GL_RGB, GL_FLOAT, nullptr);
    EXPECT_NE(GL_FRAMEBUFFER_COMPLETE_EXT, StatusOf(framebuffer));
}

TEST_F(FramebufferTest, AttachesAndDetachesEveryKind) {
    Framebuffer framebuffer;
    framebuffer.bind();
    Texture2D texture(Texture::INTERNALFORMAT_RGBA8, 8, 4, false);
    unsigned int const last = Framebuffer::MaxColorAttachments() - 1;
    framebuffer.attach(&texture, 0, last);
    ExpectAttached(&texture, GL_COLOR_ATTACHMENT0_EXT + last);
    framebuffer.attach(texture.objectID(), GL_TEXTURE_2D, 0, 2);
    ExpectAttached(&texture, GL_COLOR_ATTACHMENT0_EXT + 2);
    framebuffer.detach(&texture, last);
    ExpectAttached(nullptr, GL_COLOR_ATTACHMENT0_EXT + last);
    framebuffer.detach(GL_TEXTURE_2D, GL_FRAMEBUFFER_EXT, 2);
    ExpectAttached(nullptr, GL_COLOR_ATTACHMENT0_EXT + 2);

    Texture2DArray layers(Texture::INTERNALFORMAT_RGBA8, 8, 4, 3, true);
    framebuffer.attach(&layers, 2, 1, 1);
    GLenum const second = GL_COLOR_ATTACHMENT0_EXT + 1;
    ExpectAttached(&layers, second);
    EXPECT_EQ(2, Attachment(second, GL_FRAMEBUFFER_ATTACHMENT_TEXTURE_LAYER));
    EXPECT_EQ(1, Attachment(second, GL_FRAMEBUFFER_ATTACHMENT_TEXTURE_LEVEL_EXT));

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
            ExpectAttached(&renderbuffer, point);
            framebuffer.detach(&renderbuffer, 0);
            ExpectAttached(nullptr, point);
            if (format == GL_DEPTH_STENCIL_EXT)
                ExpectAttached(&renderbuffer, GL_STENCIL_ATTACHMENT_EXT); // stays there
        }
    }
}

// Each refusal, in the order of the checks, and no call that changes anything.
TEST_F(FramebufferTest, RefusesBeforeItCalls) {
    Framebuffer framebuffer;
    Texture2D image(Texture::INTERNALFORMAT_RGBA8, 8, 4, false);
    Texture2DArray layers(Texture::INTERNALFORMAT_RGBA8, 8, 4, 3, false);
    Renderbuffer depth(GL_DEPTH_COMPONENT24, 8, 4), stencil(GL_STENCIL_INDEX8_EXT, 8, 4);
    unsigned int const over = Framebuffer::MaxColorAttachments();
    std::string const number = std::to_string(over);
    std::string const attachUnbound = "Framebuffer Objects must be bound to attach objects",
                      detachUnbound = "Framebuffer Object must be bound before detaching objects",
                      bound = "Texture cannot be bound during attachment to framebuffer object",
                      invalid = "Invalid color buffer attachment only " + number +
                                " attachments supported with " + number + " requested",
                      noTexture = "Enforce poTex != NULL", noBuffer = "Enforce poBuffer != NULL",
                      noIndex = "Color buffer index is not supported with attachment:";

    Pushed<CountingForwarder> calls;
    auto const expect = [&](std::string const &text, std::function<void()> const &operation) {
        calls->reset();
        EXPECT_EQ(text, MessageOf(operation));
        EXPECT_EQ(calls->count("GetIntegerv"), calls->total());
    };
    // Layer, texture and renderbuffer attached, texture and renderbuffer detached.
    auto const each = [&](std::array<std::string, 5> const &texts, bool null = false) {
        expect(texts[0], [&] { framebuffer.attach(null ? nullptr : &layers, 9, 0, over); });
        expect(texts[1], [&] { framebuffer.attach(null ? nullptr : &image, 0, over); });
        expect(texts[2], [&] { framebuffer.attach(null ? nullptr : &depth, over); });
        expect(texts[3], [&] { framebuffer.detach(null ? nullptr : &image, over); });
        expect(texts[4], [&] { framebuffer.detach(null ? nullptr : &depth, over); });
    };
    each({noTexture, noTexture, noBuffer, noTexture, noBuffer}, true);
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
    expect(noIndex + "GL_DEPTH_ATTACHMENT", [&] { framebuffer.attach(&depth, 1); });
    expect(noIndex + "GL_DEPTH_ATTACHMENT", [&] { framebuffer.detach(&depth, 1); });
    expect(noIndex + "GL_STENCIL_ATTACHMENT", [&] { framebuffer.attach(&stencil, 1); });
}

TEST_F(FramebufferTest, RenderbufferLeavesTheBinding) {
    Renderbuffer outer(GL_RGBA8, 3, 5);
    EXPECT_EQ(0u, outer.getBoundID());
    EXPECT_EQ(3, outer.width());
    EXPECT_EQ(5, outer.height());
    outer.bind();
    Renderbuffer const inner(GL_RGBA8, 1, 1);
    EXPECT_TRUE(outer.isBound());

    int const size = Renderbuffer::MaxSize();
    std::string const width = "Can't create renderbuffer of width " + std::to_string(size + 1),
                      limit = " of " + std::to_string(size) + " is supported";
    EXPECT_FAILURE(width + ", a max width" + limit, Renderbuffer(GL_RGBA8, size + 1, 16));
    EXPECT_FAILURE(width + ", a max height" + limit, Renderbuffer(GL_RGBA8, 16, size + 1));
    EXPECT_FAILURE("GL_INVALID_VALUE", Renderbuffer(GL_RGBA8, -1, 1));
    EXPECT_FAILURE("GL_INVALID_ENUM", Renderbuffer(GL_BLEND, 1, 1));
    EXPECT_TRUE(outer.isBound()) << "also after a failure";
    outer.unbind();
    EXPECT_FAILURE("Framebuffer object must be bound before calling unbind()", outer.unbind());
}
