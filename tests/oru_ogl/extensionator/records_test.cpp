// Where records come from: one per device, one per foreign context.
#include "tests/support/contexts.h"

#include <atomic>
#include <functional>
#include <list>
#include <thread>

using namespace oru_test;

namespace {

constexpr char kNotInitialized[] = "OGL Library must be initialized to use Instance()";

/// Runs the work on a few threads that begin it at the same moment, each with its own number.
void OnThreads(std::size_t count, std::function<void(std::size_t)> const &work) {
    std::atomic<std::size_t> waiting{count};
    std::vector<std::thread> threads;
    for (std::size_t i = 0; i < count; ++i)
        threads.emplace_back([&, i] {
            --waiting;
            while (waiting > 0)
                std::this_thread::yield();
            work(i);
        });
    for (std::thread &thread : threads)
        thread.join();
}

} // namespace

TEST(LibraryStart, OpensOnceAndClosesOnce) {
    EXPECT_FAILURE("sIsInitialized_", Library::Terminate());
    {
        AutoInitializer library;
        EXPECT_FAILURE("!sIsInitialized_", Library::Initialize(Library::InitOptions()));
        library.release();
    }
    EXPECT_TRUE(Library::IsInitialized());
    Library::Terminate();
    EXPECT_FALSE(Library::IsInitialized());
}

TEST(LibraryStart, HandsOptionsToNewContexts) {
    AutoInitializer library;
    ExtensionManager::InitOptions options;
    options.setOpenGLProfile(OPENGLPROFILE_CORE);
    {
        ExtensionManager::ScopedInitOptions const scope(options);
        EXPECT_EQ(OPENGLPROFILE_CORE, ContextOffscreen().openGLProfile());
    }
    EXPECT_EQ(OPENGLPROFILE_DEFAULT, ContextOffscreen().openGLProfile());
}

TEST(DeviceRecord, IsBuiltOnceForAllContextsOfADevice) {
    AutoInitializer library;
    InterceptorScope<ContextCounter> const counter;
    ContextOffscreen const first, second;
    EXPECT_EQ(3, ContextCounter::Made()) << "one of them to build the record";
    EXPECT_EQ(2u, ContextCounter::Alive());
    ExtensionManager *const record = ExtensionManager::Instance(first.displayDeviceKey());
    EXPECT_EQ(record, ExtensionManager::Instance(&second));
    second.makeCurrent();
    EXPECT_EQ(record, ExtensionManager::Instance());
    EXPECT_EQ(&record->table(), &ExtensionManager::CurrentTable());
    ExtensionManager::UnRegisterContext(second);
    EXPECT_FAILURE("bFound", ExtensionManager::UnRegisterContext(second));
    ExtensionManager::RegisterContext(second);
    EXPECT_EQ(record, ExtensionManager::Instance(second.renderContext()));
}

// All threads meet the device first at the same moment: each may build a record, one stays.
TEST(DeviceRecord, IsOneForThreadsThatBuildItAtOnce) {
    for (int round = 0; round < 5; ++round) {
        AutoInitializer library;
        DisplayDeviceKey key;
        ASSERT_TRUE(Context::DisplayDevice(0, key));
        std::vector<ExtensionManager *> records(8);
        OnThreads(records.size(),
                  [&](std::size_t i) { records[i] = ExtensionManager::Instance(key); });
        ASSERT_EQ(1u, std::set<ExtensionManager *>(records.begin(), records.end()).size());
        EXPECT_TRUE(records[0]->isSupported(GL_VERSION_2_0)) << "it is there";
    }
}

TEST(ForeignRecord, IsBuiltAtTheFirstCallAndOnce) {
    HostContext host;
    EXPECT_FAILURE(kNotInitialized, ORU_GL(UseProgram, 0u));

    AutoInitializer library;
    EXPECT_EQ(nullptr, ExtensionManager::Instance());
    ORU_GL(UseProgram, 0u);
    ExtensionManager *const record = ExtensionManager::Instance();
    ASSERT_NE(nullptr, record);
    EXPECT_EQ(&record->table(), &ExtensionManager::CurrentTable());

    // Adopting it leaves the record it has; that of its display device is another one, built
    // without taking the host's context away.
    ContextWrapped const adopted;
    EXPECT_EQ(record, ExtensionManager::Instance(host.rc()));
    EXPECT_NE(record, ExtensionManager::Instance(&adopted));
    EXPECT_EQ(host.rc(), ::wglGetCurrentContext());
    EXPECT_EQ(host.dc(), ::wglGetCurrentDC());
}

// More contexts than the read-only index of the registry has places (264): the map behind it
// answers for the rest. The handles are none of a real context.
TEST(ContextRegistry, FindsMoreContextsThanItsIndexHolds) {
    AutoInitializer library;
    ContextOffscreen const real;
    ExtensionManager *const record = ExtensionManager::Instance(&real);
    std::list<Exposed<Context>> contexts;
    for (std::uintptr_t i = 1; i <= 400; ++i) {
        contexts.emplace_back(reinterpret_cast<HGLRC>(i << 16));
        contexts.back().setDisplayDeviceKey(real.displayDeviceKey());
        ExtensionManager::RegisterContext(contexts.back());
    }
    OnThreads(4, [&](std::size_t) {
        for (Context const &context : contexts)
            EXPECT_EQ(&record->table(), &ExtensionManager::CurrentTable(context.renderContext()));
    });
    for (Context const &context : contexts) {
        ExtensionManager::UnRegisterContext(context);
        EXPECT_EQ(nullptr, ExtensionManager::Instance(context.renderContext()));
    }
}
