// Buffers, images and samplers.
#include "oru/core/utility/integerrect.h"
#include "oru/oru_ocl/sampler.h"
#include "tests/oru_ocl/computetest.h"

#include <algorithm>
#include <functional>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

using MemoryTest = QueueTest;

cl_image_format const rgba8 = {CL_RGBA, CL_UNORM_INT8};

template<class T, class Object, class Query>
T Get(Object const &object, Query query) {
    T value{};
    std::size_t size = 0;
    object.getInfo(query, sizeof value, &value, &size);
    EXPECT_EQ(sizeof value, size);
    return value;
}

cl_mem_flags Flags(Memory const &memory) {
    return Get<cl_mem_flags>(memory, Memory::MEMORYINFO_FLAGS);
}

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

TEST_F(MemoryTest, BuffersHaveTheFlagsTheyAreMadeWith) {
    std::vector<int> host = Counting<int>(256);
    std::size_t const size = host.size() * sizeof host[0];
    Buffer const own(context, Memory::MEMORY_READ_ONLY, size, host.data());
    EXPECT_EQ(cl_mem_flags(CL_MEM_READ_ONLY | CL_MEM_USE_HOST_PTR), Flags(own));
    EXPECT_EQ(host.data(), Get<void *>(own, Memory::MEMORYINFO_HOST_PTR));
    Buffer const copied(context, Memory::MEMORY_READ_WRITE, true, size, host.data());
    EXPECT_EQ(cl_mem_flags(CL_MEM_READ_WRITE | CL_MEM_COPY_HOST_PTR | CL_MEM_ALLOC_HOST_PTR),
              Flags(copied));
    Buffer const plain(context, Memory::MEMORY_WRITE_ONLY, false, size);
    EXPECT_EQ(cl_mem_flags(CL_MEM_WRITE_ONLY), Flags(plain));
    EXPECT_EQ(size, Get<std::size_t>(plain, Memory::MEMORYINFO_SIZE));
    EXPECT_EQ(context.id(), Get<cl_context>(plain, Memory::MEMORYINFO_CONTEXT));
    EXPECT_EQ(Memory::MEMORYOBJECTTYPE_BUFFER, plain.memType());

    // The copy keeps what the host memory held; the other one is the host memory.
    std::vector<int> const before = host;
    host[3] = -1;
    EXPECT_EQ(before, contents<int>(copied, host.size()));
    EXPECT_EQ(host, contents<int>(own, host.size()));
}

TEST_F(MemoryTest, NullHostMemoryIsRefusedBeforeAnyCall) {
    runtime()->reset();
    EXPECT_EQ("NULL host memory pointer passed to Buffer constructor.", InternalMessage([&] {
                  Buffer(context, Memory::MEMORY_READ_ONLY, std::size_t(4), nullptr);
              }));
    EXPECT_EQ("Must allocate host memory passed to Buffer constructor.", InternalMessage([&] {
                  Buffer(context, Memory::MEMORY_READ_ONLY, true, 4, nullptr);
              }));
    for (auto const &make :
         {std::function<void()>(
              [&] { Image2D(context, Memory::MEMORY_READ_ONLY, rgba8, 4, 4, 0, nullptr); }),
          std::function<void()>(
              [&] { Image2D(context, Memory::MEMORY_READ_ONLY, true, rgba8, 4, 4, 0, nullptr); })})
        EXPECT_EQ("NULL host memory pointer passed to Image2D constructor.", InternalMessage(make));
    for (auto const &make :
         {std::function<void()>(
              [&] { Image3D(context, Memory::MEMORY_READ_ONLY, rgba8, 4, 4, 4, 0, 0, nullptr); }),
          std::function<void()>([&] {
              Image3D(context, Memory::MEMORY_READ_ONLY, true, rgba8, 4, 4, 4, 0, 0, nullptr);
          })})
        EXPECT_EQ("NULL host memory pointer passed to Image3D constructor.", InternalMessage(make));
    for (char const *name : {"clCreateBuffer", "clCreateImage2D", "clCreateImage3D"})
        EXPECT_EQ(0u, runtime()->calls(name)) << name;
}

