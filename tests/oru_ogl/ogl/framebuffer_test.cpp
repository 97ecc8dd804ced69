// Framebuffers and renderbuffers: attachments, completeness, bindings, and what they refuse.
#include "objecttest.h"

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <functional>
#include <memory>

using namespace ORU::OGL;
using oru_test::CountingForwarder;
using oru_test::MessageOf;
using oru_test::Pushed;

namespace {

/// What is attached at a point: the GL type of the object and its name.
std::pair<int, int> Attached(GLenum point) {
    GLint type = 0, name = 0;
    ORU_GL(GetFramebufferAttachmentParameterivEXT, GL_FRAMEBUFFER_EXT, point,
           GL_FRAMEBUFFER_ATTACHMENT_OBJECT_TYPE_EXT, &type);
    if (type != GL_NONE)
        ORU_GL(GetFramebufferAttachmentParameterivEXT, GL_FRAMEBUFFER_EXT, point,
               GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME_EXT, &name);
    return {type, name};
}

std::pair<int, int> const kNothing{GL_NONE, 0};

std::pair<int, int> Is(int type, Object const &object) {
    return {type, static_cast<int>(object.objectID())};
}

unsigned int StatusOf(Framebuffer const &framebuffer) {
    unsigned int status = 0;
    bool const okay = framebuffer.statusOkay(&status);
    EXPECT_EQ(okay, framebuffer.statusOkay(nullptr));
    EXPECT_EQ(okay, status == GL_FRAMEBUFFER_COMPLETE_EXT);
    return status;
}

class FramebufferTest : public oru_test::ObjectTest {
protected:
    Texture2D &texture() {
        if (!texture_)
            texture_ = std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, 8, 4, false);
        return *texture_;
    }
    void TearDown() override {
        texture_.reset();
        ObjectTest::TearDown();
    }

private:
    std::unique_ptr<Texture2D> texture_;
};

} // namespace

TEST_F(FramebufferTest, BindsAndUnbinds) {
    Framebuffer first, second;
    EXPECT_FALSE(first.isBound()) << "making one does not bind it";
    first.bind();
    EXPECT_TRUE(first.isBound());
    second.bind();
    char const unbound[] = "Framebuffer object must be bound before calling unbind()";
    EXPECT_EQ(unbound, MessageOf([&] { first.unbind(); }));
    second.unbind();
    EXPECT_EQ(0u, second.getBoundID());
    EXPECT_EQ(unbound, MessageOf([&] { second.unbind(); }));
    EXPECT_EQ("Framebuffer object must be bound before calling statusOkay()",
              MessageOf([&] { second.statusOkay(nullptr); }));
}

TEST_F(FramebufferTest, IsIncompleteByEveryCause) {
    Framebuffer framebuffer;
    framebuffer.bind();
    EXPECT_EQ(GL_FRAMEBUFFER_INCOMPLETE_MISSING_ATTACHMENT_EXT, StatusOf(framebuffer));

    framebuffer.attach(&texture(), 0, 0);
    EXPECT_EQ(GL_FRAMEBUFFER_COMPLETE_EXT, StatusOf(framebuffer));
    framebuffer.attach(&texture(), 1, 0); // a level without an image
    EXPECT_EQ(GL_FRAMEBUFFER_INCOMPLETE_ATTACHMENT_EXT, StatusOf(framebuffer));
    framebuffer.detach(&texture(), 0);

    Renderbuffer depth(GL_DEPTH_COMPONENT24, 8, 4);
    framebuffer.attach(&texture(), 0, 0);
    framebuffer.attach(&depth, 0);
    EXPECT_EQ(GL_FRAMEBUFFER_COMPLETE_EXT, StatusOf(framebuffer));
    depth.bind();
    ORU_GL(RenderbufferStorageMultisample, GL_RENDERBUFFER_EXT, 4, GL_DEPTH_COMPONENT24, 8, 4);
    EXPECT_EQ(GL_FRAMEBUFFER_INCOMPLETE_MULTISAMPLE_EXT, StatusOf(framebuffer));
    depth.unbind();
    framebuffer.detach(&depth, 0);

    // A format that cannot be drawn into.
    GLuint shared = 0;
    ORU_GL(GenTextures, 1, &shared);
    ORU_GL(BindTexture, GL_TEXTURE_2D, shared);
    ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, GL_RGB9_E5, 8, 4, 0, GL_RGB, GL_FLOAT, nullptr);
    framebuffer.attach(shared, GL_TEXTURE_2D, 0, 0);
    EXPECT_NE(GL_FRAMEBUFFER_COMPLETE_EXT, StatusOf(framebuffer));
    framebuffer.detach(GL_TEXTURE_2D, GL_FRAMEBUFFER_EXT, 0);
    EXPECT_EQ(kNothing, Attached(GL_COLOR_ATTACHMENT0_EXT));
    ORU_GL(DeleteTextures, 1, &shared);
}

