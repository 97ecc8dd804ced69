// An open file, read and written at any place.
#include "apps/common/rawfile.h"

#include "apps/common/failure.h"

#include <fcntl.h>
#include <io.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <system_error>

namespace App {

namespace {

constexpr std::size_t kMostAtOnce = 1 << 30; // of what an int counts

} // namespace

RawFile::RawFile(std::filesystem::path const &path, int flags, char const *verb) {
    errno = 0;
    file_ = ::_wopen(path.c_str(), flags | _O_BINARY | _O_NOINHERIT, _S_IREAD | _S_IWRITE);
    if (file_ < 0)
        fail(verb);
}

RawFile::~RawFile() {
    if (file_ >= 0)
        ::_close(file_);
}

std::uint64_t RawFile::size() const {
    auto const size = ::_lseeki64(file_, 0, SEEK_END);
    return size < 0 ? 0 : static_cast<std::uint64_t>(size);
}

std::size_t RawFile::read(std::uint64_t position, unsigned char *target, std::size_t count) {
    auto const part = static_cast<unsigned int>(std::min(count, kMostAtOnce));
    int const done = seek(position) ? ::_read(file_, target, part) : -1;
    if (done < 0)
        fail("read");
    return static_cast<std::size_t>(done);
}

void RawFile::write(std::uint64_t position, unsigned char const *bytes, std::size_t count) {
    while (count > 0) {
        auto const part = static_cast<unsigned int>(std::min(count, kMostAtOnce));
        int const done = seek(position) ? ::_write(file_, bytes, part) : -1;
        if (done <= 0)
            fail("written");
        position += static_cast<std::size_t>(done);
        bytes += done;
        count -= static_cast<std::size_t>(done);
    }
}

void RawFile::close() {
    int const file = file_;
    file_ = -1;
    if (::_close(file) != 0)
        fail("written");
}

bool RawFile::seek(std::uint64_t position) {
    errno = 0;
    auto const offset = static_cast<long long>(position);
    return ::_lseeki64(file_, offset, SEEK_SET) == offset;
}

void RawFile::fail(char const *verb) const {
    // Of a disk that is full errno may say nothing.
    throw Failure(std::string("cannot be ") + verb + ": " +
                  std::generic_category().message(errno != 0 ? errno : ENOSPC));
}

} // namespace App
