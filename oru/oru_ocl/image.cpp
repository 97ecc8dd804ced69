// OpenCL images: two- and three-dimensional device memory with a pixel format.
#include "oru/oru_ocl/image.h"

#include "oru/oru_ocl/internal/clcall.h"
#include "oru/oru_ocl/internal/enumtable.h"

namespace ORU::OCL {

namespace {

constexpr unsigned int imageInfos[] = {
    CL_IMAGE_FORMAT, CL_IMAGE_ELEMENT_SIZE, CL_IMAGE_ROW_PITCH, CL_IMAGE_SLICE_PITCH,
    CL_IMAGE_WIDTH,  CL_IMAGE_HEIGHT,       CL_IMAGE_DEPTH,
};

void CheckHost(void const *host, char const *message) {
    if (!host)
        ORU_THROW_INTERNAL(message);
}

constexpr char const *noHost2D = "NULL host memory pointer passed to Image2D constructor.";
constexpr char const *noHost3D = "NULL host memory pointer passed to Image3D constructor.";

} // namespace

void Image::getInfo(ImageInfo info, std::size_t size, void *value,
                    std::size_t *sizeReturned) const {
    ORU_CL(GetImageInfo)(id(), ConvertImageInfo(info), size, value, sizeReturned);
}

unsigned int Image::ConvertImageInfo(ImageInfo info) {
    return ConstantOr(imageInfos, info, 0u);
}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, cl_image_format format,
                 std::size_t width, std::size_t height, std::size_t rowPitch, void *host) {
    CheckHost(host, noHost2D);
    cl_mem_flags const flags = AccessFlags(access) | CL_MEM_USE_HOST_PTR;
    adopt(ORU_CL(CreateImage2D)(context.id(), flags, &format, width, height, rowPitch, host));
}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, bool allocHost,
                 cl_image_format format, std::size_t width, std::size_t height,
                 std::size_t rowPitch, void *host) {
    CheckHost(host, noHost2D);
    cl_mem_flags const flags = AllocationFlags(access, allocHost) | CL_MEM_COPY_HOST_PTR;
    adopt(ORU_CL(CreateImage2D)(context.id(), flags, &format, width, height, rowPitch, host));
}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, bool allocHost,
                 cl_image_format format, std::size_t width, std::size_t height,
                 std::size_t rowPitch)
    : Image(ORU_CL(CreateImage2D)(context.id(), AllocationFlags(access, allocHost), &format, width,
                                  height, rowPitch, nullptr)) {}

Image3D::Image3D(Context const &context, MemoryAccessFlags access, cl_image_format format,
                 std::size_t width, std::size_t height, std::size_t depth, std::size_t rowPitch,
                 std::size_t slicePitch, void *host) {
    CheckHost(host, noHost3D);
    cl_mem_flags const flags = AccessFlags(access) | CL_MEM_USE_HOST_PTR;
    adopt(ORU_CL(CreateImage3D)(context.id(), flags, &format, width, height, depth, rowPitch,
                                slicePitch, host));
}

Image3D::Image3D(Context const &context, MemoryAccessFlags access, bool allocHost,
                 cl_image_format format, std::size_t width, std::size_t height, std::size_t depth,
                 std::size_t rowPitch, std::size_t slicePitch, void *host) {
    CheckHost(host, noHost3D);
    cl_mem_flags const flags = AllocationFlags(access, allocHost) | CL_MEM_COPY_HOST_PTR;
    adopt(ORU_CL(CreateImage3D)(context.id(), flags, &format, width, height, depth, rowPitch,
                                slicePitch, host));
}

Image3D::Image3D(Context const &context, MemoryAccessFlags access, bool allocHost,
                 cl_image_format format, std::size_t width, std::size_t height, std::size_t depth,
                 std::size_t rowPitch, std::size_t slicePitch)
    : Image(ORU_CL(CreateImage3D)(context.id(), AllocationFlags(access, allocHost), &format, width,
                                  height, depth, rowPitch, slicePitch, nullptr)) {}

} // namespace ORU::OCL
