// Sharpening by OpenCL on the texture that it shares with OpenGL.
#include "apps/develop/openclsharpener.h"

#include "apps/develop/gaussian.h"
#include "apps/develop/openclkernels.h"
#include "apps/develop/pixelformat.h"
#include "apps/develop/shaders.h"

#include "oru/core/math/tvec2.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/context.h"

namespace Develop {

namespace OCL = ORU::OCL;
using ambra::lumo::TVec2;
using ORU::OGL::Texture2D;

namespace {

OCL::ContextProperties PropertiesFor(OpenCLDevice const &device, ORU::OGL::Context const &shared) {
    OCL::ContextProperties properties(device.platform);
    properties.setSharedRenderContext(shared.renderContext());
    properties.setDisplayContext(shared.deviceContext());
    return properties;
}

// Work items of a group.
constexpr std::size_t kGroup[2] = {16, 4};

} // namespace

OpenCLSharpener::OpenCLSharpener(OpenCLDevice const &device, ORU::OGL::Context const &shared)
    : device_(device), context_(PropertiesFor(device, shared), device.device),
      queue_(context_, device.device, false, false),
      kernels_(BuildProgram(context_, device.device, kSharedKernels, std::string())) {}

OpenCLSharpener::Kernels::Kernels(OCL::Program const &program)
    : loadTexture(program.kernel("loadTexture")), storeTexture(program.kernel("storeTexture")),
      blurRows(program.kernel("blurRows")), sharpenColumns(program.kernel("sharpenColumns")) {}

Texture2D &OpenCLSharpener::light(std::size_t width, std::size_t height) {
    bool const isNew =
        !image_ || texture_.get().width(0) < width || texture_.get().height(0) < height;
    if (isNew)
        image_.reset(); // the texture is to outlive it
    Texture2D &texture = texture_.reserve(kLightFormat.storage, width, height);
    if (isNew)
        image_.emplace(context_, OCL::Memory::MEMORY_READ_WRITE, texture, 0);
    return texture;
}

Texture2D const &OpenCLSharpener::sharpen(std::size_t width, std::size_t height,
                                          std::size_t channels, Sharpening const &sharpening) {
    OCL::Buffer &light = light_.reserve(context_, width * height * kLightBytes);
    OCL::Buffer &rows = rows_.reserve(context_, width * height * kLightBytes);
    setBlur(channels, sharpening);
    ORU_GL0(Finish); // OpenGL is to be done with the texture before OpenCL takes it
    queue_.enqueueAcquireGLObjects({*image_});
    launch(kernels_.loadTexture, width, height, *image_, light);
    launch(kernels_.blurRows, width, height, light, rows);
    launch(kernels_.sharpenColumns, width, height, light, rows);
    launch(kernels_.storeTexture, width, height, *image_, light);
    queue_.enqueueReleaseGLObjects({*image_});
    queue_.finish();
    return texture_.get();
}

void OpenCLSharpener::setBlur(std::size_t channels, Sharpening const &sharpening) {
    std::vector<float> const weights = GaussianWeights(sharpening.sigma);
    std::size_t const bytes = weights.size() * sizeof(float);
    queue_.enqueueBlockingWrite(weights_.reserve(context_, bytes), 0, bytes, weights.data());
    auto const taps = static_cast<cl_int>(weights.size());
    for (OCL::Kernel *const kernel : {&kernels_.blurRows, &kernels_.sharpenColumns}) {
        kernel->setArg(3, weights_.get());
        kernel->setArg(4, &taps, sizeof taps);
    }
    auto const amount = static_cast<float>(sharpening.amount);
    kernels_.sharpenColumns.setArg(5, &amount, sizeof amount);
    std::array<float, 4> const colours = ColourMask(channels);
    kernels_.sharpenColumns.setArg(6, colours.data(), sizeof colours);
}

template<class First>
void OpenCLSharpener::launch(OCL::Kernel &kernel, std::size_t width, std::size_t height,
                             First const &first, OCL::Buffer const &second) {
    kernel.setArg(0, first);
    kernel.setArg(1, second);
    kernel.setArg(2, TVec2<int>(static_cast<int>(width), static_cast<int>(height)));
    // Whole groups of one size for pictures of every size; the kernels leave out what is too much.
    auto const whole = [](std::size_t size, std::size_t group) {
        return (size + group - 1) / group * group;
    };
    queue_.enqueueKernel(kernel, OCL::Range<2>(whole(width, kGroup[0]), whole(height, kGroup[1])),
                         OCL::Range<2>(kGroup[0], kGroup[1]), 0);
}

} // namespace Develop
