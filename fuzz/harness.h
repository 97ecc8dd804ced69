// What the fuzzing harnesses share: laws, and the input as text.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

/// Ends the run, and has the input kept, when a law does not hold.
#define HOLDS(...) ((__VA_ARGS__) ? void(0) : fuzz::Broken(__FILE__, __LINE__, #__VA_ARGS__))

/// Defined by each harness: takes apart one input, which an attacker or a bad driver made.
/// Exceptions that the code is to throw are caught in there, others end the run.
extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size);

namespace fuzz {

[[noreturn]] inline void Broken(char const *file, int line, char const *law) {
    std::fprintf(stderr, "%s:%d: does not hold: %s\n", file, line, law);
    std::abort();
}

inline std::string Text(std::uint8_t const *data, std::size_t size) {
    return std::string(data, data + size);
}

} // namespace fuzz
