// A file that is read in pieces.
#include "apps/common/filesource.h"

#include "apps/common/failure.h"

#include <fcntl.h>

#include <system_error>

namespace App {

namespace fs = std::filesystem;

namespace {

constexpr std::size_t kBufferBytes = std::size_t{64} * 1024;

fs::path const &RequireFile(fs::path const &path) {
    std::error_code error;
    fs::file_status const status = fs::status(path, error);
    if (!fs::exists(status))
        throw Failure("no such file");
    if (fs::is_directory(status))
        throw Failure("is a folder");
    return path;
}

} // namespace

FileSource::FileSource(fs::path const &path)
    : file_(RequireFile(path), _O_RDONLY, "opened"), size_(file_.size()) {
    buffer_.reserve(kBufferBytes);
}

std::size_t FileSource::read(std::uint64_t position, unsigned char *target, std::size_t count) {
    std::size_t done = 0;
    while (done < count && position + done < size_) {
        std::uint64_t const from = position + done;
        std::size_t part = 0;
        if (from >= bufferBegin_ && from - bufferBegin_ < buffer_.size()) {
            auto const skip = static_cast<std::size_t>(from - bufferBegin_);
            part = std::min(count - done, buffer_.size() - skip);
            std::copy_n(buffer_.data() + skip, part, target + done);
        } else if (count - done >= kBufferBytes) {
            part = file_.read(from, target + done, count - done);
        } else {
            buffer_.resize(kBufferBytes);
            bufferBegin_ = from;
            buffer_.resize(file_.read(from, buffer_.data(), kBufferBytes));
            if (!buffer_.empty())
                continue;
        }
        if (part == 0)
            break; // it has become shorter
        done += part;
    }
    return done;
}

} // namespace App
