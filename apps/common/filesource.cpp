// A file that is read in pieces.
#include "apps/common/filesource.h"

#include "apps/common/failure.h"

#include <fcntl.h>
#include <io.h>

#include <cerrno>
#include <system_error>

namespace App {

namespace fs = std::filesystem;

namespace {

constexpr std::size_t kBufferBytes = 64 * 1024;
constexpr std::size_t kMostAtOnce = 1 << 30; // of what an int counts

std::string ErrnoText() {
    return std::generic_category().message(errno);
}

} // namespace

FileSource::FileSource(fs::path const &path) {
    std::error_code error;
    fs::file_status const status = fs::status(path, error);
    if (!fs::exists(status))
        throw Failure("no such file");
    if (fs::is_directory(status))
        throw Failure("is a folder");
    buffer_.reserve(kBufferBytes);
    errno = 0;
    file_ = ::_wopen(path.c_str(), _O_RDONLY | _O_BINARY | _O_NOINHERIT);
    if (file_ < 0)
        throw Failure("cannot be opened: " + ErrnoText());
    auto const size = ::_lseeki64(file_, 0, SEEK_END);
    size_ = size < 0 ? 0 : static_cast<std::uint64_t>(size);
}

FileSource::~FileSource() {
    if (file_ >= 0)
        ::_close(file_);
}

std::size_t FileSource::read(std::uint64_t position, unsigned char *target, std::size_t count) {
    std::size_t done = 0;
    while (done < count && position + done < size_) {
        std::uint64_t const from = position + done;
        if (from >= bufferBegin_ && from - bufferBegin_ < buffer_.size()) {
            auto const skip = static_cast<std::size_t>(from - bufferBegin_);
            std::size_t const part = std::min(count - done, buffer_.size() - skip);
            std::copy_n(buffer_.data() + skip, part, target + done);
            done += part;
            continue;
        }
        bool const isLong = count - done >= kBufferBytes;
        buffer_.resize(isLong ? 0 : kBufferBytes);
        std::size_t const loaded = isLong ? load(from, target + done, count - done)
                                          : load(from, buffer_.data(), kBufferBytes);
        bufferBegin_ = from;
        if (isLong)
            done += loaded;
        else
            buffer_.resize(loaded);
        if (loaded == 0)
            break; // it has become shorter
    }
    return done;
}

std::size_t FileSource::load(std::uint64_t position, unsigned char *target,
                             std::size_t count) const {
    errno = 0;
    auto const offset = static_cast<long long>(position);
    int loaded = -1;
    if (::_lseeki64(file_, offset, SEEK_SET) == offset)
        loaded = ::_read(file_, target, static_cast<unsigned int>(std::min(count, kMostAtOnce)));
    if (loaded < 0)
        throw Failure("cannot be read: " + ErrnoText());
    return static_cast<std::size_t>(loaded);
}

} // namespace App
