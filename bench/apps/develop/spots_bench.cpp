// A local edit that computes only its region, against the full frame.
#include "apps/common/offscreengpu.h"
#include "apps/develop/glslsharpener.h"
#include "apps/develop/opengldeveloper.h"
#include "apps/develop/spotareas.h"
#include "bench/comparison.h"

#include <memory>

using namespace Develop;

namespace {

/// A picture of three to two, and how to develop it.
class Desk {
public:
    /// @param root of its megapixels
    Desk(std::size_t root, Recipe const &recipe)
        : shape_{1224 * root, 816 * root, 3, 8}, task_(shape_, ColourSpace::Srgb(), recipe),
          plan_(shape_, recipe.reach(), BandPlan::Limits()),
          areas_(recipe.spots, shape_, recipe.reach()),
          developer_(std::make_unique<GlslSharpener>("to compare alike")) {
        developer_.begin(task_);
    }

    /// Develops all bands, or what the spots touch of them.
    /// @return the pixels computed
    std::size_t develop(bool isLocal) {
        std::size_t pixels = 0;
        for (std::size_t i = 0; i < plan_.bands(); ++i) {
            ORU::IntegerRect const band = plan_.area(i);
            photo_.hold(plan_.source(i), shape_);
            developed_.hold(plan_.target(i), shape_);
            for (Tile const &tile : plan_.tiles(isLocal ? areas_.in(band) : std::vector{band})) {
                developer_.develop(photo_, tile, developed_);
                pixels += tile.target.width() * tile.target.height();
            }
        }
        return pixels;
    }

    App::Shape const &shape() const { return shape_; }

private:
    App::Shape shape_;
    Task task_;
    BandPlan plan_;
    SpotAreas areas_;
    OpenGLDeveloper developer_;
    Band photo_, developed_;
};

// A spot of one per cent of pictures of 1, 25 and 100 megapixels. `ratio` is the region's time in
// terms of the full frame's; `share` is the share of its pixels.
void OnePercentSpot(benchmark::State &state, Sharpening const &sharpening) {
    App::OffscreenGpu const gpu{std::string()};
    auto const root = static_cast<double>(state.range(0));
    Recipe recipe;
    recipe.exposure = 0.3;
    recipe.sharpening = sharpening;
    recipe.spots = {{612 * root + 0.5, 408 * root + 0.25, 49 * root, 1.5}};
    Desk desk(static_cast<std::size_t>(state.range(0)), recipe);
    std::size_t const pixels = desk.develop(true); // compiles what is compiled at first use
    desk.develop(false);
    oru_bench::Compare(
        state, 1, [&] { desk.develop(false); }, [&] { desk.develop(true); });
    auto const all = static_cast<double>(desk.shape().width * desk.shape().height);
    state.counters["share"] = static_cast<double>(pixels) / all;
    state.counters["Mpx"] = all / 1e6;
}

BENCHMARK_CAPTURE(OnePercentSpot, plain, Sharpening{0, 1})
    ->Arg(1)
    ->Arg(5)
    ->Arg(10)
    ->UseManualTime()
    ->Iterations(3)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(OnePercentSpot, sharpened, Sharpening{0.8, 1.5})
    ->Arg(1)
    ->Arg(5)
    ->Arg(10)
    ->UseManualTime()
    ->Iterations(3)
    ->Unit(benchmark::kMillisecond);

} // namespace
