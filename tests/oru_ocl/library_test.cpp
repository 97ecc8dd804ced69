// Loading of the OpenCL runtime: the installed one and others, old, empty and broken. Each case
// needs a process of its own, as under CTest, since the first question in a process settles the
// runtime's folder.
#include "oru/oru_ocl/contextocl.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "tests/support/countinghooks.h"
#include "tests/support/failure.h"
#include "tests/support/testruntime.h"

#include <gtest/gtest.h>

#include <cstring>
#include <stdexcept>
#include <thread>
#include <tuple>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

class LibraryTest : public ::testing::TestWithParam<int> {
protected:
    void SetUp() override {
        static bool used = false;
        if (used)
            GTEST_SKIP() << "needs a process of its own";
        used = true;
    }

    void TearDown() override {
        EXPECT_TRUE(hooks_.outstanding().empty());
        EXPECT_EQ(0, hooks_.wrongReleases());
    }

    /// Whether nobody but the test uses the runtime; the test gives it up here.
    static bool IsUnused(TestRuntime const &runtime) {
        std::string const file = runtime.folder() + "OpenCL.dll";
        ::FreeLibrary(::GetModuleHandleA(file.c_str()));
        return !::GetModuleHandleA(file.c_str());
    }

private:
    CountingHooks hooks_;
};

std::string SystemDirectory() {
    char path[MAX_PATH];
    return {path, ::GetSystemDirectoryA(path, MAX_PATH)};
}

struct Slot {
    char const *name;
    Enum::Extension group;
};
constexpr Slot kSlots[] = {
#define ORU_CL_SLOT(Extension, Name) {#Name, Enum::Extension},
#include "oru/oru_ocl/internal/functiontable_slots.inc"
};

} // namespace

TEST_F(LibraryTest, ResolvesEveryEntryPointThatTheLoaderHas) {
    AutoInitializer const layer;
    ExtensionManager &manager = *ExtensionManager::instance();
    HMODULE const runtime = ::LoadLibraryA((SystemDirectory() + "\\OpenCL.dll").c_str());
    EXPECT_STREQ("clGetExtensionFunctionAddress", kSlots[73].name);
    EXPECT_STREQ("clEnqueueCopyBufferRect", kSlots[81].name);
    FARPROC values[std::size(kSlots)];
    static_assert(sizeof values == sizeof manager.table());

    // Versions 1.0 and 1.1 are there from the start, as the first platform here is newer. Each
    // other group is complete when the loader exports all of it.
    bool lacks[13] = {};
    std::memcpy(values, &manager.table(), sizeof values);
    for (std::size_t i = 0; i < std::size(kSlots); ++i) {
        FARPROC const exported = ::GetProcAddress(runtime, kSlots[i].name);
        EXPECT_EQ(kSlots[i].group <= 1 ? exported : nullptr, values[i]) << kSlots[i].name;
        lacks[kSlots[i].group] |= !exported;
    }
    for (int e = -1; e <= 16; ++e) {
        bool const known = e >= 0 && e <= 12;
        EXPECT_EQ(known && !lacks[e], manager.initializeCL(Enum::Extension(e))) << e;
        EXPECT_EQ(known, manager.zeroSymbolsForExtensionCL(Enum::Extension(e))) << e;
    }
    std::memcpy(values, &manager.table(), sizeof values);
    for (std::size_t i = 0; i < std::size(kSlots); ++i)
        EXPECT_EQ(::GetProcAddress(runtime, kSlots[i].name), values[i]) << kSlots[i].name;
}

// The path is glued to the file name as it is, and only the first one counts.
TEST_P(LibraryTest, LooksWhereTheFirstPathSays) {
    std::string const paths[] = {"", SystemDirectory() + '\\', SystemDirectory(), "C:\\nowhere\\"};
    bool const found = GetParam() < 2;
    EXPECT_EQ(found, Library::IsOpenCLAvailable(paths[GetParam()]));
    EXPECT_EQ(found, Library::IsOpenCLAvailable(paths[3 - GetParam()]));
    oru_test::Failure const failure = oru_test::FailureOf([] { Library::Initialize(); });
    EXPECT_EQ(found ? "" : "openCLLibraryHandle", failure.text);
    EXPECT_EQ(found ? std::string::npos : 0u,
              failure.note.find("no OpenCL runtime at " + paths[GetParam()] + "OpenCL.dll ("));
    EXPECT_EQ(found, ExtensionManager::instance() != nullptr);
    EXPECT_FAILURE(found ? "" : "bInitialized_", Library::Terminate());
}
INSTANTIATE_TEST_SUITE_P(Paths, LibraryTest, ::testing::Range(0, 4));

