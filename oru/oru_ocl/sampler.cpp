// OpenCL samplers: how kernels read images.
#include "oru/oru_ocl/sampler.h"

#include "oru/core/utility/enumtable.h"
#include "oru/oru_ocl/clcall.h"

namespace ORU::OCL {

namespace {

constexpr EnumTable<Sampler::SamplerAddressingMode, cl_addressing_mode, 4> kAddressingModes = {
    {{Sampler::ADDRESS_NONE, CL_ADDRESS_NONE},
     {Sampler::ADDRESS_REPEAT, CL_ADDRESS_REPEAT},
     {Sampler::ADDRESS_CLAMP, CL_ADDRESS_CLAMP},
     {Sampler::ADDRESS_CLAMP_TO_EDGE, CL_ADDRESS_CLAMP_TO_EDGE}}};
static_assert(kAddressingModes.isInOrder());

constexpr EnumTable<Sampler::SamplerFilterMode, cl_filter_mode, 2> kFilterModes = {
    {{Sampler::FILTER_NEAREST, CL_FILTER_NEAREST}, {Sampler::FILTER_LINEAR, CL_FILTER_LINEAR}}};
static_assert(kFilterModes.isInOrder());

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
    return kAddressingModes.constant(mode, ORU_ENUM_FAILURE("Unknown OCL addressing mode."));
}

unsigned int Sampler::OpenCLFilterMode(SamplerFilterMode mode) {
    return kFilterModes.constant(mode, ORU_ENUM_FAILURE("Unknown OCL filter mode."));
}

Sampler::SamplerAddressingMode Sampler::OCLAddressingMode(unsigned int mode) {
    return kAddressingModes.value(mode, ORU_ENUM_FAILURE("Unknown OpenCL addressing mode."));
}

Sampler::SamplerFilterMode Sampler::OCLFilterMode(unsigned int mode) {
    return kFilterModes.value(mode, ORU_ENUM_FAILURE("Unknown OpenCL filter mode."));
}

} // namespace ORU::OCL
