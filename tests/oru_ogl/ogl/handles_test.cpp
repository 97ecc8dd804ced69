// Objects that move, take over names made elsewhere, and give up their own.
#include "tests/support/textof.h"
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/buffertexture.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/programpipeline.h"
#include "oru/oru_ogl/ogl/query.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/sampler.h"
#include "oru/oru_ogl/ogl/shader.h"
#include "oru/oru_ogl/ogl/texture2dmultisample.h"
#include "oru/oru_ogl/ogl/texturecube.h"
#include "oru/oru_ogl/ogl/transformfeedback.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

#include <functional>
#include <type_traits>
#include <typeinfo>
#include <utility>

using namespace ORU::OGL;
using namespace oru_test;

static_assert(!std::is_move_constructible_v<ContextOffscreen>);

namespace {

auto const kNearest = Texture::FILTER_NEAREST;

/// What the tests do with an object of each class: whether a name lives, what is known of one, and
/// its uses, all of which an empty one refuses.
struct TextureHandling {
    static bool Lives(unsigned int name) { return ORU_GL(IsTexture, name); }
    static std::string Tell(Texture const &t) {
        return TextOf(t.target(), t.format(), t.width(0), t.height(0), t.depth(0), t.sizeInBytes());
    }
    static inline std::function<void(Texture &)> const kUses[] = {
        [](Texture &t) { t.isBound(); },
        [](Texture &t) { t.target(); },
        [](Texture &t) { t.format(); },
        [](Texture &t) { t.height(0); },
        [](Texture &t) { t.sizeInBytes(); },
        [](Texture &t) { t.enableAutoMIPGeneration(true); },
        [](Texture &t) { t.generateMipmap(); },
        [](Texture &t) { t.disown(); },
        [](Texture &t) { t.setFilter(kNearest, kNearest); }};
};

template<class Object>
struct Handling : TextureHandling {
    static Object Make() {
        auto const format = Texture::INTERNALFORMAT_RGBA16;
        if constexpr (std::is_same_v<Object, Texture1D>)
            return Object(format, 8, false);
        else if constexpr (std::is_same_v<Object, TextureRECT>)
            return Object(format, 8, 4);
        else if constexpr (std::is_same_v<Object, TextureCube>)
            return Object(format, 8, true);
        else if constexpr (std::is_same_v<Object, TextureCubeArray>)
            return Object(format, 8, 2, true);
        else if constexpr (std::is_same_v<Object, Texture2DMultisample>)
            return Object(format, 8, 4, 2);
        else if constexpr (std::is_base_of_v<Texture2, Object>)
            return Object(format, 8, 4, true);
        else
            return Object(format, 8, 4, 2, true);
    }
};

template<>
struct Handling<Buffer> {
    static Buffer Make() {
        return Buffer(40, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsBuffer, name); }
    static std::string Tell(Buffer const &b) {
        return TextOf(b.target(), b.size(), b.usagePolicy(), b.isMapped());
    }
    static inline std::function<void(Buffer &)> const kUses[] = {
        [](Buffer &b) { b.bind(); },
        [](Buffer &b) { b.size(); },
        [](Buffer &b) { b.usagePolicy(); },
        [](Buffer &b) { b.map(GL_READ_ONLY); },
        [](Buffer &b) { b.unmap(); },
        [](Buffer &b) { b.subData(0, 1, &b); },
        [](Buffer &b) { b.convertToPackBuffer(); },
        [](Buffer &b) {
            BoundTexture const texture(std::make_unique<Texture2D>(kRGBA8, 2, 2, false));
            Upload(*texture, 0, {{}, {2, 2, 1}}, kBytes, kTight, &b, std::size_t(0));
        }};
};

template<>
struct Handling<Framebuffer> {
    static Framebuffer Make() {
        Framebuffer framebuffer;
        framebuffer.bind(); // until then its name stands for none yet
        framebuffer.unbind();
        return framebuffer;
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsFramebufferEXT, name); }
    static std::string Tell(Framebuffer const &f) { return TextOf(f.target()); }
    static inline std::function<void(Framebuffer &)> const kUses[] = {
        [](Framebuffer &f) { f.bind(); }, [](Framebuffer &f) { f.statusOkay(nullptr); }};
};

