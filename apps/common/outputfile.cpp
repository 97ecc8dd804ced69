// A file that is written in pieces, whole or not at all.
#include "apps/common/outputfile.h"

#include "apps/common/failure.h"

#include <windows.h>

#include <fcntl.h>
#include <io.h>
#include <sys/stat.h>

#include <cerrno>
#include <system_error>

namespace App {

namespace fs = std::filesystem;

namespace {

constexpr std::size_t kBufferBytes = 256 * 1024;

[[noreturn]] void RefuseToWrite() {
    // A disk that took a part is full, of which errno says nothing.
    throw Failure("cannot be written: " +
                  std::generic_category().message(errno != 0 ? errno : ENOSPC));
}

} // namespace

OutputFile::OutputFile(fs::path const &target)
    : target_(target),
      path_(target.wstring() + L"." + std::to_wstring(::GetCurrentProcessId()) + L".tmp") {
    buffer_.reserve(kBufferBytes);
    errno = 0;
    file_ = ::_wopen(path_.c_str(), _O_WRONLY | _O_CREAT | _O_TRUNC | _O_BINARY | _O_NOINHERIT,
                     _S_IREAD | _S_IWRITE);
    if (file_ < 0)
        RefuseToWrite();
}

OutputFile::~OutputFile() {
    std::error_code ignored;
    if (file_ >= 0)
        ::_close(file_);
    if (!path_.empty())
        fs::remove(path_, ignored);
}

void OutputFile::write(std::uint64_t position, unsigned char const *bytes, std::size_t count) {
    if (position != bufferBegin_ + buffer_.size()) {
        flush();
        bufferBegin_ = position;
    }
    while (count > 0) {
        std::size_t const part = std::min(count, kBufferBytes - buffer_.size());
        buffer_.insert(buffer_.end(), bytes, bytes + part);
        bytes += part;
        count -= part;
        if (buffer_.size() == kBufferBytes)
            flush();
    }
}

void OutputFile::flush() {
    auto const offset = static_cast<long long>(bufferBegin_);
    errno = 0;
    int written = -1;
    if (::_lseeki64(file_, offset, SEEK_SET) == offset)
        written = ::_write(file_, buffer_.data(), static_cast<unsigned int>(buffer_.size()));
    if (written < 0 || static_cast<std::size_t>(written) < buffer_.size())
        RefuseToWrite();
    bufferBegin_ += buffer_.size();
    buffer_.clear();
}

void OutputFile::finish() {
    flush();
    int const closed = ::_close(file_);
    file_ = -1;
    if (closed != 0)
        RefuseToWrite();
    std::error_code error;
    if (fs::is_directory(target_, error))
        throw Failure("cannot be written: there is a folder of this name");
    fs::rename(path_, target_, error);
    if (error)
        throw Failure("cannot be written: the system refuses to replace it");
    path_.clear();
}

} // namespace App
