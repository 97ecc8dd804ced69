// Small values, platforms, devices, contexts, memory and samplers.
#include "oru/core/utility/integerrect.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ocl/sampler.h"
#include "tests/support/computetest.h"

#include <cstdint>
#include <sstream>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

using ObjectsTest = ComputeTest;
using MemoryTest = QueueTest;

} // namespace

TEST(Extensions, HaveExactNames) {
    EXPECT_EQ(10, ExtensionManager::nameToExtensionEnum("cl_khr_gl_sharing"));
    for (int e = -1; e <= 16; ++e) {
        std::string const name = ExtensionManager::ExtensionEnumToString(Enum::Extension(e));
        EXPECT_EQ(e < 0 || e > 12, name.empty()) << e;
        EXPECT_EQ(name.empty() ? 16 : e, ExtensionManager::nameToExtensionEnum(name)) << name;
    }
}

TEST(Ranges, RefuseOtherDimensions) {
    EXPECT_FAILURE("N==2", Range<1>(1, 2));
    EXPECT_FAILURE("N==3", Range<2>(1, 2, 3));
    Range<3> const range(1, 2, 3);
    EXPECT_EQ(3u, range[2]);
    EXPECT_FAILURE("i < range_.size()", range[3]);
    EXPECT_FAILURE("i < range_.size()", Range<2>(0)[2]);
}

TEST(ExceptionOCL, CarriesCodeAndName) {
    int named = 0;
    for (int code = -2000; code < 2000; ++code)
        named += std::string("UNKNOWN CL ERROR CODE") != ExceptionOCL::ErrorToCString(code);
    EXPECT_EQ(46, named);
    ExceptionOCL const e("file.cpp", 7, "text", static_cast<unsigned int>(-5));
    ORU::ScopedPtr<ORU::ExceptionBase> const clone(e.clone());
    EXPECT_EQ(0xFFFFFFFBu, dynamic_cast<ExceptionOCL const &>(*clone).errorNumber());
    std::ostringstream text;
    text << *clone;
    EXPECT_EQ("OCL Exception: CL_OUT_OF_RESOURCES file.cpp:7 (text)", text.str());
}

TEST_F(ObjectsTest, PlatformsAnswerAsTheRuntimeDoes) {
    std::pair<cl_platform_info, std::string (Platform::*)() const> const texts[] = {
        {CL_PLATFORM_NAME, &Platform::name},
        {CL_PLATFORM_VENDOR, &Platform::vendor},
        {CL_PLATFORM_VERSION, &Platform::version},
        {CL_PLATFORM_EXTENSIONS, &Platform::extensions}};
    for (auto const &[query, text] : texts) {
        runtime->answerText(query, TextOf("answer to", query));
        EXPECT_EQ(TextOf("answer to", query), (platform.*text)());
    }
    // By number, as a header of Windows has a macro of an enumerator's name.
    std::pair<std::string, int> const profiles[] = {
        {"FULL_PROFILE", 1}, {"EMBEDDED_PROFILE", 2}, {"FULL", 0}};
    for (auto const &[text, profile] : profiles) {
        runtime->answerText(CL_PLATFORM_PROFILE, text);
        runtime->answerText(CL_DEVICE_PROFILE, text);
        EXPECT_EQ(profile, platform.profile()) << text;
        EXPECT_EQ(profile, device.profile()) << text;
    }
}

TEST_F(ObjectsTest, DevicesAnswerEveryPropertyByItsType) {
    // Each typed read against the runtime's own bytes; every other type is refused.
    auto const check = [&](Enum::DeviceProperty property, auto value) {
        using T = decltype(value);
        if (Enum::GetPropertyTypeName(property) != Enum::GetTypeName<T>()) {
            EXPECT_FAILURE("property_typename == type_name", device.getInfo<T>(property));
            return 0;
        }
        std::size_t size = 0;
        ORU_CL(GetDeviceInfo, device.id(), property, sizeof value, &value, &size);
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
            ORU_CL(GetDeviceInfo, device.id(), property, sizeof text, text, nullptr);
            EXPECT_EQ(text, device.getInfo<std::string>(property)) << i;
            ++read;
        } else {
            EXPECT_FAILURE("GetPropertyTypeName(property) == Enum::GetTypeName<char*>()",
                           device.getInfo<std::string>(property));
        }
        EXPECT_EQ(i >= 0x1032 && i <= 0x1034 ? 0 : 1, read) << i;
    }
    EXPECT_FAILURE("property_index < table_size",
                   device.getInfo<unsigned int>(Enum::DeviceProperty(0x103E)));
    EXPECT_EQ(platform.id(), device.platform().id());
    runtime->answerNumber(CL_DEVICE_IMAGE_SUPPORT, cl_bool(false));
    EXPECT_FALSE(device.supportsImages());
}

