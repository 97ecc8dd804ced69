// Small values, platforms, devices, contexts and the reference counts of wrappers.
#include "oru/core/utility/scopedptr.h"
#include "tests/oru_ocl/computetest.h"

#include <climits>
#include <cstdint>
#include <sstream>

using namespace ORU::OCL;
using namespace oru_test;

using ObjectsTest = ComputeTest;

TEST(Extensions, HaveExactNames) {
    EXPECT_EQ(10, ExtensionManager::nameToExtensionEnum("cl_khr_gl_sharing"));
    EXPECT_EQ("CL_VERSION_1_0", ExtensionManager::ExtensionEnumToString(Enum::Extension(0)));
    for (char const *name : {"CL_KHR_GL_SHARING", "", "cl_khr_gl_sharin", "cl_khr_icd "})
        EXPECT_EQ(16, ExtensionManager::nameToExtensionEnum(std::string(name))) << name;
    for (int e = -1; e <= 16; ++e) {
        std::string const name = ExtensionManager::ExtensionEnumToString(Enum::Extension(e));
        EXPECT_EQ(e < 0 || e > 12, name.empty()) << e;
        EXPECT_EQ(name.empty() ? 16 : e, ExtensionManager::nameToExtensionEnum(name)) << name;
    }
}

TEST(Extensions, AreTokenizedAtBlanksAndTabs) {
    std::vector<std::string> tokens = {"kept"};
    TokenizeExtensionString("\t cl_a  cl_b\t\tcl_c \t", tokens);
    TokenizeExtensionString("", tokens);
    TokenizeExtensionString(" \t ", tokens);
    EXPECT_EQ((std::vector<std::string>{"kept", "cl_a", "cl_b", "cl_c"}), tokens);
}

TEST(Ranges, HoldTheirSizes) {
    EXPECT_TRUE(Range<3>(4) == Range<3>(4, 4, 4));
    EXPECT_TRUE(Range<2>(1, 2) != Range<2>(1, 3));
    EXPECT_EQ(3u, Range<3>().dimensions());
    Range<2> changed(0);
    changed[1] = 7;
    EXPECT_EQ(7u, *(changed.begin() + 1));
    EXPECT_THROWN("N==2", Range<1>(1, 2));
    EXPECT_THROWN("N==3", Range<2>(1, 2, 3));
    EXPECT_THROWN("i < range_.size()", Range<2>(0)[2]);
}

TEST(ExceptionOCL, CarriesCodeAndName) {
    int named = 0;
    for (int code = -2000; code < 2000; ++code)
        named += std::string("UNKNOWN CL ERROR CODE") != ExceptionOCL::ErrorToCString(code);
    EXPECT_EQ(46, named);
    for (int code : {-13, -29, -63, 1, -1001, INT_MIN, INT_MAX})
        EXPECT_STREQ("UNKNOWN CL ERROR CODE", ExceptionOCL::ErrorToCString(code)) << code;

    // A clone of a copy has all that the first had.
    ExceptionOCL e("", 0, "", 0);
    e = ExceptionOCL("file.cpp", 7, "text", static_cast<unsigned int>(-5));
    ORU::ScopedPtr<ORU::ExceptionBase> const clone(e.clone());
    EXPECT_EQ(0xFFFFFFFBu, dynamic_cast<ExceptionOCL const &>(*clone).errorNumber());
    EXPECT_STREQ("OCL Exception: CL_OUT_OF_RESOURCES", clone->what());
    std::ostringstream text;
    text << *clone;
    EXPECT_EQ("OCL Exception: CL_OUT_OF_RESOURCES file.cpp:7 (text)", text.str());
}

TEST_F(ObjectsTest, PlatformsAnswerAsTheRuntimeDoes) {
    FunctionTable const &cl = ExtensionManager::instance()->table();
    cl_uint count = 0;
    cl.clGetPlatformIDs(0, nullptr, &count);
    ASSERT_EQ(count, platforms().size());
    Platform const platform = ComputeTest::platform();
    std::pair<cl_platform_info, std::string> const texts[] = {
        {CL_PLATFORM_NAME, platform.name()},
        {CL_PLATFORM_VENDOR, platform.vendor()},
        {CL_PLATFORM_VERSION, platform.version()},
        {CL_PLATFORM_EXTENSIONS, platform.extensions()}};
    for (auto const &[query, answer] : texts) {
        char text[4096] = {};
        cl.clGetPlatformInfo(platform.id(), query, sizeof text, text, nullptr);
        EXPECT_EQ(text, answer);
    }
    EXPECT_EQ(Enum::PROFILE_FULL, platform.profile());
    EXPECT_THROWN("CL_DEVICE_NOT_FOUND", platform.devices(Device::TYPE_ACCELERATOR));
}

