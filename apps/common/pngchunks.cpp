// What PNG files hold beside pixels, in their chunks.
#include "apps/common/pngchunks.h"

#include "apps/common/failure.h"
#include "apps/common/history.h"

#include <zlib.h>

#include <algorithm>
#include <cmath>
#include <cstring>

namespace App {

namespace {

constexpr std::uint64_t kSignatureBytes = 8;
constexpr std::uint64_t kAround = 12; ///< length, name and checksum of a chunk
constexpr std::size_t kMostBytes = 16 << 20;
constexpr double kFixed = 100000; ///< of gamma and chromaticities
constexpr double kCentimetres = 100;
constexpr double kInches = 1 / 0.0254;
char const kXmpKeyword[] = "XML:com.adobe.xmp";

unsigned int BigEndian32(unsigned char const *bytes) {
    return static_cast<unsigned int>(bytes[0]) << 24 | static_cast<unsigned int>(bytes[1]) << 16 |
           static_cast<unsigned int>(bytes[2]) << 8 | bytes[3];
}

unsigned int Number(Bytes const &bytes, std::size_t index) {
    return BigEndian32(bytes.data() + 4 * index);
}

/// The bytes that a stream of deflate stands for, as far as it is whole.
Bytes Inflated(unsigned char const *bytes, std::size_t count) {
    z_stream stream = {};
    Bytes inflated;
    if (::inflateInit(&stream) != Z_OK)
        return inflated;
    stream.next_in = const_cast<unsigned char *>(bytes);
    stream.avail_in = static_cast<unsigned int>(count);
    std::array<unsigned char, 4096> part;
    int result = Z_OK;
    while (result == Z_OK && inflated.size() < kMostBytes) {
        stream.next_out = part.data();
        stream.avail_out = static_cast<unsigned int>(part.size());
        result = ::inflate(&stream, Z_NO_FLUSH);
        inflated.insert(inflated.end(), part.data(), stream.next_out);
    }
    ::inflateEnd(&stream);
    return inflated;
}

Bytes Deflated(Bytes const &bytes) {
    auto size = ::compressBound(static_cast<unsigned long>(bytes.size()));
    Bytes deflated(size);
    ::compress(deflated.data(), &size, bytes.data(), static_cast<unsigned long>(bytes.size()));
    deflated.resize(size);
    return deflated;
}

/// What the chunks tell, as they come.
class ChunkTaker {
public:
    explicit ChunkTaker(PictureHead &head) : head_(head) {}

    static bool IsWanted(std::string const &name) {
        static char const *const kNames[] = {"iCCP", "sRGB", "gAMA", "cHRM",
                                             "pHYs", "eXIf", "iTXt"};
        return std::find(std::begin(kNames), std::end(kNames), name) != std::end(kNames);
    }

    void take(std::string const &name, Bytes const &bytes) {
        ColourTags &colour = head_.colour;
        if (name == "iCCP")
            takeProfile(bytes);
        else if (name == "sRGB")
            colour.isNamedSrgb = true;
        else if (name == "gAMA" && bytes.size() == 4 && Number(bytes, 0) > 0)
            colour.gamma = kFixed / Number(bytes, 0);
        else if (name == "cHRM" && bytes.size() == 32)
            takePrimaries(bytes);
        else if (name == "pHYs" && bytes.size() == 9)
            takeResolution(bytes);
        else if (name == "eXIf")
            exif_ = bytes;
        else if (name == "iTXt")
            takeText(bytes);
    }

    Orientation finish() { return TakeHistory(std::move(exif_), std::move(xmp_), head_); }

private:
    /// A name, a zero, the method of compression, which is deflate, and the profile.
    void takeProfile(Bytes const &bytes) {
        auto const zero = std::find(bytes.begin(), bytes.end(), 0);
        if (bytes.end() - zero > 2)
            head_.colour.profile =
                Inflated(&*zero + 2, static_cast<std::size_t>(bytes.end() - zero - 2));
        if (head_.colour.profile.empty())
            head_.colour.profile.resize(1); // which is none, but it was to be one
    }

    void takePrimaries(Bytes const &bytes) {
        Primaries primaries;
        for (std::size_t i = 0; i < 4; ++i)
            primaries[i] = {Number(bytes, 2 * i) / kFixed, Number(bytes, 2 * i + 1) / kFixed};
        head_.colour.primaries = primaries;
    }

    void takeResolution(Bytes const &bytes) {
        double const x = Number(bytes, 0), y = Number(bytes, 1);
        bool const isMetric = bytes[8] == 1;
        double const scale = isMetric ? 1 / kCentimetres : 1;
        if (x > 0 && y > 0 && (isMetric || x != y))
            head_.metadata.resolution = {x * scale, y * scale,
                                         isMetric ? Resolution::Unit::Centimetre
                                                  : Resolution::Unit::None};
    }

