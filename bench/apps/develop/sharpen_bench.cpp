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

constexpr std::size_t kWidth = 2400;
constexpr std::size_t kHeight = 1600;
constexpr double kMegapixels = kWidth * kHeight / 1e6;
constexpr Sharpening kSharpening = {0.8, 1.5};

void Check(cl_int code) {
    if (code != CL_SUCCESS)
        throw std::runtime_error("OpenCL error " + std::to_string(code));
}

std::unique_ptr<Texture2D> MakeLight() {
    return std::make_unique<Texture2D>(kLightFormat.storage, kWidth, kHeight, false);
}

/// The stage without the library: C functions, and OpenGL's own.
class RawSharpener {
public:
    explicit RawSharpener(OpenCLDevice const &device)
        : cl_(ORU::OCL::ExtensionManager::instance()->table()),
          weights_(GaussianWeights(kSharpening.sigma)),
          host_(kWidth * kHeight * kLightBytes / sizeof(float)) {
        cl_device_id const id = device.device.id();
        cl_context_properties const properties[] = {
            CL_CONTEXT_PLATFORM, reinterpret_cast<cl_context_properties>(device.platform.id()), 0};
        cl_int code = CL_SUCCESS;
        context_ = cl_.clCreateContext(properties, 1, &id, nullptr, nullptr, &code);
        Check(code);
        queue_ = cl_.clCreateCommandQueue(context_, id, 0, &code);
        Check(code);
        char const *source = kSharpenKernels;
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
        Memory const memory(*this, CL_MEM_READ_WRITE, nullptr);
        ::glBindTexture(GL_TEXTURE_2D, texture);
        ::glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_FLOAT, host_.data());
        Check(cl_.clEnqueueWriteBuffer(queue_, memory.light, CL_TRUE, 0, bytes(), host_.data(), 0,
                                       nullptr, nullptr));
        launch(memory);
        Check(cl_.clEnqueueReadBuffer(queue_, memory.light, CL_TRUE, 0, bytes(), host_.data(), 0,
                                      nullptr, nullptr));
        ::glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, static_cast<GLsizei>(kWidth),
                          static_cast<GLsizei>(kHeight), GL_RGBA, GL_FLOAT, host_.data());
        ::glBindTexture(GL_TEXTURE_2D, 0);
    }

    /// The kernels alone, on memory of the device.
    double secondsOfKernels() {
        Memory const memory(*this, CL_MEM_READ_WRITE | CL_MEM_COPY_HOST_PTR, host_.data());
        return oru_bench::Seconds([&] {
            launch(memory);
            Check(cl_.clFinish(queue_));
        });
    }

private:
    /// What the kernels work on, for a scope.
    struct Memory {
        /// @param host what the picture is filled with, if anything
        Memory(RawSharpener &sharpener, cl_mem_flags flags, float *host)
            : cl(sharpener.cl_), light(sharpener.buffer(flags, sharpener.bytes(), host)),
              rows(sharpener.buffer(CL_MEM_READ_WRITE, sharpener.bytes(), nullptr)),
              weights(sharpener.buffer(CL_MEM_READ_ONLY | CL_MEM_COPY_HOST_PTR,
                                       sharpener.weights_.size() * sizeof(float),
                                       sharpener.weights_.data())) {}
        ~Memory() {
            for (cl_mem const memory : {light, rows, weights})
                cl.clReleaseMemObject(memory);
        }
        Memory(Memory const &) = delete;
        Memory &operator=(Memory const &) = delete;

        ORU::OCL::FunctionTable const &cl;
        cl_mem light, rows, weights;
    };

    std::size_t bytes() const { return host_.size() * sizeof(float); }

    cl_mem buffer(cl_mem_flags flags, std::size_t size, float *host) {
        cl_int code = CL_SUCCESS;
        cl_mem const memory = cl_.clCreateBuffer(context_, flags, size, host, &code);
        Check(code);
        return memory;
    }

    void launch(Memory const &memory) {
        auto const taps = static_cast<cl_int>(weights_.size());
        cl_int const size[2] = {static_cast<cl_int>(kWidth), static_cast<cl_int>(kHeight)};
        auto const amount = static_cast<float>(kSharpening.amount);
        auto const colours = ColourMask(3);
        for (cl_kernel const kernel : {blurRows_, sharpenColumns_}) {
            Check(cl_.clSetKernelArg(kernel, 0, sizeof memory.light, &memory.light));
            Check(cl_.clSetKernelArg(kernel, 1, sizeof memory.rows, &memory.rows));
            Check(cl_.clSetKernelArg(kernel, 2, sizeof size, size));
            Check(cl_.clSetKernelArg(kernel, 3, sizeof memory.weights, &memory.weights));
            Check(cl_.clSetKernelArg(kernel, 4, sizeof taps, &taps));
        }
        Check(cl_.clSetKernelArg(sharpenColumns_, 5, sizeof amount, &amount));
        Check(cl_.clSetKernelArg(sharpenColumns_, 6, sizeof colours, colours.data()));
        static constexpr std::size_t kGlobal[2] = {kWidth, kHeight};
        static constexpr std::size_t kLocal[2] = {16, 4};
        for (cl_kernel const kernel : {blurRows_, sharpenColumns_})
            Check(cl_.clEnqueueNDRangeKernel(queue_, kernel, 2, nullptr, kGlobal, kLocal, 0,
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
    sharpener.sharpen(light, 3, kSharpening); // compiles what is compiled at first use
    raw.sharpen(light->objectID());

    std::vector<double> base, stage;
    {
        oru_bench::Comparison comparison(state);
        while (state.KeepRunning()) {
            base.push_back(oru_bench::Seconds([&] { raw.sharpen(light->objectID()); }));
            stage.push_back(oru_bench::Seconds([&] { sharpener.sharpen(light, 3, kSharpening); }));
            comparison.add(base.back(), stage.back());
        }
    }
    state.counters["raw_Mpx_s"] = kMegapixels / oru_bench::Median(base);
    state.counters["oru_Mpx_s"] = kMegapixels / oru_bench::Median(stage);
    state.counters["kernels_Mpx_s"] = kMegapixels / raw.secondsOfKernels();
}
BENCHMARK(SharpenStage)->UseManualTime()->Iterations(15)->Unit(benchmark::kMillisecond);

} // namespace
