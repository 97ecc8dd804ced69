// Buffer formats, the choice of pixel formats, and what failures on the way to a context leave
// behind.
#include "tests/support/testwindow.h"

#include "tests/support/countinghooks.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>
#include <typeinfo>

using namespace ORU::OGL;
using oru_test::ContextCounter;
using oru_test::MessageOf;
using oru_test::TestWindow;

namespace {

/// Opens the protected operations of a context.
class Exposed : public ContextOffscreen {
public:
    using Context::ChoosePixelFormat;
    using Context::createRenderingContext;
    using Context::initialize;
    using Context::setPixelFormat;
    using Context::shareLists;
    using Context::UnregisterShareContext;
};

struct NeverMade : Context {
    NeverMade() : Context(DisplayDeviceKey()) {}
};

/// A host's own kind, whose makeCurrent fails in a way that the layer does not know.
class Refusing : public Context {
public:
    explicit Refusing(HWND window) : Context(PrimaryDisplayDevice()) {
        initialize(::GetDC(window), BufferFormat(BufferFormat::FORMAT_RGB8), BUFFERING_SINGLE,
                   MULTISAMPLING_NONE, nullptr);
    }
    void makeCurrent() const override { throw std::range_error("refused"); }
};

ContextWindowed Windowed(TestWindow const &window, BufferFormat::PredefinedFormat format,
                         Context::Buffering buffering, int samples) {
    return ContextWindowed(window.hwnd(), format, buffering,
                           static_cast<Context::Multisampling>(samples), nullptr);
}

std::vector<unsigned int> Bits(BufferFormat const &f) {
    return {f.redBits(),     f.greenBits(), f.blueBits(),          f.alphaBits(),
            f.stencilBits(), f.depthBits(), f.floatingPointColor()};
}

} // namespace

TEST(BufferFormat, NamesItsBits) {
    using B = BufferFormat;
    using testing::ElementsAre; // red, green, blue, alpha, stencil, depth, float
    EXPECT_THAT(Bits(B::FORMAT_R32F_D24S8), ElementsAre(32, 0, 0, 0, 8, 24, true));
    EXPECT_THAT(Bits(B::FORMAT_RGB8_D24), ElementsAre(8, 8, 8, 0, 0, 24, false));
    EXPECT_THAT(Bits(B::FORMAT_RGBA16F_B_D24S8), ElementsAre(16, 16, 16, 16, 8, 24, true));
    EXPECT_THAT(Bits(B(1, 2, 3, 4, 5, 6, false)), ElementsAre(1, 2, 3, 4, 5, 6, false));
    EXPECT_EQ("Trying to construct an buffer-format not recognized by this method",
              MessageOf([] { B(static_cast<B::PredefinedFormat>(24)); }));
}

TEST(PixelFormats, GiveWhatWasAskedFor) {
    AutoInitializer library;
    TestWindow const plain, sampled;
    ContextWindowed const gdi =
        Windowed(plain, BufferFormat::FORMAT_RGBA8_D24S8, Context::BUFFERING_DOUBLE, 1);
    int bits[6];
    gdi.getBitDepths(bits, bits + 1, bits + 2, bits + 3, bits + 4, bits + 5);
    using testing::Ge; // red, green, blue, alpha, stencil, depth
    EXPECT_THAT(bits, testing::ElementsAre(Ge(8), Ge(8), Ge(8), Ge(8), Ge(8), Ge(24)));

    ContextWindowed const arb =
        Windowed(sampled, BufferFormat::FORMAT_RGBA8_D24, Context::BUFFERING_DOUBLE, 4);
    EXPECT_EQ(nullptr, ::wglGetCurrentContext()) << "the temporary context is gone";
    EXPECT_TRUE(oru_test::InternalWindowClasses().empty());
    arb.makeCurrent();
    GLint samples = 0;
    ::glGetIntegerv(GL_SAMPLES, &samples);
    EXPECT_EQ(4, samples);
}

