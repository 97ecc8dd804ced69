// Picture files.
#include "apps/common/imagefile.h"

#include "apps/common/failure.h"
#include "apps/common/file.h"
#include "apps/common/jpegcodec.h"
#include "apps/common/pngcodec.h"

#include <fstream>
#include <system_error>

namespace App {

namespace fs = std::filesystem;

Image ReadImage(fs::path const &path, SizeLimit limit) {
    std::ifstream file = OpenFile(path);
    std::vector<unsigned char> bytes;
    // The first bytes tell whether to read the rest, which may be long.
    AppendBytes(file, bytes, kPngSignatureBytes);
    if (bytes.empty())
        throw Failure("is empty");
    bool const png = IsPng(bytes);
    if (!png && !IsJpeg(bytes))
        throw Failure("neither a PNG nor a JPEG picture");

    std::error_code error;
    std::uintmax_t const size = fs::file_size(path, error);
    if (error)
        throw Failure("cannot be read");
    if (size > bytes.size())
        AppendBytes(file, bytes, size - bytes.size());
    return png ? DecodePng(bytes, limit) : DecodeJpeg(bytes, limit);
}

void WriteImage(fs::path const &path, Image const &image) {
    WriteFile(path, EncodePng(image));
}

} // namespace App