template<>
struct Handling<BufferTexture> : TextureHandling {
    static BufferTexture Make() {
        // OpenGL keeps the store of a deleted buffer while a texture has it.
        return BufferTexture(
            Texture::INTERNALFORMAT_RGBA16,
            Buffer(40, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr));
    }
};

template<>
struct Handling<Sampler> {
    static Sampler Make() { return Sampler(kNearest, kNearest, Texture::WRAPMODE_REPEAT); }
    static bool Lives(unsigned int name) { return ORU_GL(IsSampler, name); }
    static std::string Tell(Sampler const &s) { return TextOf(s.target()); }
    static inline std::function<void(Sampler &)> const kUses[] = {
        [](Sampler &s) { s.bind(0); }, [](Sampler &s) { s.setFilter(kNearest, kNearest); }};
};

template<>
struct Handling<Renderbuffer> {
    static Renderbuffer Make() { return Renderbuffer(GL_DEPTH_COMPONENT24, 8, 4); }
    static bool Lives(unsigned int name) { return ORU_GL(IsRenderbufferEXT, name); }
    static std::string Tell(Renderbuffer const &r) {
        return TextOf(r.format(), r.width(), r.height());
    }
    static inline std::function<void(Renderbuffer &)> const kUses[] = {
        [](Renderbuffer &r) { r.bind(); }, [](Renderbuffer &r) { r.width(); },
        [](Renderbuffer &r) {
            Framebuffer framebuffer;
            framebuffer.bind();
            framebuffer.attach(&r, 0);
        }};
};

template<>
struct Handling<Query> {
    static Query Make() {
        Query query(Query::TYPE_SAMPLES);
        query.begin(); // until then its name stands for none yet
        query.end();
        return query;
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsQuery, name); }
    static std::string Tell(Query const &q) { return TextOf(q.type(), q.result()); }
    static inline std::function<void(Query &)> const kUses[] = {
        [](Query &q) { q.begin(); },  [](Query &q) { q.end(); },       [](Query &q) { q.record(); },
        [](Query &q) { q.type(); },   [](Query &q) { q.available(); }, [](Query &q) { q.result(); },
        [](Query &q) { q.isBound(); }};
};

template<>
struct Handling<VertexArray> {
    static VertexArray Make() { return VertexArray(); }
    static bool Lives(unsigned int name) { return ORU_GL(IsVertexArray, name); }
    static std::string Tell(VertexArray const &a) { return TextOf(a.target()); }
    static inline std::function<void(VertexArray &)> const kUses[] = {
        [](VertexArray &a) { a.bind(); }, [](VertexArray &a) { a.disableAttribute(0); },
        [](VertexArray &a) { a.drawArrays(GL_POINTS, 0, 1); },
        [](VertexArray &a) { a.drawElements(GL_POINTS, 1); }};
};

template<>
struct Handling<Fence> {
    static Fence Make() { return Fence(); }
    static bool Lives(GLsync sync) { return ORU_GL(IsSync, sync); }
    static std::string Tell(Fence const &f) { return TextOf(f.clientWait(std::chrono::hours(1))); }
    static inline std::function<void(Fence &)> const kUses[] = {
        [](Fence &f) { f.wait(); }, [](Fence &f) { f.clientWait({}); },
        [](Fence &f) { f.isSignalled(); }, [](Fence &f) { f.disown(); }};
};

char const *const kSource = "void main() { gl_Position = vec4(0.0); }";

template<>
struct Handling<Shader> {
    static Shader Make() { return Shader(Shader::SHADERTYPE_VERTEX); }
    static bool Lives(unsigned int name) { return ORU_GL(IsShader, name); }
    static std::string Tell(Shader const &s) { return TextOf(s.isLoaded()); }
    static inline std::function<void(Shader &)> const kUses[] = {[](Shader &s) { s.compile(true); },
                                                                 [](Shader &s) { s.shaderID(); }};
};

