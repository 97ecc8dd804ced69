// Developing by OpenCL alone.
#include "apps/develop/opencldeveloper.h"

#include "apps/develop/gaussian.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>

namespace Develop {

namespace OCL = ORU::OCL;

namespace {

// A processor's compiler makes vector code of loops; a GPU has a work item for each pixel.
constexpr std::size_t kSpanOfProcessors = 512;

std::size_t PixelsOf(ORU::IntegerRect const &area) {
    return area.width() * area.height();
}

KernelSpot ToKernel(Spot const &spot) {
    double const x = std::floor(spot.x), y = std::floor(spot.y);
    return {static_cast<std::int32_t>(x),    static_cast<std::int32_t>(y),
            static_cast<float>(spot.x - x),  static_cast<float>(spot.y - y),
            static_cast<float>(spot.radius), static_cast<float>(spot.stops)};
}

} // namespace

OpenCLDeveloper::Kernels::Kernels(OCL::Program const &program, unsigned int bits)
    : decode(program.kernel("decode" + std::to_string(bits))), blurRows(program.kernel("blurRows")),
      paintSpots(program.kernel("paintSpots")),
      encode(program.kernel("encode" + std::to_string(bits))) {}

OpenCLDeveloper::OpenCLDeveloper(OpenCLDevice const &device)
    : device_(device), span_(device.device.type() & OCL::Device::TYPE_CPU ? kSpanOfProcessors : 1),
      context_(OCL::ContextProperties(device.platform), device.device),
      queue_(context_, device.device, false, false) {
    warmUp_ = std::async(std::launch::async, [this] { warmUp(8); });
}

OpenCLDeveloper::~OpenCLDeveloper() = default;

std::size_t OpenCLDeveloper::sizeLimit() const {
    return std::numeric_limits<std::int16_t>::max(); // far from where the kernels' ints end
}

OpenCLDeveloper::Kernels &OpenCLDeveloper::kernels(unsigned int bits) {
    auto const found = kernels_.find(bits);
    if (found != kernels_.end())
        return found->second;
    std::string const options =
        "-D SPAN=" + std::to_string(span_) + " -D BITS=" + std::to_string(bits);
    OCL::Program const program = BuildProgram(context_, device_.device, kDevelopKernels, options);
    return kernels_.emplace(bits, Kernels(program, bits)).first->second;
}

// Runtimes compile again for the first launch, so that a building alone is not enough.
void OpenCLDeveloper::warmUp(unsigned int bits) {
    Recipe recipe;
    recipe.sharpening.amount = 1;
    Task const task({1, 1, 3, bits}, ColourSpace::Srgb(), recipe);
    Band photo, developed;
    photo.hold({0, 1}, task.shape);
    developed.hold({0, 1}, task.shape);
    load(task);
    develop(photo, {PixelRect(0, 0, 1, 1), PixelRect(0, 0, 1, 1)}, developed);
}

template<class T>
void OpenCLDeveloper::fill(ReusedBuffer &buffer, std::vector<T> const &values) {
    std::size_t const bytes = values.size() * sizeof(T);
    OCL::Buffer &target = buffer.reserve(context_, std::max(bytes, sizeof(T)));
    if (bytes > 0)
        queue_.enqueueBlockingWrite(target, 0, bytes, values.data());
}

void OpenCLDeveloper::begin(Task const &task) {
    if (warmUp_.valid())
        warmUp_.get();
    load(task);
}

void OpenCLDeveloper::load(Task const &task) {
    task_ = &task;
    fill(lights_, task.tables.lights);
    fill(index_, task.tables.index);
    fill(thresholds_, task.tables.thresholds);
    fill(weights_, task.recipe.sharpening.isOn() ? GaussianWeights(task.recipe.sharpening.sigma)
                                                 : std::vector<float>(1));
    std::vector<float> matrix(9);
    if (task.matrix)
        for (std::size_t i = 0; i < matrix.size(); ++i)
            matrix[i] = static_cast<float>((*task.matrix)[i / 3][i % 3]);
    fill(matrix_, matrix);
}

KernelTile ToKernel(Task const &task, Tile const &tile) {
    auto const integer = [](std::size_t value) { return static_cast<std::int32_t>(value); };
    App::Shape const &shape = task.shape;
    CodeTables const &tables = task.tables;
    KernelTile arguments = {};
    arguments.width = integer(tile.source.width());
    arguments.height = integer(tile.source.height());
    arguments.channels = integer(shape.channels);
    arguments.colours = integer(shape.channels - (shape.hasAlpha() ? 1 : 0));
    arguments.reach = integer(task.recipe.reach());
    arguments.left = tile.target.offset().x - tile.source.offset().x;
    arguments.top = tile.target.offset().y - tile.source.offset().y;
    arguments.targetWidth = integer(tile.target.width());
    arguments.targetHeight = integer(tile.target.height());
    arguments.x = tile.target.offset().x;
    arguments.y = tile.target.offset().y;
    arguments.tables = integer(tables.curves);
    arguments.levels = integer(tables.levels);
    arguments.indices = integer(tables.indices);
    arguments.steps = integer(tables.steps);
    arguments.isLinear = tables.isLinear;
    arguments.becomesLinear = tables.becomesLinear;
    arguments.hasMatrix = task.matrix.has_value();
    arguments.amount = static_cast<float>(task.recipe.sharpening.amount);
    arguments.exposure = static_cast<float>(task.recipe.exposure);
    arguments.gain = static_cast<float>(std::exp2(task.recipe.exposure));
    return arguments;
}

void OpenCLDeveloper::develop(Band const &photo, Tile const &tile, Band &developed) {
    Kernels &kernels = this->kernels(task_->shape.bitsPerChannel);
    upload(photo, tile);
    std::size_t const reach = task_->recipe.reach();
    std::size_t const values =
        (tile.source.width() + 2 * reach) * tile.source.height() * task_->shape.channels;
    light_.reserve(context_, values * sizeof(float));
    rows_.reserve(context_, values * sizeof(float));
    stops_.reserve(context_, PixelsOf(tile.target) * sizeof(float));
    developed_.reserve(context_, PixelsOf(tile.target) * task_->shape.bytesPerPixel());
    bool const hasSpots = uploadSpots(tile);
    setArguments(kernels);

    launch(kernels.decode, tile.source.width() + 2 * reach, tile.source.height());
    if (reach > 0)
        launch(kernels.blurRows, tile.source.width(), tile.source.height());
    if (hasSpots)
        launch(kernels.paintSpots, tile.target.width(), tile.target.height());
    launch(kernels.encode, tile.target.width(), tile.target.height());
    readBack(tile, developed);
}

void OpenCLDeveloper::upload(Band const &photo, Tile const &tile) {
    std::size_t const rowBytes = tile.source.width() * task_->shape.bytesPerPixel();
    std::size_t const bytes = rowBytes * tile.source.height();
    unsigned char const *codes = photo.at(tile.source);
    if (rowBytes != photo.rowBytes()) {
        codes = hostMemory(bytes);
        for (std::size_t y = 0; y < tile.source.height(); ++y)
            std::copy_n(photo.at(tile.source) + y * photo.rowBytes(), rowBytes,
                        host_.data() + y * rowBytes);
    }
    queue_.enqueueBlockingWrite(codes_.reserve(context_, bytes), 0, bytes, codes);
}

unsigned char *OpenCLDeveloper::hostMemory(std::size_t bytes) {
    if (host_.size() < bytes)
        host_.resize(bytes);
    return host_.data();
}

bool OpenCLDeveloper::uploadSpots(Tile const &tile) {
    std::vector<KernelSpot> spots;
    for (Spot const &spot : task_->recipe.spots)
        if (Touches(spot, tile.target))
            spots.push_back(ToKernel(spot));
    fill(spots_, spots);
    KernelTile arguments = ToKernel(*task_, tile);
    arguments.spots = static_cast<std::int32_t>(spots.size());
    fill(tile_, std::vector<KernelTile>{arguments});
    return !spots.empty();
}

void OpenCLDeveloper::setArguments(Kernels &kernels) {
    auto const set = [](OCL::Kernel &kernel, std::initializer_list<ReusedBuffer *> buffers) {
        unsigned int index = 0;
        for (ReusedBuffer *const buffer : buffers)
            kernel.setArg(index++, buffer->get());
    };
    set(kernels.decode, {&tile_, &codes_, &lights_, &light_});
    set(kernels.blurRows, {&tile_, &light_, &weights_, &rows_});
    set(kernels.paintSpots, {&tile_, &spots_, &stops_});
    set(kernels.encode, {&tile_, &codes_, &light_, &rows_, &weights_, &stops_, &matrix_, &index_,
                         &thresholds_, &developed_});
}

void OpenCLDeveloper::launch(OCL::Kernel const &kernel, std::size_t width, std::size_t height) {
    // On a processor groups of one item: their loops are what is to become vector code.
    OCL::Range<2> const group = span_ > 1 ? OCL::Range<2>(1, 1) : OCL::Range<2>(0);
    queue_.enqueueKernel(kernel, OCL::Range<2>((width + span_ - 1) / span_, height), group, 0);
}

void OpenCLDeveloper::readBack(Tile const &tile, Band &developed) {
    std::size_t const rowBytes = tile.target.width() * task_->shape.bytesPerPixel();
    std::size_t const bytes = rowBytes * tile.target.height();
    if (rowBytes == developed.rowBytes()) {
        queue_.enqueueBlockingRead(developed_.get(), 0, bytes, developed.at(tile.target));
        return;
    }
    queue_.enqueueBlockingRead(developed_.get(), 0, bytes, hostMemory(bytes));
    for (std::size_t y = 0; y < tile.target.height(); ++y)
        std::copy_n(host_.data() + y * rowBytes, rowBytes,
                    developed.at(tile.target) + y * developed.rowBytes());
}

} // namespace Develop
