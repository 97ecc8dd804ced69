// The history of a picture, as it goes from one file into another.
#include "apps/common/history.h"

#include "apps/common/failure.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <string>

namespace App {

namespace {

enum Tag : unsigned int {
    IMAGE_DESCRIPTION = 0x010E,
    MAKE = 0x010F,
    MODEL = 0x0110,
    ORIENTATION = 0x0112,
    X_RESOLUTION = 0x011A,
    Y_RESOLUTION = 0x011B,
    RESOLUTION_UNIT = 0x0128,
    SOFTWARE = 0x0131,
    DATE_TIME = 0x0132,
    ARTIST = 0x013B,
    HOST_COMPUTER = 0x013C,
    THUMBNAIL_POSITION = 0x0201,
    THUMBNAIL_BYTES = 0x0202,
    COPYRIGHT = 0x8298,
    EXIF_DIRECTORY = 0x8769,
    GPS_DIRECTORY = 0x8825,
    MAKER_NOTE = 0x927C,
    COLOUR_SPACE = 0xA001,
    PIXEL_WIDTH = 0xA002,
    PIXEL_HEIGHT = 0xA003,
    INTEROPERABILITY_DIRECTORY = 0xA005
};

constexpr unsigned int kShort = 3;
constexpr unsigned int kLong = 4;
constexpr std::uint64_t kSrgb = 1;
constexpr std::uint64_t kUncalibrated = 0xFFFF;
constexpr char const *kMovedNote =
    "the camera maker's note has moved, which programs of the maker may not understand";

/// Exif data that are changed in their place, which leaves alone what a maker's note points to.
class Exif {
public:
    /// @throws Failure when they are damaged
    explicit Exif(Bytes &bytes)
        : bytes_(bytes), source_(bytes), structure_(source_),
          main_(structure_.directory(structure_.firstDirectory())) {
        if (structure_.layout().isBig)
            throw Failure("is no Exif");
        if (TiffField const *const pointer = main_.find(EXIF_DIRECTORY))
            camera_ = structure_.directory(structure_.number(*pointer));
        if (TiffField const *const pointer = main_.find(GPS_DIRECTORY))
            structure_.directory(structure_.number(*pointer));
    }

    /// A number of the first directory or that of the camera; 0 without.
    std::uint64_t number(unsigned int tag) const {
        TiffField const *const field = find(tag);
        return field ? structure_.number(*field) : 0;
    }
    double fraction(unsigned int tag) const {
        TiffField const *const field = find(tag);
        return field ? structure_.fraction(*field) : 0;
    }

    /// Changes a number that is there.
    void set(unsigned int tag, std::uint64_t number) {
        TiffField const *const field = find(tag);
        bool const isLong = field && field->type == kLong;
        if (isLong || (field && field->type == kShort && number <= 0xFFFF))
            put(field->position, number, isLong ? 4 : 2);
    }

    void dropThumbnail() {
        std::uint64_t const next = structure_.numberAt(main_.link, 4);
        put(main_.link, 0, 4);
        if (next == 0 || next >= bytes_.size())
            return;
        try {
            TiffStructure::Directory const directory = structure_.directory(next);
            TiffField const *const position = directory.find(THUMBNAIL_POSITION);
            TiffField const *const length = directory.find(THUMBNAIL_BYTES);
            if (position && length)
                wipe(structure_.number(*position), structure_.number(*length));
        } catch (Failure const &) {
            // It cannot be found, by others neither.
        }
    }

private:
    TiffField const *find(unsigned int tag) const {
        TiffField const *const field = main_.find(tag);
        return field ? field : camera_.find(tag);
    }

    void put(std::uint64_t position, std::uint64_t number, std::size_t count) {
        Bytes digits;
        AppendNumber(digits, number, count, structure_.layout().isBigEndian);
        std::copy(digits.begin(), digits.end(),
                  bytes_.begin() + static_cast<std::ptrdiff_t>(position));
    }

    /// Overwrites what is no longer used, or cuts it off at the end.
    void wipe(std::uint64_t position, std::uint64_t count) {
        std::uint64_t const size = bytes_.size();
        if (position < main_.link || position > size)
            return;
        auto const begin = static_cast<std::size_t>(position);
        auto const end = static_cast<std::size_t>(std::min(size, position + std::min(size, count)));
        if (size - end <= 1)
            bytes_.resize(begin);
        else
            std::fill(bytes_.begin() + static_cast<std::ptrdiff_t>(begin),
                      bytes_.begin() + static_cast<std::ptrdiff_t>(end),
                      static_cast<unsigned char>(0));
    }

