// The small values of the compute layer: extension names, property types, ranges, error names.
#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ocl/deviceproperty.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ocl/range.h"

#include <gtest/gtest.h>

using namespace ORU::OCL;

TEST(Extensions, HaveExactNames) {
    EXPECT_EQ(10, ExtensionManager::nameToExtensionEnum("cl_khr_gl_sharing"));
    for (char const *name : {"CL_KHR_GL_SHARING", "", "cl_khr_gl_sharin", "cl_khr_icd "})
        EXPECT_EQ(16, ExtensionManager::nameToExtensionEnum(std::string(name))) << name;
    for (int e = 0; e <= 12; ++e) {
        std::string const name =
            ExtensionManager::ExtensionEnumToString(static_cast<Enum::Extension>(e));
        EXPECT_EQ(e, ExtensionManager::nameToExtensionEnum(name)) << name;
    }
    EXPECT_EQ("CL_VERSION_1_0",
              ExtensionManager::ExtensionEnumToString(static_cast<Enum::Extension>(0)));
    EXPECT_EQ("", ExtensionManager::ExtensionEnumToString(static_cast<Enum::Extension>(16)));
}

TEST(Extensions, AreTokenizedAtBlanksAndTabs) {
    std::vector<std::string> tokens = {"kept"};
    TokenizeExtensionString("\t cl_a  cl_b\t\tcl_c \t", tokens);
    TokenizeExtensionString("", tokens);
    TokenizeExtensionString(" \t ", tokens);
    EXPECT_EQ((std::vector<std::string>{"kept", "cl_a", "cl_b", "cl_c"}), tokens);
}

TEST(DeviceProperties, NameTheTypeTheyAreReadWith) {
    AutoInitializer const layer;
    int described = 0;
    for (int property = 0x1000; property <= 0x103D; ++property)
        described +=
            Enum::GetPropertyTypeName(static_cast<Enum::DeviceProperty>(property)).empty() ? 0 : 1;
    EXPECT_EQ(59, described);
    auto const type = [](int property) {
        return Enum::GetPropertyTypeName(static_cast<Enum::DeviceProperty>(property));
    };
    EXPECT_EQ("cl_platform_id", type(CL_DEVICE_PLATFORM));
    EXPECT_EQ(Enum::GetTypeName<Range<3>>(), type(CL_DEVICE_MAX_WORK_ITEM_SIZES));
    EXPECT_EQ(Enum::GetTypeName<unsigned int>(), type(CL_DEVICE_MAX_COMPUTE_UNITS));
    EXPECT_EQ(type(CL_DEVICE_NAME), type(CL_DRIVER_VERSION));
    EXPECT_EQ("", type(CL_DEVICE_HALF_FP_CONFIG));
    EXPECT_EQ("", type(CL_DEVICE_DOUBLE_FP_CONFIG));
    EXPECT_NE(type(CL_DEVICE_GLOBAL_MEM_SIZE), type(CL_DEVICE_MAX_COMPUTE_UNITS));
}

TEST(Ranges, HoldTheirSizes) {
    Range<3> const equal(4);
    EXPECT_TRUE(equal == Range<3>(4, 4, 4));
    EXPECT_TRUE(Range<2>(1, 2) == Range<2>(1, 2));
    EXPECT_TRUE(Range<2>(1, 2) != Range<2>(1, 3));
    EXPECT_EQ(2u, Range<2>(1, 2)[1]);
    EXPECT_EQ(3u, Range<3>().dimensions());
    Range<2> changed(0);
    changed[1] = 7;
    EXPECT_EQ(7u, *(changed.begin() + 1));

    auto const message = [](auto call) {
        try {
            call();
        } catch (ORU::InternalException const &e) {
            return std::string(e.message());
        }
        return std::string("nothing was thrown");
    };
    EXPECT_EQ("N==2", message([] { Range<1>(1, 2); }));
    EXPECT_EQ("N==3", message([] { Range<2>(1, 2, 3); }));
    EXPECT_EQ("i < range_.size()", message([] { Range<2>(0)[2]; }));
}
