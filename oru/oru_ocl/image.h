// OpenCL images: two- and three-dimensional device memory with a pixel format.
#pragma once

#include "oru/oru_ocl/memory.h"

namespace ORU::OGL {
class Renderbuffer;
class Texture2D;
class Texture3D;
class TextureRECT;
} // namespace ORU::OGL

namespace ORU::OCL {

/// An OpenCL image, or none.
class ORU_API Image : public Memory {
public:
    /// What `getInfo` can ask, with the type of its answer.
    enum ImageInfo : int {
        IMAGEINFO_FORMAT = 0,       ///< cl_image_format
        IMAGEINFO_ELEMENT_SIZE = 1, ///< std::size_t, bytes of a pixel
        IMAGEINFO_ROW_PITCH = 2,    ///< std::size_t, bytes
        IMAGEINFO_SLICE_PITCH = 3,  ///< std::size_t, bytes; 0 for a 2-D image
        IMAGEINFO_WIDTH = 4,        ///< std::size_t, pixels
        IMAGEINFO_HEIGHT = 5,       ///< std::size_t, pixels
        IMAGEINFO_DEPTH = 6         ///< std::size_t, pixels; 0 for a 2-D image
    };

    /// No image.
    Image() = default;

    using Memory::getInfo;

    /// Reads one property (clGetImageInfo); parameters as for `Memory::getInfo`.
    /// @throws ExceptionOCL when the runtime refuses
    void getInfo(ImageInfo info, std::size_t size, void *value, std::size_t *sizeReturned) const;

protected:
    /// @name Over an image's handle
    /// As the constructors of Memory; whether it is an image the kinds check.
    /// @{
    explicit Image(cl_mem handle) : Memory(handle) {}
    Image(cl_mem handle, take_ref_tag const &tag) : Memory(handle, tag) {}
    Image(cl_mem handle, add_ref_tag const &tag) : Memory(handle, tag) {}
    /// @}

    /// OpenCL's constant; 0 for a value outside the enumeration.
    static unsigned int ConvertImageInfo(ImageInfo info);
};

/// A two-dimensional OpenCL image.
///
/// Sizes are in pixels, pitches (the distance of rows in the host memory) in bytes; a pitch of 0
/// means that the rows follow each other. The constructors throw ExceptionOCL when the runtime
/// refuses, for example the format.
class ORU_API Image2D : public Image {
public:
    /// An image whose storage is the caller's memory, which must outlive it (clCreateImage2D with
    /// CL_MEM_USE_HOST_PTR).
    /// @throws InternalException when `host` is null
    Image2D(Context const &context, MemoryAccessFlags access, cl_image_format format,
            std::size_t width, std::size_t height, std::size_t rowPitch, void *host);

    /// An image that starts with a copy of the caller's memory (clCreateImage2D with
    /// CL_MEM_COPY_HOST_PTR).
    /// @param allocHost whether to allocate it in memory that the host reaches quickly
    /// @throws InternalException when `host` is null
    Image2D(Context const &context, MemoryAccessFlags access, bool allocHost,
            cl_image_format format, std::size_t width, std::size_t height, std::size_t rowPitch,
            void *host);

    /// An image of undefined content (clCreateImage2D); runtimes want a pitch of 0 here.
    Image2D(Context const &context, MemoryAccessFlags access, bool allocHost,
            cl_image_format format, std::size_t width, std::size_t height, std::size_t rowPitch);

    /// @name Over OpenGL objects
    /// An image over one level of a texture, or over a renderbuffer, as it is now
    /// (clCreateFromGLTexture2D, clCreateFromGLRenderbuffer). The context must share with the
    /// object's OpenGL context, and the object must outlive the image. Commands use it between
    /// `CommandQueue::enqueueAcquireGLObjects` and `enqueueReleaseGLObjects`.
    /// @{
    Image2D(Context const &context, MemoryAccessFlags access, OGL::Texture2D &texture,
            unsigned int mipLevel);
    Image2D(Context const &context, MemoryAccessFlags access, OGL::TextureRECT &texture,
            unsigned int mipLevel);
    Image2D(Context const &context, MemoryAccessFlags access, OGL::Renderbuffer &renderbuffer);

    /// @name Over a handle that was made elsewhere
    /// @throws InternalException when it is memory of another type
    /// @{
    Image2D(cl_mem handle, take_ref_tag const &tag)
        : Image(Checked(handle, MEMORYOBJECTTYPE_IMAGE2D), tag) {}
    Image2D(cl_mem handle, add_ref_tag const &tag)
        : Image(Checked(handle, MEMORYOBJECTTYPE_IMAGE2D), tag) {}
    /// @}
    /// @}

private:
    Image2D() = default;
};

/// A three-dimensional OpenCL image; everything as for `Image2D`, with a depth in pixels and a
/// slice pitch in bytes (clCreateImage3D).
class ORU_API Image3D : public Image {
public:
    /// @name In memory of its own or of the caller's
    /// Parameters and failures as for the three constructors of Image2D, in the same order: over
    /// the caller's memory, with a copy of it, and of undefined content.
    /// @{
    Image3D(Context const &context, MemoryAccessFlags access, cl_image_format format,
            std::size_t width, std::size_t height, std::size_t depth, std::size_t rowPitch,
            std::size_t slicePitch, void *host);
    Image3D(Context const &context, MemoryAccessFlags access, bool allocHost,
            cl_image_format format, std::size_t width, std::size_t height, std::size_t depth,
            std::size_t rowPitch, std::size_t slicePitch, void *host);
    Image3D(Context const &context, MemoryAccessFlags access, bool allocHost,
            cl_image_format format, std::size_t width, std::size_t height, std::size_t depth,
            std::size_t rowPitch, std::size_t slicePitch);
    /// @}

    /// Over one level of an OpenGL texture (clCreateFromGLTexture3D).
    Image3D(Context const &context, MemoryAccessFlags access, OGL::Texture3D &texture,
            unsigned int mipLevel);

    /// @name Over a handle that was made elsewhere
    /// @throws InternalException when it is memory of another type
    /// @{
    Image3D(cl_mem handle, take_ref_tag const &tag)
        : Image(Checked(handle, MEMORYOBJECTTYPE_IMAGE3D), tag) {}
    Image3D(cl_mem handle, add_ref_tag const &tag)
        : Image(Checked(handle, MEMORYOBJECTTYPE_IMAGE3D), tag) {}
    /// @}

private:
    Image3D() = default;
};

} // namespace ORU::OCL