TEST_F(FramebufferTest, AttachesAndDetachesEveryKind) {
    Framebuffer framebuffer;
    framebuffer.bind();
    unsigned int const last = Framebuffer::MaxColorAttachments() - 1;
    GLenum const lastPoint = GL_COLOR_ATTACHMENT0_EXT + last;

    framebuffer.attach(&texture(), 0, last);
    EXPECT_EQ(Is(GL_TEXTURE, texture()), Attached(lastPoint));
    framebuffer.detach(&texture(), last);
    EXPECT_EQ(kNothing, Attached(lastPoint));

    Texture2DArray layers(Texture::INTERNALFORMAT_RGBA8, 8, 4, 3, false);
    framebuffer.attach(&layers, 2, 0, 1);
    EXPECT_EQ(Is(GL_TEXTURE, layers), Attached(GL_COLOR_ATTACHMENT0_EXT + 1));
    GLint layer = 0;
    ORU_GL(GetFramebufferAttachmentParameterivEXT, GL_FRAMEBUFFER_EXT, GL_COLOR_ATTACHMENT0_EXT + 1,
           GL_FRAMEBUFFER_ATTACHMENT_TEXTURE_LAYER, &layer);
    EXPECT_EQ(2, layer);

    framebuffer.attach(texture().objectID(), GL_TEXTURE_2D, 0, 2);
    EXPECT_EQ(Is(GL_TEXTURE, texture()), Attached(GL_COLOR_ATTACHMENT0_EXT + 2));

    struct Kind {
        unsigned int format;
        GLenum point;
    } const kinds[] = {{GL_RGBA8, GL_COLOR_ATTACHMENT0_EXT},
                       {GL_DEPTH_COMPONENT, GL_DEPTH_ATTACHMENT_EXT},
                       {GL_DEPTH_COMPONENT16, GL_DEPTH_ATTACHMENT_EXT},
                       {GL_DEPTH_COMPONENT24, GL_DEPTH_ATTACHMENT_EXT},
                       {GL_DEPTH_COMPONENT32, GL_DEPTH_ATTACHMENT_EXT},
                       {GL_STENCIL_INDEX1_EXT, GL_STENCIL_ATTACHMENT_EXT},
                       {GL_STENCIL_INDEX4_EXT, GL_STENCIL_ATTACHMENT_EXT},
                       {GL_STENCIL_INDEX8_EXT, GL_STENCIL_ATTACHMENT_EXT},
                       {GL_STENCIL_INDEX16_EXT, GL_STENCIL_ATTACHMENT_EXT}};
    for (Kind const &kind : kinds) {
        Renderbuffer renderbuffer(kind.format, 8, 4);
        framebuffer.attach(&renderbuffer, 0);
        EXPECT_EQ(Is(GL_RENDERBUFFER_EXT, renderbuffer), Attached(kind.point)) << kind.format;
        framebuffer.detach(&renderbuffer, 0);
        EXPECT_EQ(kNothing, Attached(kind.point)) << kind.format;
    }

    Renderbuffer both(GL_DEPTH_STENCIL_EXT, 8, 4);
    framebuffer.attach(&both, 0);
    EXPECT_EQ(Is(GL_RENDERBUFFER_EXT, both), Attached(GL_DEPTH_ATTACHMENT_EXT));
    EXPECT_EQ(Is(GL_RENDERBUFFER_EXT, both), Attached(GL_STENCIL_ATTACHMENT_EXT));
    framebuffer.detach(&both, 0);
    EXPECT_EQ(kNothing, Attached(GL_DEPTH_ATTACHMENT_EXT));
    EXPECT_EQ(Is(GL_RENDERBUFFER_EXT, both), Attached(GL_STENCIL_ATTACHMENT_EXT));
}

