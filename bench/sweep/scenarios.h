// What is swept: uses of every class that reaches the driver, each a function that leaves nothing
// behind.
#pragma once

#include <exception>
#include <string>
#include <vector>

namespace sweep {

/// The files of the scenarios that run develop, in the working folder; what it makes lies in
/// kOutput.
inline constexpr char kPhoto[] = "photo.png", kSpots[] = "spots.txt", kOutput[] = "out";

/// The program ended with 1, having said why.
struct ProgramFailed : std::exception {
    char const *what() const noexcept override { return "the program ended with 1"; }
};

/// What has to be there before.
enum class Needs { Nothing, OpenGL, Context, OpenCL };

struct Scenario {
    char const *name;
    void (*run)();
    Needs needs;
    char const *unnoticed; ///< beginnings of entry points whose failure changes nothing
};

std::vector<Scenario> const &Scenarios();

} // namespace sweep
