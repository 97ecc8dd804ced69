// Buffers, images and samplers.
#include "oru/core/utility/integerrect.h"
#include "oru/oru_ocl/sampler.h"
#include "tests/oru_ocl/computetest.h"

#include <algorithm>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

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

TEST_F(MemoryTest, ObjectsHaveTheFlagsTheyAreMadeWith) {
    std::vector<int> host(64);
    void *const data = host.data();
    int const use = CL_MEM_USE_HOST_PTR, copy = CL_MEM_COPY_HOST_PTR,
              allocate = CL_MEM_ALLOC_HOST_PTR;
    struct {
        Memory memory;
        int flags;
        Memory::MemoryObjectType type;
    } const cases[] = {
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
        EXPECT_EQ(context.id(), Get<cl_context>(memory, Memory::MEMORYINFO_CONTEXT));
    }
}

TEST_F(MemoryTest, BuffersCopyOrUseTheHostsMemory) {
    std::vector<int> host = Counting<int>(256);
    Buffer const own(context, reads, sizeof(int) * 256, host.data());
    Buffer const copied = bufferOf(host);
    EXPECT_EQ(sizeof(int) * 256, Get<std::size_t>(copied, Memory::MEMORYINFO_SIZE));
    host[3] = -1;
    EXPECT_EQ(Counting<int>(256), contents<int>(copied, 256));
    EXPECT_EQ(host, contents<int>(own, 256));
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
    auto const constant = [](int first, int count, int i) {
        return i >= 0 && i < count ? unsigned(first + i) : 0u;
    };
    for (int i = -1; i <= 7; ++i) {
        EXPECT_EQ(constant(CL_MEM_TYPE, 7, i), T::ConvertMemoryInfo(Memory::MemoryInfo(i)));
        EXPECT_EQ(constant(CL_IMAGE_FORMAT, 7, i), T::ConvertImageInfo(Image::ImageInfo(i)));
        EXPECT_EQ(constant(CL_MEM_OBJECT_BUFFER, 3, i),
                  T::ConvertMemoryObjectType(Memory::MemoryObjectType(i)));
    }
    for (int i : {-1, 3})
        EXPECT_EQ(0u, T::AccessFlags(Memory::MemoryAccessFlags(i)));
    EXPECT_EQ(unsigned(CL_ADDRESS_CLAMP_TO_EDGE),
              T::OpenCLAddressingMode(Sampler::ADDRESS_CLAMP_TO_EDGE));
    EXPECT_THROWN("Unknown OCL addressing mode.",
                  T::OpenCLAddressingMode(Sampler::SamplerAddressingMode(4)));
    EXPECT_THROWN("Unknown OpenCL addressing mode.",
                  T::OCLAddressingMode(CL_ADDRESS_MIRRORED_REPEAT));
    EXPECT_THROWN("Unknown OCL filter mode.", T::OpenCLFilterMode(Sampler::SamplerFilterMode(2)));
    EXPECT_THROWN("Unknown OpenCL filter mode.", T::OCLFilterMode(0));
}
