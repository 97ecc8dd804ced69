// A decorator that is in its chain for a scope.
#pragma once

#include <utility>

namespace ORU::OGL {

/// Makes a decorator, of OpenGL or of WGL calls, and keeps it the first link of its chain until the
/// scope ends, by whatever way:
///
/// ```cpp
/// InterceptorScope<OpenGLTracer> const tracer(file);
/// ```
///
/// The scope ends on whichever thread, before `Library::Terminate`, and after every decorator that
/// was pushed later left the chain: the last to come is the first to go.
template<class Decorator>
class InterceptorScope {
public:
    /// Makes the decorator and pushes it.
    /// @param arguments those of the decorator's constructor
    template<class... Arguments>
    explicit InterceptorScope(Arguments &&...arguments)
        : decorator_(std::forward<Arguments>(arguments)...) {
        Decorator::Instance()->addInterceptor(&decorator_);
    }
    ~InterceptorScope() { Decorator::Instance()->popInterceptor(); }
    InterceptorScope(InterceptorScope const &) = delete;
    InterceptorScope &operator=(InterceptorScope const &) = delete;

    /// @name The decorator
    /// Which belongs to the scope.
    /// @{
    Decorator &operator*() { return decorator_; }
    Decorator const &operator*() const { return decorator_; }
    Decorator *operator->() { return &decorator_; }
    Decorator const *operator->() const { return &decorator_; }
    /// @}

private:
    Decorator decorator_;
};

} // namespace ORU::OGL
