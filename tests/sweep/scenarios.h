// What is swept: uses of every class that reaches the driver, each a function that leaves nothing behind.
#pragma once

#include <exception>
#include <string>
#include <vector>

namespace sweep {

/// The files of the scenarios that run develop, in the working folder; what it makes lies in kOutput.
inline constexpr char kPhoto[] = "photo.png", kSpots[] = "spots.txt", kOutput[] = "out";

/// The program ended with 1, having said why.
struct ProgramFailed : std::exception {
    char const *what() const noexcept override { return "the program ended with 1"; }
};

struct Scenario {
    char const *name;
    void (*run)();
    bool needsContext;  ///< one of OpenGL, current
    bool needsOpenCL;
};

std::vector<Scenario> const &Scenarios();

/// Whether `run` may go on as if nothing had happened when this entry point fails: what destructors and ends
/// of scopes call, and questions whose answer may be "no".
bool MayGoUnnoticed(std::string const &entryPoint);

} // namespace sweep
