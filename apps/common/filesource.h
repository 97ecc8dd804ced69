// A file that is read in pieces.
#pragma once

#include "apps/common/source.h"

#include <filesystem>

namespace App {

/// A file that is read through a buffer. Files of any length, unlike with MinGW's std::ifstream.
class FileSource : public Source {
public:
    /// @throws Failure when there is no such file, or it cannot be opened
    explicit FileSource(std::filesystem::path const &path);
    ~FileSource() override;

    std::uint64_t size() const override { return size_; }
    std::size_t read(std::uint64_t position, unsigned char *target, std::size_t count) override;

private:
    std::size_t load(std::uint64_t position, unsigned char *target, std::size_t count) const;

    int file_ = -1;
    std::uint64_t size_ = 0;
    std::uint64_t bufferBegin_ = 0;
    Bytes buffer_; ///< of the file from there on
};

} // namespace App
