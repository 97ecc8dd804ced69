// Puts state back at the end of a scope.
#pragma once

#include "oru/core/utility/dropexceptions.h"

namespace ORU::OGL::internal {

/// Runs an action once: with `now()`, which lets its failure out, or else, when an exception ends
/// the scope first, in the destructor, which drops it.
///
///     ORU_GL(PushClientAttrib, GL_CLIENT_PIXEL_STORE_BIT);
///     Ending restore([] { ORU_GL0(PopClientAttrib); });
///     …
///     restore.now();
template<class Action>
class Ending {
public:
    explicit Ending(Action action) : action_(action) {}
    ~Ending() {
        if (pending_)
            DropExceptions(action_);
    }
    Ending(Ending const &) = delete;
    Ending &operator=(Ending const &) = delete;

    void now() {
        pending_ = false;
        action_();
    }

    Action &action() { return action_; }

private:
    Action action_;
    bool pending_ = true;
};

} // namespace ORU::OGL::internal
