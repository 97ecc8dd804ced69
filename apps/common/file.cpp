// Files of any kind, read and written whole.
#include "apps/common/file.h"

#include "apps/common/filesource.h"
#include "apps/common/outputfile.h"

namespace App {

std::string ReadText(std::filesystem::path const &path) {
    FileSource file(path);
    Bytes text(static_cast<std::size_t>(file.size()));
    text.resize(file.read(0, text.data(), text.size()));
    return std::string(text.begin(), text.end());
}

void WriteFile(std::filesystem::path const &path, std::vector<unsigned char> const &bytes) {
    OutputFile file(path);
    file.write(0, bytes.data(), bytes.size());
    file.finish();
}

} // namespace App
