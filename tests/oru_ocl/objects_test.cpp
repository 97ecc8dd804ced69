// Small values, platforms, devices, contexts, memory and samplers.
#include "oru/core/utility/integerrect.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ocl/sampler.h"
#include "tests/support/computetest.h"

#include <algorithm>
#include <cstdint>
#include <sstream>
#include <tuple>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

using ObjectsTest = ComputeTest;
using MemoryTest = QueueTest;

constexpr auto buffer = Memory::MEMORYOBJECTTYPE_BUFFER;
constexpr auto image2D = Memory::MEMORYOBJECTTYPE_IMAGE2D;
constexpr auto image3D = Memory::MEMORYOBJECTTYPE_IMAGE3D;

/// Reaches the translations.
struct Translations : Image, Sampler {
    using Image::ConvertImageInfo;
    using Memory::AccessFlags;
    using Memory::ConvertMemoryInfo;
    using Memory::ConvertMemoryObjectType;
    using Sampler::OCLAddressingMode;
    using Sampler::OCLFilterMode;
    using Sampler::OpenCLAddressingMode;
    using Sampler::OpenCLFilterMode;
};

} // namespace

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
    EXPECT_STREQ("CL_INVALID_MIP_LEVEL", ExceptionOCL::ErrorToCString(-62));

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

TEST_F(ObjectsTest, AnExtensionIsSupportedWhenAllDevicesHaveIt) {
    Device const device = ComputeTest::device();
    EXPECT_TRUE(platform().isSupported(Enum::EXTENSION_KHR_GL_SHARING));
    EXPECT_FALSE(platform().isSupported(Enum::EXTENSION_AMD_MEDIA_OPS));
    EXPECT_FALSE(IsSupported({}, Enum::EXTENSION_KHR_GL_SHARING));
    EXPECT_TRUE(IsSupported({device, device}, Enum::EXTENSION_KHR_GL_SHARING));
    EXPECT_FALSE(IsSupported({device}, Enum::EXTENSION_AMD_FP64));
    EXPECT_THROWN("id() != 0", Platform(nullptr).isSupported(Enum::EXTENSION_KHR_FP16));
    EXPECT_THROWN("id() != 0", Device(nullptr).isSupported(Enum::EXTENSION_KHR_FP16));
}

