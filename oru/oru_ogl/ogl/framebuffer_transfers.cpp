// Framebuffers: copying, clearing and reading rectangles, and what makes one incomplete.
#include "oru/oru_ogl/ogl/framebuffer.h"

#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/extensionator/opengltokenname.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/textures/imagetransfer.h"
#include "oru/oru_ogl/ogl/internal/textures/viewtransfer.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <array>
#include <limits>
#include <optional>

namespace ORU::OGL {

namespace {

/// A framebuffer, null for the window's own, bound to be read from or drawn into.
class TargetScope {
public:
    TargetScope(GLenum target, GLenum query, Framebuffer const *framebuffer)
        : restore_(Binding{target, Name(framebuffer), Bound(query)}) {
        restore_.action().bind();
    }

    /// A failure leaves here; a destructor would drop it.
    void restore() { restore_.now(); }

private:
    struct Binding {
        GLenum target;
        GLuint name;
        GLuint previous;

        void bind() const {
            if (name != previous)
                ORU_GL(BindFramebuffer, target, name);
        }
        void operator()() const {
            if (name != previous)
                ORU_GL(BindFramebuffer, target, previous);
        }
    };

    static GLuint Name(Framebuffer const *framebuffer) {
        return framebuffer ? framebuffer->checkedID() : 0;
    }

    static GLuint Bound(GLenum query) {
        GLint name = 0;
        ORU_GL(GetIntegerv, query, &name);
        return static_cast<GLuint>(name);
    }

    internal::Ending<Binding> restore_;
};

/// The edges of a rectangle as glBlitFramebuffer takes them, and its size.
struct Edges {
    GLint x0, y0, x1, y1;
    GLsizei width, height;

    /// A side whose far end is a number of OpenGL's, too: a blit takes wrapped ones for a mirrored
    /// rectangle.
    static GLsizei Length(GLint from, std::size_t size) {
        constexpr GLint kLargest = std::numeric_limits<GLint>::max();
        if (size > static_cast<std::size_t>(kLargest - std::max(from, 0)))
            ORU_THROW_INTERNAL("A framebuffer's rectangle cannot reach ", size, " pixels beyond ",
                               from, ": no framebuffer does");
        return static_cast<GLsizei>(size);
    }

    explicit Edges(IntegerRect const &rect) {
        if (rect.isEmpty())
            ORU_THROW_INTERNAL("A framebuffer's rectangle is empty: give it a width and a height");
        x0 = rect.offset().x;
        y0 = rect.offset().y;
        width = Length(x0, rect.width());
        height = Length(y0, rect.height());
        x1 = x0 + width;
        y1 = y0 + height;
    }
};

/// What a clear looks at: the scissor of the first viewport.
class ScissorScope {
public:
    /// @param part what is cleared, or null for all
    explicit ScissorScope(Edges const *part) : restore_(State::Now(part != nullptr)) {
        State const &state = restore_.action();
        if (part)
            state.place({part->x0, part->y0, part->width, part->height});
        if (state.enabled != state.wanted)
            state.enable(state.wanted);
    }

    void restore() { restore_.now(); }

private:
    struct State {
        bool indexed;
        bool enabled; ///< as it was before
        bool wanted;
        std::array<GLint, 4> box; ///< as it was before, where one is wanted

        static State Now(bool wanted) {
            State state = {internal::Supports(GL_ARB_VIEWPORT_ARRAY),
                           ORU_GL(IsEnabled, GL_SCISSOR_TEST) == GL_TRUE,
                           wanted,
                           {}};
            if (wanted)
                ORU_GL(GetIntegerv, GL_SCISSOR_BOX, state.box.data());
            return state;
        }
        void enable(bool on) const {
            if (indexed && on)
                ORU_GL(Enablei, GL_SCISSOR_TEST, 0);
            else if (indexed)
                ORU_GL(Disablei, GL_SCISSOR_TEST, 0);
            else if (on)
                ORU_GL(Enable, GL_SCISSOR_TEST);
            else
                ORU_GL(Disable, GL_SCISSOR_TEST);
        }
        void place(std::array<GLint, 4> const &to) const {
            if (indexed)
                ORU_GL(ScissorIndexed, 0, to[0], to[1], to[2], to[3]);
            else
                ORU_GL(Scissor, to[0], to[1], to[2], to[3]);
        }
        void operator()() const {
            if (enabled != wanted)
                enable(enabled);
            if (wanted)
                place(box);
        }
    };