TEST_F(ObjectsTest, AnExtensionIsSupportedWhenAllDevicesHaveIt) {
    Device const none(nullptr);
    Enum::Extension const has = Enum::EXTENSION_KHR_GL_SHARING, hasNot = Enum::EXTENSION_AMD_FP64;
    EXPECT_TRUE(platform.isSupported(has));
    EXPECT_FALSE(platform.isSupported(hasNot));
    EXPECT_FALSE(IsSupported({}, has));
    EXPECT_TRUE(IsSupported({device, device}, has));
    // The first that lacks it decides; the others must have it, too.
    EXPECT_FALSE(IsSupported({device, none}, hasNot));
    EXPECT_FAILURE("id() != 0", IsSupported({device, none}, has));
    EXPECT_FAILURE("id() != 0", Platform(nullptr).isSupported(has));
}

TEST_F(MemoryTest, CopiesAndMovesShareTheHandle) {
    // Each object beside another of its kind.
    auto const check = [&](auto const &object, auto const &other) {
        int const &references = runtime->references().at(object.id());
        int const before = references;
        {
            auto copy = object;
            auto moved = std::move(copy);
            // A move is a copy.
            // NOLINTNEXTLINE(bugprone-use-after-move,clang-analyzer-cplusplus.Move)
            EXPECT_EQ(object.id(), copy.id());
            EXPECT_EQ(before + 2, references);
            copy = other;
            moved = std::move(copy);
            EXPECT_EQ(before, references);
            EXPECT_EQ(3, runtime->references().at(other.id()));
        }
        EXPECT_EQ(before, references);
        EXPECT_EQ(1, runtime->references().at(other.id()));
    };
    Program const program = built("kernel void f() {}");
    EXPECT_EQ(2, runtime->references().at(context.id())) << "a program holds its context";
    check(context, Context(ContextProperties(platform), device));
    check(program, Program(context, "kernel void g() {}"));
    check(queue.enqueueMarker(), queue.enqueueMarker());

    runtime->reset();
    Context const &self = context;
    context = self;
    EXPECT_EQ(0u, runtime->calls("clRetainContext") + runtime->calls("clReleaseContext"));
}

TEST_F(MemoryTest, HandlesAreTakenOverAndGivenUp) {
    auto const check = [&](auto object) {
        using Object = decltype(object);
        auto const handle = object.id();
        int const &references = runtime->references().at(handle);
        int const before = references;
        {
            Object const added(handle, add_ref_tag());
            EXPECT_EQ(before + 1, references);
        }
        EXPECT_EQ(before, references);
        EXPECT_EQ(handle, object.disown());
        EXPECT_EQ(nullptr, object.id());
        Object const taken(handle, take_ref_tag());
        EXPECT_EQ(handle, taken.id());
        EXPECT_EQ(before, references);
    };
    check(Context(ContextProperties(platform), device));
    check(CommandQueue(context, device, false, false));
    check(Buffer(context, kBoth, false, 16));
    check(Image2D(context, kBoth, false, kRGBA8, 4, 4, 0));
    check(Image3D(context, kBoth, false, kRGBA8, 4, 4, 4, 0, 0));
    check(Sampler(context, false, Sampler::ADDRESS_CLAMP, Sampler::FILTER_NEAREST));
    check(queue.enqueueMarker());
    Program program = built("kernel void f() {}");
    check(program.kernel("f"));
    check(program);
    Program(program.disown(), take_ref_tag()).build("-w"); // for the devices of its context

    Buffer const buffer(context, kBoth, false, 16);
    EXPECT_FAILURE("The memory to make a 2-D image of is a buffer",
                   Image2D(buffer.id(), take_ref_tag()));
}

