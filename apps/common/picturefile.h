// Picture files, row by row.
#pragma once

#include "apps/common/picture.h"
#include "apps/common/sink.h"
#include "apps/common/source.h"

#include <cstddef>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace App {

/// A picture file that is being read. One thread at a time uses it.
class PictureReader {
public:
    virtual ~PictureReader() = default;
    PictureReader(PictureReader const &) = delete;
    PictureReader &operator=(PictureReader const &) = delete;

    PictureHead const &head() const { return head_; }

    /// Why memory for the whole picture is needed, or empty: "interlaced PNG", "progressive JPEG".
    virtual std::string wholeReason() const { return std::string(); }

    /// Reads the next rows of the upright picture, from top to bottom, without gaps.
    /// @param count at most what is left
    /// @throws Failure when the file is damaged, cut off or cannot be read
    virtual void read(unsigned char *rows, std::size_t count) = 0;

protected:
    PictureReader() = default;

    PictureHead head_;
};

/// A picture file that is being written, under a temporary name until it is complete.
class PictureWriter {
public:
    virtual ~PictureWriter() = default; ///< an incomplete file goes
    PictureWriter(PictureWriter const &) = delete;
    PictureWriter &operator=(PictureWriter const &) = delete;

    /// Writes the next rows, from top to bottom, without gaps.
    /// @throws Failure when that is not possible
    virtual void write(unsigned char const *rows, std::size_t count) = 0;

    /// Completes the file, after all rows, and gives it its name.
    /// @throws Failure when that is not possible; a file of this name that was there before stays
    virtual void finish() = 0;

    /// What the file does not hold of its head, for people: "PNG holds no IPTC record".
    std::vector<std::string> const &losses() const { return losses_; }

protected:
    PictureWriter() = default;

    std::vector<std::string> losses_;
};

/// Opens a PNG, JPEG or TIFF file, told by its first bytes, and reads what comes before its pixels.
/// @throws Failure when there is no such file, or it cannot be read or used
std::unique_ptr<PictureReader> OpenPicture(std::filesystem::path const &path);
std::unique_ptr<PictureReader> OpenPicture(std::unique_ptr<Source> source);

/// The kind of file that a name stands for by its extension; nothing for any other name.
std::optional<FileKind> KindOfName(std::filesystem::path const &path);

/// How to store pixels.
struct Encoding {
    FileKind kind = FileKind::Png;
    int quality = 90;  ///< of a JPEG, 1 to 100
    Sampling sampling; ///< of a JPEG with colours
};

/// Begins a picture file. What the kind cannot hold of the shape (JPEG: 8 bits, no alpha; PNG: no
/// floats) is a failure.
/// @throws Failure when it cannot be begun
std::unique_ptr<PictureWriter> CreatePicture(std::filesystem::path const &path,
                                             PictureHead const &head, Encoding const &encoding);
std::unique_ptr<PictureWriter> CreatePicture(std::unique_ptr<Sink> sink, PictureHead const &head,
                                             Encoding const &encoding);

} // namespace App