template<>
struct Handling<Program> {
    static Program Make() {
        Program program;
        program.loadVertexShader(1, &kSource, nullptr);
        program.link(true);
        return program;
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsProgram, name); }
    static std::string Tell(Program const &p) { return TextOf(p.isLinked()); }
    static inline std::function<void(Program &)> const kUses[] = {
        [](Program &p) { p.enable(); }, [](Program &p) { p.programID(); }};
};

template<>
struct Handling<ProgramPipeline> {
    static ProgramPipeline Make() {
        ProgramPipeline pipeline;
        pipeline.bind(); // until then its name stands for none yet
        ProgramPipeline::BindDefault();
        return pipeline;
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsProgramPipeline, name); }
    static std::string Tell(ProgramPipeline const &p) { return TextOf(p.infoLog()); }
    static inline std::function<void(ProgramPipeline &)> const kUses[] = {
        [](ProgramPipeline &p) { p.bind(); }, [](ProgramPipeline &p) { p.validate(); },
        [](ProgramPipeline &p) { p.useStages(ProgramPipeline::STAGE_ALL, Program()); },
        [](ProgramPipeline &p) { p.clearStages(ProgramPipeline::STAGE_ALL); }};
};

template<>
struct Handling<TransformFeedback> {
    static TransformFeedback Make() {
        TransformFeedback feedback;
        feedback.bind();
        TransformFeedback::BindDefault();
        return feedback;
    }
    static bool Lives(unsigned int name) { return ORU_GL(IsTransformFeedback, name); }
    static std::string Tell(TransformFeedback const &f) { return TextOf(f.target()); }
    static inline std::function<void(TransformFeedback &)> const kUses[] = {
        [](TransformFeedback &f) { f.bind(); }, [](TransformFeedback &f) { f.draw(GL_POINTS); },
        [](TransformFeedback &f) { f.setBuffer(0, Handling<Buffer>::Make()); }};
};

unsigned int NameOf(ORU::OGL::Object const &object) {
    return object.objectID();
}
unsigned int NameOf(Shader const &shader) {
    return shader.shaderID();
}
unsigned int NameOf(Program const &program) {
    return program.programID();
}
GLsync NameOf(Fence const &fence) {
    return fence.sync();
}

template<class Object>
void ExpectEmpty(Object &object) {
    for (auto const &use : Handling<Object>::kUses) {
        Failure const failure = FailureOf([&] { use(object); });
        EXPECT_NE(std::string::npos, (failure.text + failure.note).find("empty: it was moved"))
            << "use " << &use - Handling<Object>::kUses << " says \"" << failure.text << '"';
    }
}

template<class Object>
struct Kind {
    using Type = Object;
};

template<class... Objects>
struct Kinds {
    /// Runs a check of each class.
    template<class Check>
    static void ForEach(Check check) {
        (One<Objects>(check), ...);
    }

private:
    template<class Object, class Check>
    static void One(Check check) {
        SCOPED_TRACE(typeid(Object).name());
        check(Kind<Object>());
    }
};

using AllKinds = Kinds<Texture1D, Texture2D, TextureRECT, Texture1DArray, Texture3D, Texture2DArray,
                       TextureCube, TextureCubeArray, BufferTexture, Texture2DMultisample, Sampler,
                       Buffer, Fence, Framebuffer, Query, Renderbuffer, Shader, Program,
                       ProgramPipeline, TransformFeedback, VertexArray>;

template<class Object>
void ExpectMoves() {
    using It = Handling<Object>;
    Object first = It::Make();
    auto const name = NameOf(first);
    std::string const told = It::Tell(first);
    Object second(std::move(first));
    EXPECT_EQ(name, NameOf(second));
    EXPECT_EQ(told, It::Tell(second));
    ExpectEmpty(first);

    Object third = It::Make();
    auto const replaced = NameOf(third);
    third = std::move(second);
    EXPECT_EQ(name, NameOf(third));
    EXPECT_EQ(told, It::Tell(third));
    EXPECT_FALSE(It::Lives(replaced)) << "the old object goes when another is assigned";
    ExpectEmpty(second);
    Object &itself = third;
    third = std::move(itself);
    EXPECT_EQ(told, It::Tell(third));
    second = It::Make();
    EXPECT_EQ(told, It::Tell(second)) << "an empty one can be assigned to";

    std::vector<Object> several;
    for (int i = 0; i < 5; ++i)
        several.push_back(It::Make());
    several.erase(several.begin());
    for (Object const &object : several)
        EXPECT_EQ(told, It::Tell(object));
}

