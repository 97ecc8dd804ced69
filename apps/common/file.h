// Files of any kind, read and written whole.
#pragma once

#include <cstdint>
#include <filesystem>
#include <iosfwd>
#include <string>
#include <vector>

namespace App {

/// Opens a file that is one, or says what it is instead.
/// @throws Failure when there is no such file, or it cannot be opened
std::ifstream OpenFile(std::filesystem::path const &path);

/// Appends at most `count` bytes of an open file.
/// @throws Failure when they cannot be read
void AppendBytes(std::ifstream &file, std::vector<unsigned char> &bytes, std::uintmax_t count);

/// The contents of a file.
/// @throws Failure when there is no such file, or it cannot be read
std::string ReadText(std::filesystem::path const &path);

/// Writes a file whole or not at all: under a temporary name beside it, then renamed.
/// @throws Failure when that is not possible; nothing is left behind, and a file of this name that
///         was there before stays
void WriteFile(std::filesystem::path const &path, std::vector<unsigned char> const &bytes);

} // namespace App
