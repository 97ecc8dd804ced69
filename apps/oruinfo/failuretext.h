// What a failure says in a report.
#pragma once

#include "apps/oruinfo/report.h"

#include <exception>
#include <new>
#include <string>

namespace OruInfo {

/// All that an exception says, with its place in the source.
std::string FullText(std::exception const &failure);

/// What failed, without the place.
std::string ShortText(std::exception const &failure);

/// Runs a piece of work; what fails is told by the result, which is empty otherwise.
/// @throws std::bad_alloc when memory is exhausted
template<class Work>
std::string FailureOf(Work const &work) {
    try {
        work();
        return std::string();
    } catch (std::bad_alloc const &) {
        throw;
    } catch (std::exception const &failure) {
        return FullText(failure);
    }
}

/// The value that `ask` returns, or why there is none.
/// @throws std::bad_alloc when memory is exhausted
template<class Ask>
Value Told(Ask const &ask) {
    try {
        return ask();
    } catch (std::bad_alloc const &) {
        throw;
    } catch (std::exception const &failure) {
        return Unavailable{ShortText(failure)};
    }
}

} // namespace OruInfo
