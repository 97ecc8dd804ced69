// Pictures in TIFF form, written row by row.
#include "apps/common/tiffwriter.h"

#include "apps/common/failure.h"
#include "apps/common/history.h"

#include <tiff.h>
#include <zlib.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <new>

namespace App {

namespace {

constexpr std::uint64_t kMostOfClassic = 0xF0000000;
constexpr std::size_t kStripBytes = std::size_t{256} * 1024;

/// Differences of neighbours, which compress better: TIFF's predictor 2.
template<class Value>
void Difference(unsigned char *row, Shape const &shape) {
    std::vector<Value> values(shape.width * shape.channels);
    std::memcpy(values.data(), row, shape.rowBytes());
    for (std::size_t i = values.size(); i-- > shape.channels;)
        values[i] = static_cast<Value>(values[i] - values[i - shape.channels]);
    std::memcpy(row, values.data(), shape.rowBytes());
}

/// The same of floats, all their highest bytes before all their next ones: TIFF's predictor 3.
void DifferenceFloats(unsigned char *row, Shape const &shape) {
    std::size_t const count = shape.width * shape.channels;
    Bytes const values(row, row + shape.rowBytes());
    for (std::size_t i = 0; i < count; ++i)
        for (std::size_t byte = 0; byte < 4; ++byte)
            row[(3 - byte) * count + i] = values[4 * i + byte];
    for (std::size_t i = 4 * count; i-- > shape.channels;)
        row[i] = static_cast<unsigned char>(row[i] - row[i - shape.channels]);
}

class TiffWriter : public PictureWriter {
public:
    TiffWriter(std::unique_ptr<Sink> sink, PictureHead const &head)
        : sink_(std::move(sink)), head_(head),
          rowsPerStrip_(std::max<std::size_t>(kStripBytes / head.rowBytes(), 1)) {
        layout_.isBig = std::uint64_t{head.rowBytes()} * head.height > kMostOfClassic;
        describe();
        if (::deflateInit2(&stream_, Z_DEFAULT_COMPRESSION, Z_DEFLATED, MAX_WBITS, MAX_MEM_LEVEL,
                           Z_RLE) != Z_OK)
            throw std::bad_alloc();
        position_ = layout_.isBig ? 16 : 8; // behind the header
        strip_.reserve(rowsPerStrip_ * head.rowBytes());
    }
    ~TiffWriter() override { ::deflateEnd(&stream_); }

    void write(unsigned char const *rows, std::size_t count) override {
        std::size_t const rowBytes = head_.rowBytes();
        for (std::size_t i = 0; i < count; ++i) {
            strip_.insert(strip_.end(), rows + i * rowBytes, rows + (i + 1) * rowBytes);
            unsigned char *const row = strip_.data() + strip_.size() - rowBytes;
            if (head_.bitsPerChannel == 8)
                Difference<std::uint8_t>(row, head_);
            else if (head_.bitsPerChannel == 16)
                Difference<std::uint16_t>(row, head_);
            else
                DifferenceFloats(row, head_);
            if (strip_.size() == rowsPerStrip_ * rowBytes)
                writeStrip();
        }
    }

    void finish() override {
        if (!strip_.empty())
            writeStrip();
        position_ += position_ % 2;
        addNumbers(TIFFTAG_STRIPOFFSETS, offsets_);
        addNumbers(TIFFTAG_STRIPBYTECOUNTS, counts_);
        Bytes const directory = EncodeTiffTree(tree_, position_, layout_);
        sink_->write(position_, directory.data(), directory.size());
        Bytes header = {'I', 'I'};
        AppendNumber(header, layout_.isBig ? 43 : 42, 2, false);
        if (layout_.isBig)
            AppendNumber(header, 8, 4, false); // the bytes of a position
        AppendNumber(header, position_, layout_.isBig ? 8 : 4, false);
        sink_->write(0, header.data(), header.size());
        sink_->finish();
    }

private:
    /// Adds a field, instead of what Exif data say.
    void add(unsigned int tag, TIFFDataType type, Bytes value) {
        if (value.empty())
            return;
        std::vector<TiffEntry> &entries = tree_.entries;
        auto const isSame = [tag](TiffEntry const &entry) { return entry.tag == tag; };
        entries.erase(std::remove_if(entries.begin(), entries.end(), isSame), entries.end());
        entries.push_back({tag, static_cast<unsigned int>(type), std::move(value)});
    }
    void addShorts(unsigned int tag, std::vector<std::size_t> const &numbers) {
        Bytes value;
        for (std::size_t const number : numbers)
            AppendNumber(value, number, 2, false);
        add(tag, TIFF_SHORT, std::move(value));
    }
    void addNumbers(unsigned int tag, std::vector<std::uint64_t> const &numbers) {
        Bytes value;
        for (std::uint64_t const number : numbers)
            AppendNumber(value, number, layout_.isBig ? 8 : 4, false);
        add(tag, layout_.isBig ? TIFF_LONG8 : TIFF_LONG, std::move(value));
    }
    void addFractions(unsigned int tag, std::vector<double> const &numbers) {
        Bytes value;
        for (double const number : numbers) {
            // As fine as there is room for.
            double below = 1;
            while (number * below < 1e8 && below < 1e8 &&
                   std::floor(number * below) < number * below)
                below *= 10;
            AppendNumber(value, static_cast<std::uint64_t>(std::llround(number * below)), 4, false);
            AppendNumber(value, static_cast<std::uint64_t>(below), 4, false);
        }
        add(tag, TIFF_RATIONAL, std::move(value));
    }

