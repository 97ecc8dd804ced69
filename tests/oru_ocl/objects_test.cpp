// Platforms, devices, contexts and the reference counts of wrappers.
#include "oru/core/utility/scopedptr.h"
#include "tests/oru_ocl/computetest.h"

#include <climits>
#include <cstdint>
#include <sstream>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

using ObjectsTest = ComputeTest;

int References(Context const &context, TestRuntime &runtime) {
    return runtime->references(context.id());
}

} // namespace

TEST(ExceptionOCL, CarriesCodeAndName) {
    EXPECT_STREQ("CL_SUCCESS", ExceptionOCL::ErrorToCString(0));
    EXPECT_STREQ("CL_MAP_FAILURE", ExceptionOCL::ErrorToCString(CL_MAP_FAILURE));
    EXPECT_STREQ("CL_INVALID_VALUE", ExceptionOCL::ErrorToCString(CL_INVALID_VALUE));
    EXPECT_STREQ("CL_INVALID_MIP_LEVEL", ExceptionOCL::ErrorToCString(CL_INVALID_MIP_LEVEL));
    int named = 0;
    for (int code = -2000; code < 2000; ++code)
        named += std::string("UNKNOWN CL ERROR CODE") != ExceptionOCL::ErrorToCString(code);
    EXPECT_EQ(46, named);
    for (int code : {-13, -29, -63, 1, -1001, INT_MIN, INT_MAX})
        EXPECT_STREQ("UNKNOWN CL ERROR CODE", ExceptionOCL::ErrorToCString(code)) << code;

    ExceptionOCL const e("file.cpp", 7, "text", static_cast<unsigned int>(-5));
    ExceptionOCL assigned("", 0, "", 0);
    assigned = e;
    ORU::ScopedPtr<ORU::ExceptionBase> const clone(e.clone());
    ORU::ExceptionBase const *const copies[] = {&assigned, clone.get()};
    for (ORU::ExceptionBase const *copy : copies) {
        auto const &other = dynamic_cast<ExceptionOCL const &>(*copy);
        EXPECT_EQ(0xFFFFFFFBu, other.errorNumber());
        std::ostringstream text;
        text << other;
        EXPECT_EQ("OCL Exception: CL_OUT_OF_RESOURCES file.cpp:7 (text)", text.str());
        EXPECT_EQ(other.what(), other.errorDescription());
    }
}

TEST_F(ObjectsTest, PlatformsAnswerAsTheRuntimeDoes) {
    FunctionTable const &cl = ExtensionManager::instance()->table();
    cl_uint count = 0;
    cl.clGetPlatformIDs(0, nullptr, &count);
    ASSERT_EQ(count, platforms().size());
    for (Platform const &platform : platforms()) {
        EXPECT_EQ(0u, platform.version().find("OpenCL "));
        EXPECT_FALSE(platform.name().empty());
        EXPECT_FALSE(platform.vendor().empty());
        EXPECT_EQ(Enum::PROFILE_FULL, platform.profile());
        EXPECT_EQ(std::string::npos, platform.extensions().find('\0'));
        EXPECT_TRUE(platform.isSupported(Enum::EXTENSION_KHR_GL_SHARING));
        EXPECT_FALSE(platform.isSupported(Enum::EXTENSION_AMD_MEDIA_OPS));
    }
    EXPECT_EQ(CL_DEVICE_NOT_FOUND, ErrorCode([] { platform().devices(Device::TYPE_ACCELERATOR); }));
}

