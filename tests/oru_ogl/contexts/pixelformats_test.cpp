// Buffer formats, the choice of pixel formats, and what failures leave behind.
#include "testwindow.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"

#include <gtest/gtest.h>

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
};

ContextWindowed Windowed(TestWindow const &window, BufferFormat::PredefinedFormat format,
                         Context::Buffering buffering, int samples) {
    return ContextWindowed(window.hwnd(), BufferFormat(format), buffering,
                           static_cast<Context::Multisampling>(samples), nullptr);
}

std::vector<unsigned int> Bits(BufferFormat const &f) {
    unsigned int const isFloat = f.floatingPointColor() ? 1 : 0;
    return {f.redBits(),     f.greenBits(), f.blueBits(), f.alphaBits(),
            f.stencilBits(), f.depthBits(), isFloat};
}

} // namespace

TEST(BufferFormat, NamesItsBits) {
    using B = BufferFormat;
    using Row = std::vector<unsigned int>; // red, green, blue, alpha, stencil, depth, float
    EXPECT_EQ((Row{32, 0, 0, 0, 8, 24, 1}), Bits(B(B::FORMAT_R32F_D24S8)));
    EXPECT_EQ((Row{8, 8, 8, 0, 0, 24, 0}), Bits(B(B::FORMAT_RGB8_D24)));
    EXPECT_EQ((Row{16, 16, 16, 16, 8, 24, 1}), Bits(B(B::FORMAT_RGBA16F_B_D24S8)));
    EXPECT_EQ("Trying to construct an buffer-format not recognized by this method",
              MessageOf([] { B(static_cast<B::PredefinedFormat>(24)); }));
    EXPECT_EQ((Row{1, 2, 3, 4, 5, 6, 0}), Bits(B(1, 2, 3, 4, 5, 6, false)))
        << "stencil before depth";
}

TEST(PixelFormats, GiveWhatWasAskedFor) {
    AutoInitializer library;
    int r, g, b, a, stencil, depth;
    TestWindow const plain;
    ContextWindowed const gdi =
        Windowed(plain, BufferFormat::FORMAT_RGBA8_D24S8, Context::BUFFERING_DOUBLE, 1);
    gdi.getBitDepths(&r, &g, &b, &a, &stencil, &depth);
    EXPECT_GE(r, 8);
    EXPECT_GE(a, 8);
    EXPECT_GE(stencil, 8);
    EXPECT_GE(depth, 24);

    TestWindow const sampled;
    ContextWindowed const arb =
        Windowed(sampled, BufferFormat::FORMAT_RGBA8_D24, Context::BUFFERING_DOUBLE, 4);
    EXPECT_EQ(nullptr, ::wglGetCurrentContext()) << "the temporary context is gone";
    EXPECT_TRUE(oru_test::InternalWindowClasses().empty());
    arb.makeCurrent();
    GLint samples = 0;
    ::glGetIntegerv(GL_SAMPLES, &samples);
    EXPECT_EQ(4, samples);
    ::wglMakeCurrent(nullptr, nullptr);
}

// Whatever fails, the contexts and windows made on the way are gone and the current context stays.
TEST(PixelFormats, LeaveNothingBehindWhenTheyFail) {
    AutoInitializer library;
    {
        ContextCounter const counter;
        ContextOffscreen current;
        int const alive = ContextCounter::Alive();
        auto const windows = oru_test::InternalWindowClasses();
        for (bool hasCurrent : {true, false}) {
            if (hasCurrent)
                current.makeCurrent();
            else
                ::wglMakeCurrent(nullptr, nullptr);
            TestWindow const window;
            auto const failure = [&](BufferFormat::PredefinedFormat format,
                                     Context::Buffering buffering, int samples) {
                return MessageOf([&] { Windowed(window, format, buffering, samples); });
            };
            EXPECT_EQ("Double buffering required with multisampling.",
                      failure(BufferFormat::FORMAT_RGBA8, Context::BUFFERING_SINGLE, 4));
            char const none[] = "Can't find suitable pixel format."; // float ones, in this driver
            EXPECT_EQ(none, failure(BufferFormat::FORMAT_RGBA16F, Context::BUFFERING_DOUBLE, 1));
            EXPECT_EQ(none, failure(BufferFormat::FORMAT_RGBA8, Context::BUFFERING_DOUBLE, 64));
            EXPECT_EQ(hasCurrent ? current.renderContext() : nullptr, ::wglGetCurrentContext());
            EXPECT_EQ(alive, ContextCounter::Alive());
            EXPECT_EQ(windows, oru_test::InternalWindowClasses());
        }
    }
}

// What was caught on the way leaves initialize as a logical exception with the text it had.
TEST(PixelFormats, LeaveInitializeAsLogicalExceptions) {
    AutoInitializer library;
    TestWindow const window;
    try {
        Windowed(window, BufferFormat::FORMAT_RGBA8, Context::BUFFERING_SINGLE, 2);
        ADD_FAILURE() << "a single-buffered multisampled context was made";
    } catch (ORU::LogicalException const &e) {
        EXPECT_STREQ(typeid(ORU::LogicalException).name(), typeid(e).name());
        EXPECT_STREQ("ORU Internal exception", e.what());
        EXPECT_STREQ("oru/oru_ogl/ogl/context_win.cpp", e.file());
    }
}

TEST(PixelFormats, CheckTheirArguments) {
    AutoInitializer library;
    Exposed context;
    HDC const dc = context.deviceContext();
    BufferFormat const format(BufferFormat::FORMAT_RGB8);
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
    EXPECT_EQ("wglChoosePixelFormatARB extension not supported", MessageOf([&] {
                  Exposed::ChoosePixelFormat(dc, format, Context::BUFFERING_SINGLE,
                                             Context::MULTISAMPLING_NONE,
                                             Context::WINDOWING_WINDOW);
              }))
        << "without a current context there is no such function";
    context.makeCurrent();
    EXPECT_GE(Exposed::ChoosePixelFormat(dc, format, Context::BUFFERING_SINGLE,
                                         Context::MULTISAMPLING_NONE, Context::WINDOWING_WINDOW),
              1);
}