TEST_F(ObjectsTest, DevicesAnswerEveryPropertyByItsType) {
    Device const device = ComputeTest::device();
    FunctionTable const &cl = ExtensionManager::instance()->table();
    // Each typed read against the runtime's own bytes; every other type is refused.
    auto const check = [&](Enum::DeviceProperty property, auto value) {
        using T = decltype(value);
        if (Enum::GetPropertyTypeName(property) != Enum::GetTypeName<T>()) {
            EXPECT_THROWN("property_typename == type_name", device.getInfo<T>(property));
            return 0;
        }
        std::size_t size = 0;
        cl.clGetDeviceInfo(device.id(), property, sizeof value, &value, &size);
        EXPECT_EQ(sizeof value, size) << property;
        EXPECT_TRUE(device.getInfo<T>(property) == value) << property;
        return 1;
    };
    for (int i = 0x1000; i <= 0x103D; ++i) {
        auto const property = static_cast<Enum::DeviceProperty>(i);
        int read = check(property, 0u) + check(property, std::uint64_t(0)) +
                   check(property, Range<3>(0)) + check(property, cl_platform_id());
        if (Enum::GetPropertyTypeName(property) == Enum::GetTypeName<char *>()) {
            char text[4096] = {};
            cl.clGetDeviceInfo(device.id(), property, sizeof text, text, nullptr);
            EXPECT_EQ(text, device.getInfo<std::string>(property)) << i;
            ++read;
        } else {
            EXPECT_THROWN("GetPropertyTypeName(property) == Enum::GetTypeName<char*>()",
                          device.getInfo<std::string>(property));
        }
        bool const refused = i >= 0x1032 && i <= 0x1034;
        EXPECT_EQ(refused ? 0 : 1, read) << i;
        EXPECT_EQ(refused, Enum::GetPropertyTypeName(property).empty()) << i;
    }
    EXPECT_EQ("cl_platform_id", Enum::GetPropertyTypeName(Enum::DEVICEPROPERTY_PLATFORM));
    EXPECT_THROWN("property_index < table_size",
                  device.getInfo<unsigned int>(Enum::DeviceProperty(0x103E)));
    EXPECT_EQ(platform().id(), device.platform().id());
    EXPECT_EQ(device.type(), platform().devices(device.type()).front().type());
    EXPECT_EQ(Enum::PROFILE_FULL, device.profile());
    EXPECT_EQ(device.getInfo<std::string>(Enum::DEVICEPROPERTY_NAME), device.name());
    EXPECT_EQ(device.getInfo<std::string>(Enum::DEVICEPROPERTY_VENDOR), device.vendor());
}

TEST_F(ObjectsTest, NullPlatformsAndDevicesAreRefused) {
    Platform const platform(nullptr);
    Device const device(nullptr);
    EXPECT_THROWN("id() != 0", platform.name());
    EXPECT_THROWN("id() != 0", platform.isSupported(Enum::EXTENSION_KHR_FP16));
    EXPECT_THROWN("id() != 0", device.name());
    EXPECT_THROWN("id() != 0", device.type());
}

TEST_F(ObjectsTest, AnExtensionIsSupportedWhenAllDevicesHaveIt) {
    Device const device = ComputeTest::device();
    EXPECT_TRUE(platform().isSupported(Enum::EXTENSION_KHR_GL_SHARING));
    EXPECT_FALSE(platform().isSupported(Enum::EXTENSION_AMD_MEDIA_OPS));
    EXPECT_FALSE(IsSupported({}, Enum::EXTENSION_KHR_GL_SHARING));
    EXPECT_TRUE(IsSupported({device, device}, Enum::EXTENSION_KHR_GL_SHARING));
    EXPECT_FALSE(IsSupported({device}, Enum::EXTENSION_AMD_FP64));
}

TEST_F(ObjectsTest, CopiesRetainAndDestructionReleases) {
    Context first = makeContext();
    auto const references = [](Context const &context) {
        return runtime()->references(context.id());
    };
    {
        Context const copy = first;
        EXPECT_EQ(2, references(first));
        Context const moved = std::move(first);
        EXPECT_EQ(3, references(moved));
        // A move is a copy. NOLINTNEXTLINE(bugprone-use-after-move,clang-analyzer-cplusplus.Move)
        EXPECT_EQ(copy.id(), first.id());
    }
    EXPECT_EQ(1, references(first));

    runtime()->reset();
    Context const &self = first;
    first = self;
    EXPECT_EQ(0u, runtime()->calls("clRetainContext") + runtime()->calls("clReleaseContext"));

    Context const second = makeContext();
    cl_context const old = first.id();
    first = second;
    EXPECT_EQ(0, runtime()->references(old));
    EXPECT_EQ(2, references(second));
}

TEST_F(ObjectsTest, ContextsKnowTheirDevicesAndPlatform) {
    ContextProperties properties(platform());
    std::vector<cl_context_properties> const plain = {
        CL_CONTEXT_PLATFORM, reinterpret_cast<cl_context_properties>(platform().id()), 0};
    // A device context alone shares nothing.
    properties.setDisplayContext(reinterpret_cast<HDC>(0x1234));
    EXPECT_EQ(plain, properties.properties());
    properties.setSharedRenderContext(reinterpret_cast<HGLRC>(0x5678));
    EXPECT_EQ((std::vector<cl_context_properties>{plain[0], plain[1], CL_WGL_HDC_KHR, 0x1234,
                                                  CL_GL_CONTEXT_KHR, 0x5678, 0}),
              properties.properties());

    Device const device = ComputeTest::device();
    ContextProperties const alone(platform());
    for (Context const &context :
         {Context(alone, device), Context(alone, std::vector<Device>{device}),
          Context(alone, device.type())}) {
        ASSERT_EQ(1u, context.devices().size());
        EXPECT_EQ(device.id(), context.devices().front().id());
        EXPECT_EQ(platform().id(), context.platform().id());
    }
    EXPECT_THROWN("CL_INVALID_VALUE", Context(alone, std::vector<Device>()));
}