TEST_F(ObjectsTest, ContextsPassTheirPropertiesDevicesAndCallback) {
    auto const id = reinterpret_cast<cl_context_properties>(platform.id());
    ContextProperties properties(platform);
    // A device context alone shares nothing.
    properties.setDisplayContext(reinterpret_cast<HDC>(0x1234));
    EXPECT_EQ((std::vector<cl_context_properties>{CL_CONTEXT_PLATFORM, id, 0}),
              properties.properties());
    properties.setSharedRenderContext(reinterpret_cast<HGLRC>(0x5678));

    auto *const notify = +[](char const *, void const *, std::size_t, void *) {};
    Context::NotifyCallback const callback(notify, &properties);
    std::string const sharing =
        TextOf(CL_CONTEXT_PLATFORM, id, CL_WGL_HDC_KHR, 0x1234, CL_GL_CONTEXT_KHR, 0x5678);
    std::string const told = TextOf(reinterpret_cast<void *>(notify), &properties);
    auto const check = [&](Context const &context, char const *entryPoint, auto... devices) {
        EXPECT_EQ(sharing + TextOf(devices...) + told, runtime->arguments(entryPoint));
        ASSERT_EQ(1u, context.devices().size());
        EXPECT_EQ(device.id(), context.devices().front().id());
        EXPECT_EQ(platform.id(), context.platform().id());
    };
    check(Context(properties, device, callback), "clCreateContext", 1, device.id());
    check(Context(properties, std::vector<Device>{device}, callback), "clCreateContext", 1,
          device.id());
    check(Context(properties, device.type(), callback), "clCreateContextFromType", device.type());
}

TEST_F(MemoryTest, TheRuntimeIsToldWhatToMake) {
    int host[64];
    void *const data = host;
    int const use = CL_MEM_USE_HOST_PTR, copy = CL_MEM_COPY_HOST_PTR;
    int const allocate = CL_MEM_ALLOC_HOST_PTR;
    auto const passes = [&](Memory const &memory, Memory::MemoryObjectType type,
                            auto... arguments) {
        char const *const entryPoints[] = {"clCreateBuffer", "clCreateImage2D", "clCreateImage3D"};
        EXPECT_EQ(TextOf(context.id(), arguments...), runtime->arguments(entryPoints[type]));
        EXPECT_EQ(type, memory.memType());
    };
    auto const buffer = Memory::MEMORYOBJECTTYPE_BUFFER;
    passes(Buffer(context, kReads, 16, data), buffer, CL_MEM_READ_ONLY | use, 16, data);
    passes(Buffer(context, kWrites, false, 16), buffer, CL_MEM_WRITE_ONLY, 16, kNone);
    passes(Buffer(context, kBoth, true, 16), buffer, CL_MEM_READ_WRITE | allocate, 16, kNone);
    passes(Buffer(context, kReads, false, 16, data), buffer, CL_MEM_READ_ONLY | copy, 16, data);
    auto const image2D = Memory::MEMORYOBJECTTYPE_IMAGE2D;
    passes(Image2D(context, kBoth, kRGBA8, 2, 3, 20, data), image2D, CL_MEM_READ_WRITE | use, 2, 3,
           20, data);
    passes(Image2D(context, kWrites, true, kRGBA8, 2, 3, 0), image2D, CL_MEM_WRITE_ONLY | allocate,
           2, 3, 0, kNone);
    passes(Image2D(context, kReads, false, kRGBA8, 2, 3, 20, data), image2D,
           CL_MEM_READ_ONLY | copy, 2, 3, 20, data);
    // Rows of volumes are 5 pixels apart, slices 4 rows.
    auto const image3D = Memory::MEMORYOBJECTTYPE_IMAGE3D;
    passes(Image3D(context, kBoth, kRGBA8, 2, 3, 2, 20, 80, data), image3D, CL_MEM_READ_WRITE | use,
           2, 3, 2, 20, 80, data);
    passes(Image3D(context, kReads, true, kRGBA8, 2, 3, 2, 20, 80, data), image3D,
           CL_MEM_READ_ONLY | copy | allocate, 2, 3, 2, 20, 80, data);
    passes(Image3D(context, kWrites, false, kRGBA8, 2, 3, 2, 0, 0), image3D, CL_MEM_WRITE_ONLY, 2,
           3, 2, 0, 0, kNone);
}

