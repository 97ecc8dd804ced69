// Developing by OpenCL against the same kernels called by the plain C functions.
#include "apps/develop/gaussian.h"
#include "apps/develop/opencldeveloper.h"
#include "bench/comparison.h"

#include "oru/oru_ocl/extensionmanagerocl.h"

#include <stdexcept>

using namespace Develop;

namespace {

constexpr App::Shape kShape = {4000, 125, 3, 8};
constexpr std::size_t kReach = 5;
constexpr std::size_t kRows = kShape.height + 2 * kReach;
constexpr std::size_t kSpan = 512;
constexpr double kMegapixels = 4000 * 125 / 1e6;

void Check(cl_int code) {
    if (code != CL_SUCCESS)
        throw std::runtime_error("OpenCL error " + std::to_string(code));
}

/// A band of a picture, and how to develop it.
struct Work {
    Work() : task(Whole(), ColourSpace::Srgb(), RecipeOf()), tile(MakeTile()) {
        photo.hold({0, kRows}, kShape);
        developed.hold({kReach, kReach + kShape.height}, kShape);
    }

    static App::Shape Whole() {
        App::Shape whole = kShape;
        whole.height = kRows;
        return whole;
    }
    static Recipe const &RecipeOf() {
        static Recipe const kRecipe = [] {
            Recipe sharpened;
            sharpened.sharpening = {0.8, 1.5};
            return sharpened;
        }();
        return kRecipe;
    }
    static Tile MakeTile() {
        return {PixelRect(0, kReach, kShape.width, kShape.height),
                PixelRect(0, 0, kShape.width, kRows)};
    }

    Task task;
    Tile tile;
    Band photo, developed;
};

/// The work without the library: C functions.
class RawDeveloper {
public:
    RawDeveloper(OpenCLDevice const &device, Work &work)
        : cl_(ORU::OCL::ExtensionManager::instance()->table()), work_(work),
          arguments_(ToKernel(work.task, work.tile)) {
        cl_device_id const id = device.device.id();
        cl_context_properties const properties[] = {
            CL_CONTEXT_PLATFORM, reinterpret_cast<cl_context_properties>(device.platform.id()), 0};
        cl_int code = CL_SUCCESS;
        context_ = cl_.clCreateContext(properties, 1, &id, nullptr, nullptr, &code);
        Check(code);
        queue_ = cl_.clCreateCommandQueue(context_, id, 0, &code);
        Check(code);
        char const *source = kDevelopKernels;
        program_ = cl_.clCreateProgramWithSource(context_, 1, &source, nullptr, &code);
        Check(code);
        Check(cl_.clBuildProgram(program_, 0, nullptr, "-D SPAN=512 -D BITS=8", nullptr, nullptr));
        makeMemory();
        makeKernels();
    }
    ~RawDeveloper() {
        for (cl_kernel const kernel : {decode_, blurRows_, encode_})
            cl_.clReleaseKernel(kernel);
        for (cl_mem const memory :
             {tile_, codes_, lights_, light_, weights_, rows_, index_, thresholds_, developed_})
            cl_.clReleaseMemObject(memory);
        cl_.clReleaseProgram(program_);
        cl_.clReleaseCommandQueue(queue_);
        cl_.clReleaseContext(context_);
    }
    RawDeveloper(RawDeveloper const &) = delete;
    RawDeveloper &operator=(RawDeveloper const &) = delete;

    void develop() {
        write(tile_, sizeof arguments_, &arguments_);
        write(codes_, kRows * kShape.rowBytes(), work_.photo.row(0));
        launch();
        Check(cl_.clEnqueueReadBuffer(queue_, developed_, CL_TRUE, 0,
                                      kShape.height * kShape.rowBytes(),
                                      work_.developed.row(kReach), 0, nullptr, nullptr));
    }

    /// The kernels alone, on memory of the device.
    double secondsOfKernels() {
        return oru_bench::Seconds([&] {
            launch();
            Check(cl_.clFinish(queue_));
        });
    }

private:
    cl_mem buffer(std::size_t size) {
        cl_int code = CL_SUCCESS;
        cl_mem const memory = cl_.clCreateBuffer(context_, CL_MEM_READ_WRITE, size, nullptr, &code);
        Check(code);
        return memory;
    }

    void write(cl_mem memory, std::size_t size, void const *values) {
        Check(cl_.clEnqueueWriteBuffer(queue_, memory, CL_TRUE, 0, size, values, 0, nullptr,
                                       nullptr));
    }