using VersionTest = LibraryTest;

TEST_P(VersionTest, DecidesOnTheSlotsOf11) {
    std::tuple<char const *, char const *, bool> const cases[] = {
        {"ocl_runtime", "OpenCL 1.0 old", false},
        {"ocl_runtime", "OpenCL 1.1", true},
        {"ocl_runtime", "OpenCL 2.0 new", true},
        {"ocl_runtime", "", false},
        {"ocl_runtime_1_0", "OpenCL 1.1 lie", true}};
    auto const &[folder, text, isNew] = cases[GetParam()];
    TestRuntime const runtime(folder);
    EXPECT_TRUE(Library::IsOpenCLAvailable(runtime.folder()));
    runtime->answerText(CL_PLATFORM_VERSION, text);
    {
        AutoInitializer const layer;
        ExtensionManager &manager = *ExtensionManager::instance();
        EXPECT_EQ(isNew, manager.table().clCreateUserEvent != nullptr);
        // A caller may still ask, and has what there is even where something lacks.
        EXPECT_EQ(std::string("ocl_runtime") == folder, manager.init_CL_VERSION_1_1());
        EXPECT_NE(nullptr, manager.table().clCreateUserEvent);
    }
    EXPECT_TRUE(IsUnused(runtime));
}
INSTANTIATE_TEST_SUITE_P(Versions, VersionTest, ::testing::Range(0, 5));

TEST_F(LibraryTest, RefusesARuntimeWithoutVersion10) {
    TestRuntime const runtime("ocl_runtime_broken");
    EXPECT_FALSE(Library::IsOpenCLAvailable(runtime.folder()));
    for (int i = 0; i < 2; ++i)
        EXPECT_FAILURE("isInitialized", Library::Initialize());
    EXPECT_EQ(nullptr, ExtensionManager::instance());
    EXPECT_TRUE(IsUnused(runtime));
}

TEST_F(LibraryTest, CanBeTriedAgainAfterAFailure) {
    TestRuntime const runtime("ocl_runtime");
    runtime->fail("clGetPlatformIDs", 1, -1001);
    EXPECT_FALSE(Library::IsOpenCLAvailable(runtime.folder()));
    runtime->fail("clGetPlatformIDs", 1, -1001);
    EXPECT_FAILURE("CL_SUCCESS == error", Library::Initialize());
    EXPECT_FALSE(Library::IsInitialized());
    EXPECT_FAILURE("extMgrInstance_ == 0", Library::Initialize());
    ExtensionManager::destroy();
    runtime->answerText(CL_PLATFORM_VERSION, "Open");
    EXPECT_THROW(Library::Initialize(), std::out_of_range);
    ExtensionManager::destroy();
    runtime->reset();
    Library::Initialize();
    Library::Terminate();
    // The folder is forgotten: what opens now is the system's runtime.
    AutoInitializer const layer;
    EXPECT_TRUE(IsUnused(runtime));
}

TEST_F(LibraryTest, OpensAndClosesAgainAndAgain) {
    for (int i = 0; i < 100; ++i) {
        AutoInitializer layer;
        EXPECT_FAILURE("!bInitialized_", Library::Initialize());
        if (i % 2 == 0)
            continue;
        layer.release();
        Library::Terminate();
    }

    // Objects that outlive it are harmless.
    Library::Initialize();
    Context const context(ContextProperties(platforms().front()), Device::TYPE_ALL);
    Library::Terminate();
    EXPECT_FAILURE("table_ != 0", context.devices());
}

TEST_F(LibraryTest, OpensAndClosesFromManyThreads) {
    std::thread threads[8];
    for (std::thread &thread : threads)
        thread = std::thread([] {
            for (int round = 0; round < 20; ++round) {
                Library::InitializeIfNecessary();
                // Another thread may have closed it before.
                std::string const message = MessageOf([] { Library::Terminate(); });
                EXPECT_TRUE(message.empty() || message == "bInitialized_") << message;
            }
        });
    for (std::thread &thread : threads)
        thread.join();
    EXPECT_FALSE(Library::IsInitialized());
}
