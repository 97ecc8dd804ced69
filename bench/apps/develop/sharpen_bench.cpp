// The sharpening stage of develop against the same kernels called by the plain C functions.
#include "apps/common/offscreengpu.h"
#include "apps/develop/gaussian.h"
#include "apps/develop/openclkernels.h"
#include "apps/develop/openclsharpener.h"
#include "apps/develop/pixelformat.h"
#include "apps/develop/shaders.h"
#include "bench/comparison.h"

#include "oru/oru_ocl/extensionmanagerocl.h"
#include "oru/oru_ogl/platformgl.h"

#include <memory>
#include <stdexcept>

using namespace Develop;
using ORU::OGL::Texture2D;

namespace {

constexpr std::size_t cWidth = 2400;
constexpr std::size_t cHeight = 1600;
constexpr double cMegapixels = cWidth * cHeight / 1e6;
constexpr Sharpening cSharpening = {0.8, 1.5};

void Check(cl_int code) {
    if (code != CL_SUCCESS)
        throw std::runtime_error("OpenCL error " + std::to_string(code));
}

std::unique_ptr<Texture2D> MakeLight() {
    return std::make_unique<Texture2D>(cLightFormat.storage, cWidth, cHeight, false);
}

/// The stage without the library: C functions, and OpenGL's own.
class RawSharpener {
public:
    explicit RawSharpener(OpenCLDevice const &device)
        : cl_(ORU::OCL::ExtensionManager::instance()->table()),
          weights_(GaussianWeights(cSharpening.sigma)),
          host_(cWidth * cHeight * cLightBytes / sizeof(float)) {
        cl_device_id const id = device.device.id();
        cl_context_properties const properties[] = {
            CL_CONTEXT_PLATFORM, reinterpret_cast<cl_context_properties>(device.platform.id()), 0};
        cl_int code = CL_SUCCESS;
        context_ = cl_.clCreateContext(properties, 1, &id, nullptr, nullptr, &code);
        Check(code);
        queue_ = cl_.clCreateCommandQueue(context_, id, 0, &code);
        Check(code);
        char const *source = cSharpenKernels;
        program_ = cl_.clCreateProgramWithSource(context_, 1, &source, nullptr, &code);
        Check(code);
        Check(cl_.clBuildProgram(program_, 0, nullptr, "", nullptr, nullptr));
        blurRows_ = cl_.clCreateKernel(program_, "blurRows", &code);
        Check(code);
        sharpenColumns_ = cl_.clCreateKernel(program_, "sharpenColumns", &code);
        Check(code);
    }
    ~RawSharpener() {
        cl_.clReleaseKernel(blurRows_);
        cl_.clReleaseKernel(sharpenColumns_);
        cl_.clReleaseProgram(program_);
        cl_.clReleaseCommandQueue(queue_);
        cl_.clReleaseContext(context_);
    }
    RawSharpener(RawSharpener const &) = delete;
    RawSharpener &operator=(RawSharpener const &) = delete;

    void sharpen(unsigned int texture) {
        std::size_t const bytes = host_.size() * sizeof(float);
        cl_int code = CL_SUCCESS;
        cl_mem light = cl_.clCreateBuffer(context_, CL_MEM_READ_WRITE, bytes, nullptr, &code);
        Check(code);
        cl_mem rows = cl_.clCreateBuffer(context_, CL_MEM_READ_WRITE, bytes, nullptr, &code);
        Check(code);
        cl_mem weights =
            cl_.clCreateBuffer(context_, CL_MEM_READ_ONLY | CL_MEM_COPY_HOST_PTR,
                               weights_.size() * sizeof(float), weights_.data(), &code);
        Check(code);
        ::glBindTexture(GL_TEXTURE_2D, texture);
        ::glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_FLOAT, host_.data());
        Check(cl_.clEnqueueWriteBuffer(queue_, light, CL_TRUE, 0, bytes, host_.data(), 0, nullptr,
                                       nullptr));
        launch(light, rows, weights);
        Check(cl_.clEnqueueReadBuffer(queue_, light, CL_TRUE, 0, bytes, host_.data(), 0, nullptr,
                                      nullptr));
        ::glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, static_cast<GLsizei>(cWidth),
                          static_cast<GLsizei>(cHeight), GL_RGBA, GL_FLOAT, host_.data());
        ::glBindTexture(GL_TEXTURE_2D, 0);
        cl_.clReleaseMemObject(light);
        cl_.clReleaseMemObject(rows);
        cl_.clReleaseMemObject(weights);
    }

    /// The kernels alone, on memory of the device.
    double secondsOfKernels() {
        std::size_t const bytes = host_.size() * sizeof(float);
        cl_int code = CL_SUCCESS;
        cl_mem light = cl_.clCreateBuffer(context_, CL_MEM_READ_WRITE | CL_MEM_COPY_HOST_PTR, bytes,
                                          host_.data(), &code);
        Check(code);
        cl_mem rows = cl_.clCreateBuffer(context_, CL_MEM_READ_WRITE, bytes, nullptr, &code);
        Check(code);
        cl_mem weights =
            cl_.clCreateBuffer(context_, CL_MEM_READ_ONLY | CL_MEM_COPY_HOST_PTR,
                               weights_.size() * sizeof(float), weights_.data(), &code);
        Check(code);
        double const seconds = oru_bench::Seconds([&] {
            launch(light, rows, weights);
            Check(cl_.clFinish(queue_));
        });
        cl_.clReleaseMemObject(light);
        cl_.clReleaseMemObject(rows);
        cl_.clReleaseMemObject(weights);
        return seconds;
    }

