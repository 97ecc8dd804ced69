// Pictures in TIFF form, read row by row, by libtiff.
#include "apps/common/tiffreader.h"

#include "apps/common/failure.h"
#include "apps/common/history.h"
#include "apps/common/uprightreader.h"

#include <tiffio.h>

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <exception>

namespace App {

namespace {

/// Hands the library the bytes of a source, and keeps what it says and what its callbacks threw.
struct TiffSource {
    static TiffSource &Of(thandle_t handle) { return *static_cast<TiffSource *>(handle); }

    static tmsize_t Read(thandle_t handle, void *target, tmsize_t count) {
        TiffSource &self = Of(handle);
        try {
            std::size_t const done =
                self.source->read(self.position, static_cast<unsigned char *>(target),
                                  static_cast<std::size_t>(count));
            self.position += done;
            return static_cast<tmsize_t>(done);
        } catch (...) {
            self.thrown = std::current_exception();
            return -1;
        }
    }
    static tmsize_t Write(thandle_t, void *, tmsize_t) { return -1; }
    static toff_t Seek(thandle_t handle, toff_t position, int from) {
        TiffSource &self = Of(handle);
        self.position = position + (from == SEEK_CUR   ? self.position
                                    : from == SEEK_END ? self.source->size()
                                                       : 0);
        return self.position;
    }
    static int Close(thandle_t) { return 0; }
    static toff_t Size(thandle_t handle) { return Of(handle).source->size(); }

    static int OnError(TIFF *, void *user, char const *, char const *format,
                       std::va_list arguments) {
        TiffSource &self = *static_cast<TiffSource *>(user);
        char text[256];
        std::vsnprintf(text, sizeof text, format, arguments);
        if (self.message.empty())
            self.message = text;
        return 1;
    }
    static int OnWarning(TIFF *, void *, char const *, char const *, std::va_list) {
        return 1; // what it can read past is no reason to refuse a photo
    }

    [[noreturn]] void fail() const {
        if (thrown)
            std::rethrow_exception(thrown);
        std::string text = message;
        std::replace(text.begin(), text.end(), '\n', ' ');
        throw Failure("damaged TIFF: " + (text.empty() ? "it cannot be read" : text));
    }

    std::unique_ptr<Source> source;
    std::uint64_t position = 0;
    std::string message;
    std::exception_ptr thrown;
};

struct CloseTiff {
    void operator()(TIFF *tiff) const { ::TIFFClose(tiff); }
};
using TiffHandle = std::unique_ptr<TIFF, CloseTiff>;

TiffHandle OpenHandle(TiffSource &source) {
    struct FreeOptions {
        void operator()(TIFFOpenOptions *options) const { ::TIFFOpenOptionsFree(options); }
    };
    std::unique_ptr<TIFFOpenOptions, FreeOptions> const options(::TIFFOpenOptionsAlloc());
    ::TIFFOpenOptionsSetErrorHandlerExtR(options.get(), TiffSource::OnError, &source);
    ::TIFFOpenOptionsSetWarningHandlerExtR(options.get(), TiffSource::OnWarning, &source);
    return TiffHandle(::TIFFClientOpenExt("", "rm", &source, TiffSource::Read, TiffSource::Write,
                                          TiffSource::Seek, TiffSource::Close, TiffSource::Size,
                                          nullptr, nullptr, options.get()));
}

/// Colours that were multiplied by their alpha, divided by it.
template<class Value>
void Divide(unsigned char *row, Shape const &shape, double most) {
    std::vector<Value> values(shape.width * shape.channels);
    std::memcpy(values.data(), row, shape.rowBytes());
    for (std::size_t pixel = 0; pixel < values.size(); pixel += shape.channels) {
        double const alpha = values[pixel + shape.channels - 1];
        for (std::size_t c = 0; c + 1 < shape.channels && alpha > 0; ++c) {
            double const value = values[pixel + c] * most / alpha;
            values[pixel + c] = most == 1 ? static_cast<Value>(value)
                                          : static_cast<Value>(std::min(value + 0.5, most));
        }
    }
    std::memcpy(row, values.data(), shape.rowBytes());
}

class TiffReader : public PictureReader {
public:
    explicit TiffReader(std::unique_ptr<Source> from) {
        source_.source = std::move(from);
        tiff_ = OpenHandle(source_);
        if (!tiff_)
            source_.fail();
        head_.kind = FileKind::Tiff;
        head_.width = number<std::uint32_t>(TIFFTAG_IMAGEWIDTH);
        head_.height = number<std::uint32_t>(TIFFTAG_IMAGELENGTH);
        RequirePixels(head_.width, head_.height);
        readKind();
        requireUsableSize();
        takeTags();
    }

