// The choice of pixel formats, and what failures on the way to a context leave behind.
#include "tests/support/contexts.h"
#include "tests/support/countinghooks.h"

#include <gmock/gmock.h>

#include <functional>
#include <stdexcept>
#include <utility>

using namespace oru_test;
using testing::Ge;

namespace {

/// A host's own kind, whose makeCurrent fails in a way that the layer does not know.
class Refusing : public Exposed<Context> {
public:
    explicit Refusing(HWND window) : Exposed(PrimaryDisplayDevice()) {
        initialize(::GetDC(window), BufferFormat(BufferFormat::FORMAT_RGB8), BUFFERING_SINGLE,
                   MULTISAMPLING_NONE, nullptr);
    }
    void makeCurrent() const override { throw std::range_error("refused"); }
};

} // namespace

TEST(BufferFormat, NamesItsBits) {
    BufferFormat const format(BufferFormat::FORMAT_RGB8_D24);
    EXPECT_EQ(24u, format.depthBits());
    EXPECT_EQ(0u, format.alphaBits() + format.stencilBits());
    EXPECT_FAILURE("Trying to construct an buffer-format not recognized by this method",
                   BufferFormat(static_cast<BufferFormat::PredefinedFormat>(24)));
}

TEST(PixelFormats, GiveWhatWasAskedFor) {
    AutoInitializer library;
    std::tuple<unsigned int, unsigned int, unsigned int> const wanted[] = {{8, 8, 0}, {0, 0, 24}};
    for (auto const &[alpha, stencil, depth] : wanted) {
        TestWindow const window;
        ContextWindowed const context =
            Windowed(window, nullptr, BufferFormat(8, 8, 8, alpha, stencil, depth, false));
        int bits[6]; // red, green, blue, alpha, stencil, depth
        context.getBitDepths(bits, bits + 1, bits + 2, bits + 3, bits + 4, bits + 5);
        EXPECT_THAT(bits, testing::ElementsAre(8, 8, 8, alpha, Ge(stencil), Ge(depth)));
    }
    TestWindow const window;
    ContextWindowed const sampled = Windowed(window, nullptr, BufferFormat::FORMAT_RGBA8_D24, 4);
    EXPECT_EQ(0, InternalWindows()) << "the temporary context is gone";
    sampled.makeCurrent();
    EXPECT_EQ(4, Get(GL_SAMPLES));
}

// Whatever fails, with a current context and without one: the contexts and windows made on the way
// are gone and the current context stays.
TEST(ContextFailures, NameWhatIsWrongAndLeaveNothingBehind) {
    AutoInitializer library;
    InterceptorScope<ContextCounter> const counter;
    using Opened = Exposed<ContextOffscreen>;
    Opened context;
    Opened::UnregisterShareContext(&context);
    Exposed<Context> const neverMade(DisplayDeviceKey{});
    HDC const dc = context.deviceContext();
    BufferFormat const simple(BufferFormat::FORMAT_RGBA8);
    std::pair<char const *, std::function<void()>> const failures[] = {
        {"Double buffering required with multisampling.",
         [&] { Windowed(TestWindow(), nullptr, simple, 4, Context::BUFFERING_SINGLE); }},
        {"Can't find suitable pixel format.", [&] { Windowed(TestWindow(), nullptr, simple, 64); }},
        {"refused", [] { Refusing(TestWindow().hwnd()); }},
        {"outerIter != gVectorOfContextVectors->end()",
         [&] { ContextOffscreen const orphan(&context); }},
        {"pContext != NULL", [] { ContextOffscreen(static_cast<Context const *>(nullptr)); }},
        {"Context::createRenderingContext cannot share lists.",
         [&] { context.createRenderingContext(dc, &neverMade); }},
        {"Context::createRenderingContext invalid device context",
         [&] { context.createRenderingContext(nullptr, nullptr); }},
        {"Context::shareLists cannot share lists.", [&] { context.shareLists(nullptr); }},
        {"Context::setPixelFormat invalid pixel format 0", [&] { context.setPixelFormat(dc, 0); }},
        {"Context::setPixelFormat Unable to set pixel format 1 on device context. Window Error: ",
         [&] { context.setPixelFormat(nullptr, 1); }},
        {"Context:choosePixelFormat invalid device context",
         [&] { Opened::ChoosePixelFormat(nullptr, simple, false); }},
        {"ContextWindowed::ctor invalid DC on window", [&] {
             Exposed<Context>(DisplayDeviceKey{})
                 .initialize(nullptr, simple, Context::BUFFERING_SINGLE,
                             Context::MULTISAMPLING_NONE, nullptr);
         }}};
    for (HGLRC current : {context.renderContext(), HGLRC(nullptr)}) {
        ::wglMakeCurrent(current ? dc : nullptr, current);
        EXPECT_FAILURE(current ? "" : "wglChoosePixelFormatARB extension not supported",
                       Opened::ChoosePixelFormat(dc, simple, Context::BUFFERING_SINGLE,
                                                 Context::MULTISAMPLING_NONE,
                                                 Context::WINDOWING_WINDOW));
        for (auto const &[text, fail] : failures) {
            EXPECT_EQ(text, MessageOf(fail).substr(0, std::string(text).size()));
            EXPECT_EQ(current, ::wglGetCurrentContext()) << text;
            EXPECT_EQ(1u, ContextCounter::Alive()) << text;
            EXPECT_EQ(0, ContextCounter::Remembered()) << text;
            EXPECT_EQ(1, InternalWindows()) << text;
        }
    }
    EXPECT_THAT(FailureOf(failures[0].second).file, testing::StartsWith("oru/oru_ogl/ogl/context"));
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
        MessageOf(
            [&] { Windowed(window, nullptr, BufferFormat::FORMAT_RGBA16F); }); // there is none
    };
    bool hasFailed = true;
    for (int i = 1; hasFailed; ++i) {
        CountingHooks hooks;
        hooks.failAt(i);
        try {
            useTheLayer();
            hasFailed = false; // it has all it needs
            EXPECT_GT(i, 6);
        } catch (std::bad_alloc const &) {
        }
        EXPECT_TRUE(hooks.outstanding().empty()) << i;
        EXPECT_EQ(0, hooks.wrongReleases()) << i;
        EXPECT_EQ(nullptr, ::wglGetCurrentContext()) << i;
        EXPECT_EQ(0, InternalWindows()) << i;
    }
}
