// The whole run of develop: every photo through its stages.
#include "apps/develop/job.h"

#include "apps/common/failure.h"
#include "apps/common/file.h"
#include "apps/common/offscreengpu.h"
#include "apps/common/picturefile.h"
#include "apps/common/unicode.h"
#include "apps/develop/cancellation.h"
#include "apps/develop/choosedeveloper.h"
#include "apps/develop/console.h"
#include "apps/develop/openclruntime.h"
#include "apps/develop/opengldeveloper.h"
#include "apps/develop/options.h"
#include "apps/develop/pace.h"
#include "apps/develop/photolist.h"
#include "apps/develop/photoqueue.h"
#include "apps/develop/runreport.h"
#include "apps/develop/stopwatch.h"

#include "oru/oru_ocl/exceptionocl.h"

#include <algorithm>
#include <future>
#include <memory>
#include <new>
#include <system_error>

namespace Develop {

namespace {

namespace fs = std::filesystem;

using RuntimePtr = std::shared_ptr<OpenCLRuntime const>;
using Status = PhotoRecord::Status;

/// After so many photos a failure may have left the screen.
constexpr std::size_t kScreenful = 20;

std::string ReasonOf(std::exception_ptr const &failure) {
    try {
        std::rethrow_exception(failure);
    } catch (ORU::OCL::ExceptionOCL const &caught) {
        return caught.errorDescription();
    } catch (ORU::LogicalException const &caught) {
        return caught.message();
    } catch (std::bad_alloc const &) {
        return "not enough memory";
    } catch (std::exception const &caught) {
        return caught.what();
    }
}

/// Does a piece of the whole run's work.
/// @throws Failure when it fails, which names what it is about
template<class Work>
void About(std::string const &name, Work const &work) {
    try {
        work();
    } catch (...) {
        throw App::Failure(name + ": " + ReasonOf(std::current_exception()));
    }
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

/// The colours of a developed picture.
ColourSpace SpaceOf(App::PictureHead const &head, Recipe const &recipe) {
    std::vector<std::string> told; // by the queue already
    return recipe.convertTo ? *recipe.convertTo : ColourSpace::Of(head.colour, head, told);
}

void MakeFolder(fs::path const &folder) {
    std::error_code error;
    fs::create_directories(folder, error);
    if (!fs::is_directory(folder, error))
        throw App::Failure("cannot be made a folder for the developed pictures");
}

/// Refuses to write over a picture: a pattern of the shell may have put one behind the option.
void RefuseToReplacePicture(fs::path const &path) {
    if (App::KindOfName(path))
        throw App::Failure("has the name of a picture, which it would replace");
}

/// Fails before the work where a report could not be written after it.
void PrepareReport(std::string const &file) {
    if (file.empty() || file == "-")
        return;
    fs::path const path = fs::absolute(App::ToPath(file));
    RefuseToReplacePicture(path);
    std::error_code error;
    if (fs::is_directory(path, error))
        throw App::Failure("is a folder");
    MakeFolder(path.parent_path());
}

void WriteReport(std::string const &file, RunReport const &report) {
    if (file.empty())
        return;
    std::string const text = report.json();
    if (file != "-")
        App::WriteFile(App::ToPath(file), std::vector<unsigned char>(text.begin(), text.end()));
    else if (std::fwrite(text.data(), 1, text.size(), stdout) != text.size() ||
             std::fflush(stdout) != 0)
        throw App::Failure("the standard output takes no report");
}

/// The photos of a command line on their way; what happens to them goes to console and report.
class Run {
public:
    Run(Options const &options, Console &console, Cancellation const &cancellation)
        : options_(options), console_(console), cancellation_(cancellation) {}

    RunReport const &run() {
        Stopwatch const stopwatch;
        try {
            developAll();
        } catch (App::Failure const &failure) {
            abandon(failure.what());
        }
        report_.milliseconds = stopwatch.milliseconds();
        std::size_t const count = report_.photos.size();
        if (std::size_t const left = report_.count(Status::Cancelled))
            console_.notice("cancelled after " + std::to_string(count - left) + " of " +
                            std::to_string(count) + (count == 1 ? " picture" : " pictures"));
        else if (report_.problem.empty())
            summarise();
        return report_;
    }

private:
    void developAll() {
        listPhotos();
        if (!options_.base.empty() && photos_.size() > 1)
            throw App::Failure(options_.base +
                               ": is the base of one picture only, but there are several");
        Recipe recipe;
        recipe.exposure = options_.exposure;
        recipe.sharpening = options_.sharpening;
        recipe.quality = options_.quality;
        if (!options_.convertTo.empty())
            recipe.convertTo = NamedColourSpace(options_.convertTo);
        if (!options_.spots.empty())
            About(options_.spots, [&] { recipe.spots = ReadSpots(App::ToPath(options_.spots)); });
        About(options_.trace, [&] { RefuseToReplacePicture(App::ToPath(options_.trace)); });
        About(options_.output, [&] { MakeFolder(App::ToPath(options_.output)); });
        if (!photos_.empty())
            About("GPU", [&] { develop(recipe); });
    }

    void listPhotos() {
        std::vector<std::string> inputs = options_.inputs;
        if (!options_.list.empty())
            About(options_.list == "-" ? "the list" : options_.list, [&] {
                std::vector<std::string> const listed = ReadList(options_.list);
                if (listed.empty())
                    throw App::Failure("names no picture");
                inputs.insert(inputs.end(), listed.begin(), listed.end());
            });
        std::vector<std::string> alsoRead;
        if (!options_.base.empty())
            alsoRead = {options_.base};
        auto const onProblem = [this](std::string const &name, std::string const &reason) {
            PhotoRecord record;
            record.input = name;
            fail(record, reason);
            report_.photos.push_back(record);
        };
        for (Photo const &photo :
             ListPhotos(inputs, App::ToPath(options_.output), options_.kind, alsoRead, onProblem)) {
            PhotoRecord record;
            record.input = photo.name();
            record.output = App::ToText(photo.output);
            std::error_code error;
            if (options_.skipExisting && fs::is_regular_file(photo.output, error)) {
                record.status = Status::Skipped;
                ++done_;
            } else {
                photos_.push_back(photo);
                records_.push_back(report_.photos.size());
            }
            report_.photos.push_back(record);
        }
    }

    void develop(Recipe const &recipe) {
        std::shared_future<RuntimePtr> openCL;
        if (!options_.quiet || recipe.sharpening.isOn())
            openCL = LoadOpenCL(options_.openCLFolder);
        App::OffscreenGpu const gpu(options_.trace);
        Introduction introduction(console_, gpu.description(), openCL);

        std::unique_ptr<Developer> developer;
        if (recipe.sharpening.isOn()) {
            developer = ChooseDeveloper(*openCL.get(), options_.device, gpu.context());
            introduction.print();
            console_.line("sharpening by " + developer->description());
        } else {
            developer = std::make_unique<OpenGLDeveloper>(nullptr);
        }
        PhotoQueue queue(*developer, recipe, App::ToPath(options_.base), options_.report);

        Stopwatch const stopwatch;
        Pace pace(0);
        std::size_t next = 0;
        showProgress(std::string());
        auto const onDone = [&](PhotoResult const &result) {
            introduction.print();
            finish(report_.photos[records_[next++]], result, recipe);
            pace.add(stopwatch.milliseconds() / 1000);
            ++done_;
            showProgress(pace.text(photos_.size() - next));
        };
        auto const onBand = [&](double share) {
            // A small photo has one band; after Ctrl-C the bands under way only pass.
            if (report_.photos.size() == 1 && share < 1 && !cancellation_.isRequested())
                console_.progress(share, pace.textOfOne(share, stopwatch.milliseconds() / 1000));
        };
        queue.run(photos_, onDone, cancellation_.isRequested(), onBand);
        introduction.print();
        console_.endProgress();
    }

    void showProgress(std::string const &pace) {
        std::size_t const count = report_.photos.size();
        if (count > 1)
            console_.progress(static_cast<double>(done_) / static_cast<double>(count),
                              std::to_string(done_) + "/" + std::to_string(count) +
                                  (pace.empty() ? "" : ", ") + pace);
    }

    /// Notes and tells what became of a photo.
    void finish(PhotoRecord &record, PhotoResult const &result, Recipe const &recipe) {
        record.notes = result.notes;
        if (result.head.width != 0) {
            record.shape = result.head;
            record.colourSpace = SpaceOf(result.head, recipe).description();
        }
        if (result.failure) {
            fail(record, ReasonOf(result.failure));
            return;
        }
        record.status = Status::Developed;
        record.milliseconds = result.milliseconds;
        console_.line(record.input + " -> " + record.output + " (" +
                      Milliseconds(result.milliseconds) + ")");
        for (std::string const &note : result.notes)
            console_.line("    note: " + note);
        for (std::string const &line : result.report)
            console_.line("    " + line);
    }

    void fail(PhotoRecord &record, std::string const &reason) {
        record.status = Status::Failed;
        record.reason = reason;
        console_.problem(record.input + ": " + reason);
    }

    /// What ended the whole run is why the photos that were to come are not developed.
    void abandon(std::string const &problem) {
        console_.problem(problem);
        report_.problem = problem;
        for (PhotoRecord &photo : report_.photos)
            if (photo.status == Status::Cancelled && !cancellation_.isRequested()) {
                photo.status = Status::Failed;
                photo.reason = problem;
            }
    }

    void summarise() {
        std::size_t const count = report_.photos.size();
        std::size_t const failed = report_.count(Status::Failed);
        std::size_t const skipped = report_.count(Status::Skipped);
        if (count < 2 && skipped == 0)
            return;
        bool const repeats = failed != 0 && count > kScreenful;
        console_.line(
            std::to_string(report_.count(Status::Developed)) + " of " + std::to_string(count) +
            " pictures in " + Duration(report_.milliseconds / 1000) +
            (skipped ? ", " + std::to_string(skipped) + " skipped" : "") +
            (failed ? "; " + std::to_string(failed) + " failed" : "") + (repeats ? ":" : ""));
        if (repeats)
            repeatFailures(failed);
    }

    void repeatFailures(std::size_t failed) {
        std::size_t repeated = 0;
        for (PhotoRecord const &photo : report_.photos)
            if (photo.status == Status::Failed && repeated++ < kScreenful)
                console_.line("    " + photo.input + ": " + photo.reason);
        if (failed > kScreenful)
            console_.line("    and " + std::to_string(failed - kScreenful) + " more");
    }

    Options const &options_;
    Console &console_;
    Cancellation const &cancellation_;
    RunReport report_;
    std::vector<Photo> photos_;        ///< those to develop
    std::vector<std::size_t> records_; ///< where each of them stands in the report
    std::size_t done_ = 0;             ///< how many inputs are settled
};

} // namespace

int RunJob(Options const &options) {
    Cancellation const cancellation;
    Console console(options.quiet, options.json == "-" ? stderr : stdout);
    try {
        About(options.json, [&] { PrepareReport(options.json); });
        Run run(options, console, cancellation);
        RunReport const &report = run.run();
        About(options.json, [&] { WriteReport(options.json, report); });
        if (report.count(Status::Cancelled) != 0)
            return Cancellation::kExitCode;
    } catch (App::Failure const &failure) {
        console.problem(failure.what());
    }
    return console.hadProblems() ? 1 : 0;
}

} // namespace Develop
