// One step of a destructor that must not fail.
#pragma once

namespace ORU {

/// Runs a step of a clean-up and drops what it throws, so that the next step runs too.
template<class Step>
void DropExceptions(Step step) noexcept {
    try {
        step();
    } catch (...) {
        // A destructor has nobody to report to.
    }
}

} // namespace ORU
