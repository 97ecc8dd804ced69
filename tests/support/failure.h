// What an expected failure says, and where.
#pragma once

#include "oru/core/exceptions/logicalexception.h"

#include <gtest/gtest.h>

#include <exception>
#include <new>
#include <string>

namespace oru_test {

struct Failure {
    std::string text; ///< the message, or what() of an exception without one; empty: no failure
    std::string file;
    int line = 0;
    std::string note;
};

/// What a call throws.
template<class Call>
Failure FailureOf(Call call) {
    try {
        call();
    } catch (ORU::LogicalException const &e) {
        return {*e.message() != '\0' ? e.message() : e.what(), e.file(), e.line(), e.note()};
    } catch (std::bad_alloc const &) {
        throw; // no exception of a check: the test's own matter
    } catch (std::exception const &e) {
        return {e.what(), "", 0, ""};
    }
    return {};
}

/// The text of what a call throws.
template<class Call>
std::string MessageOf(Call call) {
    return FailureOf(call).text;
}

} // namespace oru_test

/// The statement throws an exception with this text; "" says that it throws none.
#define EXPECT_FAILURE(expected, ...)                                                              \
    EXPECT_EQ(expected, ::oru_test::MessageOf([&] { __VA_ARGS__; }))
