// Files of any kind, read and written whole.
#include "apps/common/file.h"

#include "apps/common/failure.h"

#include <windows.h>

#include <cerrno>
#include <fstream>
#include <iterator>
#include <system_error>

namespace App {

namespace fs = std::filesystem;

namespace {

std::string ErrnoText() {
    return std::generic_category().message(errno);
}

/// A file that is removed unless it gets its final name.
class TemporaryFile {
public:
    explicit TemporaryFile(fs::path const &target)
        : target_(target),
          path_(target.wstring() + L"." + std::to_wstring(::GetCurrentProcessId()) + L".tmp") {}
    ~TemporaryFile() {
        std::error_code ignored;
        if (!path_.empty())
            fs::remove(path_, ignored);
    }
    TemporaryFile(TemporaryFile const &) = delete;
    TemporaryFile &operator=(TemporaryFile const &) = delete;

    void write(std::vector<unsigned char> const &bytes) {
        errno = 0;
        std::ofstream file(path_, std::ios::binary | std::ios::trunc);
        file.write(reinterpret_cast<char const *>(bytes.data()),
                   static_cast<std::streamsize>(bytes.size()));
        file.close();
        if (!file)
            throw Failure("cannot be written: " + ErrnoText());
    }

    void rename() {
        std::error_code error;
        if (fs::is_directory(target_, error))
            throw Failure("cannot be written: there is a folder of this name");
        fs::rename(path_, target_, error);
        if (error)
            throw Failure("cannot be written: the system refuses to replace it");
        path_.clear();
    }

private:
    fs::path target_;
    fs::path path_;
};

} // namespace

std::ifstream OpenFile(fs::path const &path) {
    std::error_code error;
    fs::file_status const status = fs::status(path, error);
    if (!fs::exists(status))
        throw Failure("no such file");
    if (fs::is_directory(status))
        throw Failure("is a folder");
    errno = 0;
    std::ifstream file(path, std::ios::binary);
    if (!file)
        throw Failure("cannot be opened: " + ErrnoText());
    return file;
}

void AppendBytes(std::ifstream &file, std::vector<unsigned char> &bytes, std::uintmax_t count) {
    std::size_t const before = bytes.size();
    bytes.resize(before + static_cast<std::size_t>(count));
    file.read(reinterpret_cast<char *>(bytes.data()) + before, static_cast<std::streamsize>(count));
    if (file.bad())
        throw Failure("cannot be read: " + ErrnoText());
    bytes.resize(before + static_cast<std::size_t>(file.gcount()));
}

std::string ReadText(fs::path const &path) {
    std::ifstream file = OpenFile(path);
    std::string text(std::istreambuf_iterator<char>(file), {});
    if (file.bad())
        throw Failure("cannot be read: " + ErrnoText());
    return text;
}

void WriteFile(fs::path const &path, std::vector<unsigned char> const &bytes) {
    TemporaryFile file(path);
    file.write(bytes);
    file.rename();
}

} // namespace App
