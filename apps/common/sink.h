// Where the bytes of a file go.
#pragma once

#include "apps/common/picture.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>

namespace App {

/// Takes bytes at any place; what lies behind all of them is not there.
class Sink {
public:
    virtual ~Sink() = default;
    Sink(Sink const &) = delete;
    Sink &operator=(Sink const &) = delete;

    /// @throws Failure when that is not possible
    virtual void write(std::uint64_t position, unsigned char const *bytes, std::size_t count) = 0;

    /// After the last byte: the file is complete.
    /// @throws Failure when that is not possible
    virtual void finish() = 0;

protected:
    Sink() = default;
};

/// Keeps what it takes in memory.
class MemorySink : public Sink {
public:
    /// @param bytes gets them, and lives as long as this
    explicit MemorySink(Bytes &bytes) : bytes_(bytes) {}

    void write(std::uint64_t position, unsigned char const *bytes, std::size_t count) override {
        auto const begin = static_cast<std::size_t>(position);
        bytes_.resize(std::max(bytes_.size(), begin + count));
        std::copy_n(bytes, count, bytes_.begin() + static_cast<std::ptrdiff_t>(begin));
    }
    void finish() override {}

private:
    Bytes &bytes_;
};

} // namespace App