    /// All fields but those of the strips.
    void describe() {
        Metadata const history = HistoryOf(head_);
        losses_ = history.losses;
        try {
            if (!history.exif.empty())
                tree_ = TiffOfExif(history.exif, layout_.isBigEndian, losses_);
        } catch (Failure const &) {
            tree_ = {};
            losses_.push_back("the Exif data are damaged");
        }
        bool const isGrey = head_.channels < 3, isFloat = head_.bitsPerChannel == 32;
        std::size_t const channels = head_.channels;
        addNumbers(TIFFTAG_IMAGEWIDTH, {head_.width});
        addNumbers(TIFFTAG_IMAGELENGTH, {head_.height});
        addNumbers(TIFFTAG_ROWSPERSTRIP, {rowsPerStrip_});
        addShorts(TIFFTAG_BITSPERSAMPLE, std::vector<std::size_t>(channels, head_.bitsPerChannel));
        addShorts(TIFFTAG_COMPRESSION, {COMPRESSION_ADOBE_DEFLATE});
        addShorts(TIFFTAG_PHOTOMETRIC,
                  {isGrey ? std::size_t{PHOTOMETRIC_MINISBLACK} : std::size_t{PHOTOMETRIC_RGB}});
        addShorts(TIFFTAG_ORIENTATION, {ORIENTATION_TOPLEFT});
        addShorts(TIFFTAG_SAMPLESPERPIXEL, {channels});
        addShorts(TIFFTAG_PLANARCONFIG, {PLANARCONFIG_CONTIG});
        addShorts(TIFFTAG_PREDICTOR, {isFloat ? 3u : 2u});
        if (head_.hasAlpha())
            addShorts(TIFFTAG_EXTRASAMPLES, {EXTRASAMPLE_UNASSALPHA});
        addShorts(
            TIFFTAG_SAMPLEFORMAT,
            std::vector<std::size_t>(channels, isFloat ? SAMPLEFORMAT_IEEEFP : SAMPLEFORMAT_UINT));
        addColour();
        add(TIFFTAG_XMLPACKET, TIFF_BYTE, history.xmp);
        add(TIFFTAG_RICHTIFFIPTC, TIFF_UNDEFINED, history.iptc);
        if (auto const &resolution = history.resolution) {
            static constexpr std::size_t kUnits[] = {RESUNIT_NONE, RESUNIT_INCH,
                                                     RESUNIT_CENTIMETER};
            addFractions(TIFFTAG_XRESOLUTION, {resolution->x});
            addFractions(TIFFTAG_YRESOLUTION, {resolution->y});
            addShorts(TIFFTAG_RESOLUTIONUNIT, {kUnits[static_cast<int>(resolution->unit)]});
        }
    }

    void addColour() {
        ColourTags const &colour = head_.colour;
        add(TIFFTAG_ICCPROFILE, TIFF_UNDEFINED, colour.profile);
        if (colour.primaries) {
            Primaries const &points = *colour.primaries;
            addFractions(TIFFTAG_WHITEPOINT, {points[0][0], points[0][1]});
            addFractions(TIFFTAG_PRIMARYCHROMATICITIES, {points[1][0], points[1][1], points[2][0],
                                                         points[2][1], points[3][0], points[3][1]});
        }
        if (colour.gamma && colour.profile.empty() && !colour.isNamedSrgb)
            losses_.push_back("TIFF holds no gamma without a colour profile");
    }

    void writeStrip() {
        ::deflateReset(&stream_);
        packed_.resize(::deflateBound(&stream_, static_cast<unsigned long>(strip_.size())));
        stream_.next_in = strip_.data();
        stream_.avail_in = static_cast<unsigned int>(strip_.size());
        stream_.next_out = packed_.data();
        stream_.avail_out = static_cast<unsigned int>(packed_.size());
        if (::deflate(&stream_, Z_FINISH) != Z_STREAM_END)
            throw Failure("cannot be encoded");
        std::size_t const count = packed_.size() - stream_.avail_out;
        sink_->write(position_, packed_.data(), count);
        offsets_.push_back(position_);
        counts_.push_back(count);
        position_ += count;
        strip_.clear();
    }

    std::unique_ptr<Sink> sink_;
    PictureHead head_;
    TiffLayout layout_;
    TiffTree tree_;
    std::size_t rowsPerStrip_;
    z_stream stream_ = {};
    Bytes strip_;
    Bytes packed_;
    std::uint64_t position_ = 0;
    std::vector<std::uint64_t> offsets_;
    std::vector<std::uint64_t> counts_;
};

} // namespace

std::unique_ptr<PictureWriter> CreateTiff(std::unique_ptr<Sink> sink, PictureHead const &head) {
    if (head.width > UINT32_MAX || head.height > UINT32_MAX)
        throw Failure("TIFF holds at most 4294967295 pixels a side");
    return std::make_unique<TiffWriter>(std::move(sink), head);
}

} // namespace App