    template<class T>
    cl_mem buffer(std::vector<T> const &values) {
        cl_mem const memory = buffer(values.size() * sizeof(T));
        write(memory, values.size() * sizeof(T), values.data());
        return memory;
    }

    void makeMemory() {
        std::size_t const light =
            (kShape.width + 2 * kReach) * kRows * kShape.channels * sizeof(float);
        tile_ = buffer(sizeof arguments_);
        codes_ = buffer(kRows * kShape.rowBytes());
        light_ = buffer(light);
        rows_ = buffer(light);
        developed_ = buffer(kShape.height * kShape.rowBytes());
        lights_ = buffer(work_.task.tables.lights);
        index_ = buffer(work_.task.tables.index);
        thresholds_ = buffer(work_.task.tables.thresholds);
        weights_ = buffer(GaussianWeights(work_.task.recipe.sharpening.sigma));
    }

    cl_kernel kernel(char const *name, std::vector<cl_mem> const &arguments) {
        cl_int code = CL_SUCCESS;
        cl_kernel const made = cl_.clCreateKernel(program_, name, &code);
        Check(code);
        for (std::size_t i = 0; i < arguments.size(); ++i)
            Check(cl_.clSetKernelArg(made, static_cast<cl_uint>(i), sizeof(cl_mem), &arguments[i]));
        return made;
    }

    void makeKernels() {
        decode_ = kernel("decode8", {tile_, codes_, lights_, light_});
        blurRows_ = kernel("blurRows", {tile_, light_, weights_, rows_});
        encode_ = kernel("encode8", {tile_, codes_, light_, rows_, weights_, weights_, weights_,
                                     index_, thresholds_, developed_});
    }

    void launch() {
        launch(decode_, kShape.width + 2 * kReach, kRows);
        launch(blurRows_, kShape.width, kRows);
        launch(encode_, kShape.width, kShape.height);
    }

    void launch(cl_kernel kernel, std::size_t width, std::size_t height) {
        std::size_t const global[2] = {(width + kSpan - 1) / kSpan, height};
        static constexpr std::size_t kLocal[2] = {1, 1};
        Check(cl_.clEnqueueNDRangeKernel(queue_, kernel, 2, nullptr, global, kLocal, 0, nullptr,
                                         nullptr));
    }

    ORU::OCL::FunctionTable const &cl_;
    Work &work_;
    KernelTile arguments_;
    cl_context context_ = nullptr;
    cl_command_queue queue_ = nullptr;
    cl_program program_ = nullptr;
    cl_mem tile_ = nullptr, codes_ = nullptr, lights_ = nullptr, light_ = nullptr,
           weights_ = nullptr, rows_ = nullptr, index_ = nullptr, thresholds_ = nullptr,
           developed_ = nullptr;
    cl_kernel decode_ = nullptr, blurRows_ = nullptr, encode_ = nullptr;
};

// A band from codes to codes: written, three kernels, read back. `kernels_Mpx_s` is the speed of
// the kernels alone.
void SharpenBand(benchmark::State &state) {
    OpenCLRuntime const runtime{std::string()};
    std::vector<OpenCLDevice> const devices = runtime.devices();
    if (devices.empty()) {
        state.SkipWithError("no OpenCL device");
        return;
    }
    Work work;
    OpenCLDeveloper developer(devices.front());
    RawDeveloper raw(devices.front(), work);
    developer.begin(work.task);
    developer.develop(work.photo, work.tile, work.developed); // compiles at first use
    raw.develop();

    std::vector<double> base, library;
    {
        oru_bench::Comparison comparison(state);
        while (state.KeepRunning()) {
            base.push_back(oru_bench::Seconds([&] { raw.develop(); }));
            library.push_back(oru_bench::Seconds(
                [&] { developer.develop(work.photo, work.tile, work.developed); }));
            comparison.add(base.back(), library.back());
        }
    }
    state.counters["raw_Mpx_s"] = kMegapixels / oru_bench::Median(base);
    state.counters["oru_Mpx_s"] = kMegapixels / oru_bench::Median(library);
    state.counters["kernels_Mpx_s"] = kMegapixels / raw.secondsOfKernels();
}
BENCHMARK(SharpenBand)->UseManualTime()->Iterations(50)->Unit(benchmark::kMillisecond);

} // namespace