template<class Object>
void ExpectTakesOverAndGivesUpNames() {
    using It = Handling<Object>;
    Object owner = It::Make();
    auto const name = NameOf(owner);
    std::string const told = It::Tell(owner);
    auto const made = [&](ownership_tag ownership) {
        if constexpr (std::is_same_v<Object, Buffer>)
            return Buffer(name, Buffer::TYPE_PIXEL_UNPACK_BUFFER, ownership);
        else if constexpr (std::is_same_v<Object, Query>)
            return Query(name, Query::TYPE_SAMPLES, ownership);
        else
            return Object(name, ownership);
    };
    {
        Object borrowed = made(borrow_name_tag());
        EXPECT_EQ(name, NameOf(borrowed));
        EXPECT_EQ(told, It::Tell(borrowed));
        Object const moved(std::move(borrowed));
        EXPECT_EQ(name, NameOf(moved));
    }
    EXPECT_TRUE(It::Lives(name)) << "a borrowed name stays";
    EXPECT_EQ(name, owner.disown());
    ExpectEmpty(owner);
    EXPECT_TRUE(It::Lives(name)) << "a name that was given up stays";
    { Object const taken = made(take_name_tag()); }
    EXPECT_FALSE(It::Lives(name)) << "a name that was taken goes with its object";
    EXPECT_NE("", MessageOf([&] { made(take_name_tag()); })) << "a name of nothing";
}

} // namespace

class HandlesTest : public ObjectTest {};

TEST_F(HandlesTest, Move) {
    AllKinds::ForEach([](auto kind) { ExpectMoves<typename decltype(kind)::Type>(); });
}

TEST_F(HandlesTest, TakeOverAndGiveUpNames) {
    AllKinds::ForEach(
        [](auto kind) { ExpectTakesOverAndGivesUpNames<typename decltype(kind)::Type>(); });
}

TEST_F(HandlesTest, TakesOverOnlyTexturesThatAFormatStandsFor) {
    std::pair<GLenum, std::string> const formats[] = {
        {GL_R8, TextOf(Texture::INTERNALFORMAT_RED)},
        {GL_RG8, TextOf(Texture::INTERNALFORMAT_RG)},
        {GL_RGB5_A1, TextOf(Texture::INTERNALFORMAT_RGB5_A1)},
        {GL_SRGB8_ALPHA8, TextOf(Texture::INTERNALFORMAT_SRGB8_ALPHA8)},
        {GL_RGBA8_SNORM, "A texture of the format GL_RGBA8_SNORM cannot be taken over: no "
                         "InternalFormat stands for it"}};
    for (auto const &[format, expected] : formats) {
        GLuint name = 0;
        ORU_GL(GenTextures, 1, &name);
        ORU_GL(BindTexture, GL_TEXTURE_2D, name);
        EXPECT_FAILURE("The texture " + std::to_string(name) + " has no level 0 yet",
                       Texture2D(name, borrow_name_tag()));
        ORU_GL(TexImage2D, GL_TEXTURE_2D, 0, static_cast<GLint>(format), 4, 4, 0, GL_RGBA, GL_FLOAT,
               nullptr);
        std::string told;
        told += MessageOf([&] { told = TextOf(Texture2D(name, borrow_name_tag()).format()); });
        EXPECT_EQ(expected, told);
        EXPECT_FAILURE("GL_INVALID_OPERATION", Texture3D(name, borrow_name_tag()));
        ORU_GL(DeleteTextures, 1, &name);
    }
}
