// A file that is written in pieces, whole or not at all.
#include "apps/common/outputfile.h"

#include "apps/common/failure.h"

#include <windows.h>

#include <fcntl.h>

#include <system_error>

namespace App {

namespace fs = std::filesystem;

namespace {

constexpr std::size_t kBufferBytes = std::size_t{256} * 1024;

} // namespace

TemporaryPath::TemporaryPath(fs::path const &target)
    : target_(target),
      path_(target.wstring() + L"." + std::to_wstring(::GetCurrentProcessId()) + L".tmp") {}

TemporaryPath::~TemporaryPath() {
    std::error_code ignored;
    if (!path_.empty())
        fs::remove(path_, ignored);
}

void TemporaryPath::becomeTarget() {
    std::error_code error;
    if (fs::is_directory(target_, error))
        throw Failure("cannot be written: there is a folder of this name");
    fs::rename(path_, target_, error);
    if (error)
        throw Failure("cannot be written: the system refuses to replace it");
    path_.clear();
}

OutputFile::OutputFile(fs::path const &target)
    : path_(target), file_(path_.path(), _O_WRONLY | _O_CREAT | _O_TRUNC, "written") {
    buffer_.reserve(kBufferBytes);
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
    file_.write(bufferBegin_, buffer_.data(), buffer_.size());
    bufferBegin_ += buffer_.size();
    buffer_.clear();
}

void OutputFile::finish() {
    flush();
    file_.close();
    path_.becomeTarget();
}

} // namespace App
