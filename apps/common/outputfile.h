// A file that is written in pieces, whole or not at all.
#pragma once

#include "apps/common/sink.h"

#include <filesystem>

namespace App {

/// A file that is written through a buffer, under a temporary name beside its own, which it gets
/// when it is complete. Before that it goes with its writer; a file of the name stays.
class OutputFile : public Sink {
public:
    /// @throws Failure when it cannot be begun
    explicit OutputFile(std::filesystem::path const &target);
    ~OutputFile() override;

    void write(std::uint64_t position, unsigned char const *bytes, std::size_t count) override;
    void finish() override;

private:
    void flush();

    std::filesystem::path target_;
    std::filesystem::path path_;
    int file_ = -1;
    std::uint64_t bufferBegin_ = 0;
    Bytes buffer_; ///< what follows there
};

} // namespace App
