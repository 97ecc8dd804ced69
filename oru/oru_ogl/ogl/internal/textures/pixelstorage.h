// The client's pixel storage around a transfer.
#pragma once

#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/gltypes.h"

#include <array>
#include <cstddef>

namespace ORU::OGL::internal {

/// Some of the parameters of glPixelStore, in the order of Texture::PixelStoreMode.
struct PixelStoreRange {
    std::size_t first;
    std::size_t count;
};
inline constexpr PixelStoreRange kPackStorage = {0, 8};
inline constexpr PixelStoreRange kPackAlignment = {7, 1};
inline constexpr PixelStoreRange kUnpackStorage = {8, 8};

/// The values of such parameters.
class PixelStorage {
public:
    /// Reads them from the current context. @note glGetIntegerv
    void read(PixelStoreRange range);

    /// Sets them. @note glPixelStorei
    void set() const;

private:
    PixelStoreRange range_ = {0, 0};
    std::array<GLint, 8> values_ = {};
};

/// Saves pixel storage for a scope. In a compatibility context that is all of it, on the client
/// attribute stack; a scope that fails before `restore()` leaves its state there, above what was
/// before: the caller looks at it, or drops it with glPopClientAttrib. A core context has no such
/// stack: there the range is saved, and put back also after a failure.
class PixelStorageScope {
public:
    /// @param range what the scope is going to change
    /// @note glPushClientAttrib, or glGetIntegerv
    explicit PixelStorageScope(PixelStoreRange range);
    ~PixelStorageScope() {
        if (isPending_ && isCore_)
            DropExceptions([this] { restore(); });
    }
    PixelStorageScope(PixelStorageScope const &) = delete;
    PixelStorageScope &operator=(PixelStorageScope const &) = delete;

    /// A failure leaves here; a destructor would drop it.
    /// @note glPopClientAttrib, or glPixelStorei
    void restore();

private:
    bool isCore_;
    bool isPending_ = true;
    PixelStorage saved_;
};

/// @name The same without a scope
/// In a core context the library has a stack of its own, of 16 entries for each thread.
/// @throws InternalException in a core context, when the stack is full or has nothing of the
///         current context
/// @{
void PushPixelStorage(PixelStoreRange range);
void PopPixelStorage();
/// @}

} // namespace ORU::OGL::internal
