// The kinds of picture files, each with its codec.
#include "apps/common/picturefile.h"

#include "apps/common/failure.h"
#include "apps/common/jpegreader.h"
#include "apps/common/jpegwriter.h"
#include "apps/common/pngreader.h"
#include "apps/common/pngwriter.h"
#include "apps/common/tiffreader.h"
#include "apps/common/tiffwriter.h"

namespace App {

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
    if (IsTiff(beginning))
        return OpenTiff(std::move(source));
    throw Failure("neither a PNG, a JPEG nor a TIFF picture");
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
    return CreateTiff(std::move(sink), head);
}

} // namespace App
