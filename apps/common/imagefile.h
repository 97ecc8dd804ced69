// Picture files.
#pragma once

#include "apps/common/image.h"

#include <filesystem>

namespace App {

/// Reads a PNG or JPEG file.
/// @throws Failure when there is no such file, or it cannot be read or used
Image ReadImage(std::filesystem::path const &path, SizeLimit limit);

/// Writes a file whole or not at all: under a temporary name beside it, then renamed.
/// @throws Failure when that is not possible; nothing is left behind, and a file of this name that
///         was there before stays
void WriteFile(std::filesystem::path const &path, std::vector<unsigned char> const &bytes);

/// Writes a picture as PNG, whole or not at all.
/// @throws Failure as WriteFile
void WriteImage(std::filesystem::path const &path, Image const &image);

} // namespace App
