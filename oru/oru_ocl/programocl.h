// OpenCL programs: what is built for a device from source or binaries.
#pragma once

#include "oru/oru_ocl/contextocl.h"
#include "oru/oru_ocl/kernel.h"

#include <string>
#include <vector>

namespace ORU::OCL {

/// A program in OpenCL C, or its binaries; it keeps its context alive.
///
/// The operations throw ExceptionOCL when the runtime refuses.
class ORU_API Program : public OpenCLObjectWrapper<cl_program> {
public:
    class BinaryArray;

    /// What `buildStatus` tells.
    enum BuildStatus : int {
        BUILD_STATUS_NONE = 0,       ///< never built for the device
        BUILD_STATUS_ERROR = 1,      ///< failed; see `buildLog`
        BUILD_STATUS_SUCCESS = 2,    ///< kernels can be made
        BUILD_STATUS_IN_PROGRESS = 3 ///< goes on, see `buildAsync`
    };

    /// Called by the runtime when a build has ended; possibly on a thread of the runtime.
    using NotifyCallback = OCL::NotifyCallback<void(CL_CALLBACK *)(cl_program, void *)>;

    /// From source (clCreateProgramWithSource).
    /// @param source OpenCL C, up to its first NUL
    Program(Context const &context, std::string const &source);

    /// From the binaries of an earlier build (clCreateProgramWithBinary).
    Program(Context const &context, BinaryArray const &binaries);

    /// @name Over a handle that was made elsewhere
    /// The context is asked for (clGetProgramInfo).
    /// @{
    Program(cl_program handle, take_ref_tag const &tag);
    Program(cl_program handle, add_ref_tag const &tag);
    /// @}

    /// Builds for all devices of the context and returns when that is done (clBuildProgram).
    /// @param options the compiler's command line, such as "-D SIZE=4 -cl-fast-relaxed-math"
    /// @throws ExceptionOCL CL_BUILD_PROGRAM_FAILURE when the source is wrong; `buildLog` then
    ///     tells why, and the program can be built again with other options
    void build(std::string const &options);

    /// Builds for some devices of the context.
    void build(std::vector<Device> const &devices, std::string const &options);

    /// Starts a build, which may go on after the return; the callback tells its end.
    void buildAsync(std::vector<Device> const &devices, std::string const &options,
                    NotifyCallback const &callback);

    /// What the compiler said about the last build for a device (clGetProgramBuildInfo).
    std::string buildLog(Device const &device);

    /// How the last build for a device ended (clGetProgramBuildInfo).
    BuildStatus buildStatus(Device const &device);

    /// A new kernel for a function of the built program (clCreateKernel).
    Kernel kernel(std::string const &name) const;

    /// A new kernel for every function of the built program (clCreateKernelsInProgram).
    std::vector<Kernel> kernels() const;

private:
    void build(std::vector<Device> const &devices, std::string const &options,
               NotifyCallback const &callback);

    static BuildStatus OCLBuildStatus(int status);
    static int OpenCLBuildStatus(BuildStatus status); ///< has its place in the binary interface

    Context context_;
    std::string source_;
    std::string annotation_; ///< empty; has its place in the binary interface
};

/// The binaries of a program, one per device.
class ORU_API Program::BinaryArray {
public:
    /// Copies the three lists.
    /// @param sizes bytes of each binary
    /// @throws InternalException when the lists are not of one length, or a size is larger than its
    ///         binary
    BinaryArray(std::vector<Device> const &devices, std::vector<std::size_t> const &sizes,
                std::vector<std::vector<unsigned char>> const &binaries);

    /// Copies one size and that many bytes of a binary for each device.
    BinaryArray(std::vector<cl_device_id> const &devices, std::size_t const *sizes,
                unsigned char const **binaries);

    /// The devices, in the order of the binaries.
    std::vector<cl_device_id> const &devices() const { return devices_; }

    /// Number of devices.
    std::size_t nBinary() const { return devices_.size(); }

    /// Bytes of each binary, `nBinary()` of them.
    std::size_t const *sizes() const { return sizes_.data(); }

    /// The first byte of each binary, valid as long as this object lives unchanged.
    std::vector<unsigned char const *> binaries() const;

private:
    std::vector<cl_device_id> devices_;
    std::vector<std::size_t> sizes_;
    std::vector<std::vector<unsigned char>> binaries_;
};

} // namespace ORU::OCL
