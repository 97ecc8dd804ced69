// Where records come from: one per device, one per foreign context, none before the library is
// open.
#include "tests/support/glfixture.h"
#include "tests/support/testwindow.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include <atomic>
#include <cstdint>
#include <cstring>
#include <set>
#include <thread>
#include <vector>

using namespace ORU::OGL;
using oru_test::MessageOf;

namespace {

/// A context that the host makes with plain calls, current for its lifetime.
class HostContext {
public:
    HostContext() {
        PIXELFORMATDESCRIPTOR descriptor = {};
        descriptor.nSize = sizeof descriptor;
        descriptor.nVersion = 1;
        descriptor.dwFlags = PFD_DRAW_TO_WINDOW | PFD_SUPPORT_OPENGL;
        descriptor.iPixelType = PFD_TYPE_RGBA;
        ::SetPixelFormat(dc_, ::ChoosePixelFormat(dc_, &descriptor), &descriptor);
        rc_ = ::wglCreateContext(dc_);
        EXPECT_TRUE(::wglMakeCurrent(dc_, rc_));
    }
    ~HostContext() {
        ::wglMakeCurrent(nullptr, nullptr);
        ::wglDeleteContext(rc_);
        ::ReleaseDC(window_.hwnd(), dc_);
    }
    HostContext(HostContext const &) = delete;
    HostContext &operator=(HostContext const &) = delete;

    HDC dc() const { return dc_; }
    HGLRC rc() const { return rc_; }

private:
    oru_test::TestWindow window_;
    HDC dc_ = ::GetDC(window_.hwnd());
    HGLRC rc_ = nullptr;
};

char const kNotInitialized[] = "OGL Library must be initialized to use Instance()";

} // namespace

TEST(LibraryStart, OpensOnceAndClosesOnce) {
    EXPECT_EQ("sIsInitialized_", MessageOf([] { Library::Terminate(); }));
    {
        AutoInitializer library;
        EXPECT_EQ("!sIsInitialized_",
                  MessageOf([] { Library::Initialize(Library::InitOptions()); }));
        EXPECT_EQ(nullptr, ExtensionManager::Instance());
        library.release();
    }
    EXPECT_TRUE(Library::IsInitialized());
    Library::Terminate();
    EXPECT_FALSE(Library::IsInitialized());
    EXPECT_EQ(kNotInitialized,
              MessageOf([] { ExtensionManager::Instance(static_cast<Context const *>(nullptr)); }));
}

TEST(LibraryStart, HandsOptionsToNewContexts) {
    AutoInitializer library;
    ExtensionManager::InitOptions options;
    options.setOpenGLProfile(OPENGLPROFILE_CORE);
    {
        ExtensionManager::ScopedInitOptions const outer(options);
        {
            ExtensionManager::ScopedInitOptions const inner(ExtensionManager::InitOptions{});
            EXPECT_EQ(OPENGLPROFILE_DEFAULT,
                      ExtensionManager::CurrentInitOptions().openGLProfile());
        }
        ContextOffscreen context;
        EXPECT_EQ(OPENGLPROFILE_CORE, context.openGLProfile());
        EXPECT_EQ(OPENGLPROFILE_CORE,
                  ExtensionManager::Instance(&context)->initOptions().openGLProfile());
    }
    EXPECT_EQ(OPENGLPROFILE_DEFAULT, ExtensionManager::CurrentInitOptions().openGLProfile());
}

TEST(DeviceRecord, IsBuiltOnceForAllContextsOfADevice) {
    AutoInitializer library;
    oru_test::ContextCounter const created;
    int const before = oru_test::ContextCounter::Made();
    ContextOffscreen first, second, third(&first);
    EXPECT_EQ(4, oru_test::ContextCounter::Made() - before) << "one of them to build the record";
    EXPECT_EQ(nullptr, ::wglGetCurrentContext());

    ExtensionManager *const record = ExtensionManager::Instance(first.displayDeviceKey());
    for (Context const *context : {&first, &second, &third}) {
        EXPECT_EQ(record, ExtensionManager::Instance(context));
        EXPECT_EQ(record, ExtensionManager::Instance(context->renderContext()));
        context->makeCurrent();
        EXPECT_EQ(record, ExtensionManager::Instance());
        EXPECT_EQ(&record->table(), &ExtensionManager::CurrentTable());
    }
    ExtensionManager::UnRegisterContext(second);
    EXPECT_EQ("bFound", MessageOf([&] { ExtensionManager::UnRegisterContext(second); }));
    EXPECT_EQ(nullptr, ExtensionManager::Instance(second.renderContext()));
    ExtensionManager::RegisterContext(second);
    EXPECT_EQ(record, ExtensionManager::Instance(second.renderContext()));
}

