// Files of any kind, read and written whole.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace App {

/// The contents of a file.
/// @throws Failure when there is no such file, or it cannot be read
std::string ReadText(std::filesystem::path const &path);

/// Writes a file whole or not at all: under a temporary name beside it, then renamed.
/// @throws Failure when that is not possible; nothing is left behind, and a file of this name that
///         was there before stays
void WriteFile(std::filesystem::path const &path, std::vector<unsigned char> const &bytes);

} // namespace App
