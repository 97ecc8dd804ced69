// A decorator that is the first link of its chain for a scope.
#pragma once

#include <utility>

namespace oru_test {

/// Makes a decorator of OpenGL or of WGL calls and pushes it onto its chain for a scope.
template<class Decorator>
class Pushed {
public:
    template<class... Arguments>
    explicit Pushed(Arguments &&...arguments) : decorator_(std::forward<Arguments>(arguments)...) {
        Decorator::Instance()->addInterceptor(&decorator_);
    }
    ~Pushed() { Decorator::Instance()->popInterceptor(); }
    Pushed(Pushed const &) = delete;
    Pushed &operator=(Pushed const &) = delete;

    Decorator *operator->() { return &decorator_; }
    Decorator &operator*() { return decorator_; }

private:
    Decorator decorator_;
};

} // namespace oru_test