// All threads meet the device first at the same moment: each may build a record, one stays.
TEST(DeviceRecord, IsOneForThreadsThatBuildItAtOnce) {
    for (int round = 0; round < 5; ++round) {
        AutoInitializer library;
        DisplayDeviceKey key;
        ASSERT_TRUE(Context::DisplayDevice(0, key));
        std::atomic<int> waiting{8};
        std::vector<ExtensionManager *> records(8);
        std::vector<std::thread> threads;
        threads.reserve(8);
        for (auto &record : records)
            threads.emplace_back([&] {
                --waiting;
                while (waiting > 0)
                    std::this_thread::yield();
                record = ExtensionManager::Instance(key);
            });
        for (std::thread &thread : threads)
            thread.join();
        std::set<ExtensionManager *> const distinct(records.begin(), records.end());
        ASSERT_EQ(1u, distinct.size());
        EXPECT_TRUE((*distinct.begin())->isSupported(GL_VERSION_2_0));
    }
}

TEST(DeviceRecord, RestoresTheCurrentContext) {
    AutoInitializer library;
    HostContext host;
    DisplayDeviceKey key;
    ASSERT_TRUE(Context::DisplayDevice(0, key));
    ASSERT_NE(nullptr, ExtensionManager::Instance(key));
    EXPECT_EQ(host.rc(), ::wglGetCurrentContext());
    EXPECT_EQ(host.dc(), ::wglGetCurrentDC());
}

TEST(ForeignRecord, IsBuiltAtTheFirstCallAndOnce) {
    HostContext host;
    EXPECT_EQ(kNotInitialized, MessageOf([] { ExtensionManager::CurrentTable(); }));
    EXPECT_EQ(kNotInitialized, MessageOf([] { ORU_GL(UseProgram, 0u); }));

    AutoInitializer library;
    EXPECT_EQ(nullptr, ExtensionManager::Instance());
    ORU_GL(UseProgram, 0u);
    ExtensionManager *const record = ExtensionManager::Instance();
    ASSERT_NE(nullptr, record);
    EXPECT_TRUE(record->displayDeviceKey().deviceID.empty());
    EXPECT_EQ(&record->table(), &ExtensionManager::CurrentTable());
    EXPECT_EQ(record, ExtensionManager::InstanceGuaranteed(host.rc()));

    // Adopting it leaves the record it has; its display device is found all the same.
    ContextWrapped const adopted;
    EXPECT_EQ(record, ExtensionManager::Instance(host.rc()));
    EXPECT_FALSE(adopted.displayDeviceKey().deviceID.empty());
}

TEST(ForeignRecord, IsEmptyWithoutAContext) {
    AutoInitializer library;
    FunctionTable const empty;
    EXPECT_EQ(0, std::memcmp(&empty, &ExtensionManager::CurrentTable(), sizeof empty));
    std::ostringstream text;
    text << *ExtensionManager::Instance();
    EXPECT_NE(std::string::npos, text.str().find("Supported extensions:\n    NONE\n"));
}

// More contexts than the read-only index of the registry has places (264): the map behind it
// answers for the rest. The handles are none of a real context, so nothing limits their number.
TEST(ContextRegistry, FindsMoreContextsThanItsIndexHolds) {
    struct Fake : Context {
        Fake(std::uintptr_t handle, Context const &like)
            : Context(reinterpret_cast<HGLRC>(handle)) {
            setDisplayDeviceKey(like.displayDeviceKey());
        }
    };
    AutoInitializer library;
    ContextOffscreen const real;
    ExtensionManager *const record = ExtensionManager::Instance(&real);
    std::vector<std::unique_ptr<Fake>> contexts;
    for (std::uintptr_t i = 1; i <= 400; ++i) {
        contexts.push_back(std::make_unique<Fake>(i << 16, real));
        ExtensionManager::RegisterContext(*contexts.back());
    }
    std::vector<std::thread> threads;
    threads.reserve(4);
    for (int t = 0; t < 4; ++t)
        threads.emplace_back([&] {
            int wrong = 0;
            for (auto const &context : contexts)
                wrong +=
                    &ExtensionManager::CurrentTable(context->renderContext()) != &record->table();
            EXPECT_EQ(0, wrong);
        });
    for (std::thread &thread : threads)
        thread.join();
    for (auto const &context : contexts) {
        ExtensionManager::UnRegisterContext(*context);
        EXPECT_EQ(nullptr, ExtensionManager::Instance(context->renderContext()));
    }
    EXPECT_EQ(record, ExtensionManager::Instance(real.renderContext()));
}
