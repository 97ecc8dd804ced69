// Picture files, read and written whole.
#pragma once

#include "apps/common/image.h"

#include <filesystem>
#include <vector>

namespace App {

/// Reads a PNG, JPEG or TIFF file.
/// @throws Failure when there is no such file, or it cannot be read or used
Image ReadImage(std::filesystem::path const &path, SizeLimit limit = {});

/// Writes a picture as PNG, whole or not at all.
/// @throws Failure as WriteFile
void WriteImage(std::filesystem::path const &path, Image const &image);

/// The picture that the bytes of a file stand for.
/// @throws Failure as ReadImage
Image Decode(std::vector<unsigned char> const &bytes, SizeLimit limit = {});

/// The bytes of a PNG file.
std::vector<unsigned char> EncodePng(Image const &image);

} // namespace App
