// A callback and what it is called with.
#pragma once

namespace ORU::OCL {

/// A function that the runtime calls back, and the user data that it hands over.
/// @tparam Function the runtime's type of the callback
template<class Function>
class NotifyCallback {
public:
    /// Without a function nothing is called back.
    NotifyCallback(Function notify = nullptr, void *userData = nullptr)
        : pf_notify_(notify), user_data_(userData) {}

    Function pf_notify() const { return pf_notify_; } ///< The function, or null.
    void *user_data() const { return user_data_; }    ///< What the function receives last.

private:
    Function pf_notify_;
    void *user_data_;
};

} // namespace ORU::OCL
