// A place where a host leaves a function that resolves addresses, for code that asks for it.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU {

/// What its three texts mean is between the host and the code that asks.
using ZURGetAddressProc = void *(*)(char const *, char const *, char const *);

/// Keeps the function; the library itself never calls it. Not synchronised: set it at start-up.
ORU_API void SetZURGetAddressProc(ZURGetAddressProc proc);

/// The function kept, null until one is set.
ORU_API ZURGetAddressProc GetZURGetAddressProc();

} // namespace ORU