    Orientation orientation() const { return orientation_; }

    std::string wholeReason() const override { return wholeReason_; }

    void read(unsigned char *rows, std::size_t count) override {
        for (std::size_t i = 0; i < count; ++i, ++y_) {
            unsigned char *const row = rows + i * head_.rowBytes();
            if (tileRows_ > 0)
                readFromTiles(row);
            else if (::TIFFReadScanline(tiff_.get(), row, static_cast<std::uint32_t>(y_), 0) != 1)
                source_.fail();
            finishRow(row);
        }
    }

private:
    template<class Number>
    Number number(std::uint32_t tag, Number value = 0) const {
        ::TIFFGetFieldDefaulted(tiff_.get(), tag, &value);
        return value;
    }

    void readKind() {
        auto const compression = number<std::uint16_t>(TIFFTAG_COMPRESSION);
        auto const photometric = number<std::uint16_t>(TIFFTAG_PHOTOMETRIC, 0xFFFF);
        if (!::TIFFIsCODECConfigured(compression))
            refuse("compressed by method " + std::to_string(compression));
        bool const isJpeg = photometric == PHOTOMETRIC_YCBCR && compression == COMPRESSION_JPEG;
        if (isJpeg)
            ::TIFFSetField(tiff_.get(), TIFFTAG_JPEGCOLORMODE, JPEGCOLORMODE_RGB);
        bool const isGrey =
            photometric == PHOTOMETRIC_MINISBLACK || photometric == PHOTOMETRIC_MINISWHITE;
        if (!isGrey && !isJpeg && photometric != PHOTOMETRIC_RGB)
            refuse(photometric == PHOTOMETRIC_PALETTE     ? "with a palette"
                   : photometric == PHOTOMETRIC_SEPARATED ? "in CMYK"
                   : photometric == PHOTOMETRIC_YCBCR     ? "in YCbCr"
                                                          : "in an unknown colour space");
        isNegative_ = photometric == PHOTOMETRIC_MINISWHITE;

        auto const bits = number<std::uint16_t>(TIFFTAG_BITSPERSAMPLE);
        auto const format = number<std::uint16_t>(TIFFTAG_SAMPLEFORMAT);
        bool const isInteger = format == SAMPLEFORMAT_UINT || format == SAMPLEFORMAT_VOID;
        bool const isFloat = format == SAMPLEFORMAT_IEEEFP && bits == 32;
        if (!isFloat && !(isInteger && (bits == 8 || bits == 16)))
            refuse("of " + std::to_string(bits) +
                   (format == SAMPLEFORMAT_IEEEFP ? "-bit floats" : "-bit integers"));
        auto const channels = number<std::uint16_t>(TIFFTAG_SAMPLESPERPIXEL);
        unsigned int const colours = isGrey ? 1 : 3;
        if (channels < colours || channels > colours + 1)
            refuse("of " + std::to_string(channels) + " channels");
        if (number<std::uint16_t>(TIFFTAG_PLANARCONFIG) != PLANARCONFIG_CONTIG && channels > 1)
            refuse("with each channel apart");
        head_.bitsPerChannel = bits;
        head_.channels = channels;

        std::uint16_t extraCount = 0, *extras = nullptr;
        if (::TIFFGetField(tiff_.get(), TIFFTAG_EXTRASAMPLES, &extraCount, &extras) == 1)
            isMultiplied_ = extraCount == 1 && extras[0] == EXTRASAMPLE_ASSOCALPHA;
    }

