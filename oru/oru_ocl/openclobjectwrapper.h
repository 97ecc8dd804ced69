// The owner of one OpenCL handle.
#pragma once

#include "oru/core/utility/dropexceptions.h"
#include "oru/core/utility/export.h"
#include "oru/oru_ocl/openclheaders.h"

namespace ORU::OCL {

/// Selects the constructor that retains the handle it is given.
struct add_ref_tag {};

/// Counts a reference to a handle up or down; platforms and devices have no count, for them and
/// for a null handle the result is 0 and no call is made.
/// @return what the runtime returns
/// @throws InternalException "table_ != 0" when the layer is not initialised
template<class T>
ORU_API int RetainHandle(T handle);
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
    T const &id() const { return handle_; }

protected:
    /// Takes over the caller's reference.
    explicit OpenCLObjectWrapper(T handle = nullptr) : handle_(handle) {}

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

    int retain() const { return RetainHandle(handle_); }
    int release() const { return ReleaseHandle(handle_); }

private:
    T handle_;
};

} // namespace ORU::OCL
