// A file that is written in pieces, whole or not at all.
#pragma once

#include "apps/common/rawfile.h"
#include "apps/common/sink.h"

#include <filesystem>

namespace App {

/// A path that is removed unless it becomes another.
class TemporaryPath {
public:
    /// A name beside the target's.
    explicit TemporaryPath(std::filesystem::path const &target);
    ~TemporaryPath();
    TemporaryPath(TemporaryPath const &) = delete;
    TemporaryPath &operator=(TemporaryPath const &) = delete;

    std::filesystem::path const &path() const { return path_; }

    /// @throws Failure when the file cannot get the target's name
    void becomeTarget();

private:
    std::filesystem::path target_;
    std::filesystem::path path_;
};

/// A file that is written through a buffer, under a temporary name beside its own, which it gets
/// when it is complete. Before that it goes with its writer; a file of the name stays.
class OutputFile : public Sink {
public:
    /// @throws Failure when it cannot be begun
    explicit OutputFile(std::filesystem::path const &target);

    void write(std::uint64_t position, unsigned char const *bytes, std::size_t count) override;
    void finish() override;

private:
    void flush();

    TemporaryPath path_;
    RawFile file_;
    std::uint64_t bufferBegin_ = 0;
    Bytes buffer_; ///< what follows there
};

} // namespace App