    [[noreturn]] static void refuse(std::string const &kind) {
        throw Failure("a TIFF " + kind +
                      ", which is not supported; convert it to grey or RGB of 8 or 16 bits first");
    }

    /// No method of compression gives more than some thousand bytes for one: a file that is shorter
    /// need not be given memory.
    void requireUsableSize() {
        constexpr std::uint64_t kMostExpanded = 4096;
        constexpr std::uint64_t kLarge = 32 << 20;
        std::uint64_t const size = source_.source->size();
        if (std::uint64_t{head_.rowBytes()} * head_.height / kMostExpanded > size)
            throw Failure("damaged TIFF: the file is cut off");
        if (::TIFFIsTiled(tiff_.get())) {
            tileColumns_ = number<std::uint32_t>(TIFFTAG_TILEWIDTH);
            tileRows_ = number<std::uint32_t>(TIFFTAG_TILELENGTH);
            std::uint64_t const bytes = ::TIFFTileSize64(tiff_.get());
            if (tileColumns_ == 0 || tileRows_ == 0 || bytes == 0 || bytes / kMostExpanded > size ||
                bytes != std::uint64_t{tileColumns_} * tileRows_ * head_.bytesPerPixel())
                throw Failure("damaged TIFF: its tiles have no usable size");
            std::uint64_t const rows = std::min<std::uint64_t>(tileRows_, head_.height);
            if (rows * head_.rowBytes() > kLarge)
                wholeReason_ = "TIFF in large tiles";
            return;
        }
        if (::TIFFScanlineSize64(tiff_.get()) != head_.rowBytes())
            throw Failure("damaged TIFF: its rows have no usable size");
        if (::TIFFRawStripSize64(tiff_.get(), 0) > kLarge)
            wholeReason_ = "TIFF in large strips";
    }

    /// Takes all that is not pixels.
    void takeTags() {
        TiffStructure const structure(*source_.source);
        TiffStructure::Directory const directory = structure.directory(structure.firstDirectory());
        auto const bytesOf = [&](std::uint32_t tag) {
            TiffField const *const field = directory.find(tag);
            return field ? structure.value(*field) : Bytes();
        };
        head_.colour.profile = bytesOf(TIFFTAG_ICCPROFILE);
        head_.metadata.iptc = bytesOf(TIFFTAG_RICHTIFFIPTC);
        takePrimaries();
        takeResolution();
        std::vector<std::string> &losses = head_.metadata.losses;
        Bytes exif;
        try {
            exif = ExifOfTiff(structure, losses);
        } catch (Failure const &) {
            losses.push_back("the Exif data are damaged");
        }
        TakeHistory(std::move(exif), bytesOf(TIFFTAG_XMLPACKET), head_);
        orientation_ = number<std::uint16_t>(TIFFTAG_ORIENTATION);
        if (orientation_ < 1 || orientation_ > 8)
            orientation_ = kUpright;
        if ((number<std::uint32_t>(TIFFTAG_SUBFILETYPE) & FILETYPE_REDUCEDIMAGE) != 0)
            refuse("that begins with a thumbnail, as raw files of cameras do");
        if (!::TIFFLastDirectory(tiff_.get()))
            losses.push_back("only the first picture of the TIFF is read");
    }

    void takePrimaries() {
        float *white = nullptr, *others = nullptr;
        if (::TIFFGetField(tiff_.get(), TIFFTAG_WHITEPOINT, &white) != 1 ||
            ::TIFFGetField(tiff_.get(), TIFFTAG_PRIMARYCHROMATICITIES, &others) != 1)
            return;
        Primaries primaries = {{{white[0], white[1]}}};
        for (std::size_t i = 0; i < 3; ++i)
            primaries[i + 1] = {others[2 * i], others[2 * i + 1]};
        head_.colour.primaries = primaries;
    }

