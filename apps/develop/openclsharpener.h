// Sharpening by OpenCL.
#pragma once

#include "apps/develop/openclruntime.h"
#include "apps/develop/sharpener.h"

#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ocl/programocl.h"

namespace ORU::OGL {
class Context;
} // namespace ORU::OGL

namespace Develop {

/// Kernels on a device of an OpenCL runtime. Where device and OpenGL share, they work on the
/// texture itself; otherwise it is read back once and written once.
class OpenCLSharpener : public Sharpener {
public:
    /// @param shared the OpenGL context to share with, current on this thread; null to copy
    /// @throws ORU::LogicalException when the device refuses, as one does that cannot share with
    ///         the context
    /// @throws Failure when the device's compiler refuses the kernels
    OpenCLSharpener(OpenCLDevice const &device, ORU::OGL::Context const *shared);

    void sharpen(std::unique_ptr<ORU::OGL::Texture2D> &light, std::size_t channels,
                 Sharpening const &sharpening) override;
    std::string description() const override;

private:
    /// What the kernels work with.
    struct Work;
    struct Kernels {
        explicit Kernels(ORU::OCL::Program const &program);
        ORU::OCL::Kernel loadTexture, storeTexture, blurRows, sharpenColumns;
    };

    void sharpenShared(ORU::OGL::Texture2D &light, Work &work);
    void sharpenCopy(ORU::OGL::Texture2D &light, Work &work);
    void sharpenBuffer(Work &work);

    /// Launches a kernel whose first arguments are two pieces of memory and the picture's size.
    template<class First>
    void launch(ORU::OCL::Kernel &kernel, Work const &work, First const &first,
                ORU::OCL::Buffer const &second);

    OpenCLDevice device_;
    bool isShared_;
    ORU::OCL::Context context_;
    ORU::OCL::CommandQueue queue_;
    Kernels kernels_;
    std::vector<float> host_; ///< the copy; kept, since new memory of its size is slow to get
};

} // namespace Develop
