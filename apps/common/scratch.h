// Bytes that are put aside for a while.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>

namespace App {

/// Bytes that are put aside, at any place, until their owner goes.
class Scratch {
public:
    virtual ~Scratch() = default;
    Scratch(Scratch const &) = delete;
    Scratch &operator=(Scratch const &) = delete;

    /// @throws Failure when that is not possible
    virtual void write(std::uint64_t position, unsigned char const *bytes, std::size_t count) = 0;

    /// Reads what was written.
    virtual void read(std::uint64_t position, unsigned char *target, std::size_t count) = 0;

protected:
    Scratch() = default;
};

/// Room for some bytes: a few in memory, many in a temporary file, which goes with its owner, even
/// when the system ends the program.
/// @throws Failure when there is no such file
std::unique_ptr<Scratch> MakeScratch(std::uint64_t bytes);

} // namespace App