TEST_F(MemoryTest, ImagesKeepTheirPixels) {
    // Two rows of padding pixels at the end of each host row must not get in.
    std::size_t const width = 7, height = 5, pitch = (width + 2) * 4;
    std::vector<unsigned char> host(pitch * height);
    std::iota(host.begin(), host.end(), static_cast<unsigned char>(1));
    std::vector<unsigned char> dense;
    for (std::size_t y = 0; y < height; ++y)
        dense.insert(dense.end(), host.begin() + std::ptrdiff_t(y * pitch),
                     host.begin() + std::ptrdiff_t(y * pitch + width * 4));

    Image2D const copied(context, Memory::MEMORY_READ_ONLY, false, rgba8, width, height, pitch,
                         host.data());
    Image2D const own(context, Memory::MEMORY_READ_WRITE, rgba8, width, height, pitch, host.data());
    for (Image2D const &image : {copied, own}) {
        EXPECT_EQ(Memory::MEMORYOBJECTTYPE_IMAGE2D, image.memType());
        EXPECT_EQ(width, Get<std::size_t>(image, Image::IMAGEINFO_WIDTH));
        EXPECT_EQ(height, Get<std::size_t>(image, Image::IMAGEINFO_HEIGHT));
        EXPECT_EQ(4u, Get<std::size_t>(image, Image::IMAGEINFO_ELEMENT_SIZE));
        EXPECT_EQ(unsigned(CL_RGBA),
                  Get<cl_image_format>(image, Image::IMAGEINFO_FORMAT).image_channel_order);
        std::vector<unsigned char> read(dense.size());
        queue.enqueueBlockingRead(image, ORU::IntegerRect({0, 0}, ORU::size2(width, height)),
                                  read.data(), 0);
        EXPECT_EQ(dense, read);
    }

    // A rectangle into rows that are further apart: nothing else is touched.
    std::vector<unsigned char> target(30, 0xEE), expected = target;
    for (std::size_t y = 0; y < 3; ++y)
        std::copy_n(dense.begin() + std::ptrdiff_t(((y + 1) * width + 2) * 4), 8,
                    expected.begin() + std::ptrdiff_t(y * 10));
    queue.enqueueRead(copied, ORU::IntegerRect({2, 1}, ORU::size2(2, 3)), target.data(), 10).wait();
    EXPECT_EQ(expected, target);
    EXPECT_EQ(CL_INVALID_VALUE, ErrorCode([&] {
                  queue.enqueueBlockingRead(copied, ORU::IntegerRect({6, 0}, ORU::size2(2, 2)),
                                            target.data(), 0);
              }));

    Image3D const volume(context, Memory::MEMORY_WRITE_ONLY, false, rgba8, 4, 3, 2, 0, 0);
    EXPECT_EQ(Memory::MEMORYOBJECTTYPE_IMAGE3D, volume.memType());
    EXPECT_EQ(2u, Get<std::size_t>(volume, Image::IMAGEINFO_DEPTH));
    EXPECT_EQ(cl_mem_flags(CL_MEM_WRITE_ONLY), Flags(volume));
    EXPECT_NE(CL_SUCCESS, ErrorCode([&] {
                  Image2D(context, Memory::MEMORY_READ_ONLY, false, {CL_RGBA, 0x9999}, 4, 4, 0);
              }));
}

TEST_F(MemoryTest, ImagesAreRefusedByARuntimeWithoutThem) {
    runtime()->setImages(false);
    EXPECT_FALSE(device().supportsImages());
    EXPECT_EQ(CL_INVALID_OPERATION, ErrorCode([&] {
                  Image2D(context, Memory::MEMORY_READ_ONLY, false, rgba8, 4, 4, 0);
              }));
    runtime()->setImages(true);
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
            EXPECT_EQ("Not implemented.", InternalMessage([&] { sampler.context(); }));
        }
}

TEST_F(MemoryTest, EnumerationsAreTranslatedBothWays) {
    using T = Translations;
    EXPECT_EQ(0u, T::AccessFlags(Memory::MemoryAccessFlags(3)));
    EXPECT_EQ(0u, T::AccessFlags(Memory::MemoryAccessFlags(-1)));
    EXPECT_EQ(0u, T::ConvertMemoryInfo(Memory::MemoryInfo(7)));
    EXPECT_EQ(unsigned(CL_MEM_CONTEXT), T::ConvertMemoryInfo(Memory::MEMORYINFO_CONTEXT));
    EXPECT_EQ(0u, T::ConvertImageInfo(Image::ImageInfo(7)));
    EXPECT_EQ(unsigned(CL_IMAGE_DEPTH), T::ConvertImageInfo(Image::IMAGEINFO_DEPTH));
    EXPECT_EQ(0u, T::ConvertMemoryObjectType(Memory::MEMORYOBJECTTYPE_OTHER));
    EXPECT_EQ(unsigned(CL_MEM_OBJECT_IMAGE3D),
              T::ConvertMemoryObjectType(Memory::MEMORYOBJECTTYPE_IMAGE3D));
    for (int i = 0; i < 4; ++i)
        EXPECT_EQ(i,
                  T::OCLAddressingMode(T::OpenCLAddressingMode(Sampler::SamplerAddressingMode(i))));
    EXPECT_EQ("Unknown OCL addressing mode.",
              InternalMessage([] { T::OpenCLAddressingMode(Sampler::SamplerAddressingMode(4)); }));
    EXPECT_EQ("Unknown OpenCL addressing mode.",
              InternalMessage([] { T::OCLAddressingMode(CL_ADDRESS_MIRRORED_REPEAT); }));
    EXPECT_EQ("Unknown OCL filter mode.",
              InternalMessage([] { T::OpenCLFilterMode(Sampler::SamplerFilterMode(2)); }));
    EXPECT_EQ("Unknown OpenCL filter mode.", InternalMessage([] { T::OCLFilterMode(0); }));
}
