// OpenCL images: two- and three-dimensional device memory with a pixel format.
#include "oru/oru_ocl/image.h"

#include "oru/core/utility/enumtable.h"
#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"

namespace ORU::OCL {

namespace {

constexpr EnumTable<Image::ImageInfo, cl_image_info, 7> kImageInfos = {
    {{Image::IMAGEINFO_FORMAT, CL_IMAGE_FORMAT},
     {Image::IMAGEINFO_ELEMENT_SIZE, CL_IMAGE_ELEMENT_SIZE},
     {Image::IMAGEINFO_ROW_PITCH, CL_IMAGE_ROW_PITCH},
     {Image::IMAGEINFO_SLICE_PITCH, CL_IMAGE_SLICE_PITCH},
     {Image::IMAGEINFO_WIDTH, CL_IMAGE_WIDTH},
     {Image::IMAGEINFO_HEIGHT, CL_IMAGE_HEIGHT},
     {Image::IMAGEINFO_DEPTH, CL_IMAGE_DEPTH}}};
static_assert(kImageInfos.isInOrder());

cl_mem FromTexture2D(Context const &context, cl_mem_flags flags, OGL::Object const &texture,
                     unsigned int mipLevel) {
    return ORU_CL(CreateFromGLTexture2D, context.id(), flags, texture.target(),
                  static_cast<cl_GLint>(mipLevel), texture.checkedID());
}

} // namespace

void Image::getInfo(ImageInfo info, std::size_t size, void *value,
                    std::size_t *sizeReturned) const {
    ORU_CL(GetImageInfo, id(), ConvertImageInfo(info), size, value, sizeReturned);
}

unsigned int Image::ConvertImageInfo(ImageInfo info) {
    return kImageInfos.constantOr(info, 0);
}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, cl_image_format format,
                 std::size_t width, std::size_t height, std::size_t rowPitch, void *host) {
    ORU_ASSERT_TEXT("NULL host memory pointer passed to Image2D constructor.", host);
    cl_mem_flags const flags = AccessFlags(access) | CL_MEM_USE_HOST_PTR;
    adopt(ORU_CL(CreateImage2D, context.id(), flags, &format, width, height, rowPitch, host));
}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, bool allocHost,
                 cl_image_format format, std::size_t width, std::size_t height,
                 std::size_t rowPitch, void *host) {
    ORU_ASSERT_TEXT("NULL host memory pointer passed to Image2D constructor.", host);
    cl_mem_flags const flags = AllocationFlags(access, allocHost) | CL_MEM_COPY_HOST_PTR;
    adopt(ORU_CL(CreateImage2D, context.id(), flags, &format, width, height, rowPitch, host));
}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, bool allocHost,
                 cl_image_format format, std::size_t width, std::size_t height,
                 std::size_t rowPitch)
    : Image(ORU_CL(CreateImage2D, context.id(), AllocationFlags(access, allocHost), &format, width,
                   height, rowPitch, nullptr)) {}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, OGL::Texture2D &texture,
                 unsigned int mipLevel)
    : Image(FromTexture2D(context, AccessFlags(access), texture, mipLevel)) {}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, OGL::TextureRECT &texture,
                 unsigned int mipLevel)
    : Image(FromTexture2D(context, AccessFlags(access), texture, mipLevel)) {}

Image2D::Image2D(Context const &context, MemoryAccessFlags access, OGL::Renderbuffer &renderbuffer)
    : Image(ORU_CL(CreateFromGLRenderbuffer, context.id(), AccessFlags(access),
                   renderbuffer.checkedID())) {}

Image3D::Image3D(Context const &context, MemoryAccessFlags access, cl_image_format format,
                 std::size_t width, std::size_t height, std::size_t depth, std::size_t rowPitch,
                 std::size_t slicePitch, void *host) {
    ORU_ASSERT_TEXT("NULL host memory pointer passed to Image3D constructor.", host);
    cl_mem_flags const flags = AccessFlags(access) | CL_MEM_USE_HOST_PTR;
    adopt(ORU_CL(CreateImage3D, context.id(), flags, &format, width, height, depth, rowPitch,
                 slicePitch, host));
}

Image3D::Image3D(Context const &context, MemoryAccessFlags access, bool allocHost,
                 cl_image_format format, std::size_t width, std::size_t height, std::size_t depth,
                 std::size_t rowPitch, std::size_t slicePitch, void *host) {
    ORU_ASSERT_TEXT("NULL host memory pointer passed to Image3D constructor.", host);
    cl_mem_flags const flags = AllocationFlags(access, allocHost) | CL_MEM_COPY_HOST_PTR;
    adopt(ORU_CL(CreateImage3D, context.id(), flags, &format, width, height, depth, rowPitch,
                 slicePitch, host));
}

Image3D::Image3D(Context const &context, MemoryAccessFlags access, bool allocHost,
                 cl_image_format format, std::size_t width, std::size_t height, std::size_t depth,
                 std::size_t rowPitch, std::size_t slicePitch)
    : Image(ORU_CL(CreateImage3D, context.id(), AllocationFlags(access, allocHost), &format, width,
                   height, depth, rowPitch, slicePitch, nullptr)) {}

Image3D::Image3D(Context const &context, MemoryAccessFlags access, OGL::Texture3D &texture,
                 unsigned int mipLevel)
    : Image(ORU_CL(CreateFromGLTexture3D, context.id(), AccessFlags(access), texture.target(),
                   static_cast<cl_GLint>(mipLevel), texture.checkedID())) {}

} // namespace ORU::OCL
