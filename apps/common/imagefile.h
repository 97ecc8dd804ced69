// Picture files.
#pragma once

#include "apps/common/image.h"

#include <filesystem>

namespace App {

/// Reads a PNG or JPEG file.
/// @throws Failure when there is no such file, or it cannot be read or used
Image ReadImage(std::filesystem::path const &path, SizeLimit limit);

/// Writes a picture as PNG, whole or not at all.
/// @throws Failure as WriteFile
void WriteImage(std::filesystem::path const &path, Image const &image);

} // namespace App
