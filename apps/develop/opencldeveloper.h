// Developing by OpenCL alone.
#pragma once

#include "apps/develop/developer.h"
#include "apps/develop/openclkernels.h"
#include "apps/develop/openclprogram.h"
#include "apps/develop/openclruntime.h"

#include "oru/oru_ocl/commandqueue.h"

#include <future>
#include <map>
#include <vector>

namespace Develop {

/// Kernels from codes to codes, for devices that do not share with OpenGL: nothing goes through
/// OpenGL.
class OpenCLDeveloper : public Developer {
public:
    /// Begins to make the kernels for pictures of 8 bits ready, on a thread of its own.
    /// @throws ORU::LogicalException when the device refuses
    explicit OpenCLDeveloper(OpenCLDevice const &device);
    ~OpenCLDeveloper() override;

    std::string description() const override {
        return "OpenCL on " + device_.name + ", like all else";
    }
    std::size_t sizeLimit() const override;
    void begin(Task const &task) override;
    void develop(Band const &photo, Tile const &tile, Band &developed) override;

private:
    /// The kernels for pictures of some number of bits.
    struct Kernels {
        Kernels(ORU::OCL::Program const &program, unsigned int bits);
        ORU::OCL::Kernel decode, blurRows, paintSpots, encode;
    };

    Kernels &kernels(unsigned int bits);
    void warmUp(unsigned int bits);
    void load(Task const &task);
    template<class T>
    void fill(ReusedBuffer &buffer, std::vector<T> const &values);

    void upload(Band const &photo, Tile const &tile);
    bool uploadSpots(Tile const &tile);
    void setArguments(Kernels &kernels);
    void launch(ORU::OCL::Kernel const &kernel, std::size_t width, std::size_t height);
    void readBack(Tile const &tile, Band &developed);
    unsigned char *hostMemory(std::size_t bytes);

    OpenCLDevice device_;
    std::size_t span_; ///< pixels of a work item
    ORU::OCL::Context context_;
    ORU::OCL::CommandQueue queue_;
    std::map<unsigned int, Kernels> kernels_;

    Task const *task_ = nullptr;
    ReusedBuffer lights_, index_, thresholds_, weights_, matrix_; ///< of the picture
    ReusedBuffer tile_, spots_;
    ReusedBuffer codes_, light_, rows_, stops_, developed_;
    std::vector<unsigned char> host_; ///< rows that are shorter than the picture's

    std::future<void> warmUp_; ///< uses all the others until it has ended
};

/// What the kernels are told of a tile, but for its spots.
KernelTile ToKernel(Task const &task, Tile const &tile);

} // namespace Develop
