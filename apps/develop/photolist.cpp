// The pictures to develop, and the files they become.
#include "apps/develop/photolist.h"

#include "apps/common/unicode.h"

#include <algorithm>
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

bool HasPictureName(fs::path const &path) {
    std::string const extension = App::FoldCase(App::ToText(path.extension()));
    return extension == ".png" || extension == ".jpg" || extension == ".jpeg";
}

std::vector<fs::path> PicturesOf(fs::path const &folder, std::error_code &error) {
    std::vector<fs::path> pictures;
    for (fs::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error))
        if (HasPictureName(entry->path()) && !entry->is_directory())
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
            onProblem(input, "the folder has no PNG or JPEG files");
        files.insert(files.end(), pictures.begin(), pictures.end());
    }
    return files;
}

} // namespace

std::string Photo::name() const {
    return App::ToText(input);
}

std::vector<Photo> ListPhotos(std::vector<std::string> const &inputs, fs::path const &outputFolder,
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
        Photo const photo{file, outputFolder / (file.stem().wstring() + L".png")};
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
