// Picture files, row by row.
#include "apps/common/picturefile.h"

#include "apps/common/filesource.h"
#include "apps/common/outputfile.h"
#include "apps/common/unicode.h"

namespace App {

namespace fs = std::filesystem;

std::unique_ptr<PictureReader> OpenPicture(fs::path const &path) {
    return OpenPicture(std::make_unique<FileSource>(path));
}

std::optional<FileKind> KindOfName(fs::path const &path) {
    std::string const extension = FoldCase(ToText(path.extension()));
    if (extension == ".png")
        return FileKind::Png;
    if (extension == ".jpg" || extension == ".jpeg")
        return FileKind::Jpeg;
    if (extension == ".tif" || extension == ".tiff")
        return FileKind::Tiff;
    return std::nullopt;
}

std::unique_ptr<PictureWriter> CreatePicture(fs::path const &path, PictureHead const &head,
                                             Encoding const &encoding) {
    return CreatePicture(std::make_unique<OutputFile>(path), head, encoding);
}

} // namespace App
