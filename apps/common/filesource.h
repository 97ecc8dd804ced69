// A file that is read in pieces.
#pragma once

#include "apps/common/rawfile.h"
#include "apps/common/source.h"

#include <filesystem>

namespace App {

/// A file that is read through a buffer.
class FileSource : public Source {
public:
    /// @throws Failure when there is no such file, or it cannot be opened
    explicit FileSource(std::filesystem::path const &path);

    std::uint64_t size() const override { return size_; }
    std::size_t read(std::uint64_t position, unsigned char *target, std::size_t count) override;

private:
    RawFile file_;
    std::uint64_t size_;
    std::uint64_t bufferBegin_ = 0;
    Bytes buffer_; ///< of the file from there on
};

} // namespace App
