// Loading of the OpenCL runtime. Each case runs in a process of its own under CTest, as the answer
// of IsOpenCLAvailable is one for the process.
#include "tests/messageof.h"

#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "oru/oru_ocl/ocllibrary.h"

#include <gtest/gtest.h>
#include <windows.h>

#include <algorithm>
#include <cstring>
#include <vector>

using namespace ORU::OCL;
using oru_test::MessageOf;

namespace {

/// The runtime as the system loads it, to ask for its exports directly.
HMODULE SystemRuntime() {
    wchar_t path[MAX_PATH];
    UINT const length = ::GetSystemDirectoryW(path, MAX_PATH);
    return ::LoadLibraryW((std::wstring(path, length) + L"\\OpenCL.dll").c_str());
}

char const *const kSlots[] = {
#define ORU_CL_SLOT(Extension, Name) #Name,
#include "oru/oru_ocl/functiontable_slots.inc"
};

FARPROC SlotValue(std::size_t index) {
    FARPROC value;
    std::memcpy(&value,
                reinterpret_cast<char const *>(&ExtensionManager::instance()->table()) +
                    index * sizeof value,
                sizeof value);
    return value;
}

} // namespace

TEST(OpenCLRuntime, ResolvesEveryEntryPointThatTheLoaderHas) {
    AutoInitializer layer;
    ExtensionManager &manager = *ExtensionManager::instance();
    HMODULE const runtime = SystemRuntime();
    ASSERT_EQ(89u, std::size(kSlots));
    EXPECT_STREQ("clGetPlatformIDs", kSlots[0]);
    EXPECT_STREQ("clGetExtensionFunctionAddress", kSlots[73]);
    EXPECT_STREQ("clEnqueueCopyBufferRect", kSlots[81]);
    EXPECT_STREQ("clIcdGetPlatformIDsKHR", kSlots[88]);

    // Versions 1.0 and 1.1 are there from the start; the first platform here is newer.
    for (std::size_t i = 0; i < 82; ++i)
        EXPECT_EQ(::GetProcAddress(runtime, kSlots[i]), SlotValue(i)) << kSlots[i];
    for (std::size_t i = 82; i < 89; ++i)
        EXPECT_EQ(nullptr, SlotValue(i)) << kSlots[i] << " before its extension is asked for";

    // Each group is complete exactly when the loader exports all of it.
    bool complete[13];
    std::fill_n(complete, 13, true);
    std::size_t const groups[89] = {
#define ORU_CL_SLOT(Extension, Name) Enum::Extension,
#include "oru/oru_ocl/functiontable_slots.inc"
    };
    for (std::size_t i = 0; i < 89; ++i)
        complete[groups[i]] = complete[groups[i]] && ::GetProcAddress(runtime, kSlots[i]);
    for (int e = 0; e <= 12; ++e)
        EXPECT_EQ(complete[e], manager.initializeCL(static_cast<Enum::Extension>(e))) << e;

    std::vector<std::string> missing;
    for (std::size_t i = 0; i < 89; ++i) {
        EXPECT_EQ(::GetProcAddress(runtime, kSlots[i]), SlotValue(i)) << kSlots[i];
        if (!SlotValue(i))
            missing.push_back(kSlots[i]);
    }
    std::vector<std::string> const lacking = {
        "clReleaseDeviceEXT",           "clRetainDeviceEXT",          "clCreateSubDevicesEXT",
        "clEnqueueMigrateMemObjectEXT", "clCreateEventFromGLsyncKHR", "clGetGLContextInfoKHR",
        "clIcdGetPlatformIDsKHR"};
    EXPECT_EQ(lacking, missing) << "what Wine's loader really lacks";
    EXPECT_FALSE(manager.init_cl_ext_migrate_memobject());
    EXPECT_TRUE(manager.init_cl_khr_fp64());
    EXPECT_FALSE(manager.initializeCL(static_cast<Enum::Extension>(13)));
    EXPECT_TRUE(manager.zeroSymbolsForExtensionCL(static_cast<Enum::Extension>(12)));
    EXPECT_FALSE(manager.zeroSymbolsForExtensionCL(static_cast<Enum::Extension>(16)));
}

TEST(OpenCLRuntime, OpensAndClosesOnce) {
    EXPECT_EQ("bInitialized_", MessageOf([] { Library::Terminate(); }));
    EXPECT_EQ(nullptr, ExtensionManager::instance());
    for (int round = 0; round < 3; ++round) {
        Library::Initialize();
        EXPECT_TRUE(Library::IsInitialized());
        EXPECT_EQ("!bInitialized_", MessageOf([] { Library::Initialize(); }));
        Library::InitializeIfNecessary();
        Library::Terminate();
        EXPECT_FALSE(Library::IsInitialized());
        EXPECT_EQ(nullptr, ExtensionManager::instance());
    }
    {
        AutoInitializer layer;
        layer.release();
    }
    EXPECT_TRUE(Library::IsInitialized());
    Library::Terminate();
}

TEST(OpenCLRuntime, IsLookedForInTheSystemDirectory) {
    EXPECT_TRUE(Library::IsOpenCLAvailable(""));
    EXPECT_TRUE(Library::IsOpenCLAvailable("C:\\no such folder\\")) << "the first answer stays";
    AutoInitializer const layer;
}

// The first question settles the folder; a wrong one makes the initialisation fail, which Terminate
// or a second attempt survives.
TEST(OpenCLRuntime, IsMissingInAWrongFolder) {
    EXPECT_FALSE(Library::IsOpenCLAvailable("C:\\no such folder\\"));
    EXPECT_FALSE(Library::IsOpenCLAvailable("")) << "the first answer stays";
    EXPECT_EQ("openCLLibraryHandle", MessageOf([] { Library::Initialize(); }));
    EXPECT_FALSE(Library::IsInitialized());
    EXPECT_EQ(nullptr, ExtensionManager::instance());
    EXPECT_EQ("bInitialized_", MessageOf([] { Library::Terminate(); }));
}

// The prefix is glued to the file name as it is: it names a folder only with its separator.
TEST(OpenCLRuntime, TakesThePathAsAPrefix) {
    wchar_t path[MAX_PATH];
    UINT const length = ::GetSystemDirectoryW(path, MAX_PATH);
    std::string const directory(path, path + length);
    EXPECT_TRUE(Library::IsOpenCLAvailable(directory + "\\"));
    {
        AutoInitializer const layer; // from that folder, by its path
    }
    AutoInitializer const again; // Terminate has forgotten the folder
}

TEST(OpenCLRuntime, DoesNotTakeAFolderWithoutItsSeparator) {
    wchar_t path[MAX_PATH];
    UINT const length = ::GetSystemDirectoryW(path, MAX_PATH);
    EXPECT_FALSE(Library::IsOpenCLAvailable(std::string(path, path + length)));
}
