// The layer on other runtimes: old ones, empty ones, broken ones. Each case needs a process of its
// own, as under CTest, since only the first question in a process settles the runtime's folder.
#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ocl/contextocl.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "tests/countinghooks.h"
#include "tests/oru_ocl/testruntime.h"

#include <gtest/gtest.h>

#include <atomic>
#include <stdexcept>
#include <thread>
#include <vector>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

class FacesTest : public ::testing::Test {
protected:
    void SetUp() override {
        static bool used = false;
        if (used)
            GTEST_SKIP() << "needs a process of its own";
        used = true;
    }
};

/// What `Library::Initialize` says when it fails.
std::string Failure() {
    try {
        Library::Initialize();
    } catch (ORU::InternalException const &e) {
        return e.message();
    } catch (std::out_of_range const &) {
        return "out of range";
    }
    return "";
}

bool HasVersion11() {
    return ExtensionManager::instance()->table().clCreateUserEvent != nullptr;
}

} // namespace

TEST_F(FacesTest, AnOldPlatformLeavesTheSlotsOf11Empty) {
    TestRuntime const runtime("ocl_runtime");
    EXPECT_TRUE(Library::IsOpenCLAvailable(runtime.folder()));
    runtime->setVersion("OpenCL 1.0 old");
    AutoInitializer const layer;
    EXPECT_FALSE(HasVersion11());
    EXPECT_TRUE(ExtensionManager::instance()->init_CL_VERSION_1_1()) << "a caller may still ask";
    EXPECT_TRUE(HasVersion11());
    EXPECT_TRUE(ExtensionManager::instance()->init_cl_ext_device_fission());
}

TEST_F(FacesTest, AVersionOfOneOneBringsItsEntryPoints) {
    TestRuntime const runtime("ocl_runtime");
    EXPECT_TRUE(Library::IsOpenCLAvailable(runtime.folder()));
    runtime->setVersion("OpenCL 1.1");
    AutoInitializer const layer;
    EXPECT_TRUE(HasVersion11());
    EXPECT_EQ("OpenCL 1.1", platforms().front().version());
}

TEST_F(FacesTest, AnEmptyVersionCountsAsZero) {
    TestRuntime const runtime("ocl_runtime");
    EXPECT_TRUE(Library::IsOpenCLAvailable(runtime.folder()));
    runtime->setVersion("");
    AutoInitializer const layer;
    EXPECT_FALSE(HasVersion11());
}

TEST_F(FacesTest, AVersionTooShortFails) {
    TestRuntime const runtime("ocl_runtime");
    EXPECT_TRUE(Library::IsOpenCLAvailable(runtime.folder()));
    runtime->setVersion("Open");
    EXPECT_EQ("out of range", Failure());
    EXPECT_FALSE(Library::IsInitialized());
}

TEST_F(FacesTest, ARuntimeWithoutVersion11LeavesItsSlotsEmpty) {
    TestRuntime const runtime("ocl_runtime_1_0");
    EXPECT_TRUE(Library::IsOpenCLAvailable(runtime.folder()));
    AutoInitializer const layer;
    EXPECT_FALSE(HasVersion11()) << "though the platform says it has them";
    EXPECT_FALSE(ExtensionManager::instance()->init_CL_VERSION_1_1());
    EXPECT_TRUE(ExtensionManager::instance()->init_CL_VERSION_1_0());
    EXPECT_FALSE(platforms().empty());
}

TEST_F(FacesTest, ARuntimeWithoutVersion10IsRefused) {
    CountingHooks hooks;
    TestRuntime const runtime("ocl_runtime_empty");
    EXPECT_FALSE(Library::IsOpenCLAvailable(runtime.folder()));
    for (int i = 0; i < 2; ++i) {
        EXPECT_EQ("isInitialized", Failure());
        EXPECT_EQ(nullptr, ExtensionManager::instance());
    }
    EXPECT_TRUE(hooks.outstanding().empty());
}

TEST_F(FacesTest, WithoutPlatformsNothingOpens) {
    CountingHooks hooks;
    TestRuntime const runtime("ocl_runtime");
    runtime->setPlatforms(false);
    EXPECT_FALSE(Library::IsOpenCLAvailable(runtime.folder()));
    EXPECT_EQ("CL_SUCCESS == error", Failure());
    EXPECT_FALSE(Library::IsInitialized());
    EXPECT_NE(nullptr, ExtensionManager::instance());
    EXPECT_EQ("extMgrInstance_ == 0", Failure()) << "the half-made manager is in the way";
    ExtensionManager::destroy();
    runtime->setPlatforms(true);
    EXPECT_EQ("", Failure());
    EXPECT_FALSE(platforms().empty());
    Library::Terminate();
    EXPECT_TRUE(hooks.outstanding().empty());
}

TEST_F(FacesTest, OpensAndClosesAgainAndAgainFromManyThreads) {
    CountingHooks hooks;
    for (int i = 0; i < 100; ++i) {
        AutoInitializer const layer;
        EXPECT_FALSE(platforms().empty());
    }
    EXPECT_TRUE(hooks.outstanding().empty());
    EXPECT_EQ(0, hooks.wrongReleases());

    // Every thread opens or finds it open; of those that close, one does.
    std::atomic<int> closed{0};
    auto const inThreads = [](auto work) {
        std::vector<std::thread> threads;
        for (int i = 0; i < 8; ++i)
            threads.emplace_back(work);
        for (std::thread &thread : threads)
            thread.join();
    };
    for (int round = 1; round <= 10; ++round) {
        inThreads([] {
            Library::InitializeIfNecessary();
            EXPECT_TRUE(Library::IsInitialized());
        });
        inThreads([&closed] {
            try {
                Library::Terminate();
                ++closed;
            } catch (ORU::InternalException const &e) {
                EXPECT_STREQ("bInitialized_", e.message());
            }
        });
        EXPECT_EQ(round, closed);
    }
}

TEST_F(FacesTest, ObjectsThatOutliveTheLayerDoNoHarm) {
    Library::Initialize();
    auto const platform = platforms().front();
    {
        Context const context(ContextProperties(platform), Device::TYPE_ALL);
        Library::Terminate();
        try {
            static_cast<void>(context.devices());
            ADD_FAILURE() << "nothing was thrown";
        } catch (ORU::InternalException const &e) {
            EXPECT_STREQ("table_ != 0", e.message());
        }
    }
}
