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
        ADDRESS_NONE = 0,   ///< CL_ADDRESS_NONE: the kernel never reads beyond
        ADDRESS_REPEAT = 1, ///< CL_ADDRESS_REPEAT: the image again, for normalized coordinates
        ADDRESS_CLAMP = 2,  ///< CL_ADDRESS_CLAMP: the border colour
        ADDRESS_CLAMP_TO_EDGE = 3 ///< CL_ADDRESS_CLAMP_TO_EDGE: the nearest pixel
    };

    /// What lies between the pixels.
    enum SamplerFilterMode : int {
        FILTER_NEAREST = 0, ///< CL_FILTER_NEAREST
        FILTER_LINEAR = 1   ///< CL_FILTER_LINEAR
    };

    /// Makes a sampler (clCreateSampler).
    /// @param normalizedCoordinates whether coordinates go from 0 to 1 instead of counting pixels
    /// @throws InternalException for a mode outside the enumerations
    Sampler(Context const &context, bool normalizedCoordinates, SamplerAddressingMode addressing,
            SamplerFilterMode filter);

    /// @name Over a handle that was made elsewhere
    /// The tag tells whose reference the object holds.
    /// @{
    Sampler(cl_sampler handle, take_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    Sampler(cl_sampler handle, add_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    /// @}

    /// @name Properties
    /// clGetSamplerInfo.
    /// @throws InternalException for a mode that OpenCL 1.0 does not have
    /// @{
    SamplerAddressingMode addressingMode() const;
    SamplerFilterMode filterMode() const;
    bool usesNormalizedCoordinates() const;
    /// @}

    /// The context, which is not told.
    /// @throws InternalException "Not implemented.", always
    Context context() const;

protected:
    /// @name Translations to and from OpenCL's constants
    /// @throws InternalException for a value that has no counterpart
    /// @{
    static unsigned int OpenCLAddressingMode(SamplerAddressingMode mode);
    static unsigned int OpenCLFilterMode(SamplerFilterMode mode);
    static SamplerAddressingMode OCLAddressingMode(unsigned int mode);
    static SamplerFilterMode OCLFilterMode(unsigned int mode);
    /// @}

private:
    unsigned int info(cl_sampler_info query) const;
};

} // namespace ORU::OCL