private:
    void launch(cl_mem light, cl_mem rows, cl_mem weights) {
        auto const taps = static_cast<cl_int>(weights_.size());
        cl_int const size[2] = {static_cast<cl_int>(cWidth), static_cast<cl_int>(cHeight)};
        auto const amount = static_cast<float>(cSharpening.amount);
        auto const colours = ColourMask(3);
        for (cl_kernel const kernel : {blurRows_, sharpenColumns_}) {
            Check(cl_.clSetKernelArg(kernel, 0, sizeof light, &light));
            Check(cl_.clSetKernelArg(kernel, 1, sizeof rows, &rows));
            Check(cl_.clSetKernelArg(kernel, 2, sizeof size, size));
            Check(cl_.clSetKernelArg(kernel, 3, sizeof weights, &weights));
            Check(cl_.clSetKernelArg(kernel, 4, sizeof taps, &taps));
        }
        Check(cl_.clSetKernelArg(sharpenColumns_, 5, sizeof amount, &amount));
        Check(cl_.clSetKernelArg(sharpenColumns_, 6, sizeof colours, colours.data()));
        static constexpr std::size_t sGlobal[2] = {cWidth, cHeight};
        static constexpr std::size_t sLocal[2] = {16, 4};
        for (cl_kernel const kernel : {blurRows_, sharpenColumns_})
            Check(cl_.clEnqueueNDRangeKernel(queue_, kernel, 2, nullptr, sGlobal, sLocal, 0,
                                             nullptr, nullptr));
    }

    ORU::OCL::FunctionTable const &cl_;
    std::vector<float> weights_;
    std::vector<float> host_;
    cl_context context_ = nullptr;
    cl_command_queue queue_ = nullptr;
    cl_program program_ = nullptr;
    cl_kernel blurRows_ = nullptr;
    cl_kernel sharpenColumns_ = nullptr;
};

// The whole stage on a copy of the texture: read back, two kernels, write back. `kernels_Mpx_s` is
// the speed of the kernels alone.
void SharpenStage(benchmark::State &state) {
    OpenCLRuntime const runtime{std::string()};
    std::vector<OpenCLDevice> const devices = runtime.devices();
    if (devices.empty()) {
        state.SkipWithError("no OpenCL device");
        return;
    }
    App::OffscreenGpu const gpu{std::string()};
    OpenCLSharpener sharpener(devices.front(), nullptr);
    RawSharpener raw(devices.front());
    auto light = MakeLight();
    sharpener.sharpen(light, 3, cSharpening); // compiles what is compiled at first use
    raw.sharpen(light->objectID());

    std::vector<double> base, stage;
    {
        oru_bench::Comparison comparison(state);
        while (state.KeepRunning()) {
            base.push_back(oru_bench::Seconds([&] { raw.sharpen(light->objectID()); }));
            stage.push_back(oru_bench::Seconds([&] { sharpener.sharpen(light, 3, cSharpening); }));
            comparison.add(base.back(), stage.back());
        }
    }
    state.counters["raw_Mpx_s"] = cMegapixels / oru_bench::Median(base);
    state.counters["oru_Mpx_s"] = cMegapixels / oru_bench::Median(stage);
    state.counters["kernels_Mpx_s"] = cMegapixels / raw.secondsOfKernels();
}
BENCHMARK(SharpenStage)->UseManualTime()->Iterations(15)->Unit(benchmark::kMillisecond);

} // namespace
