// What the programs report about a file or an argument that they cannot use.
#pragma once

#include <stdexcept>
#include <string>

namespace App {

/// A reason that a person can act on, in one line and without the name of the file it is about.
class Failure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

} // namespace App
