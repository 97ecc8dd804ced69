// Many photos in one process.
#include "apps/common/imagefile.h"
#include "apps/common/offscreengpu.h"
#include "apps/develop/choosedeveloper.h"
#include "apps/develop/openclruntime.h"
#include "apps/develop/photoqueue.h"
#include "bench/soak/footprint.h"
#include "bench/soak/soaks.h"
#include "tests/support/nameledger.h"
#include "tests/support/pictures.h"

#include <atomic>
#include <cstdio>
#include <system_error>

namespace Soak {

namespace {

namespace fs = std::filesystem;

/// That a photo may add. Its textures take some hundred KiB; the heap of an OpenCL runtime on the
/// processor sways by some MiB, which makes up to 4 KiB a photo.
constexpr double kMostBytes = 16384;

/// A folder of pictures of every kind, in several sizes, for a scope.
class Folder {
public:
    Folder()
        : path_(fs::temp_directory_path() / ("soak" + std::to_string(::GetCurrentProcessId()))) {
        fs::create_directories(path_);
        for (unsigned int channels = 1; channels <= 4; ++channels) {
            for (unsigned int const bits : {8u, 16u}) {
                std::size_t const side = 40 * channels * channels + bits;
                pictures_.push_back(path_ / (std::to_string(pictures_.size()) + ".png"));
                App::WriteImage(pictures_.back(), apps_test::RandomPicture(
                                                      {side, side * 3 / 4, channels, bits}, bits));
            }
        }
    }
    ~Folder() {
        std::error_code ignored;
        fs::remove_all(path_, ignored);
    }
    Folder(Folder const &) = delete;
    Folder &operator=(Folder const &) = delete;

    std::vector<fs::path> const &pictures() const { return pictures_; }
    fs::path output() const { return path_ / "developed.png"; }

private:
    fs::path path_;
    std::vector<fs::path> pictures_;
};

/// The developers of all ways to sharpen. Turns differ in the way, in sharpening at all and in
/// spots, each with a period of its own.
class Studio {
public:
    explicit Studio(App::OffscreenGpu const &gpu) {
        developers_.push_back(ChooseDeveloper(runtime_, "none", gpu.context()));
        if (!runtime_.devices().empty())
            developers_.push_back(ChooseDeveloper(runtime_, "", gpu.context()));
    }

    std::size_t ways() const { return developers_.size(); }

    void develop(std::size_t turn, fs::path const &input, fs::path const &output) {
        Develop::Recipe recipe;
        recipe.exposure = 0.5;
        recipe.sharpening = {turn % 5 == 0 ? 0 : 0.8, 1.5};
        if (turn % 3 == 0)
            recipe.spots = {{20, 20, 15, 1}, {35, 30, 8, -0.5}};
        std::atomic<bool> const isCancelled = false;
        Develop::PhotoQueue(*developers_[turn / 7 % ways()], recipe, fs::path(), false)
            .run({{input, output}}, RethrowFailure, isCancelled);
    }

private:
    static void RethrowFailure(Develop::PhotoResult const &result) {
        if (result.failure)
            std::rethrow_exception(result.failure);
    }

    Develop::OpenCLRuntime runtime_{std::string()};
    std::vector<std::unique_ptr<Develop::Developer>> developers_;
};

} // namespace

Verdict DevelopPhotos(std::size_t count, std::vector<fs::path> const &photos) {
    Folder const folder;
    std::vector<fs::path> inputs = folder.pictures();
    inputs.insert(inputs.end(), photos.begin(), photos.end());
    App::OffscreenGpu const gpu{std::string()};
    ORU::OGL::InterceptorScope<oru_test::NameLedger> const ledger;

    Growth growth;
    Handles before, after;
    std::size_t ways = 0;
    {
        Studio studio(gpu);
        ways = studio.ways();
        for (std::size_t i = 0; i < Growth::StepsFor(count); ++i) {
            studio.develop(i, inputs[i % inputs.size()], folder.output());
            growth.measure();
            if (growth.isWarm(count))
                before = Handles::Now();
        }
        after = Handles::Now();
    }
    std::string const leaks = ledger->leaks();
    char text[160];
    std::snprintf(
        text, sizeof text, "%zu photos, %zu ways to sharpen: %.1f MiB, %+.0f bytes a photo (%s); ",
        count, ways, growth.megabytes(), growth.bytesPerStep(), growth.limit(kMostBytes).c_str());
    bool const isFlat = !growth.isLongEnough() || growth.bytesPerStep() <= kMostBytes;
    return {isFlat && after.isWithin(before) && leaks.empty(),
            text + Change(before, after) + "; " + (leaks.empty() ? "no name left" : leaks)};
}

} // namespace Soak
