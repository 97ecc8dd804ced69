// Picture files, row by row.
#include "apps/common/picturefile.h"

#include "apps/common/failure.h"
#include "apps/common/filesource.h"
#include "apps/common/jpegreader.h"
#include "apps/common/jpegwriter.h"
#include "apps/common/outputfile.h"
#include "apps/common/pngreader.h"
#include "apps/common/pngwriter.h"
#include "apps/common/unicode.h"

namespace App {

namespace fs = std::filesystem;

std::unique_ptr<PictureReader> OpenPicture(std::unique_ptr<Source> source) {
    constexpr std::size_t kBytesThatTell = 8;
    Bytes beginning(kBytesThatTell);
    beginning.resize(source->read(0, beginning.data(), beginning.size()));
    if (beginning.empty())
        throw Failure("is empty");
    if (IsPng(beginning))
        return OpenPng(std::move(source));
    if (IsJpeg(beginning))
        return OpenJpeg(std::move(source));
    throw Failure("neither a PNG, a JPEG nor a TIFF picture");
}

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

std::unique_ptr<PictureWriter> CreatePicture(std::unique_ptr<Sink> sink, PictureHead const &head,
                                             Encoding const &encoding) {
    RequirePixels(head.width, head.height);
    switch (encoding.kind) {
    case FileKind::Png:
        return CreatePng(std::move(sink), head);
    case FileKind::Jpeg:
        return CreateJpeg(std::move(sink), head, encoding);
    case FileKind::Tiff:
        break;
    }
    throw Failure("TIFF is not written");
}

std::unique_ptr<PictureWriter> CreatePicture(fs::path const &path, PictureHead const &head,
                                             Encoding const &encoding) {
    return CreatePicture(std::make_unique<OutputFile>(path), head, encoding);
}

} // namespace App
