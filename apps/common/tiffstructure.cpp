// Directories of fields, as TIFF files and Exif data have them.
#include "apps/common/tiffstructure.h"

#include "apps/common/failure.h"

#include <algorithm>
#include <array>

namespace App {

namespace {

enum Type : unsigned int {
    BYTE = 1,
    SHORT = 3,
    LONG = 4,
    RATIONAL = 5,
    IFD = 13,
    LONG8 = 16,
    IFD8 = 18
};

/// What no history reaches.
constexpr std::uint64_t kMostBytes = 16 << 20;

/// The sizes of what differs between the two kinds.
struct Sizes {
    explicit Sizes(bool isBig) : count(isBig ? 8 : 2), position(isBig ? 8 : 4) {}

    std::size_t count;    ///< of a directory's fields
    std::size_t position; ///< in the file; also a field's count of values

    std::size_t entry() const { return 4 + 2 * position; }
    std::size_t directory(std::size_t fields) const { return count + fields * entry() + position; }
};

std::size_t ValueBytes(TiffEntry const &entry, Sizes const &sizes) {
    std::size_t const bytes = entry.value.size();
    return bytes <= sizes.position ? 0 : bytes + bytes % 2;
}

std::size_t OwnBytes(TiffTree const &tree, Sizes const &sizes) {
    std::size_t bytes = sizes.directory(tree.entries.size() + tree.children.size());
    for (TiffEntry const &entry : tree.entries)
        bytes += ValueBytes(entry, sizes);
    return bytes + bytes % 2;
}

} // namespace

std::size_t TiffTypeBytes(unsigned int type) {
    static constexpr std::array<std::size_t, 19> kBytes = {0, 1, 1, 2, 4, 8, 1, 1, 2, 4,
                                                           8, 4, 8, 4, 0, 0, 8, 8, 8};
    return type < kBytes.size() ? kBytes[type] : 0;
}

TiffField const *TiffStructure::Directory::find(unsigned int tag) const {
    auto const found = std::find_if(fields.begin(), fields.end(),
                                    [&](TiffField const &field) { return field.tag == tag; });
    return found == fields.end() ? nullptr : &*found;
}

TiffStructure::TiffStructure(Source &source) : source_(source) {
    layout_.isBigEndian = numberAt(0, 1) == 'M';
    std::uint64_t const version = numberAt(2, 2);
    layout_.isBig = version == 43;
    bool const isKnown = numberAt(0, 1) == numberAt(1, 1) &&
                         (layout_.isBigEndian || numberAt(0, 1) == 'I') &&
                         (version == 42 || layout_.isBig);
    if (!isKnown)
        throw Failure("is no TIFF structure");
    firstDirectory_ = layout_.isBig ? numberAt(8, 8) : numberAt(4, 4);
}

std::uint64_t TiffStructure::numberAt(std::uint64_t position, std::size_t bytes) const {
    std::array<unsigned char, 8> digits;
    if (source_.read(position, digits.data(), bytes) < bytes)
        throw Failure("is cut off");
    std::uint64_t number = 0;
    for (std::size_t i = 0; i < bytes; ++i)
        number = number << 8 | digits[layout_.isBigEndian ? i : bytes - 1 - i];
    return number;
}

TiffStructure::Directory TiffStructure::directory(std::uint64_t position) const {
    Sizes const sizes(layout_.isBig);
    std::uint64_t const size = source_.size();
    if (position == 0 || position > size)
        throw Failure("has no directory where one should be");
    std::uint64_t const count = numberAt(position, sizes.count);
    if (count > (size - position - sizes.count) / sizes.entry())
        throw Failure("is cut off");
    Directory directory;
    directory.link = position + sizes.count + count * sizes.entry();
    for (std::uint64_t i = 0; i < count; ++i) {
        TiffField field;
        field.entry = position + sizes.count + i * sizes.entry();
        field.tag = static_cast<unsigned int>(numberAt(field.entry, 2));
        field.type = static_cast<unsigned int>(numberAt(field.entry + 2, 2));
        field.count = numberAt(field.entry + 4, sizes.position);
        std::size_t const typeBytes = TiffTypeBytes(field.type);
        if (typeBytes == 0 || field.count == 0 || field.count > size / typeBytes)
            continue;
        field.position = field.entry + 4 + sizes.position;
        if (field.bytes() > sizes.position)
            field.position = numberAt(field.position, sizes.position);
        if (field.position <= size && field.bytes() <= size - field.position)
            directory.fields.push_back(field);
        else
            directory.isWhole = false;
    }
    return directory;
}

Bytes TiffStructure::value(TiffField const &field) const {
    if (field.bytes() > kMostBytes)
        throw Failure("is absurdly large");
    Bytes value(static_cast<std::size_t>(field.bytes()));
    if (source_.read(field.position, value.data(), value.size()) < value.size())
        throw Failure("is cut off");
    return value;
}

std::uint64_t TiffStructure::number(TiffField const &field) const {
    bool const isInteger = field.type == BYTE || field.type == SHORT || field.type == LONG ||
                           field.type == IFD || field.type == LONG8 || field.type == IFD8;
    return isInteger ? numberAt(field.position, TiffTypeBytes(field.type)) : 0;
}

double TiffStructure::fraction(TiffField const &field) const {
    if (field.type != RATIONAL)
        return 0;
    auto const above = static_cast<double>(numberAt(field.position, 4));
    auto const below = static_cast<double>(numberAt(field.position + 4, 4));
    return below > 0 ? above / below : 0;
}

TiffTree ReadTiffTree(TiffStructure const &structure, std::uint64_t directory,
                      std::vector<unsigned int> const &pointers) {
    TiffTree tree;
    std::uint64_t bytes = 0;
    for (TiffField const &field : structure.directory(directory).fields) {
        bytes += field.bytes();
        if (bytes > kMostBytes)
            throw Failure("is absurdly large");
        if (std::find(pointers.begin(), pointers.end(), field.tag) == pointers.end()) {
            tree.entries.push_back({field.tag, field.type, structure.value(field)});
            continue;
        }
        tree.children.push_back(ReadTiffTree(structure, structure.number(field), {}));
        tree.children.back().tag = field.tag;
    }
    return tree;
}

void SwapBytes(TiffEntry &entry) {
    constexpr unsigned int kSignedRational = 10;
    std::size_t unit = TiffTypeBytes(entry.type);
    if (entry.type == RATIONAL || entry.type == kSignedRational)
        unit /= 2;
    if (unit < 2)
        return;
    for (auto begin = entry.value.begin();
         entry.value.end() - begin >= static_cast<std::ptrdiff_t>(unit);
         begin += static_cast<std::ptrdiff_t>(unit))
        std::reverse(begin, begin + static_cast<std::ptrdiff_t>(unit));
}

void AppendNumber(Bytes &bytes, std::uint64_t number, std::size_t count, bool isBigEndian) {
    for (std::size_t i = 0; i < count; ++i)
        bytes.push_back(
            static_cast<unsigned char>(number >> 8 * (isBigEndian ? count - 1 - i : i)));
}

Bytes EncodeTiffTree(TiffTree const &tree, std::uint64_t position, TiffLayout const &layout) {
    Sizes const sizes(layout.isBig);
    // Directory, its values, then those that it points to.
    std::vector<TiffEntry> entries = tree.entries;
    Bytes below;
    for (TiffTree const &child : tree.children) {
        std::uint64_t const childPosition = position + OwnBytes(tree, sizes) + below.size();
        TiffEntry pointer = {child.tag, layout.isBig ? LONG8 : LONG, {}};
        AppendNumber(pointer.value, childPosition, sizes.position, layout.isBigEndian);
        entries.push_back(pointer);
        Bytes const encoded = EncodeTiffTree(child, childPosition, layout);
        below.insert(below.end(), encoded.begin(), encoded.end());
    }
    std::sort(entries.begin(), entries.end(),
              [](TiffEntry const &a, TiffEntry const &b) { return a.tag < b.tag; });

    Bytes directory, values;
    auto const append = [&](std::uint64_t number, std::size_t bytes) {
        AppendNumber(directory, number, bytes, layout.isBigEndian);
    };
    append(entries.size(), sizes.count);
    for (TiffEntry const &entry : entries) {
        append(entry.tag, 2);
        append(entry.type, 2);
        // Only entries of known types are kept.
        std::size_t const unit = std::max<std::size_t>(TiffTypeBytes(entry.type), 1);
        append(entry.value.size() / unit, sizes.position);
        if (ValueBytes(entry, sizes) == 0) {
            directory.insert(directory.end(), entry.value.begin(), entry.value.end());
            directory.insert(directory.end(), sizes.position - entry.value.size(), 0);
            continue;
        }
        append(position + sizes.directory(entries.size()) + values.size(), sizes.position);
        values.insert(values.end(), entry.value.begin(), entry.value.end());
        values.insert(values.end(), entry.value.size() % 2, 0);
    }
    append(0, sizes.position); // no next directory
    directory.insert(directory.end(), values.begin(), values.end());
    directory.resize(OwnBytes(tree, sizes));
    directory.insert(directory.end(), below.begin(), below.end());
    return directory;
}

} // namespace App
