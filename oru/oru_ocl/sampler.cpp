// OpenCL samplers: how kernels read images.
#include "oru/oru_ocl/sampler.h"

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/internal/enumtable.h"

namespace ORU::OCL {

namespace {

constexpr unsigned int addressingModes[] = {
    CL_ADDRESS_NONE,
    CL_ADDRESS_REPEAT,
    CL_ADDRESS_CLAMP,
    CL_ADDRESS_CLAMP_TO_EDGE,
};

constexpr unsigned int filterModes[] = {CL_FILTER_NEAREST, CL_FILTER_LINEAR};

template<std::size_t Size>
unsigned int ToOpenCL(unsigned int const (&modes)[Size], int mode, char const *failure) {
    unsigned int const constant = ConstantOr(modes, mode, 0u);
    if (constant == 0)
        ORU_THROW_INTERNAL(failure);
    return constant;
}

template<std::size_t Size>
int FromOpenCL(unsigned int const (&modes)[Size], unsigned int constant, char const *failure) {
    int const mode = IndexOf(modes, constant);
    if (mode == static_cast<int>(Size))
        ORU_THROW_INTERNAL(failure);
    return mode;
}

} // namespace

Sampler::Sampler(Context const &context, bool normalizedCoordinates,
                 SamplerAddressingMode addressing, SamplerFilterMode filter) {
    unsigned int const addressingMode = OpenCLAddressingMode(addressing);
    unsigned int const filterMode = OpenCLFilterMode(filter);
    adopt(ORU_CL(CreateSampler, context.id(), normalizedCoordinates, addressingMode, filterMode));
}

unsigned int Sampler::info(cl_sampler_info query) const {
    unsigned int value = 0;
    ORU_CL(GetSamplerInfo, id(), query, sizeof value, &value, nullptr);
    return value;
}

Sampler::SamplerAddressingMode Sampler::addressingMode() const {
    return OCLAddressingMode(info(CL_SAMPLER_ADDRESSING_MODE));
}

Sampler::SamplerFilterMode Sampler::filterMode() const {
    return OCLFilterMode(info(CL_SAMPLER_FILTER_MODE));
}

bool Sampler::usesNormalizedCoordinates() const {
    return info(CL_SAMPLER_NORMALIZED_COORDS) != 0;
}

Context Sampler::context() const {
    ORU_THROW_INTERNAL("Not implemented.");
}

unsigned int Sampler::OpenCLAddressingMode(SamplerAddressingMode mode) {
    return ToOpenCL(addressingModes, mode, "Unknown OCL addressing mode.");
}

unsigned int Sampler::OpenCLFilterMode(SamplerFilterMode mode) {
    return ToOpenCL(filterModes, mode, "Unknown OCL filter mode.");
}

Sampler::SamplerAddressingMode Sampler::OCLAddressingMode(unsigned int mode) {
    return static_cast<SamplerAddressingMode>(
        FromOpenCL(addressingModes, mode, "Unknown OpenCL addressing mode."));
}

Sampler::SamplerFilterMode Sampler::OCLFilterMode(unsigned int mode) {
    return static_cast<SamplerFilterMode>(
        FromOpenCL(filterModes, mode, "Unknown OpenCL filter mode."));
}

} // namespace ORU::OCL
