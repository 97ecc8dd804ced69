// Where records come from: one per device, one per foreign context, none before the library is
// open.
#include "tests/support/contexts.h"
#include "tests/support/failure.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/glcall.h"

#include <atomic>
#include <cstdint>
#include <cstring>
#include <functional>
#include <set>
#include <sstream>
#include <thread>
#include <vector>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

char const kNotInitialized[] = "OGL Library must be initialized to use Instance()";

/// Runs the work on a few threads that begin it at the same moment, each with its own number.
void OnThreads(std::size_t count, std::function<void(std::size_t)> const &work) {
    std::atomic<std::size_t> waiting{count};
    std::vector<std::thread> threads;
    threads.reserve(count);
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
        EXPECT_EQ(nullptr, ExtensionManager::Instance());
        library.release();
    }
    EXPECT_TRUE(Library::IsInitialized());
    Library::Terminate();
    EXPECT_FALSE(Library::IsInitialized());
    EXPECT_FAILURE(kNotInitialized,
                   ExtensionManager::Instance(static_cast<Context const *>(nullptr)));
}

TEST(LibraryStart, HandsOptionsToNewContexts) {
    AutoInitializer library;
    ExtensionManager::InitOptions options;
    auto const current = [] { return ExtensionManager::CurrentInitOptions().openGLProfile(); };
    options.setOpenGLProfile(OPENGLPROFILE_CORE);
    {
        ExtensionManager::ScopedInitOptions const outer(options);
        {
            ExtensionManager::ScopedInitOptions const inner(ExtensionManager::InitOptions{});
            EXPECT_EQ(OPENGLPROFILE_DEFAULT, current());
        }
        ContextOffscreen const context;
        EXPECT_EQ(OPENGLPROFILE_CORE, context.openGLProfile());
        EXPECT_EQ(OPENGLPROFILE_CORE,
                  ExtensionManager::Instance(&context)->initOptions().openGLProfile());
    }
    EXPECT_EQ(OPENGLPROFILE_DEFAULT, current());
}

TEST(DeviceRecord, IsBuiltOnceForAllContextsOfADevice) {
    AutoInitializer library;
    InterceptorScope<ContextCounter> const counter;
    ContextOffscreen first, second, third(&first);
    EXPECT_EQ(4, ContextCounter::Made()) << "one of them to build the record";
    EXPECT_EQ(3u, ContextCounter::Alive());

    ExtensionManager *const record = ExtensionManager::Instance(first.displayDeviceKey());
    for (Context const *context : {&first, &second, &third}) {
        EXPECT_EQ(record, ExtensionManager::Instance(context));
        EXPECT_EQ(record, ExtensionManager::Instance(context->renderContext()));
        context->makeCurrent();
        EXPECT_EQ(record, ExtensionManager::Instance());
        EXPECT_EQ(&record->table(), &ExtensionManager::CurrentTable());
    }
    ExtensionManager::UnRegisterContext(second);
    EXPECT_FAILURE("bFound", ExtensionManager::UnRegisterContext(second));
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
        std::vector<ExtensionManager *> records(8);
        OnThreads(records.size(),
                  [&](std::size_t i) { records[i] = ExtensionManager::Instance(key); });
        ASSERT_EQ(1u, std::set<ExtensionManager *>(records.begin(), records.end()).size());
        EXPECT_TRUE(records[0]->isSupported(GL_VERSION_2_0));
    }
}

TEST(ForeignRecord, IsBuiltAtTheFirstCallAndOnce) {
    HostContext host;
    EXPECT_FAILURE(kNotInitialized, ExtensionManager::CurrentTable());
    EXPECT_FAILURE(kNotInitialized, ORU_GL(UseProgram, 0u));

    AutoInitializer library;
    EXPECT_EQ(nullptr, ExtensionManager::Instance());
    ORU_GL(UseProgram, 0u);
    ExtensionManager *const record = ExtensionManager::Instance();
    ASSERT_NE(nullptr, record);
    EXPECT_TRUE(record->displayDeviceKey().deviceID.empty());
    EXPECT_EQ(&record->table(), &ExtensionManager::CurrentTable());
    EXPECT_EQ(record, ExtensionManager::InstanceGuaranteed(host.rc()));

    // Adopting it leaves the record it has; its display device is found all the same, and that
    // device's record, which is another one, built without taking the host's context away.
    ContextWrapped const adopted;
    EXPECT_EQ(record, ExtensionManager::Instance(host.rc()));
    EXPECT_FALSE(adopted.displayDeviceKey().deviceID.empty());
    EXPECT_NE(record, ExtensionManager::Instance(&adopted));
    EXPECT_EQ(host.rc(), ::wglGetCurrentContext());
    EXPECT_EQ(host.dc(), ::wglGetCurrentDC());
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
    AutoInitializer library;
    ContextOffscreen const real;
    ExtensionManager *const record = ExtensionManager::Instance(&real);
    std::vector<std::unique_ptr<Exposed<Context>>> contexts;
    for (std::uintptr_t i = 1; i <= 400; ++i) {
        contexts.push_back(std::make_unique<Exposed<Context>>(reinterpret_cast<HGLRC>(i << 16)));
        contexts.back()->setDisplayDeviceKey(real.displayDeviceKey());
        ExtensionManager::RegisterContext(*contexts.back());
    }
    OnThreads(4, [&](std::size_t) {
        int wrong = 0;
        for (auto const &context : contexts)
            wrong += &ExtensionManager::CurrentTable(context->renderContext()) != &record->table();
        EXPECT_EQ(0, wrong);
    });
    for (auto const &context : contexts) {
        ExtensionManager::UnRegisterContext(*context);
        EXPECT_EQ(nullptr, ExtensionManager::Instance(context->renderContext()));
    }
    EXPECT_EQ(record, ExtensionManager::Instance(real.renderContext()));
}
