// The pictures to develop, and the files they become.
#include "apps/develop/photolist.h"

#include "apps/common/failure.h"
#include "apps/common/file.h"
#include "apps/common/picturefile.h"
#include "apps/common/unicode.h"

#include <fcntl.h>
#include <io.h>

#include <algorithm>
#include <cstdio>
#include <iostream>
#include <iterator>
#include <map>
#include <set>
#include <system_error>

namespace Develop {

namespace {

namespace fs = std::filesystem;

/// What two paths to one file have in common.
std::string Identity(fs::path const &path) {
    std::error_code error;
    fs::path const canonical = fs::weakly_canonical(path, error);
    return App::FoldCase(App::ToText(error ? path : canonical));
}

std::vector<fs::path> PicturesOf(fs::path const &folder, std::error_code &error) {
    std::vector<fs::path> pictures;
    for (fs::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error))
        if (App::KindOfName(entry->path()) && !entry->is_directory())
            pictures.push_back(entry->path());
    std::sort(pictures.begin(), pictures.end());
    return pictures;
}

/// The files that the inputs stand for; each is looked at when its turn comes.
std::vector<fs::path> ListFiles(std::vector<std::string> const &inputs,
                                ProblemHandler const &onProblem) {
    std::vector<fs::path> files;
    for (std::string const &input : inputs) {
        fs::path const path = App::ToPath(input);
        std::error_code error;
        if (!fs::is_directory(path, error)) {
            files.push_back(path);
            continue;
        }
        std::vector<fs::path> const pictures = PicturesOf(path, error);
        if (error)
            onProblem(input, "the folder cannot be read");
        else if (pictures.empty())
            onProblem(input, "the folder has no PNG, JPEG or TIFF files");
        files.insert(files.end(), pictures.begin(), pictures.end());
    }
    return files;
}

wchar_t const *ExtensionOf(App::FileKind kind) {
    switch (kind) {
    case App::FileKind::Jpeg:
        return L".jpg";
    case App::FileKind::Tiff:
        return L".tif";
    case App::FileKind::Png:
        break;
    }
    return L".png";
}

std::string ReadStandardInput() {
    ::_setmode(::_fileno(stdin), _O_BINARY);
    return std::string(std::istreambuf_iterator<char>(std::cin), {});
}

} // namespace

std::vector<std::string> ReadList(std::string const &file) {
    std::string text = file == "-" ? ReadStandardInput() : App::ReadText(App::ToPath(file));
    if (text.find('\0') != std::string::npos)
        throw App::Failure("is not a list of paths in UTF-8");
    if (text.compare(0, 3, "\xEF\xBB\xBF") == 0) // a mark that some editors begin UTF-8 with
        text.erase(0, 3);
    std::vector<std::string> lines;
    for (std::size_t begin = 0; begin < text.size();) {
        std::size_t const end = std::min(text.find_first_of("\r\n", begin), text.size());
        if (end > begin)
            lines.push_back(text.substr(begin, end - begin));
        begin = end + 1;
    }
    return lines;
}

std::string Photo::name() const {
    return App::ToText(input);
}

std::vector<Photo> ListPhotos(std::vector<std::string> const &inputs, fs::path const &outputFolder,
                              std::optional<App::FileKind> kind,
                              std::vector<std::string> const &alsoRead,
                              ProblemHandler const &onProblem) {
    std::vector<fs::path> const files = ListFiles(inputs, onProblem);
    std::set<std::string> inputFiles;
    for (fs::path const &file : files)
        inputFiles.insert(Identity(file));
    for (std::string const &file : alsoRead)
        inputFiles.insert(Identity(App::ToPath(file)));

    std::vector<Photo> photos;
    std::map<std::string, std::string> writers; // by output
    for (fs::path const &file : files) {
        App::FileKind const own = App::KindOfName(file).value_or(App::FileKind::Png);
        Photo const photo{file,
                          outputFolder / (file.stem().wstring() + ExtensionOf(kind.value_or(own)))};
        std::string const output = Identity(photo.output);
        auto const [writer, isNew] = writers.emplace(output, photo.name());
        if (inputFiles.count(output))
            onProblem(photo.name(), "its output " + App::ToText(photo.output) +
                                        " would replace a picture that is to be read");
        else if (!isNew)
            onProblem(photo.name(), "its output " + App::ToText(photo.output) +
                                        " is already that of " + writer->second);
        else
            photos.push_back(photo);
    }
    return photos;
}

} // namespace Develop