// Each refusal, in the order of the checks, and no call that changes anything.
TEST_F(FramebufferTest, RefusesBeforeItCalls) {
    Framebuffer framebuffer;
    Texture2DArray layers(Texture::INTERNALFORMAT_RGBA8, 8, 4, 3, false);
    Renderbuffer depth(GL_DEPTH_COMPONENT24, 8, 4), stencil(GL_STENCIL_INDEX8_EXT, 8, 4);
    Texture2D *const noTexture = nullptr;
    Texture2DArray *const noArray = nullptr;
    Renderbuffer *const noBuffer = nullptr;
    unsigned int const over = Framebuffer::MaxColorAttachments();
    std::string const invalid = "Invalid color buffer attachment only " + std::to_string(over) +
                                " attachments supported with " + std::to_string(over) +
                                " requested";
    std::string const attachUnbound = "Framebuffer Objects must be bound to attach objects";
    std::string const detachUnbound = "Framebuffer Object must be bound before detaching objects";
    std::string const bound = "Texture cannot be bound during attachment to framebuffer object";
    std::string const noIndex = "Color buffer index is not supported with attachment:";

    Texture2D &image = texture(); // made before calls are counted
    Pushed<CountingForwarder> calls;
    auto const expect = [&](std::string const &text, std::function<void()> const &operation) {
        calls->reset();
        EXPECT_EQ(text, MessageOf(operation));
        EXPECT_EQ(calls->count("GetIntegerv"), calls->total());
    };
    expect("Enforce poTex != NULL", [&] { framebuffer.attach(noTexture, 0, over); });
    expect("Enforce poTex != NULL", [&] { framebuffer.attach(noArray, 9, 0, over); });
    expect("Enforce poTex != NULL", [&] { framebuffer.detach(noTexture, over); });
    expect("Enforce poBuffer != NULL", [&] { framebuffer.attach(noBuffer, over); });
    expect("Enforce poBuffer != NULL", [&] { framebuffer.detach(noBuffer, over); });
    expect(attachUnbound, [&] { framebuffer.attach(&image, 0, over); });
    expect(attachUnbound, [&] { framebuffer.attach(&layers, 9, 0, over); });
    expect(attachUnbound, [&] { framebuffer.attach(&depth, over); });
    expect(detachUnbound, [&] { framebuffer.detach(&image, over); });
    expect(detachUnbound, [&] { framebuffer.detach(&depth, over); });

    ORU_GL(BindTexture, GL_TEXTURE_2D, image.objectID());
    ORU_GL(BindTexture, GL_TEXTURE_2D_ARRAY, layers.objectID());
    expect(bound, [&] { framebuffer.attach(&image, 0, over); });
    framebuffer.bind();
    expect(bound, [&] { framebuffer.attach(&image, 0, 0); });
    expect(bound, [&] { framebuffer.attach(&layers, 9, 0, over); });
    ORU_GL(BindTexture, GL_TEXTURE_2D, 0u);
    ORU_GL(BindTexture, GL_TEXTURE_2D_ARRAY, 0u);

    expect(invalid, [&] { framebuffer.attach(&image, 0, over); });
    expect(invalid, [&] { framebuffer.attach(&layers, 9, 0, over); });
    expect(invalid, [&] { framebuffer.attach(image.objectID(), GL_TEXTURE_2D, 0, over); });
    expect(invalid, [&] { framebuffer.attach(&depth, over); });
    expect(invalid, [&] { framebuffer.detach(&image, over); });
    expect(invalid, [&] { framebuffer.detach(&depth, over); });
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
    EXPECT_EQ(static_cast<unsigned int>(GL_RGBA8), outer.format());
    outer.bind();
    Renderbuffer inner(GL_RGBA8, 1, 1);
    EXPECT_TRUE(outer.isBound());

    int const size = Renderbuffer::MaxSize();
    std::string const over = std::to_string(size + 1), maximum = std::to_string(size);
    EXPECT_EQ("Can't create renderbuffer of width " + over + ", a max width of " + maximum +
                  " is supported",
              MessageOf([&] { Renderbuffer(GL_RGBA8, size + 1, 16); }));
    EXPECT_EQ("Can't create renderbuffer of width " + over + ", a max height of " + maximum +
                  " is supported",
              MessageOf([&] { Renderbuffer(GL_RGBA8, 16, size + 1); }));
    EXPECT_EQ("GL_INVALID_VALUE", MessageOf([&] { Renderbuffer(GL_RGBA8, -1, 1); }));
    EXPECT_EQ("GL_INVALID_ENUM", MessageOf([&] { Renderbuffer(GL_BLEND, 1, 1); }));
    EXPECT_TRUE(outer.isBound()) << "also after a failure";
    outer.unbind();
    EXPECT_EQ("Framebuffer object must be bound before calling unbind()",
              MessageOf([&] { outer.unbind(); }));
}

TEST_F(FramebufferTest, ObjectsOutliveTheirContext) {
    GLuint framebufferID = 0, renderbufferID = 0;
    {
        ScopedContextWrapper const restore;
        Framebuffer const framebuffer;
        Renderbuffer const renderbuffer(GL_RGBA8, 1, 1);
        VertexBuffer vertices({VertexBuffer::Field("", VertexBuffer::ATTRIBUTETYPE_FLOAT, {})}, 1,
                              VertexBuffer::PRIMITIVETYPE_POINTS);
        EXPECT_NE("", MessageOf([&] { vertices.setupWithProgram(0u); })) << "no program, but names";
        framebufferID = framebuffer.objectID();
        renderbufferID = renderbuffer.objectID();
        ::wglMakeCurrent(nullptr, nullptr);
    }
    // Nothing was deleted in another context's stead: give it back, for the ledger.
    EXPECT_TRUE(ORU_GL(IsRenderbufferEXT, renderbufferID));
    ORU_GL(DeleteFramebuffersEXT, 1, &framebufferID);
    ORU_GL(DeleteRenderbuffersEXT, 1, &renderbufferID);
    GLuint const first = 1;
    ORU_GL(DeleteVertexArrays, 1, &first);
    ORU_GL(DeleteBuffers, 1, &first);
}