TEST_F(MemoryTest, NullHostMemoryIsRefusedBeforeAnyCall) {
    auto const refused = [](std::string const &kind, auto make) {
        EXPECT_FAILURE("NULL host memory pointer passed to " + kind + " constructor.", make());
    };
    refused("Buffer", [&] { Buffer(context, kReads, std::size_t(4), kNone); });
    refused("Image2D", [&] { Image2D(context, kReads, kRGBA8, 4, 4, 0, kNone); });
    refused("Image2D", [&] { Image2D(context, kReads, true, kRGBA8, 4, 4, 0, kNone); });
    refused("Image3D", [&] { Image3D(context, kReads, kRGBA8, 4, 4, 4, 0, 0, kNone); });
    refused("Image3D", [&] { Image3D(context, kReads, true, kRGBA8, 4, 4, 4, 0, 0, kNone); });
    EXPECT_FAILURE("Must allocate host memory passed to Buffer constructor.",
                   Buffer(context, kReads, true, 4, kNone));
    for (char const *name : {"clCreateBuffer", "clCreateImage2D", "clCreateImage3D"})
        EXPECT_EQ(0u, runtime->calls(name)) << name;
}

TEST_F(MemoryTest, ImagesAreReadWhereTheirAccessIsKnown) {
    Image2D const image(context, kReads, false, kRGBA8, 7, 5, 0);
    std::size_t width = 0;
    image.getInfo(Image::IMAGEINFO_WIDTH, sizeof width, &width, nullptr);
    EXPECT_EQ(7u, width);
    runtime->answerNumber(CL_MEM_FLAGS, cl_mem_flags(0));
    EXPECT_FAILURE("isCompatible", queue.enqueueRead(image, {}, nullptr, 0));
}

TEST_F(MemoryTest, SamplersAnswerWhatTheyAreMadeWith) {
    int const addressings[] = {CL_ADDRESS_NONE, CL_ADDRESS_REPEAT, CL_ADDRESS_CLAMP,
                               CL_ADDRESS_CLAMP_TO_EDGE};
    int const filters[] = {CL_FILTER_NEAREST, CL_FILTER_LINEAR};
    for (int addressing = 0; addressing < 4; ++addressing)
        for (int filter = 0; filter < 2; ++filter) {
            // Repeating needs normalised coordinates.
            bool const normalized = addressing == Sampler::ADDRESS_REPEAT || filter == 1;
            Sampler const sampler(context, normalized, Sampler::SamplerAddressingMode(addressing),
                                  Sampler::SamplerFilterMode(filter));
            EXPECT_EQ(TextOf(context.id(), normalized, addressings[addressing], filters[filter]),
                      runtime->arguments("clCreateSampler"));
            EXPECT_EQ(addressing, sampler.addressingMode());
            EXPECT_EQ(filter, sampler.filterMode());
            EXPECT_EQ(normalized, sampler.usesNormalizedCoordinates());
            EXPECT_FAILURE("Not implemented.", sampler.context());
        }
    EXPECT_FAILURE("Unknown OCL addressing mode.",
                   Sampler(context, true, Sampler::SamplerAddressingMode(4), {}));
    runtime->answerNumber(CL_SAMPLER_ADDRESSING_MODE, CL_ADDRESS_MIRRORED_REPEAT);
    Sampler const sampler(context, true, Sampler::ADDRESS_CLAMP, Sampler::FILTER_LINEAR);
    EXPECT_FAILURE("Unknown OpenCL addressing mode.", sampler.addressingMode());
}
