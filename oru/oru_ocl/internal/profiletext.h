// The profile that a runtime names.
#pragma once

#include "oru/oru_ocl/profile.h"

#include <string>

namespace ORU::OCL {

inline Enum::Profile ProfileOf(std::string const &text) {
    if (text == "FULL_PROFILE")
        return Enum::PROFILE_FULL;
    return text == "EMBEDDED_PROFILE" ? Enum::PROFILE_EMBEDDED : Enum::PROFILE_OTHER;
}

} // namespace ORU::OCL