// Whatever fails, the contexts and windows made on the way are gone and the current context stays.
// What is the library's own leaves as a logical exception with the texts it had.
TEST(ContextFailures, LeaveNothingBehind) {
    AutoInitializer library;
    ContextCounter const counter;
    {
        Exposed current;
        Exposed::UnregisterShareContext(&current);
        int const alive = ContextCounter::Alive();
        auto const windows = oru_test::InternalWindowClasses();
        NeverMade const neverMade;
        for (bool hasCurrent : {true, false}) {
            if (hasCurrent)
                current.makeCurrent();
            else
                ::wglMakeCurrent(nullptr, nullptr);
            TestWindow const window;
            auto const failure = [&](BufferFormat::PredefinedFormat format,
                                     Context::Buffering buffering, int samples) -> std::string {
                try {
                    Windowed(window, format, buffering, samples);
                } catch (ORU::LogicalException const &e) {
                    EXPECT_EQ(typeid(ORU::LogicalException), typeid(e));
                    EXPECT_STREQ("ORU Internal exception", e.what());
                    EXPECT_THAT(e.file(), testing::StartsWith("oru/oru_ogl/ogl/context_win"));
                    return e.message();
                }
                return "";
            };
            EXPECT_EQ("Double buffering required with multisampling.",
                      failure(BufferFormat::FORMAT_RGBA8, Context::BUFFERING_SINGLE, 4));
            char const none[] = "Can't find suitable pixel format."; // float ones, in this driver
            EXPECT_EQ(none, failure(BufferFormat::FORMAT_RGBA16F, Context::BUFFERING_DOUBLE, 1));
            EXPECT_EQ(none, failure(BufferFormat::FORMAT_RGBA8, Context::BUFFERING_DOUBLE, 64));
            EXPECT_THROW(Refusing(window.hwnd()), std::range_error);
            EXPECT_EQ("outerIter != gVectorOfContextVectors->end()",
                      MessageOf([&] { ContextOffscreen const orphan(&current); }));
            EXPECT_EQ("Context::createRenderingContext cannot share lists.", MessageOf([&] {
                          current.createRenderingContext(current.deviceContext(), &neverMade);
                      }));
            EXPECT_EQ(hasCurrent ? current.renderContext() : nullptr, ::wglGetCurrentContext());
            EXPECT_EQ(alive, ContextCounter::Alive());
            EXPECT_EQ(windows, oru_test::InternalWindowClasses());
        }
    }
}

TEST(ContextFailures, NameWhatIsWrong) {
    AutoInitializer library;
    Exposed context;
    HDC const dc = context.deviceContext();
    BufferFormat const format(BufferFormat::FORMAT_RGB8);
    auto const chooseARB = [&] {
        return Exposed::ChoosePixelFormat(dc, format, Context::BUFFERING_SINGLE,
                                          Context::MULTISAMPLING_NONE, Context::WINDOWING_WINDOW);
    };
    EXPECT_EQ("Context::setPixelFormat invalid pixel format 0",
              MessageOf([&] { context.setPixelFormat(dc, 0); }));
    EXPECT_EQ(0u, MessageOf([&] { context.setPixelFormat(nullptr, 1); })
                      .find("Context::setPixelFormat Unable to set pixel format 1 on device "
                            "context. Window Error: "));
    EXPECT_EQ("Context:choosePixelFormat invalid device context",
              MessageOf([&] { Exposed::ChoosePixelFormat(nullptr, format, false); }));
    EXPECT_EQ("Context::createRenderingContext invalid device context",
              MessageOf([&] { context.createRenderingContext(nullptr, nullptr); }));
    EXPECT_EQ("Context::shareLists cannot share lists.",
              MessageOf([&] { context.shareLists(nullptr); }));
    EXPECT_EQ("ContextWindowed::ctor invalid DC on window", MessageOf([&] {
                  Exposed().initialize(nullptr, format, Context::BUFFERING_SINGLE,
                                       Context::MULTISAMPLING_NONE, nullptr);
              }));
    EXPECT_EQ("pContext != NULL",
              MessageOf([] { ContextOffscreen(static_cast<Context const *>(nullptr)); }));
    EXPECT_EQ("wglChoosePixelFormatARB extension not supported", MessageOf(chooseARB))
        << "without a current context there is no such function";
    context.makeCurrent();
    EXPECT_GE(chooseARB(), 1);
}

// Memory runs out at each of the layer's allocations in turn: what was made before is released.
TEST(ContextFailures, ReleaseEverythingWhenMemoryRunsOut) {
    auto const useTheLayer = [] {
        AutoInitializer library;
        ContextOffscreen const first, second(&first);
        first.makeCurrent();
        ContextWrapped const adopted;
        ORU_GL(UseProgram, 0u);
        ReleaseOGLContext(); // so that a temporary window is made
        TestWindow const window;
        EXPECT_EQ("Can't find suitable pixel format.", MessageOf([&] {
                      Windowed(window, BufferFormat::FORMAT_RGBA16F, Context::BUFFERING_DOUBLE, 1);
                  }));
    };
    bool hasFailed = true;
    for (int i = 1; hasFailed; ++i) {
        oru_test::CountingHooks hooks;
        hooks.failAt(i);
        try {
            useTheLayer();
            hasFailed = false; // it has all it needs
            EXPECT_GT(i, 6);
        } catch (std::bad_alloc const &) {
        }
        EXPECT_TRUE(hooks.outstanding().empty()) << "allocation " << i;
        EXPECT_EQ(0, hooks.wrongReleases()) << "allocation " << i;
        EXPECT_EQ(nullptr, ::wglGetCurrentContext()) << "allocation " << i;
        EXPECT_TRUE(oru_test::InternalWindowClasses().empty()) << "allocation " << i;
    }
}