    /// Keyword, zero, whether it is compressed and how, language, zero, keyword in it, zero, text.
    void takeText(Bytes const &bytes) {
        std::size_t const keyword = sizeof kXmpKeyword;
        if (bytes.size() < keyword + 2 || std::memcmp(bytes.data(), kXmpKeyword, keyword) != 0)
            return;
        auto from = bytes.begin() + static_cast<std::ptrdiff_t>(keyword) + 2;
        for (int i = 0; i < 2; ++i) {
            from = std::find(from, bytes.end(), 0);
            if (from == bytes.end())
                return;
            ++from;
        }
        bool const isCompressed = bytes[keyword] == 1;
        auto const count = static_cast<std::size_t>(bytes.end() - from);
        xmp_ = isCompressed ? Inflated(bytes.data() + (bytes.size() - count), count)
                            : Bytes(from, bytes.end());
    }

    PictureHead &head_;
    Bytes exif_;
    Bytes xmp_;
};

void AppendFixed(Bytes &bytes, double value) {
    constexpr double kMost = 0x7FFFFFFF;
    double const number = std::clamp(std::round(value), 0.0, kMost);
    AppendNumber(bytes, static_cast<std::uint64_t>(number), 4, true);
}

Bytes ResolutionBytes(Resolution const &resolution) {
    using Unit = Resolution::Unit;
    double const scale = resolution.unit == Unit::Inch         ? kInches
                         : resolution.unit == Unit::Centimetre ? kCentimetres
                                                               : 1;
    Bytes bytes;
    AppendFixed(bytes, resolution.x * scale);
    AppendFixed(bytes, resolution.y * scale);
    bytes.push_back(resolution.unit != Unit::None);
    return bytes;
}

Bytes ProfileBytes(Bytes const &profile) {
    static char const kName[] = "ICC profile";
    Bytes bytes(kName, kName + sizeof kName);
    bytes.push_back(0);
    Bytes const deflated = Deflated(profile);
    bytes.insert(bytes.end(), deflated.begin(), deflated.end());
    return bytes;
}

Bytes XmpBytes(Bytes const &xmp) {
    Bytes bytes(kXmpKeyword, kXmpKeyword + sizeof kXmpKeyword);
    bytes.resize(bytes.size() + 4); // neither compressed nor in a language
    bytes.insert(bytes.end(), xmp.begin(), xmp.end());
    return bytes;
}

} // namespace

Orientation TakePngChunks(Source &source, PictureHead &head) {
    ChunkTaker taker(head);
    std::uint64_t position = kSignatureBytes;
    std::array<unsigned char, 8> beginning;
    while (source.read(position, beginning.data(), beginning.size()) == beginning.size()) {
        std::size_t const count = BigEndian32(beginning.data());
        std::string const name(beginning.begin() + 4, beginning.end());
        if (ChunkTaker::IsWanted(name) && count <= kMostBytes &&
            position + kAround + count <= source.size()) {
            Bytes bytes(count + 8); // the name before, the checksum behind
            source.read(position + 4, bytes.data(), bytes.size());
            bool const isSound = ::crc32(0, bytes.data(), static_cast<unsigned int>(count + 4)) ==
                                 BigEndian32(bytes.data() + count + 4);
            if (isSound)
                taker.take(name, Bytes(bytes.begin() + 4, bytes.end() - 4));
        }
        position += kAround + count;
    }
    return taker.finish();
}

std::vector<PngChunk> PngChunksOf(PictureHead const &head, std::vector<std::string> &losses) {
    Metadata const history = HistoryOf(head);
    ColourTags const &colour = head.colour;
    losses = history.losses;
    std::vector<PngChunk> chunks;
    auto const add = [&](char const(&name)[5], Bytes bytes) {
        PngChunk chunk = {{}, std::move(bytes)};
        std::copy(std::begin(name), std::end(name), chunk.name.begin());
        chunks.push_back(std::move(chunk));
    };
    if (!colour.profile.empty())
        add("iCCP", ProfileBytes(colour.profile));
    else if (colour.isNamedSrgb)
        add("sRGB", Bytes(1)); // perceptual
    if (colour.gamma) {
        Bytes bytes;
        AppendFixed(bytes, kFixed / *colour.gamma);
        add("gAMA", std::move(bytes));
    }
    if (colour.primaries) {
        Bytes bytes;
        for (auto const &point : *colour.primaries)
            for (double const coordinate : point)
                AppendFixed(bytes, coordinate * kFixed);
        add("cHRM", std::move(bytes));
    }
    if (history.resolution)
        add("pHYs", ResolutionBytes(*history.resolution));
    if (!history.exif.empty())
        add("eXIf", history.exif);
    if (!history.xmp.empty())
        add("iTXt", XmpBytes(history.xmp));
    if (!history.iptc.empty())
        losses.push_back("PNG holds no IPTC records");
    return chunks;
}

} // namespace App
