// Deleters for smart pointers to the library's objects, and shared ownership of them.
#pragma once

#include "oru/core/memory/orumemory.h"

#include <memory>
#include <type_traits>

namespace ORU {

/// Deleter for smart pointers to objects that something else owns.
struct NullDeleter {
    void operator()(void const *) const noexcept {} ///< does nothing
};

/// Deleter of objects made with `ORU_NEW`: destroys the object, then frees it through the hooks.
/// A `T` that is a base class needs a virtual destructor.
template<class T>
struct ORUDeleter {
    constexpr ORUDeleter() noexcept = default; ///< without state

    /// So that an owner of a derived object can become an owner of its base.
    template<class U, class = std::enable_if_t<std::is_convertible_v<U *, T *>>>
    constexpr ORUDeleter(ORUDeleter<U> const &) noexcept {
        static_assert(std::is_same_v<std::remove_cv_t<U>, std::remove_cv_t<T>> ||
                          std::has_virtual_destructor_v<T>,
                      "deleting through a base needs its virtual destructor");
    }

    /// Destroys and frees the object; null is ignored. In a destructor that throws the process
    /// ends.
    void operator()(T *p) const noexcept {
        static_assert(sizeof(T) > 0, "the type must be complete where it is deleted");
        static_assert(alignof(T) <= __STDCPP_DEFAULT_NEW_ALIGNMENT__,
                      "the hooks promise no more than the default alignment");
        if (!p)
            return;
        void *storage = StorageOf(p);
        p->~T();
        operator delete(storage, MEMORYTYPE_DEFAULT, __FILE__, __LINE__);
    }

private:
    /// The start of the whole object, which a second base class does not share.
    static void *StorageOf(T *p) noexcept {
        auto *object = const_cast<std::remove_cv_t<T> *>(p);
        if constexpr (std::is_polymorphic_v<T>)
            return dynamic_cast<void *>(object);
        else
            return object;
    }
};

/// Shared ownership of an object made with `ORU_NEW`: `MakeShared(ORU_NEW T(arguments))`.
/// @throws std::bad_alloc when there is no memory for the count; the object is then destroyed
template<class T>
std::shared_ptr<T> MakeShared(T *p) {
    return std::shared_ptr<T>(p, ORUDeleter<T>());
}

} // namespace ORU
