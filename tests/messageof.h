// The message of an expected failure.
#pragma once

#include "oru/core/exceptions/logicalexception.h"

#include <string>

namespace oru_test {

/// The message of the library's exception that a call throws, empty when it throws none.
template<class Call>
std::string MessageOf(Call call) {
    try {
        call();
    } catch (ORU::LogicalException const &e) {
        return e.message();
    }
    return "";
}

} // namespace oru_test
