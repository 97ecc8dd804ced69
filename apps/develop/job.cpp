// The whole run of develop: every photo through its stages.
#include "apps/develop/job.h"

#include "apps/common/failure.h"
#include "apps/common/imagefile.h"
#include "apps/common/offscreengpu.h"
#include "apps/common/unicode.h"
#include "apps/develop/console.h"
#include "apps/develop/developer.h"
#include "apps/develop/openclruntime.h"
#include "apps/develop/options.h"
#include "apps/develop/photolist.h"

#include "oru/core/exceptions/logicalexception.h"

#include <chrono>
#include <future>
#include <new>
#include <system_error>

namespace Develop {

namespace {

namespace fs = std::filesystem;

class Stopwatch {
public:
    double milliseconds() const {
        std::chrono::duration<double, std::milli> const elapsed = Clock::now() - start_;
        return elapsed.count();
    }

private:
    using Clock = std::chrono::steady_clock;
    Clock::time_point start_ = Clock::now();
};

std::string Milliseconds(double milliseconds) {
    return std::to_string(static_cast<long>(milliseconds + 0.5)) + " ms";
}

/// Runs a piece of work about a file. What fails becomes a problem of that file.
/// @return whether it succeeded
template<class Work>
bool Try(Console &console, std::string const &name, Work const &work) {
    try {
        work();
        return true;
    } catch (ORU::LogicalException const &failure) {
        console.problem(name, failure.message());
    } catch (std::bad_alloc const &) {
        console.problem(name, "not enough memory");
    } catch (std::exception const &failure) {
        console.problem(name, failure.what());
    }
    return false;
}

/// The line about this machine, which is printed before any other.
class Introduction {
public:
    explicit Introduction(Console &console) : console_(console) {}

    /// Starts to look for OpenCL, which takes long enough to be done beside the first photo.
    void begin(std::string const &gpu) {
        gpu_ = gpu;
        openCL_ = std::async(std::launch::async, [] { return OpenCLRuntime().description(); });
    }

    void print() {
        if (openCL_.valid())
            console_.line(gpu_ + "; " + openCL_.get());
    }

private:
    Console &console_;
    std::string gpu_;
    std::future<std::string> openCL_;
};

void DevelopPhoto(Photo const &photo, Options const &options, App::SizeLimit limit,
                  Developer &developer) {
    App::Image const image = App::ReadImage(photo.input, limit);
    developer.upload(image);
    developer.develop({options.exposure});
    App::WriteImage(photo.output, developer.readBack());
}

void MakeFolder(fs::path const &folder) {
    std::error_code error;
    fs::create_directories(folder, error);
    if (!fs::is_directory(folder, error))
        throw App::Failure("cannot be made a folder for the developed pictures");
}

void DevelopPhotos(std::vector<Photo> const &photos, Options const &options, Console &console) {
    App::OffscreenGpu const gpu(options.trace);
    Introduction introduction(console);
    if (!options.quiet)
        introduction.begin(gpu.description());
    App::SizeLimit const limit = gpu.sizeLimit();
    Developer developer;

    Stopwatch const total;
    std::size_t begun = 0;
    std::size_t succeeded = 0;
    for (Photo const &photo : photos) {
        console.progress(begun++, photos.size(), photo.name());
        Stopwatch const stopwatch;
        bool const developed =
            Try(console, photo.name(), [&] { DevelopPhoto(photo, options, limit, developer); });
        double const time = stopwatch.milliseconds();
        introduction.print();
        if (!developed)
            continue;
        ++succeeded;
        console.line(photo.name() + " -> " + App::ToText(photo.output) + " (" + Milliseconds(time) +
                     ")");
    }
    introduction.print();
    if (photos.size() > 1)
        console.line(std::to_string(succeeded) + " of " + std::to_string(photos.size()) +
                     " pictures in " + Milliseconds(total.milliseconds()));
}

} // namespace

int RunJob(Options const &options) {
    Console console(options.quiet);
    auto const onProblem = [&console](std::string const &name, std::string const &reason) {
        console.problem(name, reason);
    };
    fs::path const output = App::ToPath(options.output);
    std::vector<Photo> const photos = ListPhotos(options.inputs, output, onProblem);
    Try(console, options.output, [&] {
        MakeFolder(output);
        Try(console, "OpenGL", [&] { DevelopPhotos(photos, options, console); });
    });
    return console.hadProblems() ? 1 : 0;
}

} // namespace Develop