    internal::Ending<State> restore_;
};

/// Runs a clear of a rectangle of a framebuffer.
template<class Call>
void ClearPart(Framebuffer const *framebuffer, IntegerRect const *part, Call call) {
    ORU_ASSERT_SUPPORTED(GL_VERSION_3_0);
    std::optional<Edges> edges;
    if (part)
        edges.emplace(*part);
    TargetScope bound(GL_DRAW_FRAMEBUFFER, GL_DRAW_FRAMEBUFFER_BINDING, framebuffer);
    ScissorScope scissor(part ? &*edges : nullptr);
    call();
    scissor.restore();
    bound.restore();
}

struct StatusRow {
    GLenum status;
    char const *text;
};

constexpr StatusRow kStatuses[] = {
    {GL_FRAMEBUFFER_COMPLETE, ""},
    {GL_FRAMEBUFFER_INCOMPLETE_ATTACHMENT, "an attached image cannot be drawn into: it has no such "
                                           "level, or its format does not suit the "
                                           "point that it is attached at"},
    {GL_FRAMEBUFFER_INCOMPLETE_MISSING_ATTACHMENT,
     "nothing is attached: attach a texture or a renderbuffer"},
    {GL_FRAMEBUFFER_INCOMPLETE_DIMENSIONS_EXT, "the attached images are of different sizes"},
    {GL_FRAMEBUFFER_INCOMPLETE_FORMATS_EXT, "the attached colours are of different formats"},
    {GL_FRAMEBUFFER_INCOMPLETE_DRAW_BUFFER,
     "a draw buffer is a colour where nothing is attached: call setDrawBuffers with those that are "
     "there"},
    {GL_FRAMEBUFFER_INCOMPLETE_READ_BUFFER,
     "the read buffer is a colour where nothing is attached: call setReadBuffer with one that is "
     "there, or ATTACHMENT_NONE"},
    {GL_FRAMEBUFFER_UNSUPPORTED,
     "the driver cannot draw into these formats together: try others, depth and stencil in one "
     "image, say"},
    {GL_FRAMEBUFFER_INCOMPLETE_MULTISAMPLE,
     "the attached images have different numbers of samples, or not all have them in fixed places"},
    {GL_FRAMEBUFFER_INCOMPLETE_LAYER_TARGETS,
     "some attached images have layers and others have not, or they are of different kinds"},
    {GL_FRAMEBUFFER_UNDEFINED, "the context has no framebuffer of its own"},
};

/// What is attached at a point, as words behind a comma; empty for nothing.
std::string AttachedAt(GLenum target, GLenum point) {
    auto const ask = [&](GLenum parameter) {
        GLint value = 0;
        ORU_GL(GetFramebufferAttachmentParameterivEXT, target, point, parameter, &value);
        return value;
    };
    auto const type = static_cast<GLenum>(ask(GL_FRAMEBUFFER_ATTACHMENT_OBJECT_TYPE_EXT));
    if (type == GL_NONE)
        return "";
    std::string const object = ComposeText(ORUOGLTokenName(point), " has ",
                                           type == GL_TEXTURE ? "texture " : "renderbuffer ",
                                           ask(GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME_EXT));
    if (type != GL_TEXTURE)
        return "; " + object;
    return ComposeText("; ", object, " level ", ask(GL_FRAMEBUFFER_ATTACHMENT_TEXTURE_LEVEL_EXT));
}

} // namespace

char const *Framebuffer::StatusText(unsigned int status) {
    for (StatusRow const &row : kStatuses) {
        if (row.status == status)
            return row.text;
    }
    return "OpenGL tells a reason that the library does not know";
}

std::string Framebuffer::incompleteness() const {
    unsigned int status = 0;
    if (statusOkay(&status))
        return "";
    constexpr GLenum kDepthPoints[] = {GL_DEPTH_ATTACHMENT, GL_STENCIL_ATTACHMENT};
    std::string text = StatusText(status);
    for (unsigned int i = 0, count = MaxColorAttachments(); i < count; ++i)
        text += AttachedAt(target(), GL_COLOR_ATTACHMENT0 + i);
    for (GLenum const point : kDepthPoints)
        text += AttachedAt(target(), point);
    return text;
}

void Framebuffer::BindDefault() {
    ORU_GL(BindFramebufferEXT, GL_FRAMEBUFFER_EXT, 0);
}

void Framebuffer::Blit(Framebuffer const *source, IntegerRect const &from,
                       Framebuffer const *destination, IntegerRect const &to, unsigned int contents,
                       Texture::Filter filter) {
    Edges const a(from), b(to);
    constexpr unsigned int kAll = CONTENTS_COLOR | CONTENTS_DEPTH | CONTENTS_STENCIL;
    if (contents == 0 || (contents & ~kAll) != 0)
        ORU_THROW_INTERNAL("Framebuffer::Blit copies colour, depth and stencil, and ", contents,
                           " is none of them joined");
    bool const smooth = filter == Texture::FILTER_LINEAR && contents == CONTENTS_COLOR;
    if (filter != Texture::FILTER_NEAREST && !smooth)
        ORU_THROW_INTERNAL("Framebuffer::Blit takes FILTER_NEAREST, or FILTER_LINEAR for colours "
                           "alone");
    GLbitfield const mask = (contents & CONTENTS_COLOR ? GL_COLOR_BUFFER_BIT : 0u) |
                            (contents & CONTENTS_DEPTH ? GL_DEPTH_BUFFER_BIT : 0u) |
                            (contents & CONTENTS_STENCIL ? GL_STENCIL_BUFFER_BIT : 0u);
    ORU_ASSERT_SUPPORTED(GL_ARB_FRAMEBUFFER_OBJECT);
    TargetScope read(GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING, source);
    TargetScope drawn(GL_DRAW_FRAMEBUFFER, GL_DRAW_FRAMEBUFFER_BINDING, destination);
    ORU_GL(BlitFramebuffer, a.x0, a.y0, a.x1, a.y1, b.x0, b.y0, b.x1, b.y1, mask,
           Texture::Filter2GL(filter));
    drawn.restore();
    read.restore();
}

void Framebuffer::Resolve(Framebuffer const *source, Framebuffer const *destination,
                          size2 const &size) {
    IntegerRect const all({0, 0}, size);
    Blit(source, all, destination, all, CONTENTS_COLOR, Texture::FILTER_NEAREST);
}

void Framebuffer::ClearColor(Framebuffer const *framebuffer, unsigned int drawBuffer,
                             float const *rgba, IntegerRect const *part) {
    ClearPart(framebuffer, part,
              [&] { ORU_GL(ClearBufferfv, GL_COLOR, static_cast<GLint>(drawBuffer), rgba); });
}

void Framebuffer::ClearColor(Framebuffer const *framebuffer, unsigned int drawBuffer,
                             int const *rgba, IntegerRect const *part) {
    ClearPart(framebuffer, part,
              [&] { ORU_GL(ClearBufferiv, GL_COLOR, static_cast<GLint>(drawBuffer), rgba); });
}

void Framebuffer::ClearColor(Framebuffer const *framebuffer, unsigned int drawBuffer,
                             unsigned int const *rgba, IntegerRect const *part) {
    ClearPart(framebuffer, part,
              [&] { ORU_GL(ClearBufferuiv, GL_COLOR, static_cast<GLint>(drawBuffer), rgba); });
}

void Framebuffer::ClearDepth(Framebuffer const *framebuffer, float depth, IntegerRect const *part) {
    ClearPart(framebuffer, part, [&] { ORU_GL(ClearBufferfv, GL_DEPTH, 0, &depth); });
}

void Framebuffer::ClearStencil(Framebuffer const *framebuffer, int stencil,
                               IntegerRect const *part) {
    ClearPart(framebuffer, part, [&] { ORU_GL(ClearBufferiv, GL_STENCIL, 0, &stencil); });
}

void Framebuffer::ClearDepthAndStencil(Framebuffer const *framebuffer, float depth, int stencil,
                                       IntegerRect const *part) {
    ClearPart(framebuffer, part,
              [&] { ORU_GL(ClearBufferfi, GL_DEPTH_STENCIL, 0, depth, stencil); });
}

void Framebuffer::Read(Framebuffer const *framebuffer, IntegerRect const &part,
                       Texture::Format format, Texture::Type type, void *dst,
                       unsigned int alignment) {
    Edges const edges(part);
    internal::PixelLayout const layout = internal::LayoutOf(format, type);
    ORU_ASSERT_SUPPORTED(GL_ARB_FRAMEBUFFER_OBJECT);
    TargetScope bound(GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING, framebuffer);
    internal::KeepingPackAlignment(alignment, [&] {
        ORU_GL(ReadPixels, edges.x0, edges.y0, edges.width, edges.height, layout.format,
               layout.type, dst);
    });
    bound.restore();
}

void Framebuffer::Read(Framebuffer const *framebuffer, IntegerRect const &part,
                       Texture::Format format, Texture::Type type, Buffer *buffer,
                       std::size_t offset, unsigned int alignment) {
    Edges const edges(part);
    internal::CheckBuffer(buffer);
    internal::CheckByteAlignment(alignment);
    internal::PixelLayout const layout = internal::LayoutOf(format, type);
    ORU_ASSERT_SUPPORTED(GL_ARB_FRAMEBUFFER_OBJECT);
    internal::BecomePackBuffer(*buffer);
    TargetScope bound(GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING, framebuffer);
    internal::KeepingPackAlignment(alignment, [&] {
        internal::ReadInto(*buffer, offset, [&](void *pixels) {
            ORU_GL(ReadPixels, edges.x0, edges.y0, edges.width, edges.height, layout.format,
                   layout.type, pixels);
        });
    });
    bound.restore();
}

void Framebuffer::Read(Framebuffer const *framebuffer, int x, int y,
                       MutablePixelView const &pixels) {
    PixelShape const &shape = pixels.shape();
    internal::CheckSides(shape, 2);
    Edges const edges(IntegerRect({x, y}, {shape.width, shape.height}));
    internal::PixelLayout const layout = internal::LayoutOf(shape.format, shape.type);
    ORU_ASSERT_SUPPORTED(GL_ARB_FRAMEBUFFER_OBJECT);
    TargetScope bound(GL_READ_FRAMEBUFFER, GL_READ_FRAMEBUFFER_BINDING, framebuffer);
    internal::WithPackState(shape, [&] {
        ORU_GL(ReadPixels, edges.x0, edges.y0, edges.width, edges.height, layout.format,
               layout.type, pixels.data());
    });
    bound.restore();
}

} // namespace ORU::OGL
