// Sharpening by OpenCL on the texture that it shares with OpenGL.
#pragma once

#include "apps/develop/openclprogram.h"
#include "apps/develop/openclruntime.h"
#include "apps/develop/reusedtexture.h"
#include "apps/develop/sharpener.h"

#include "oru/oru_ocl/commandqueue.h"

#include <optional>

namespace ORU::OGL {
class Context;
} // namespace ORU::OGL

namespace Develop {

/// Kernels of an OpenCL runtime on the texture itself.
class OpenCLSharpener : public Sharpener {
public:
    /// @param shared the OpenGL context to share with, current on this thread
    /// @throws ORU::LogicalException when the device refuses, as one does that cannot share with
    ///         the context
    /// @throws Failure when the device's compiler refuses the kernels
    OpenCLSharpener(OpenCLDevice const &device, ORU::OGL::Context const &shared);

    ORU::OGL::Texture2D &light(std::size_t width, std::size_t height) override;
    ORU::OGL::Texture2D const &sharpen(std::size_t width, std::size_t height, std::size_t channels,
                                       Sharpening const &sharpening) override;
    std::string description() const override {
        return "OpenCL on " + device_.name + ", on the texture shared with OpenGL";
    }

private:
    struct Kernels {
        explicit Kernels(ORU::OCL::Program const &program);
        ORU::OCL::Kernel loadTexture, storeTexture, blurRows, sharpenColumns;
    };

    void setBlur(std::size_t channels, Sharpening const &sharpening);

    /// Launches a kernel over a size, which is its third argument after two pieces of memory.
    template<class First>
    void launch(ORU::OCL::Kernel &kernel, std::size_t width, std::size_t height, First const &first,
                ORU::OCL::Buffer const &second);

    OpenCLDevice device_;
    ORU::OCL::Context context_;
    ORU::OCL::CommandQueue queue_;
    Kernels kernels_;
    ReusedTexture texture_;
    std::optional<ORU::OCL::Image2D> image_; ///< over the texture
    ReusedBuffer light_, rows_, weights_;
};

} // namespace Develop
