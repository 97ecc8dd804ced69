// Where the bytes of a file come from.
#pragma once

#include "apps/common/picture.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <utility>

namespace App {

/// Bytes that can be read at any place.
class Source {
public:
    virtual ~Source() = default;
    Source(Source const &) = delete;
    Source &operator=(Source const &) = delete;

    virtual std::uint64_t size() const = 0;

    /// @return how many bytes were read; fewer than asked for at the end only
    /// @throws Failure when they cannot be read
    virtual std::size_t read(std::uint64_t position, unsigned char *target, std::size_t count) = 0;

protected:
    Source() = default;
};

/// Bytes in memory.
class MemorySource : public Source {
public:
    explicit MemorySource(Bytes bytes) : bytes_(std::move(bytes)) {}

    std::uint64_t size() const override { return bytes_.size(); }

    std::size_t read(std::uint64_t position, unsigned char *target, std::size_t count) override {
        auto const begin =
            static_cast<std::size_t>(std::min<std::uint64_t>(position, bytes_.size()));
        count = std::min(count, bytes_.size() - begin);
        std::copy_n(bytes_.data() + begin, count, target);
        return count;
    }

private:
    Bytes bytes_;
};

} // namespace App
