// The kinds of contexts: what is current before and after, threads, and what 200 leave behind.
#include "tests/support/contexts.h"

#include "oru/oru_ogl/extensionator/wgl/extensionswgl.h"

#include <functional>
#include <list>
#include <thread>

using namespace oru_test;

// That is none, or another one in its own window.
TEST(ContextKinds, KeepTheCurrentContext) {
    AutoInitializer library;
    TestWindow const window, otherWindow;
    ContextWindowed const first = Windowed(window), other = Windowed(otherWindow);
    std::function<void()> const steps[] = {
        [] { ContextOffscreen(); }, [&] { Windowed(TestWindow(), &first); },
        [&] { ContextWrapped(first.deviceContext(), first.renderContext(), window.hwnd()); },
        [&] {
            ScopedContextWrapper const scope(false);
            other.makeCurrent();
        },
        [&] { // the same context in another window
            ScopedContextWrapper const scope;
            EXPECT_TRUE(::wglMakeCurrent(other.deviceContext(), first.renderContext()));
        }};
    for (bool hasCurrent : {false, true}) {
        if (hasCurrent)
            first.makeCurrent();
        for (auto const &step : steps) {
            SCOPED_TRACE(&step - steps);
            step();
            EXPECT_EQ(hasCurrent ? first.renderContext() : nullptr, Context::CurrentContext());
            EXPECT_EQ(hasCurrent ? first.deviceContext() : nullptr, ::wglGetCurrentDC());
        }
    }
    ContextOffscreen().makeCurrent();
    EXPECT_EQ(nullptr, Context::CurrentContext()) << "destroying the current one leaves none";
}

TEST(ContextKinds, WaitForTheDisplay) {
    AutoInitializer library;
    TestWindow const window;
    ContextWindowed context = Windowed(window);
    context.makeCurrent();
    for (bool waits : {true, false}) {
        context.enableSyncToVerticalRetrace(waits);
        EXPECT_EQ(waits, _wcgmGetSwapIntervalEXT());
    }
}

TEST(ContextKinds, AdoptTheHostsContext) {
    AutoInitializer library;
    EXPECT_FAILURE("ContextWrapped::ctor invalid device", ContextWrapped());
    std::optional<HostContext> host(std::in_place);
    EXPECT_FAILURE("ContextWrapped::ctor invalid rendering context",
                   ContextWrapped(host->dc(), nullptr, nullptr));
    ContextWrapped const adopted;
    EXPECT_EQ(host->rc(), adopted.renderContext());
    host.reset();
    EXPECT_FAILURE("ContextWrapped Object leaked", adopted.makeCurrent());
}

TEST(ContextKinds, WorkOnOneThreadEachAtOnce) {
    AutoInitializer library;
    ContextOffscreen const parent;
    std::list<ContextOffscreen> contexts;
    for (int i = 0; i < 6; ++i)
        contexts.emplace_back(&parent);
    std::vector<std::thread> threads;
    for (ContextOffscreen const &context : contexts)
        threads.emplace_back([&context] {
            context.makeCurrent();
            ::glClearColor(1, 0.5f, 0, 1);
            ::glClear(GL_COLOR_BUFFER_BIT);
            unsigned int pixel = 0;
            ::glReadPixels(1, 1, 1, 1, GL_RGB, GL_UNSIGNED_BYTE, &pixel);
            EXPECT_EQ(0x0080FFu, pixel);
            ReleaseOGLContext();
        });
    for (std::thread &thread : threads)
        thread.join();

    parent.makeCurrent();
    std::thread([&] {
        std::string const message = MessageOf([&] { parent.makeCurrent(); });
        EXPECT_EQ(0u, message.find("Context::can't make this context current")) << message;
    }).join();
}

// 200 contexts of every kind, in changing order: no context, record, window or GDI object stays.
TEST(ContextKinds, LeaveNothingBehind) {
    AutoInitializer library;
    InterceptorScope<ContextCounter> const counter;
    {
        ContextOffscreen const keep;
        int const made = ContextCounter::Made();
        TestWindow const window;
        DWORD gdiObjects = 0;
        for (int i = 0; i < 100; ++i) {
            std::unique_ptr<Context> a = std::make_unique<ContextOffscreen>(&keep), b;
            if (i % 10 == 0)
                b.reset(new ContextWindowed(Windowed(window, i % 20 ? &keep : nullptr)));
            else
                b = std::make_unique<ContextOffscreen>(a.get());
            (i % 3 ? a : b)->makeCurrent();
            (i % 2 ? a : b).reset();
            a.reset(); // before or after the other
            b.reset();
            ASSERT_EQ(nullptr, Context::CurrentContext());
            if (i == 20)
                gdiObjects = ::GetGuiResources(::GetCurrentProcess(), GR_GDIOBJECTS);
        }
        EXPECT_EQ(200, ContextCounter::Made() - made);
        EXPECT_EQ(gdiObjects, ::GetGuiResources(::GetCurrentProcess(), GR_GDIOBJECTS));
        EXPECT_EQ(1, InternalWindows());
    }
    EXPECT_EQ(0u, ContextCounter::Alive());
    EXPECT_EQ(0, ContextCounter::Remembered());
}
