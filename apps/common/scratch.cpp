// Bytes that are put aside for a while.
#include "apps/common/scratch.h"

#include "apps/common/failure.h"
#include "apps/common/picture.h"
#include "apps/common/rawfile.h"
#include "apps/common/unicode.h"

#include <windows.h>

#include <fcntl.h>

#include <algorithm>
#include <atomic>

namespace App {

namespace fs = std::filesystem;

namespace {

constexpr std::uint64_t kMostInMemory = 32 << 20;

class MemoryScratch : public Scratch {
public:
    explicit MemoryScratch(std::uint64_t bytes) : bytes_(static_cast<std::size_t>(bytes)) {}

    void write(std::uint64_t position, unsigned char const *bytes, std::size_t count) override {
        std::copy_n(bytes, count, bytes_.data() + position);
    }
    void read(std::uint64_t position, unsigned char *target, std::size_t count) override {
        std::copy_n(bytes_.data() + position, count, target);
    }

private:
    Bytes bytes_;
};

fs::path NameOfScratch() {
    static std::atomic<unsigned int> sCount;
    std::error_code error;
    fs::path const folder = fs::temp_directory_path(error);
    return folder / (L"develop-" + std::to_wstring(::GetCurrentProcessId()) + L"-" +
                     std::to_wstring(++sCount) + L".tmp");
}

class FileScratch : public Scratch {
public:
    explicit FileScratch(fs::path const &path) : path_(ToText(path)) {
        named([&] {
            file_ = std::make_unique<RawFile>(path, _O_RDWR | _O_CREAT | _O_TRUNC | _O_TEMPORARY,
                                              "written");
        });
    }

    void write(std::uint64_t position, unsigned char const *bytes, std::size_t count) override {
        named([&] { file_->write(position, bytes, count); });
    }
    void read(std::uint64_t position, unsigned char *target, std::size_t count) override {
        named([&] {
            while (count > 0) {
                std::size_t const done = file_->read(position, target, count);
                if (done == 0)
                    throw Failure("is cut off");
                position += done;
                target += done;
                count -= done;
            }
        });
    }

private:
    template<class Step>
    void named(Step const &step) const {
        try {
            step();
        } catch (Failure const &failure) {
            throw Failure("its temporary file " + path_ + " " + failure.what());
        }
    }

    std::string path_;
    std::unique_ptr<RawFile> file_;
};

} // namespace

std::unique_ptr<Scratch> MakeScratch(std::uint64_t bytes) {
    if (bytes <= kMostInMemory)
        return std::make_unique<MemoryScratch>(bytes);
    return std::make_unique<FileScratch>(NameOfScratch());
}

} // namespace App
