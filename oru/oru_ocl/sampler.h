// OpenCL samplers: how kernels read images.
#pragma once

#include "oru/oru_ocl/contextocl.h"

namespace ORU::OCL {

/// How kernels read an image between and beyond its pixels.
///
/// The operations throw ExceptionOCL when the runtime refuses.
class ORU_API Sampler : public OpenCLObjectWrapper<cl_sampler> {
public:
    /// What lies beyond the edges.
    enum SamplerAddressingMode : int {
        ADDRESS_NONE = 0,
        ADDRESS_REPEAT = 1,
        ADDRESS_CLAMP = 2,
        ADDRESS_CLAMP_TO_EDGE = 3
    };

    enum SamplerFilterMode : int { FILTER_NEAREST = 0, FILTER_LINEAR = 1 };

    /// Makes a sampler (clCreateSampler).
    /// @param normalizedCoordinates whether coordinates go from 0 to 1 instead of counting pixels
    /// @throws InternalException for a mode outside the enumerations
    Sampler(Context const &context, bool normalizedCoordinates, SamplerAddressingMode addressing,
            SamplerFilterMode filter);

    /// @name Over a handle that was made elsewhere
    /// @{
    Sampler(cl_sampler handle, take_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    Sampler(cl_sampler handle, add_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    /// @}

    // Properties (clGetSamplerInfo). InternalException for a mode that OpenCL 1.0 does not have.
    SamplerAddressingMode addressingMode() const;
    SamplerFilterMode filterMode() const;
    bool usesNormalizedCoordinates() const;

    /// @throws InternalException "Not implemented.", always
    Context context() const;

protected:
    // Library to OpenCL, and back; InternalException for a value that has no counterpart.
    static unsigned int OpenCLAddressingMode(SamplerAddressingMode mode);
    static unsigned int OpenCLFilterMode(SamplerFilterMode mode);
    static SamplerAddressingMode OCLAddressingMode(unsigned int mode);
    static SamplerFilterMode OCLFilterMode(unsigned int mode);

private:
    unsigned int info(cl_sampler_info query) const;
};

} // namespace ORU::OCL
