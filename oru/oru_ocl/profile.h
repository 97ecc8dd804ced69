// The profiles of OpenCL.
#pragma once

namespace ORU::OCL::Enum {

/// How much of OpenCL a platform or device offers.
enum Profile {
    PROFILE_OTHER = 0,   ///< neither of the two below
    PROFILE_FULL = 1,    ///< FULL_PROFILE
    PROFILE_EMBEDDED = 2 ///< EMBEDDED_PROFILE
};

} // namespace ORU::OCL::Enum
