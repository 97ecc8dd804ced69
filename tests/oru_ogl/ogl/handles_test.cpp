// Objects that move, take over names made elsewhere, and give up their own.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/textureunit.h"

#include <functional>
#include <sstream>
#include <type_traits>
#include <utility>

using namespace ORU::OGL;
using namespace oru_test;

static_assert(!std::is_move_constructible_v<ContextOffscreen>);

namespace {

// What the test does with every class: makes one, looks whether a name lives, tells all that is
// known of an object, and the uses that an empty one refuses.
template<class Object>
struct Handled;

template<class Kind, auto make>
struct HandledTexture {
    static Kind Make() {
        auto const format = Texture::INTERNALFORMAT_RGBA16;
        return make(format);
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsTexture, name); }
    static unsigned int Name(Kind const &texture) { return texture.objectID(); }
    static std::string Tell(Kind const &t) {
        std::ostringstream text;
        text << t.target() << ' ' << t.format() << ' ' << t.width(0) << 'x' << t.height(0) << 'x'
             << t.depth(0) << ' ' << t.sizeInBytes();
        return text.str();
    }
    static std::vector<std::function<void(Kind &)>> Uses() {
        auto const nearest = Texture::FILTER_NEAREST;
        return {[](Kind &t) { t.isBound(); },
                [](Kind &t) { t.target(); },
                [](Kind &t) { t.format(); },
                [](Kind &t) { t.height(0); },
                [](Kind &t) { t.sizeInBytes(); },
                [](Kind &t) { t.enableAutoMIPGeneration(true); },
                [](Kind &t) { t.generateMipmap(); },
                [](Kind &t) { t.disown(); },
                [=](Kind &t) { t.setFilter(nearest, nearest); }};
    }
};

#define ORU_HANDLED(Kind, ...)                                                                     \
    inline Kind Make##Kind(Texture::InternalFormat format) {                                       \
        return Kind(format, __VA_ARGS__);                                                          \
    }                                                                                              \
    template<>                                                                                     \
    struct Handled<Kind> : HandledTexture<Kind, Make##Kind> {};
ORU_HANDLED(Texture1D, 8, false)
ORU_HANDLED(Texture2D, 8, 4, true)
ORU_HANDLED(TextureRECT, 8, 4)
ORU_HANDLED(Texture1DArray, 8, 3, false)
ORU_HANDLED(Texture3D, 8, 4, 2, false)
ORU_HANDLED(Texture2DArray, 8, 4, 3, true)
#undef ORU_HANDLED

template<>
struct Handled<Buffer> {
    static Buffer Make() {
        return Buffer(40, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsBuffer, name); }
    static unsigned int Name(Buffer const &buffer) { return buffer.objectID(); }
    static std::string Tell(Buffer const &b) {
        std::ostringstream text;
        text << b.target() << ' ' << b.size() << ' ' << b.usagePolicy() << ' ' << b.isMapped();
        return text.str();
    }
    static std::vector<std::function<void(Buffer &)>> Uses() {
        return {[](Buffer &b) { b.bind(); },
                [](Buffer &b) { b.size(); },
                [](Buffer &b) { b.usagePolicy(); },
                [](Buffer &b) { b.isMapped(); },
                [](Buffer &b) { b.map(GL_READ_ONLY); },
                [](Buffer &b) { b.unmap(); },
                [](Buffer &b) { b.subData(0, 1, &b); },
                [](Buffer &b) { b.isPackBuffer(); },
                [](Buffer &b) { b.convertToPackBuffer(); },
                [](Buffer &b) {
                    Texture2D texture(kRGBA8, 2, 2, false);
                    TextureUnit::Unit(0)->bind(&texture);
                    texture.subImage(0, 0, 0, 2, 2, kBytes.format, kBytes.type, &b, 0, kTight);
                }};
    }
};

template<>
struct Handled<Framebuffer> {
    static Framebuffer Make() {
        Framebuffer framebuffer;
        framebuffer.bind(); // until then its name stands for none yet
        framebuffer.unbind();
        return framebuffer;
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsFramebufferEXT, name); }
    static unsigned int Name(Framebuffer const &framebuffer) { return framebuffer.objectID(); }
    static std::string Tell(Framebuffer const &f) { return std::to_string(f.target()); }
    static std::vector<std::function<void(Framebuffer &)>> Uses() {
        return {[](Framebuffer &f) { f.bind(); }, [](Framebuffer &f) { f.unbind(); },
                [](Framebuffer &f) { f.statusOkay(nullptr); }};
    }
};

template<>
struct Handled<Renderbuffer> {
    static Renderbuffer Make() { return Renderbuffer(GL_DEPTH_COMPONENT24, 8, 4); }
    static bool Lives(unsigned int name) { return ORU_GL(IsRenderbufferEXT, name); }
    static unsigned int Name(Renderbuffer const &renderbuffer) { return renderbuffer.objectID(); }
    static std::string Tell(Renderbuffer const &r) {
        std::ostringstream text;
        text << r.format() << ' ' << r.width() << 'x' << r.height();
        return text.str();
    }
    static std::vector<std::function<void(Renderbuffer &)>> Uses() {
        return {[](Renderbuffer &r) { r.bind(); }, [](Renderbuffer &r) { r.width(); },
                [](Renderbuffer &r) { r.height(); }, [](Renderbuffer &r) { r.format(); },
                [](Renderbuffer &r) {
                    Framebuffer framebuffer;
                    framebuffer.bind();
                    framebuffer.attach(&r, 0);
                }};
    }
};

