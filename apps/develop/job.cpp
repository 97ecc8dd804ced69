// The whole run of develop: every photo through its stages.
#include "apps/develop/job.h"

#include "apps/common/failure.h"
#include "apps/common/offscreengpu.h"
#include "apps/common/unicode.h"
#include "apps/develop/choosesharpener.h"
#include "apps/develop/console.h"
#include "apps/develop/openclruntime.h"
#include "apps/develop/options.h"
#include "apps/develop/photojob.h"
#include "apps/develop/photolist.h"
#include "apps/develop/stopwatch.h"

#include "oru/oru_ocl/exceptionocl.h"

#include <future>
#include <memory>
#include <new>
#include <system_error>

namespace Develop {

namespace {

namespace fs = std::filesystem;

using RuntimePtr = std::shared_ptr<OpenCLRuntime const>;

/// Runs a piece of work about a file. What fails becomes a problem of that file.
/// @return whether it succeeded
template<class Work>
bool Try(Console &console, std::string const &name, Work const &work) {
    try {
        work();
        return true;
    } catch (ORU::OCL::ExceptionOCL const &failure) {
        console.problem(name, failure.errorDescription());
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
    Introduction(Console &console, std::string const &gpu,
                 std::shared_future<RuntimePtr> const &openCL)
        : console_(console), gpu_(gpu), openCL_(openCL) {}

    void print() {
        if (!isPrinted_ && openCL_.valid())
            console_.line(gpu_ + "; " + openCL_.get()->description());
        isPrinted_ = true;
    }

private:
    Console &console_;
    std::string gpu_;
    std::shared_future<RuntimePtr> openCL_;
    bool isPrinted_ = false;
};

/// Loads the OpenCL runtime beside other work, for that takes as long as a photo.
std::shared_future<RuntimePtr> LoadOpenCL(std::string const &folder) {
    return std::async(std::launch::async,
                      [folder] { return std::make_shared<OpenCLRuntime const>(folder); })
        .share();
}

void MakeFolder(fs::path const &folder) {
    std::error_code error;
    fs::create_directories(folder, error);
    if (!fs::is_directory(folder, error))
        throw App::Failure("cannot be made a folder for the developed pictures");
}

/// Develops one photo after the other; what happens to them goes to the console.
class Batch {
public:
    Batch(Options const &options, Recipe const &recipe, Console &console)
        : options_(options), recipe_(recipe), console_(console) {}

    void run(std::vector<Photo> const &photos) {
        std::shared_future<RuntimePtr> openCL;
        if (!options_.quiet || recipe_.sharpening.isOn())
            openCL = LoadOpenCL(options_.openCLFolder);
        App::OffscreenGpu const gpu(options_.trace);
        Introduction introduction(console_, gpu.description(), openCL);

        std::unique_ptr<Sharpener> sharpener;
        if (recipe_.sharpening.isOn()) {
            sharpener = ChooseSharpener(*openCL.get(), options_.device, gpu.context());
            introduction.print();
            console_.line("sharpening by " + sharpener->description());
        }
        Developer developer(std::move(sharpener));
        PhotoJob job(developer, recipe_, gpu.sizeLimit(), App::ToPath(options_.base),
                     options_.report);
        develop(photos, job, introduction);
        introduction.print();
    }

private:
    void develop(std::vector<Photo> const &photos, PhotoJob &job, Introduction &introduction) {
        Stopwatch const total;
        std::size_t begun = 0;
        std::size_t succeeded = 0;
        for (Photo const &photo : photos) {
            console_.progress(begun++, photos.size(), photo.name());
            Stopwatch const stopwatch;
            ReportLines report;
            bool const developed =
                Try(console_, photo.name(), [&] { report = job.run(photo.input, photo.output); });
            double const time = stopwatch.milliseconds();
            introduction.print();
            if (!developed)
                continue;
            ++succeeded;
            console_.line(photo.name() + " -> " + App::ToText(photo.output) + " (" +
                          Milliseconds(time) + ")");
            for (std::string const &line : report)
                console_.line("    " + line);
        }
        if (photos.size() > 1)
            console_.line(std::to_string(succeeded) + " of " + std::to_string(photos.size()) +
                          " pictures in " + Milliseconds(total.milliseconds()));
    }

    Options const &options_;
    Recipe const &recipe_;
    Console &console_;
};

} // namespace

int RunJob(Options const &options) {
    Console console(options.quiet);
    auto const onProblem = [&console](std::string const &name, std::string const &reason) {
        console.problem(name, reason);
    };
    Recipe recipe{options.exposure, options.sharpening, {}};
    if (!options.spots.empty() &&
        !Try(console, options.spots, [&] { recipe.spots = ReadSpots(App::ToPath(options.spots)); }))
        return 1;

    fs::path const output = App::ToPath(options.output);
    std::vector<std::string> alsoRead;
    if (!options.base.empty())
        alsoRead = {options.base};
    std::vector<Photo> const photos = ListPhotos(options.inputs, output, alsoRead, onProblem);
    if (!options.base.empty() && photos.size() > 1) {
        console.problem(options.base, "is the base of one picture only, but there are several");
        return 1;
    }
    Try(console, options.output, [&] {
        MakeFolder(output);
        Try(console, "GPU", [&] { Batch(options, recipe, console).run(photos); });
    });
    return console.hadProblems() ? 1 : 0;
}

} // namespace Develop
