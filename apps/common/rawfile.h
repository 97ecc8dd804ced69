// An open file, read and written at any place.
#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <string>

namespace App {

/// An open file without a buffer. Unlike MinGW's file streams it takes files of any length.
class RawFile {
public:
    /// @param flags of _wopen; binary, and not inherited, it is always
    /// @param verb for its failures: "cannot be " + verb
    /// @throws Failure when it cannot be opened
    RawFile(std::filesystem::path const &path, int flags, char const *verb);
    ~RawFile();
    RawFile(RawFile const &) = delete;
    RawFile &operator=(RawFile const &) = delete;

    std::uint64_t size() const;

    /// @return how many bytes were read; none at the end only
    std::size_t read(std::uint64_t position, unsigned char *target, std::size_t count);
    void write(std::uint64_t position, unsigned char const *bytes, std::size_t count);
    void close();

private:
    bool seek(std::uint64_t position);
    [[noreturn]] void fail(char const *verb) const;

    int file_;
};

} // namespace App
