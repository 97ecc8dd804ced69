// What the examples of the compute layer share: comparing what the device computed.
#pragma once

#include "examples/example.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ocl/programocl.h"

#include <sstream>
#include <stdexcept>

namespace example {

/// Compares the values that the device computed with those of the host.
/// @throws std::runtime_error about the first that differs
template<class Value>
void Compare(std::vector<Value> const &computed, std::vector<Value> const &expected) {
    auto const differing =
        std::mismatch(computed.begin(), computed.end(), expected.begin(), expected.end());
    if (differing.first == computed.end() && differing.second == expected.end())
        return;
    std::ostringstream text;
    text << "value " << differing.first - computed.begin() << " is " << +*differing.first
         << ", not " << +*differing.second;
    throw std::runtime_error(text.str());
}

} // namespace example
