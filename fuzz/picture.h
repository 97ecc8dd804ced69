// What the harnesses of picture files share.
#pragma once

#include "fuzz/harness.h"

#include "apps/common/failure.h"
#include "apps/common/picturefile.h"
#include "apps/common/scratch.h"

#include <algorithm>
#include <memory>
#include <vector>

namespace App {

// The programs' own, which makes files, is of Windows.
std::unique_ptr<Scratch> MakeScratch(std::uint64_t bytes) {
    class Memory : public Scratch {
    public:
        explicit Memory(std::uint64_t count) : bytes_(count) {}
        void write(std::uint64_t position, unsigned char const *bytes, std::size_t count) override {
            HOLDS(position + count <= bytes_.size());
            std::copy_n(bytes, count, bytes_.data() + position);
        }
        void read(std::uint64_t position, unsigned char *target, std::size_t count) override {
            HOLDS(position + count <= bytes_.size());
            std::copy_n(bytes_.data() + position, count, target);
        }

    private:
        Bytes bytes_;
    };
    return std::make_unique<Memory>(bytes);
}

} // namespace App

namespace fuzz {

/// What a file holds; without pixels when it is larger than a harness has time for.
struct Picture {
    App::PictureHead head;
    App::Bytes pixels;
};

inline Picture Read(App::Bytes const &file) {
    constexpr std::size_t kMostSide = 300;
    auto const reader = App::OpenPicture(std::make_unique<App::MemorySource>(file));
    Picture picture = {reader->head(), {}};
    App::PictureHead const &head = picture.head;
    HOLDS(head.width > 0 && head.height > 0 && head.channels >= 1 && head.channels <= 4);
    HOLDS(head.bitsPerChannel == 8 || head.bitsPerChannel == 16 || head.bitsPerChannel == 32);
    if (head.width > kMostSide || head.height > kMostSide)
        return picture;
    picture.pixels.resize(head.rowBytes() * head.height);
    for (std::size_t y = 0; y < head.height; y += 3)
        reader->read(picture.pixels.data() + y * head.rowBytes(),
                     std::min<std::size_t>(3, head.height - y));
    return picture;
}

/// Writes what was read as another kind of file, and reads it again.
inline void WriteAndRead(Picture const &picture, App::FileKind kind) {
    App::Bytes file;
    App::Encoding encoding;
    encoding.kind = kind;
    if (picture.head.sampling)
        encoding.sampling = *picture.head.sampling;
    auto const writer =
        App::CreatePicture(std::make_unique<App::MemorySink>(file), picture.head, encoding);
    writer->write(picture.pixels.data(), picture.head.height);
    writer->finish();
    Picture const again = Read(file);
    HOLDS(again.head == static_cast<App::Shape const &>(picture.head));
    HOLDS(kind == App::FileKind::Jpeg || again.pixels == picture.pixels);
    HOLDS(again.head.colour.profile == picture.head.colour.profile);
}

/// Takes a file apart, and puts it together as every kind that holds it.
inline void Check(std::uint8_t const *data, std::size_t size) {
    Picture picture;
    try {
        picture = Read(App::Bytes(data, data + size));
    } catch (App::Failure const &failure) {
        HOLDS(std::string(failure.what()).find('\n') == std::string::npos);
        return;
    }
    if (picture.pixels.empty())
        return;
    unsigned int const bits = picture.head.bitsPerChannel;
    WriteAndRead(picture, App::FileKind::Tiff);
    if (bits <= 16)
        WriteAndRead(picture, App::FileKind::Png);
    if (bits == 8 && !picture.head.hasAlpha())
        WriteAndRead(picture, App::FileKind::Jpeg);
}

} // namespace fuzz