    void takeResolution() {
        using Unit = Resolution::Unit;
        auto const unit = number<std::uint16_t>(TIFFTAG_RESOLUTIONUNIT);
        auto const x = number<float>(TIFFTAG_XRESOLUTION), y = number<float>(TIFFTAG_YRESOLUTION);
        if (x > 0 && y > 0 && (unit != RESUNIT_NONE || x < y || x > y))
            head_.metadata.resolution = {x, y,
                                         unit == RESUNIT_NONE         ? Unit::None
                                         : unit == RESUNIT_CENTIMETER ? Unit::Centimetre
                                                                      : Unit::Inch};
    }

    /// Copies a row out of the tiles that it goes through, which are read with its first row.
    void readFromTiles(unsigned char *row) {
        std::size_t const first = y_ / tileRows_ * tileRows_;
        std::size_t const rows = std::min<std::size_t>(tileRows_, head_.height - first);
        if (y_ == first)
            loadTiles(first, rows);
        std::copy_n(band_.data() + (y_ - first) * head_.rowBytes(), head_.rowBytes(), row);
    }

    void loadTiles(std::size_t first, std::size_t rows) {
        band_.resize(rows * head_.rowBytes());
        std::size_t const tileRowBytes = tileColumns_ * head_.bytesPerPixel();
        tile_.resize(tileRows_ * tileRowBytes);
        for (std::size_t x = 0; x < head_.width; x += tileColumns_) {
            if (::TIFFReadTile(tiff_.get(), tile_.data(), static_cast<std::uint32_t>(x),
                               static_cast<std::uint32_t>(first), 0, 0) < 0)
                source_.fail();
            std::size_t const bytes =
                std::min<std::size_t>(tileColumns_, head_.width - x) * head_.bytesPerPixel();
            for (std::size_t i = 0; i < rows; ++i)
                std::copy_n(tile_.data() + i * tileRowBytes, bytes,
                            band_.data() + i * head_.rowBytes() + x * head_.bytesPerPixel());
        }
    }

    void finishRow(unsigned char *row) const {
        if (isMultiplied_) {
            if (head_.bitsPerChannel == 8)
                Divide<std::uint8_t>(row, head_, 255);
            else if (head_.bitsPerChannel == 16)
                Divide<std::uint16_t>(row, head_, 65535);
            else
                Divide<float>(row, head_, 1);
        }
        if (isNegative_ && head_.bitsPerChannel != 32) {
            std::size_t const valueBytes = head_.bitsPerChannel / 8;
            for (std::size_t x = 0; x < head_.width; ++x)
                for (std::size_t i = 0; i < valueBytes; ++i) {
                    unsigned char &byte = row[x * head_.bytesPerPixel() + i];
                    byte = static_cast<unsigned char>(~byte);
                }
        }
    }

    TiffSource source_;
    TiffHandle tiff_;
    Orientation orientation_ = kUpright;
    std::string wholeReason_;
    bool isNegative_ = false;   ///< 0 is white
    bool isMultiplied_ = false; ///< colours by alpha
    std::uint32_t tileColumns_ = 0;
    std::uint32_t tileRows_ = 0; ///< 0 when in strips
    Bytes tile_;
    Bytes band_; ///< the rows of a row of tiles
    std::size_t y_ = 0;
};

} // namespace

bool IsTiff(Bytes const &beginning) {
    static unsigned char const kBeginnings[][4] = {
        {'I', 'I', 42, 0}, {'M', 'M', 0, 42}, {'I', 'I', 43, 0}, {'M', 'M', 0, 43}};
    return beginning.size() >= 4 &&
           std::any_of(std::begin(kBeginnings), std::end(kBeginnings), [&](auto const &known) {
               return std::equal(std::begin(known), std::end(known), beginning.begin());
           });
}

std::unique_ptr<PictureReader> OpenTiff(std::unique_ptr<Source> source) {
    auto reader = std::make_unique<TiffReader>(std::move(source));
    Orientation const orientation = reader->orientation();
    return Upright(std::move(reader), orientation);
}

} // namespace App
