// Sharpening by OpenCL.
#include "apps/develop/openclsharpener.h"

#include "apps/common/failure.h"
#include "apps/develop/gaussian.h"
#include "apps/develop/openclkernels.h"
#include "apps/develop/pixelformat.h"
#include "apps/develop/shaders.h"
#include "apps/develop/texturescope.h"

#include "oru/core/math/tvec2.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/context.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"

namespace Develop {

namespace OCL = ORU::OCL;
using ambra::lumo::TVec2;
using ORU::OGL::Texture2D;

namespace {

OCL::ContextProperties PropertiesFor(OpenCLDevice const &device, ORU::OGL::Context const *shared) {
    OCL::ContextProperties properties(device.platform);
    if (shared) {
        properties.setSharedRenderContext(shared->renderContext());
        properties.setDisplayContext(shared->deviceContext());
    }
    return properties;
}

/// The program with all kernels, built for a device.
OCL::Program BuildKernels(OCL::Context const &context, OCL::Device const &device) {
    OCL::Program program(context, kSharpenKernels);
    try {
        program.build(std::string());
    } catch (OCL::ExceptionOCL const &) {
        std::string const log = program.buildLog(device);
        throw App::Failure("the OpenCL compiler refuses the kernels: " +
                           log.substr(0, log.find('\n')));
    }
    return program;
}

// Work items of a group.
constexpr std::size_t kGroup[2] = {16, 4};

} // namespace

struct OpenCLSharpener::Work {
    Work(OCL::Context const &context, Texture2D const &texture, std::size_t channels,
         Sharpening const &sharpening)
        : width(texture.width(0)), height(texture.height(0)), bytes(width * height * kLightBytes),
          amount(static_cast<float>(sharpening.amount)), colours(ColourMask(channels)),
          hostWeights(GaussianWeights(sharpening.sigma)),
          light(context, OCL::Memory::MEMORY_READ_WRITE, false, bytes),
          rows(context, OCL::Memory::MEMORY_READ_WRITE, false, bytes),
          weights(context, OCL::Memory::MEMORY_READ_ONLY, false, hostWeights.size() * sizeof(float),
                  hostWeights.data()) {}

    std::size_t width, height, bytes;
    float amount;
    std::array<float, 4> colours;
    std::vector<float> hostWeights;
    OCL::Buffer light; ///< the picture
    OCL::Buffer rows;  ///< its blurred rows
    OCL::Buffer weights;
};

OpenCLSharpener::OpenCLSharpener(OpenCLDevice const &device, ORU::OGL::Context const *shared)
    : device_(device), isShared_(shared != nullptr),
      context_(PropertiesFor(device, shared), device.device),
      queue_(context_, device.device, false, false),
      kernels_(BuildKernels(context_, device.device)) {}

OpenCLSharpener::Kernels::Kernels(OCL::Program const &program)
    : loadTexture(program.kernel("loadTexture")), storeTexture(program.kernel("storeTexture")),
      blurRows(program.kernel("blurRows")), sharpenColumns(program.kernel("sharpenColumns")) {}

std::string OpenCLSharpener::description() const {
    return "OpenCL on " + device_.name +
           (isShared_ ? ", on the texture shared with OpenGL" : ", on a copy");
}

void OpenCLSharpener::sharpen(std::unique_ptr<Texture2D> &light, std::size_t channels,
                              Sharpening const &sharpening) {
    Work work(context_, *light, channels, sharpening);
    if (isShared_)
        sharpenShared(*light, work);
    else
        sharpenCopy(*light, work);
}

void OpenCLSharpener::sharpenShared(Texture2D &light, Work &work) {
    OCL::Image2D const image(context_, OCL::Memory::MEMORY_READ_WRITE, light, 0);
    ORU_GL0(Finish); // OpenGL is to be done with the texture before OpenCL takes it
    queue_.enqueueAcquireGLObjects({image});
    launch(kernels_.loadTexture, work, image, work.light);
    sharpenBuffer(work);
    launch(kernels_.storeTexture, work, image, work.light);
    queue_.enqueueReleaseGLObjects({image});
    queue_.finish();
}

void OpenCLSharpener::sharpenCopy(Texture2D &light, Work &work) {
    host_.resize(work.bytes / sizeof(float));
    TextureScope const bound(light);
    light.getPixelData(host_.data(), 0, kLightFormat.layout, kLightFormat.type, 1);
    queue_.enqueueBlockingWrite(work.light, 0, work.bytes, host_.data());
    sharpenBuffer(work);
    queue_.enqueueBlockingRead(work.light, 0, work.bytes, host_.data());
    light.subImage(0, 0, 0, work.width, work.height, kLightFormat.layout, kLightFormat.type,
                   host_.data(), ORU::OGL::PixelUnpackParameters());
}

void OpenCLSharpener::sharpenBuffer(Work &work) {
    auto const taps = static_cast<cl_int>(work.hostWeights.size());
    for (OCL::Kernel *const kernel : {&kernels_.blurRows, &kernels_.sharpenColumns}) {
        kernel->setArg(3, work.weights);
        kernel->setArg(4, &taps, sizeof taps);
    }
    kernels_.sharpenColumns.setArg(5, &work.amount, sizeof work.amount);
    kernels_.sharpenColumns.setArg(6, work.colours.data(), sizeof work.colours);
    launch(kernels_.blurRows, work, work.light, work.rows);
    launch(kernels_.sharpenColumns, work, work.light, work.rows);
}

template<class First>
void OpenCLSharpener::launch(OCL::Kernel &kernel, Work const &work, First const &first,
                             OCL::Buffer const &second) {
    kernel.setArg(0, first);
    kernel.setArg(1, second);
    kernel.setArg(2, TVec2<int>(static_cast<int>(work.width), static_cast<int>(work.height)));
    // Whole groups of one size for pictures of every size; the kernels leave out what is too much.
    auto const whole = [](std::size_t size, std::size_t group) {
        return (size + group - 1) / group * group;
    };
    queue_.enqueueKernel(kernel,
                         OCL::Range<2>(whole(work.width, kGroup[0]), whole(work.height, kGroup[1])),
                         OCL::Range<2>(kGroup[0], kGroup[1]), 0);
}

} // namespace Develop
