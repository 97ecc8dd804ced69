// The single-owner pointer to an object of the library.
#pragma once

#include "oru/core/utility/sharedptr.h"

namespace ORU {

/// Owns one object made with `ORU_NEW` and frees it through the memory hooks; moves, never copies.
template<class T>
using ScopedPtr = std::unique_ptr<T, ORUDeleter<T>>;

/// Takes ownership with the type deduced: `auto p = MakeScoped(ORU_NEW T(arguments))`.
template<class T>
ScopedPtr<T> MakeScoped(T *p) noexcept {
    return ScopedPtr<T>(p);
}

} // namespace ORU