    Bytes &bytes_;
    MemorySource source_; ///< of the bytes as they were
    TiffStructure structure_;
    TiffStructure::Directory main_;
    TiffStructure::Directory camera_;
};

/// Changes the number that a property of XMP has, as an attribute or an element.
void SetInXmp(Bytes &xmp, std::string const &name, std::uint64_t number) {
    std::string const digits = std::to_string(number);
    auto from = xmp.begin();
    for (;;) {
        from = std::search(from, xmp.end(), name.begin(), name.end());
        if (from == xmp.end())
            return;
        from += static_cast<std::ptrdiff_t>(name.size());
        auto const isDigit = [](unsigned char c) { return std::isdigit(c) != 0; };
        auto const isBetween = [](unsigned char c) {
            return std::isspace(c) || c == '=' || c == '"' || c == '\'' || c == '>';
        };
        auto const begin = std::find_if_not(from, xmp.end(), isBetween);
        auto const end = std::find_if_not(begin, xmp.end(), isDigit);
        if (begin == from || begin == end)
            continue;
        auto const at = begin - xmp.begin();
        xmp.insert(xmp.erase(begin, end), digits.begin(), digits.end());
        from = xmp.begin() + at + static_cast<std::ptrdiff_t>(digits.size());
    }
}

Orientation TakeExif(Bytes exif, PictureHead &head) {
    Orientation orientation = kUpright;
    try {
        Exif data(exif);
        std::uint64_t const held = data.number(ORIENTATION);
        if (held >= 1 && held <= 8)
            orientation = static_cast<Orientation>(held);
        if (data.number(COLOUR_SPACE) == kSrgb)
            head.colour.isNamedSrgb = true;
        Resolution const resolution = {data.fraction(X_RESOLUTION), data.fraction(Y_RESOLUTION),
                                       data.number(RESOLUTION_UNIT) == 3
                                           ? Resolution::Unit::Centimetre
                                           : Resolution::Unit::Inch};
        if (!head.metadata.resolution && resolution.x > 0 && resolution.y > 0)
            head.metadata.resolution = resolution;
        data.set(ORIENTATION, kUpright);
        data.dropThumbnail();
        // Of directories that share bytes one spoils the other.
        if (Exif(exif).number(ORIENTATION) > kUpright)
            throw Failure("cannot be changed");
        head.metadata.exif = std::move(exif);
    } catch (Failure const &) {
        head.metadata.losses.push_back("the Exif data are damaged");
    }
    return orientation;
}

/// What the first directory tells of a picture, not of how its pixels are stored.
bool IsHistory(unsigned int tag) {
    static constexpr unsigned int kTags[] = {
        IMAGE_DESCRIPTION, MAKE,      MODEL,  X_RESOLUTION,  Y_RESOLUTION, RESOLUTION_UNIT,
        SOFTWARE,          DATE_TIME, ARTIST, HOST_COMPUTER, COPYRIGHT};
    constexpr unsigned int kFirstOfWindows = 0x9C9B, kLastOfWindows = 0x9C9F; // titles, keywords
    return std::find(std::begin(kTags), std::end(kTags), tag) != std::end(kTags) ||
           (tag >= kFirstOfWindows && tag <= kLastOfWindows);
}

/// The history in a first directory.
/// @param losses gets what may not be understood elsewhere
TiffTree HistoryTree(TiffStructure const &structure, std::vector<std::string> &losses) {
    TiffTree tree;
    for (TiffField const &field : structure.directory(structure.firstDirectory()).fields)
        if (IsHistory(field.tag)) {
            tree.entries.push_back({field.tag, field.type, structure.value(field)});
        } else if (field.tag == EXIF_DIRECTORY || field.tag == GPS_DIRECTORY) {
            TiffTree child =
                ReadTiffTree(structure, structure.number(field), {INTEROPERABILITY_DIRECTORY});
            child.tag = field.tag;
            for (TiffEntry const &entry : child.entries)
                if (entry.tag == MAKER_NOTE &&
                    std::find(losses.begin(), losses.end(), kMovedNote) == losses.end())
                    losses.push_back(kMovedNote);
            tree.children.push_back(std::move(child));
        }
    return tree;
}

void SwapAll(TiffTree &tree) {
    std::for_each(tree.entries.begin(), tree.entries.end(), SwapBytes);
    std::for_each(tree.children.begin(), tree.children.end(), SwapAll);
}

} // namespace

Orientation TakeHistory(Bytes exif, Bytes xmp, PictureHead &head) {
    Orientation orientation = kUpright;
    if (!exif.empty())
        orientation = TakeExif(std::move(exif), head);
    SetInXmp(xmp, "tiff:Orientation", kUpright);
    head.metadata.xmp = std::move(xmp);
    return orientation;
}

Metadata HistoryOf(PictureHead const &head) {
    Metadata history = head.metadata;
    ColourTags const &colour = head.colour;
    bool const isTagged = !colour.profile.empty() || colour.gamma || colour.primaries;
    if (!history.exif.empty()) {
        try {
            Exif data(history.exif);
            data.set(PIXEL_WIDTH, head.width);
            data.set(PIXEL_HEIGHT, head.height);
            if (colour.isNamedSrgb || isTagged)
                data.set(COLOUR_SPACE, colour.isNamedSrgb ? kSrgb : kUncalibrated);
        } catch (Failure const &) {
            history.exif.clear();
            history.losses.push_back("the Exif data are damaged");
        }
    }
    for (char const *const name : {"exif:PixelXDimension", "tiff:ImageWidth"})
        SetInXmp(history.xmp, name, head.width);
    for (char const *const name : {"exif:PixelYDimension", "tiff:ImageLength"})
        SetInXmp(history.xmp, name, head.height);
    return history;
}

Bytes ExifOfTiff(TiffStructure const &structure, std::vector<std::string> &losses) {
    TiffTree const tree = HistoryTree(structure, losses);
    if (tree.entries.empty() && tree.children.empty())
        return Bytes();
    constexpr std::uint64_t kHeaderBytes = 8;
    TiffLayout const layout = {structure.layout().isBigEndian, false};
    char const mark = layout.isBigEndian ? 'M' : 'I';
    Bytes exif(2, static_cast<unsigned char>(mark));
    AppendNumber(exif, 42, 2, layout.isBigEndian);
    AppendNumber(exif, kHeaderBytes, 4, layout.isBigEndian);
    Bytes const directories = EncodeTiffTree(tree, kHeaderBytes, layout);
    exif.insert(exif.end(), directories.begin(), directories.end());
    return exif;
}

TiffTree TiffOfExif(Bytes const &exif, bool isBigEndian, std::vector<std::string> &losses) {
    MemorySource source(exif);
    TiffStructure const structure(source);
    TiffTree tree = HistoryTree(structure, losses);
    if (structure.layout().isBigEndian != isBigEndian)
        SwapAll(tree);
    return tree;
}

} // namespace App
