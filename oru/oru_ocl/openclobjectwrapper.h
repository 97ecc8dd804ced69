// The owner of one OpenCL handle.
#pragma once

#include "oru/core/utility/dropexceptions.h"
#include "oru/core/utility/export.h"
#include "oru/oru_ocl/openclheaders.h"

#include <utility>

namespace ORU::OCL {

/// @name What becomes of a handle that was made elsewhere
/// The last argument of the constructors that make an object over such a handle:
///
/// ```cpp
/// Event written(event, take_ref_tag());
/// ```
/// @{

/// The object adds a reference of its own; the caller keeps and releases theirs.
struct add_ref_tag {};

/// The object takes over the caller's reference; after a failure it is the caller's as before.
struct take_ref_tag {};
/// @}

/// Counts a reference to a handle up or down; platforms and devices have no count, for them and
/// for a null handle the result is 0 and no call is made.
/// @return what the runtime returns
/// @throws InternalException "table_ != 0" when the layer is not initialised
template<class T>
ORU_API int RetainHandle(T handle);
/// Counts down; as `RetainHandle`.
template<class T>
ORU_API int ReleaseHandle(T handle);

#if !defined(ORU_BUILDING)
// For hosts, whose compilers would look for the definitions otherwise.
#define ORU_CL_HANDLE(Handle)                                                                      \
    extern template ORU_API int RetainHandle(Handle);                                              \
    extern template ORU_API int ReleaseHandle(Handle);
#include "oru/oru_ocl/openclhandles.inc"
#endif

/// Holds one OpenCL handle of type `T`, or null, and one reference to it: copying retains,
/// destroying releases, and a move is a copy.
template<class T>
class OpenCLObjectWrapper {
public:
    /// The handle.
    T const &handle() const { return handle_; }
    T const &id() const { return handle_; } ///< The handle.

    /// Gives up the handle with its reference, which is the caller's to release now. This object
    /// holds none afterwards: the runtime refuses what it is asked.
    T disown() { return std::exchange(handle_, nullptr); }

protected:
    /// Takes over the caller's reference.
    explicit OpenCLObjectWrapper(T handle = nullptr) : handle_(handle) {}

    /// Takes over the caller's reference.
    OpenCLObjectWrapper(T handle, take_ref_tag const &) : handle_(handle) {}

    /// Adds a reference of its own.
    OpenCLObjectWrapper(T handle, add_ref_tag const &) : handle_(handle) { retain(); }

    OpenCLObjectWrapper(OpenCLObjectWrapper const &other) : handle_(other.handle_) { retain(); }

    OpenCLObjectWrapper &operator=(OpenCLObjectWrapper const &other) {
        if (handle_ != other.handle_) {
            release();
            handle_ = other.handle_;
            retain();
        }
        return *this;
    }

    /// Releases the handle; lets no exception out.
    ~OpenCLObjectWrapper() {
        // When the layer was terminated before this object, the handle went with the runtime.
        DropExceptions([this] { release(); });
    }

    /// Takes over the caller's reference to `handle`, when none is held yet.
    void adopt(T handle) { handle_ = handle; }

    /// Counts the reference up; results and failures as `RetainHandle`.
    int retain() const { return RetainHandle(handle_); }
    /// Counts the reference down; results and failures as `ReleaseHandle`.
    int release() const { return ReleaseHandle(handle_); }

private:
    T handle_;
};

} // namespace ORU::OCL
