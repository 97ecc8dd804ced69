// Directories of fields, as TIFF files and Exif data have them.
#pragma once

#include "apps/common/source.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace App {

/// How a TIFF structure stores numbers.
struct TiffLayout {
    bool isBigEndian = false;
    bool isBig = false; ///< BigTIFF: positions of 64 bits
};

/// The bytes of a value, 0 for an unknown type.
std::size_t TiffTypeBytes(unsigned int type);

/// A field, as it lies in a directory.
struct TiffField {
    unsigned int tag = 0;
    unsigned int type = 0;
    std::uint64_t count = 0;
    std::uint64_t entry = 0;    ///< the position of its entry
    std::uint64_t position = 0; ///< of its first value

    std::uint64_t bytes() const { return count * TiffTypeBytes(type); }
};

/// The directories of a TIFF file, or of Exif data, which are like one.
class TiffStructure {
public:
    /// @param source outlives this
    /// @throws Failure when it does not begin as a TIFF does
    explicit TiffStructure(Source &source);

    TiffLayout const &layout() const { return layout_; }
    std::uint64_t firstDirectory() const { return firstDirectory_; }

    struct Directory {
        std::vector<TiffField> fields; ///< those whose values lie in the file
        std::uint64_t link = 0;        ///< the position of the next directory's position

        /// The field of a tag, null without.
        TiffField const *find(unsigned int tag) const;
    };

    /// @throws Failure when there is no directory at the position
    Directory directory(std::uint64_t position) const;

    /// The bytes of a field's values, in the byte order of the file.
    Bytes value(TiffField const &field) const;

    /// A value of a field of integers; 0 for one of another type.
    std::uint64_t number(TiffField const &field) const;

    /// A value of a field of fractions; 0 for one of another type.
    double fraction(TiffField const &field) const;

    /// A number in the byte order of the file. @throws Failure when the file ends before
    std::uint64_t numberAt(std::uint64_t position, std::size_t bytes) const;

private:
    Source &source_;
    TiffLayout layout_;
    std::uint64_t firstDirectory_ = 0;
};

/// A field by itself.
struct TiffEntry {
    unsigned int tag = 0;
    unsigned int type = 0;
    Bytes value; ///< in the byte order of where it came from or goes to
};

/// A directory with those that its fields point to.
struct TiffTree {
    unsigned int tag = 0; ///< of the field that points to it
    std::vector<TiffEntry> entries;
    std::vector<TiffTree> children;
};

/// Reads a directory whole.
/// @param pointers tags of fields that point to another directory, which has no such fields
/// @throws Failure when it is damaged or absurdly large
TiffTree ReadTiffTree(TiffStructure const &structure, std::uint64_t directory,
                      std::vector<unsigned int> const &pointers);

/// Turns numbers into those of the other byte order.
void SwapBytes(TiffEntry &entry);

/// The bytes of directories and their values, to lie at a position.
/// @param tree with values in the byte order of the layout
Bytes EncodeTiffTree(TiffTree const &tree, std::uint64_t position, TiffLayout const &layout);

/// Appends a number.
void AppendNumber(Bytes &bytes, std::uint64_t number, std::size_t count, bool isBigEndian);

} // namespace App
