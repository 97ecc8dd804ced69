// What JPEG files hold beside pixels, in their markers.
#include "apps/common/jpegmarkers.h"

#include "apps/common/history.h"

#include <algorithm>
#include <cmath>
#include <map>

namespace App {

namespace {

using namespace std::string_literals;

constexpr int kExifMarker = JPEG_APP0 + 1; // XMP's, too
constexpr int kProfileMarker = JPEG_APP0 + 2;
constexpr int kPhotoshopMarker = JPEG_APP0 + 13;
constexpr std::size_t kMostBytes = 65533; ///< of a marker
constexpr unsigned int kIptcResource = 0x0404;

// What the markers' contents begin with.
std::string const kExif = "Exif\0\0"s;
std::string const kXmp = "http://ns.adobe.com/xap/1.0/\0"s;
std::string const kExtendedXmp = "http://ns.adobe.com/xmp/extension/\0"s;
std::string const kProfile = "ICC_PROFILE\0"s;
std::string const kPhotoshop = "Photoshop 3.0\0"s;
std::string const kResource = "8BIM";

bool BeginsWith(Bytes const &bytes, std::string const &beginning) {
    return bytes.size() >= beginning.size() &&
           std::equal(beginning.begin(), beginning.end(), bytes.begin(),
                      [](char a, unsigned char b) { return static_cast<unsigned char>(a) == b; });
}

Bytes Without(Bytes const &bytes, std::string const &beginning) {
    return Bytes(bytes.begin() + static_cast<std::ptrdiff_t>(beginning.size()), bytes.end());
}

void Append(Bytes &bytes, Bytes const &more) {
    bytes.insert(bytes.end(), more.begin(), more.end());
}

Bytes Joined(std::string const &beginning, Bytes const &rest) {
    Bytes bytes(beginning.begin(), beginning.end());
    Append(bytes, rest);
    return bytes;
}

/// The profile that its numbered chunks make; one byte, which is none, when one is missing.
Bytes JoinProfile(std::map<unsigned int, Bytes> const &chunks, std::size_t count) {
    if (chunks.empty())
        return Bytes();
    if (chunks.size() != count || chunks.begin()->first != 1 || chunks.rbegin()->first != count)
        return Bytes(1);
    Bytes profile;
    for (auto const &chunk : chunks)
        Append(profile, chunk.second);
    return profile;
}

std::size_t BigEndian(Bytes const &bytes, std::size_t position, std::size_t count) {
    std::size_t number = 0;
    for (std::size_t i = 0; i < count; ++i)
        number = number << 8 | bytes[position + i];
    return number;
}

/// The IPTC records in Photoshop's resources: each with a mark, a number, a name and its length.
Bytes IptcOf(Bytes const &resources) {
    std::size_t at = 0;
    while (at + 7 <= resources.size()) {
        std::size_t const nameBytes = resources[at + 6] + std::size_t{1};
        std::size_t const length = at + 6 + nameBytes + nameBytes % 2;
        if (length + 4 > resources.size())
            break;
        std::size_t const begin = length + 4, count = BigEndian(resources, length, 4);
        if (count > resources.size() - begin)
            break;
        auto const first = resources.begin() + static_cast<std::ptrdiff_t>(begin);
        if (BigEndian(resources, at + 4, 2) == kIptcResource)
            return Bytes(first, first + static_cast<std::ptrdiff_t>(count));
        at = begin + count + count % 2;
    }
    return Bytes();
}

Bytes ResourceOf(Bytes const &iptc) {
    Bytes resource = Joined(kResource, Bytes());
    AppendNumber(resource, kIptcResource, 2, true);
    AppendNumber(resource, 0, 2, true); // no name
    AppendNumber(resource, iptc.size(), 4, true);
    Append(resource, iptc);
    resource.resize(resource.size() + resource.size() % 2);
    return resource;
}

std::optional<Resolution> ResolutionOf(jpeg_decompress_struct const &codec) {
    using Unit = Resolution::Unit;
    bool const isSquareAspect = codec.density_unit == 0 && codec.X_density == codec.Y_density;
    if (!codec.saw_JFIF_marker || codec.density_unit > 2 || isSquareAspect ||
        codec.X_density == 0 || codec.Y_density == 0)
        return std::nullopt;
    static constexpr Unit kUnits[] = {Unit::None, Unit::Inch, Unit::Centimetre};
    return Resolution{1.0 * codec.X_density, 1.0 * codec.Y_density, kUnits[codec.density_unit]};
}

} // namespace

void SaveJpegMarkers(j_decompress_ptr codec) {
    for (int const marker : {kExifMarker, kProfileMarker, kPhotoshopMarker})
        jpeg_save_markers(codec, marker, 0xFFFF);
}

Orientation TakeJpegMarkers(jpeg_decompress_struct const &codec, PictureHead &head) {
    Bytes exif, xmp, resources;
    std::map<unsigned int, Bytes> chunks;
    std::size_t chunkCount = 0;
    bool isXmpCut = false;
    for (auto const *marker = codec.marker_list; marker; marker = marker->next) {
        Bytes const bytes(marker->data, marker->data + marker->data_length);
        if (marker->marker == kExifMarker && BeginsWith(bytes, kExif) && exif.empty())
            exif = Without(bytes, kExif);
        else if (marker->marker == kExifMarker && BeginsWith(bytes, kXmp) && xmp.empty())
            xmp = Without(bytes, kXmp);
        else if (marker->marker == kExifMarker && BeginsWith(bytes, kExtendedXmp))
            isXmpCut = true;
        else if (marker->marker == kPhotoshopMarker && BeginsWith(bytes, kPhotoshop))
            Append(resources, Without(bytes, kPhotoshop));
        else if (marker->marker == kProfileMarker && BeginsWith(bytes, kProfile) &&
                 bytes.size() > kProfile.size() + 2) {
            chunkCount = bytes[kProfile.size() + 1];
            chunks[bytes[kProfile.size()]] = Without(bytes, kProfile + "nn");
        }
    }
    head.colour.profile = JoinProfile(chunks, chunkCount);
    head.metadata.iptc = IptcOf(resources);
    head.metadata.resolution = ResolutionOf(codec);
    if (isXmpCut)
        head.metadata.losses.push_back(
            "the extended XMP, of more than one JPEG segment, is dropped");
    return TakeHistory(std::move(exif), std::move(xmp), head);
}

std::vector<JpegMarker> JpegMarkersOf(PictureHead const &head, std::vector<std::string> &losses) {
    Metadata const history = HistoryOf(head);
    losses = history.losses;
    std::vector<JpegMarker> markers;
    auto const add = [&](int marker, std::string const &beginning, Bytes const &bytes,
                         char const *what) {
        if (bytes.empty())
            return;
        if (beginning.size() + bytes.size() <= kMostBytes)
            markers.push_back({marker, Joined(beginning, bytes)});
        else
            losses.push_back("JPEG holds at most 64 KiB of "s + what);
    };
    add(kExifMarker, kExif, history.exif, "Exif data");
    add(kExifMarker, kXmp, history.xmp, "XMP");
    if (!history.iptc.empty())
        add(kPhotoshopMarker, kPhotoshop, ResourceOf(history.iptc), "IPTC records");

    Bytes const &profile = head.colour.profile;
    std::size_t const chunkBytes = kMostBytes - kProfile.size() - 2;
    std::size_t const count = (profile.size() + chunkBytes - 1) / chunkBytes;
    if (count > 255)
        losses.push_back("JPEG holds at most 16 MiB of a colour profile");
    for (std::size_t i = 0; i < count && count <= 255; ++i) {
        auto const begin = profile.begin() + static_cast<std::ptrdiff_t>(i * chunkBytes);
        auto const end = profile.begin() + static_cast<std::ptrdiff_t>(
                                               std::min(profile.size(), (i + 1) * chunkBytes));
        std::string const number = {static_cast<char>(i + 1), static_cast<char>(count)};
        markers.push_back({kProfileMarker, Joined(kProfile + number, Bytes(begin, end))});
    }
    if (profile.empty() && !head.colour.isNamedSrgb && (head.colour.gamma || head.colour.primaries))
        losses.push_back("JPEG holds no gamma and primaries without a colour profile");
    return markers;
}

void SetJpegDensity(j_compress_ptr codec, Resolution const &resolution) {
    using Unit = Resolution::Unit;
    // What is near to a whole number in inches is written so, whatever unit it came in.
    constexpr double kCentimetres = 2.54;
    double x = resolution.x, y = resolution.y;
    auto const error = [&](double factor) {
        double const value = x * factor;
        return std::abs(value - std::round(value)) / value;
    };
    bool const isInches = resolution.unit == Unit::Inch;
    double const other = isInches ? 1 / kCentimetres : kCentimetres;
    bool isOther = resolution.unit != Unit::None && error(other) < error(1);
    x *= isOther ? other : 1;
    y *= isOther ? other : 1;
    if (!(std::min(x, y) >= 0.5 && std::max(x, y) < 65535))
        return;
    codec->density_unit = resolution.unit == Unit::None ? 0 : isInches != isOther ? 1 : 2;
    codec->X_density = static_cast<UINT16>(std::lround(x));
    codec->Y_density = static_cast<UINT16>(std::lround(y));
}

} // namespace App
