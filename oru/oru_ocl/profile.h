// The profiles of OpenCL.
#pragma once

// windows.h has a macro of this name. Include it before this header, or the name means the macro.
#undef PROFILE_EMBEDDED

namespace ORU::OCL::Enum {

/// How much of OpenCL a platform or device offers.
enum Profile {
    PROFILE_OTHER = 0,   ///< neither of the two below
    PROFILE_FULL = 1,    ///< FULL_PROFILE
    PROFILE_EMBEDDED = 2 ///< EMBEDDED_PROFILE
};

} // namespace ORU::OCL::Enum
