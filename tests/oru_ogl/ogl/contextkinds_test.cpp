// The kinds of contexts: what is current before and after, threads, and what 200 of them leave
// behind.
#include "tests/support/testwindow.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include <gtest/gtest.h>

#include <memory>
#include <thread>

using namespace ORU::OGL;
using oru_test::ContextCounter;
using oru_test::MessageOf;
using oru_test::TestWindow;

namespace {

ContextWindowed Windowed(TestWindow const &window, Context const *share = nullptr) {
    return ContextWindowed(window.hwnd(), BufferFormat(BufferFormat::FORMAT_RGBA8_D24),
                           Context::BUFFERING_DOUBLE, Context::MULTISAMPLING_NONE, share);
}

/// Draws one colour into the window's back buffer and reads a pixel of it.
unsigned int DrawAndRead() {
    ::glClearColor(1, 0.5f, 0, 1);
    ::glClear(GL_COLOR_BUFFER_BIT);
    unsigned int pixel = 0;
    ::glReadPixels(1, 1, 1, 1, GL_RGBA, GL_UNSIGNED_BYTE, &pixel);
    return pixel;
}

} // namespace

TEST(ContextKinds, KeepTheCurrentContext) {
    AutoInitializer library;
    ContextOffscreen const first;
    EXPECT_EQ(nullptr, Context::CurrentContext()) << "making a context makes none current";
    {
        ScopedContextWrapper const scope;
        first.makeCurrent();
    }
    EXPECT_EQ(nullptr, Context::CurrentContext()) << "a scope restores none";
    first.makeCurrent();
    {
        TestWindow const window;
        ContextOffscreen const other;
        ContextWindowed const windowed = Windowed(window, &first);
        EXPECT_EQ(first.renderContext(), Context::CurrentContext());
        EXPECT_TRUE(windowed.isSharingWithCurrentContext());
        ScopedContextWrapper const scope(false);
        other.makeCurrent();
        ReleaseOGLContext();
    }
    EXPECT_EQ(first.renderContext(), Context::CurrentContext()) << "nor does destroying others";
    {
        ContextOffscreen const mine;
        mine.makeCurrent();
    }
    EXPECT_EQ(nullptr, Context::CurrentContext()) << "destroying the current one leaves none";
}

TEST(ContextKinds, DrawIntoTheHostsWindow) {
    AutoInitializer library;
    TestWindow const window;
    ContextWindowed context = Windowed(window);
    context.makeCurrent();
    EXPECT_EQ(0xFF0080FFu, DrawAndRead());
    context.swapBuffers();
    EXPECT_TRUE(Context::SupportsVerticalRetraceControl());
    EXPECT_NO_THROW(context.enableSyncToVerticalRetrace(true));
    EXPECT_EQ(static_cast<GLenum>(GL_NO_ERROR), ::glGetError());
}

TEST(ContextKinds, AdoptTheHostsContext) {
    AutoInitializer library;
    EXPECT_EQ("ContextWrapped::ctor invalid device", MessageOf([] { ContextWrapped(); }));
    TestWindow const window;
    std::unique_ptr<ContextWindowed> owner(new ContextWindowed(Windowed(window)));
    HDC const dc = owner->deviceContext();
    HGLRC const rc = owner->renderContext();
    EXPECT_EQ("ContextWrapped::ctor invalid rendering context",
              MessageOf([=] { ContextWrapped(dc, nullptr, nullptr); }));
    ContextWrapped const byWindow(dc, rc, window.hwnd());
    EXPECT_EQ(nullptr, Context::CurrentContext()) << "what was current before the probe is again";
    byWindow.makeCurrent();
    {
        ContextWrapped const current;
        EXPECT_EQ(rc, current.renderContext());
        EXPECT_EQ(owner->displayDeviceKey().displayName, current.displayDeviceKey().displayName);
        EXPECT_TRUE(current.isSharingWithCurrentContext());
    }
    EXPECT_EQ(rc, Context::CurrentContext()) << "the adopted context is left as it is";
    owner.reset();
    EXPECT_EQ("ContextWrapped Object leaked", MessageOf([&] { byWindow.makeCurrent(); }));
}

TEST(ContextKinds, WorkOnOneThreadEachAtOnce) {
    AutoInitializer library;
    ContextOffscreen const parent;
    std::vector<std::unique_ptr<ContextOffscreen>> contexts;
    for (int i = 0; i < 6; ++i) // all before the first is used: sharing needs an unused context
        contexts.push_back(std::make_unique<ContextOffscreen>(&parent));
    std::vector<std::thread> threads;
    threads.reserve(contexts.size());
    for (auto const &context : contexts)
        threads.emplace_back([&context] {
            context->makeCurrent();
            EXPECT_EQ(0x0080FFu, DrawAndRead() & 0xFFFFFFu);
            ReleaseOGLContext();
        });
    for (auto &thread : threads)
        thread.join();

    parent.makeCurrent();
    std::string message;
    std::thread([&] { message = MessageOf([&] { parent.makeCurrent(); }); }).join();
    EXPECT_EQ(0u, message.find("Context::can't make this context current")) << message;
}

// 200 contexts of every kind, in changing order: no context, window or GDI object stays.
// A class that stayed would stand in the way of the next window at its address.
TEST(ContextKinds, LeaveNothingBehind) {
    AutoInitializer library;
    ContextCounter const counter; // in place before the record learns how contexts are made
    {
        ContextOffscreen const keep;
        int const alive = ContextCounter::Alive(), made = ContextCounter::Made();
        TestWindow const window;
        DWORD gdiObjects = 0;
        for (int i = 0; i < 100; ++i) {
            std::unique_ptr<Context> a = std::make_unique<ContextOffscreen>(&keep);
            std::unique_ptr<Context> b;
            if (i % 10 == 0)
                b.reset(new ContextWindowed(Windowed(window, i % 20 ? &keep : nullptr)));
            else
                b = std::make_unique<ContextOffscreen>(a.get());
            (i % 3 ? a : b)->makeCurrent();
            (i % 2 ? a : b).reset();
            a.reset();
            b.reset();
            ASSERT_EQ(nullptr, Context::CurrentContext());
            if (i == 20)
                gdiObjects = ::GetGuiResources(::GetCurrentProcess(), GR_GDIOBJECTS);
        }
        EXPECT_EQ(200, ContextCounter::Made() - made);
        EXPECT_EQ(alive, ContextCounter::Alive());
        EXPECT_EQ(gdiObjects, ::GetGuiResources(::GetCurrentProcess(), GR_GDIOBJECTS));
        EXPECT_EQ(1u, oru_test::InternalWindowClasses().size());
    }
}