TEST_F(ObjectsTest, CopiesRetainAndDestructionReleases) {
    auto const references = [](Context const &wrapper) {
        return runtime()->references(wrapper.id());
    };
    Context first = makeContext();
    {
        Context const copy = first;
        EXPECT_EQ(2, references(first));
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

TEST_F(MemoryTest, ObjectsHaveTheFlagsTheyAreMadeWith) {
    std::vector<int> host(64);
    void *const data = host.data();
    int const use = CL_MEM_USE_HOST_PTR, copy = CL_MEM_COPY_HOST_PTR;
    int const allocate = CL_MEM_ALLOC_HOST_PTR;
    std::tuple<Memory, int, Memory::MemoryObjectType> const cases[] = {
        {Buffer(context, reads, 16, data), CL_MEM_READ_ONLY | use, buffer},
        {Buffer(context, writes, false, 16), CL_MEM_WRITE_ONLY, buffer},
        {Buffer(context, both, true, 16), CL_MEM_READ_WRITE | allocate, buffer},
        {Buffer(context, reads, false, 16, data), CL_MEM_READ_ONLY | copy, buffer},
        {Buffer(context, both, true, 16, data), CL_MEM_READ_WRITE | copy | allocate, buffer},
        {Image2D(context, both, rgba8, 4, 4, 0, data), CL_MEM_READ_WRITE | use, image2D},
        {Image2D(context, writes, true, rgba8, 4, 4, 0), CL_MEM_WRITE_ONLY | allocate, image2D},
        {Image2D(context, reads, false, rgba8, 4, 4, 0, data), CL_MEM_READ_ONLY | copy, image2D},
        {Image3D(context, both, rgba8, 4, 4, 4, 0, 0, data), CL_MEM_READ_WRITE | use, image3D},
        {Image3D(context, writes, false, rgba8, 4, 4, 4, 0, 0), CL_MEM_WRITE_ONLY, image3D},
        {Image3D(context, reads, true, rgba8, 4, 4, 4, 0, 0, data),
         CL_MEM_READ_ONLY | copy | allocate, image3D},
    };
    for (auto const &[memory, flags, type] : cases) {
        EXPECT_EQ(cl_mem_flags(flags), Get<cl_mem_flags>(memory, Memory::MEMORYINFO_FLAGS));
        EXPECT_EQ(type, memory.memType());
        if ((flags & use) != 0) {
            EXPECT_EQ(data, Get<void *>(memory, Memory::MEMORYINFO_HOST_PTR));
        }
        EXPECT_EQ(context.id(), Get<cl_context>(memory, Memory::MEMORYINFO_CONTEXT));
    }
}

TEST_F(MemoryTest, NullHostMemoryIsRefusedBeforeAnyCall) {
    auto const refused = [](std::string const &kind, auto make) {
        EXPECT_EQ("NULL host memory pointer passed to " + kind + " constructor.", Thrown(make));
    };
    void *const none = nullptr;
    refused("Buffer", [&] { Buffer(context, reads, std::size_t(4), none); });
    refused("Image2D", [&] { Image2D(context, reads, rgba8, 4, 4, 0, none); });
    refused("Image2D", [&] { Image2D(context, reads, true, rgba8, 4, 4, 0, none); });
    refused("Image3D", [&] { Image3D(context, reads, rgba8, 4, 4, 4, 0, 0, none); });
    refused("Image3D", [&] { Image3D(context, reads, true, rgba8, 4, 4, 4, 0, 0, none); });
    EXPECT_THROWN("Must allocate host memory passed to Buffer constructor.",
                  Buffer(context, reads, true, 4, none));
    for (char const *name : {"clCreateBuffer", "clCreateImage2D", "clCreateImage3D"})
        EXPECT_EQ(0u, runtime()->calls(name)) << name;
}

TEST_F(MemoryTest, ImagesKeepTheirPixels) {
    // Two padding pixels at the end of each host row must not get in.
    std::size_t const width = 7, height = 5, pitch = (width + 2) * 4;
    std::vector<unsigned char> host = Counting<unsigned char>(pitch * height), dense;
    for (std::size_t y = 0; y < height; ++y)
        dense.insert(dense.end(), &host[y * pitch], &host[y * pitch] + width * 4);

    Image2D const copied(context, reads, false, rgba8, width, height, pitch, host.data());
    Image2D const own(context, both, rgba8, width, height, pitch, host.data());
    for (Image2D const &image : {copied, own}) {
        EXPECT_EQ(width, Get<std::size_t>(image, Image::IMAGEINFO_WIDTH));
        EXPECT_EQ(height, Get<std::size_t>(image, Image::IMAGEINFO_HEIGHT));
        std::vector<unsigned char> read(dense.size());
        queue.enqueueBlockingRead(image, ORU::IntegerRect({0, 0}, ORU::size2(width, height)),
                                  read.data(), 0);
        EXPECT_EQ(dense, read);
    }

    // A rectangle into rows that are further apart: nothing else is touched.
    std::vector<unsigned char> target(30, 0xEE), expected = target;
    for (std::size_t y = 0; y < 3; ++y)
        std::copy_n(&dense[((y + 1) * width + 2) * 4], 8, &expected[y * 10]);
    queue.enqueueRead(copied, ORU::IntegerRect({2, 1}, ORU::size2(2, 3)), target.data(), 10).wait();
    EXPECT_EQ(expected, target);
}

TEST_F(MemoryTest, ImagesAreRefusedByARuntimeWithoutThem) {
    runtime()->setImages(false);
    EXPECT_FALSE(device().supportsImages());
    EXPECT_THROWN("CL_INVALID_OPERATION", Image2D(context, reads, false, rgba8, 4, 4, 0));
    runtime()->setImages(true);
    EXPECT_TRUE(device().supportsImages());
}

TEST_F(MemoryTest, SamplersAnswerWhatTheyAreMadeWith) {
    for (int addressing = 0; addressing < 4; ++addressing)
        for (int filter = 0; filter < 2; ++filter) {
            // Repeating needs normalised coordinates.
            bool const normalized = addressing == Sampler::ADDRESS_REPEAT || filter == 1;
            Sampler const sampler(context, normalized, Sampler::SamplerAddressingMode(addressing),
                                  Sampler::SamplerFilterMode(filter));
            EXPECT_EQ(addressing, sampler.addressingMode());
            EXPECT_EQ(filter, sampler.filterMode());
            EXPECT_EQ(normalized, sampler.usesNormalizedCoordinates());
            EXPECT_THROWN("Not implemented.", sampler.context());
        }
}

TEST_F(MemoryTest, EnumerationsAreTranslated) {
    using T = Translations;
    // OpenCL numbers each family in the library's order.
    for (int i = 0; i <= 7; ++i) {
        auto const constant = [i](int first, int count) {
            return i < count ? unsigned(first + i) : 0u;
        };
        EXPECT_EQ(constant(CL_MEM_TYPE, 7), T::ConvertMemoryInfo(Memory::MemoryInfo(i)));
        EXPECT_EQ(constant(CL_IMAGE_FORMAT, 7), T::ConvertImageInfo(Image::ImageInfo(i)));
        EXPECT_EQ(constant(CL_MEM_OBJECT_BUFFER, 3),
                  T::ConvertMemoryObjectType(Memory::MemoryObjectType(i)));
    }
    for (int i : {-1, 3})
        EXPECT_EQ(0u, T::AccessFlags(Memory::MemoryAccessFlags(i)));
    EXPECT_THROWN("Unknown OCL addressing mode.",
                  T::OpenCLAddressingMode(Sampler::SamplerAddressingMode(4)));
    EXPECT_THROWN("Unknown OpenCL addressing mode.",
                  T::OCLAddressingMode(CL_ADDRESS_MIRRORED_REPEAT));
    EXPECT_THROWN("Unknown OCL filter mode.", T::OpenCLFilterMode(Sampler::SamplerFilterMode(2)));
    EXPECT_THROWN("Unknown OpenCL filter mode.", T::OCLFilterMode(0));
}