template<>
struct Handled<Shader> {
    static Shader Make() {
        Shader shader(Shader::SHADERTYPE_VERTEX);
        shader.load("void main() { gl_Position = vec4(0.0); }");
        return shader;
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsShader, name); }
    static unsigned int Name(Shader const &shader) { return shader.shaderID(); }
    static std::string Tell(Shader const &shader) { return std::to_string(shader.isLoaded()); }
    static std::vector<std::function<void(Shader &)>> Uses() {
        return {[](Shader &s) { s.compile(true); }, [](Shader &s) { s.shaderID(); }};
    }
};

template<>
struct Handled<Program> {
    static Program Make() {
        Program program;
        char const *const source = "void main() { gl_Position = vec4(0.0); }";
        program.loadVertexShader(1, &source, nullptr);
        program.link(true);
        return program;
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsProgram, name); }
    static unsigned int Name(Program const &program) { return program.programID(); }
    static std::string Tell(Program const &program) { return std::to_string(program.isLinked()); }
    static std::vector<std::function<void(Program &)>> Uses() {
        return {[](Program &p) { p.enable(); }, [](Program &p) { p.programID(); }};
    }
};

template<class Object>
class Handles : public ObjectTest {
protected:
    static void ExpectEmpty(Object &object) {
        int number = 0;
        for (auto const &use : Handled<Object>::Uses()) {
            Failure const failure = FailureOf([&] { use(object); });
            EXPECT_NE(std::string::npos, (failure.text + failure.note).find("empty: it was moved"))
                << "use " << number << " says \"" << failure.text << '"';
            ++number;
        }
    }
};

using Kinds = testing::Types<Texture1D, Texture2D, TextureRECT, Texture1DArray, Texture3D,
                             Texture2DArray, Buffer, Framebuffer, Renderbuffer, Shader, Program>;

} // namespace

TYPED_TEST_SUITE(Handles, Kinds, ); // with the comma, as clang wants an argument there

TYPED_TEST(Handles, Move) {
    using It = Handled<TypeParam>;
    TypeParam first = It::Make();
    unsigned int const name = It::Name(first);
    std::string const told = It::Tell(first);
    TypeParam second(std::move(first));
    EXPECT_EQ(name, It::Name(second));
    EXPECT_EQ(told, It::Tell(second));
    this->ExpectEmpty(first);

    TypeParam third = It::Make();
    unsigned int const replaced = It::Name(third);
    third = std::move(second);
    EXPECT_EQ(name, It::Name(third));
    EXPECT_EQ(told, It::Tell(third));
    EXPECT_FALSE(It::Lives(replaced)) << "the old object goes when another is assigned";
    this->ExpectEmpty(second);
    TypeParam &itself = third;
    third = std::move(itself);
    EXPECT_EQ(told, It::Tell(third));
    second = It::Make();
    EXPECT_EQ(told, It::Tell(second)) << "an empty one can be assigned to";

    std::vector<TypeParam> several;
    for (int i = 0; i < 5; ++i)
        several.push_back(It::Make());
    several.erase(several.begin());
    for (TypeParam const &object : several)
        EXPECT_EQ(told, It::Tell(object));
}

TYPED_TEST(Handles, TakeOverAndGiveUpNames) {
    using It = Handled<TypeParam>;
    TypeParam owner = It::Make();
    unsigned int const name = It::Name(owner);
    std::string const told = It::Tell(owner);
    auto const made = [&](ownership_tag ownership) {
        if constexpr (std::is_same_v<TypeParam, Buffer>)
            return Buffer(name, Buffer::TYPE_PIXEL_UNPACK_BUFFER, ownership);
        else
            return TypeParam(name, ownership);
    };
    {
        TypeParam borrowed = made(borrow_name_tag());
        EXPECT_EQ(name, It::Name(borrowed));
        EXPECT_EQ(told, It::Tell(borrowed));
        TypeParam const moved(std::move(borrowed));
        EXPECT_EQ(name, It::Name(moved));
    }
    EXPECT_TRUE(It::Lives(name)) << "a borrowed name stays";
    EXPECT_EQ(name, owner.disown());
    this->ExpectEmpty(owner);
    EXPECT_TRUE(It::Lives(name)) << "a name that was given up stays";
    { TypeParam const taken = made(take_name_tag()); }
    EXPECT_FALSE(It::Lives(name)) << "a name that was taken goes with its object";
    EXPECT_NE("", MessageOf([&] { made(take_name_tag()); })) << "a name of nothing";
}

TEST_F(ObjectTest, TakesOverOnlyTexturesThatAFormatStandsFor) {
    std::pair<GLenum, std::string> const formats[] = {
        {GL_R8, "INTERNALFORMAT_RED"},
        {GL_RG8, "INTERNALFORMAT_RG"},
        {GL_RGBA32F, "INTERNALFORMAT_RGBA32F_ARB"},
        {GL_RGBA8UI, "A texture of the format GL_RGBA8UI cannot be taken over: no InternalFormat "
                     "stands for it"}};
    for (auto const &[format, expected] : formats) {
        GLuint name = 0;
        ORU_GL(GenTextures, 1, &name);
        ORU_GL(BindTexture, GL_TEXTURE_2D, name);
        EXPECT_FAILURE("The texture " + std::to_string(name) + " has no level 0 yet",
                       Texture2D(name, borrow_name_tag()));
        bool const isInteger = format == GL_RGBA8UI;
        ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, static_cast<GLint>(format), 4, 4, 0,
               isInteger ? GL_RGBA_INTEGER : GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
        std::ostringstream told;
        std::string const failure =
            MessageOf([&] { told << Texture2D(name, borrow_name_tag()).format(); });
        EXPECT_EQ(expected, told.str() + failure);
        EXPECT_FAILURE("GL_INVALID_OPERATION", Texture3D(name, borrow_name_tag()));
        ORU_GL(BindTexture, GL_TEXTURE_2D, 0);
        ORU_GL(DeleteTextures, 1, &name);
    }
}