TEST_F(ObjectsTest, DevicesAnswerEveryPropertyByItsType) {
    Device const device = ComputeTest::device();
    FunctionTable const &cl = ExtensionManager::instance()->table();
    std::string const types[] = {Enum::GetTypeName<unsigned int>(),
                                 Enum::GetTypeName<std::uint64_t>(), Enum::GetTypeName<Range<3>>(),
                                 Enum::GetTypeName<cl_platform_id>(), Enum::GetTypeName<char *>()};
    // Each typed read against the runtime's own bytes; every other type is refused.
    auto const check = [&](Enum::DeviceProperty property, auto value, std::string const &tag) {
        using T = decltype(value);
        if (Enum::GetPropertyTypeName(property) != tag) {
            EXPECT_EQ("property_typename == type_name",
                      InternalMessage([&] { device.getInfo<T>(property); }))
                << property;
            return 0;
        }
        std::size_t size = 0;
        EXPECT_EQ(CL_SUCCESS,
                  cl.clGetDeviceInfo(device.id(), property, sizeof value, &value, &size));
        EXPECT_EQ(sizeof value, size) << property;
        EXPECT_TRUE(device.getInfo<T>(property) == value) << property;
        return 1;
    };
    for (int i = 0x1000; i <= 0x103D; ++i) {
        auto const property = static_cast<Enum::DeviceProperty>(i);
        int read = check(property, 0u, types[0]) + check(property, std::uint64_t(0), types[1]) +
                   check(property, Range<3>(0), types[2]) +
                   check(property, cl_platform_id(), types[3]);
        if (Enum::GetPropertyTypeName(property) == types[4]) {
            char text[4096] = {};
            cl.clGetDeviceInfo(device.id(), cl_device_info(i), sizeof text, text, nullptr);
            EXPECT_EQ(text, device.getInfo<std::string>(property)) << i;
            ++read;
        } else {
            EXPECT_EQ("GetPropertyTypeName(property) == Enum::GetTypeName<char*>()",
                      InternalMessage([&] { device.getInfo<std::string>(property); }));
        }
        bool const refused = i >= 0x1032 && i <= 0x1034;
        EXPECT_EQ(refused ? 0 : 1, read) << i;
    }
    EXPECT_EQ("property_index < table_size",
              InternalMessage([&] { device.getInfo<unsigned int>(Enum::DeviceProperty(0x103E)); }));
    EXPECT_EQ(platform().id(), device.platform().id());
    EXPECT_EQ(device.type(), platform().devices(device.type()).front().type());
    EXPECT_TRUE(device.supportsImages());
    EXPECT_EQ(Enum::PROFILE_FULL, device.profile());
}

TEST_F(ObjectsTest, NullPlatformsAndDevicesAreRefused) {
    Platform const platform(nullptr);
    Device const device(nullptr);
    EXPECT_EQ("id() != 0", InternalMessage([&] { platform.name(); }));
    EXPECT_EQ("id() != 0", InternalMessage([&] { platform.profile(); }));
    EXPECT_EQ("id() != 0",
              InternalMessage([&] { platform.isSupported(Enum::EXTENSION_KHR_FP16); }));
    EXPECT_EQ("id() != 0", InternalMessage([&] { device.name(); }));
    EXPECT_EQ("id() != 0", InternalMessage([&] { device.type(); }));
}

TEST_F(ObjectsTest, AnExtensionIsSupportedWhenAllDevicesHaveIt) {
    Device const device = ComputeTest::device();
    EXPECT_FALSE(IsSupported({}, Enum::EXTENSION_KHR_GL_SHARING));
    EXPECT_TRUE(IsSupported({device, device}, Enum::EXTENSION_KHR_GL_SHARING));
    EXPECT_FALSE(IsSupported({device}, Enum::EXTENSION_AMD_FP64));
}

TEST_F(ObjectsTest, CopiesRetainAndDestructionReleases) {
    runtime()->reset();
    {
        Platform const platform = ComputeTest::platform();
        Device device = ComputeTest::device();
        Device const copy = device;
        device = copy;
        device = Device(nullptr);
    }
    EXPECT_EQ(0u, runtime()->calls("clRetainDeviceEXT") + runtime()->calls("clReleaseDeviceEXT"));

    Context first = makeContext();
    {
        Context const copy = first;
        EXPECT_EQ(2, References(first, runtime()));
        Context const moved = std::move(first);
        EXPECT_EQ(3, References(moved, runtime()));
        // A move is a copy. NOLINTNEXTLINE(bugprone-use-after-move,clang-analyzer-cplusplus.Move)
        EXPECT_EQ(copy.id(), first.id());
    }
    EXPECT_EQ(1, References(first, runtime()));

    runtime()->reset();
    Context const &self = first;
    first = self;
    EXPECT_EQ(0u, runtime()->calls("clRetainContext") + runtime()->calls("clReleaseContext"));

    Context second = makeContext();
    cl_context const old = first.id();
    first = second;
    EXPECT_EQ(0, runtime()->references(old));
    EXPECT_EQ(2, References(second, runtime()));
}

TEST_F(ObjectsTest, ContextsKnowTheirDevicesAndPlatform) {
    ContextProperties properties(platform());
    std::vector<cl_context_properties> const plain = {
        CL_CONTEXT_PLATFORM, reinterpret_cast<cl_context_properties>(platform().id()), 0};
    EXPECT_EQ(plain, properties.properties());
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
    EXPECT_EQ(CL_INVALID_VALUE, ErrorCode([&] { Context(alone, std::vector<Device>()); }));
    EXPECT_EQ(CL_INVALID_PLATFORM,
              ErrorCode([&] { Context(ContextProperties(Platform(nullptr)), device); }));
}
