// A local edit that computes only its region, against the full frame.
#include "apps/common/offscreengpu.h"
#include "apps/develop/developer.h"
#include "apps/develop/glslsharpener.h"
#include "bench/comparison.h"

#include <memory>

using namespace Develop;

namespace {

/// A picture of 24 megapixels with something in it.
App::Image LargePhoto() {
    App::Image photo({6000, 4000, 3, 8});
    for (std::size_t i = 0; i < photo.pixels.size(); ++i)
        photo.pixels[i] = static_cast<unsigned char>(i * 7919 >> 8);
    return photo;
}

/// The work of the GPU for an area: upload, all stages, read-back.
void DevelopAreas(Developer &developer, App::Image const &photo, Areas const &areas,
                  Recipe const &recipe) {
    developer.upload(photo, areas);
    developer.sharpen(recipe);
    developer.develop(recipe);
    App::Image const result = developer.readBack();
    benchmark::DoNotOptimize(result.pixels.data());
}

// A spot of one per cent of the picture. `ratio` is the region's time in terms of the full frame's;
// `share` is the share of its pixels.
void OnePercentSpot(benchmark::State &state, Sharpening const &sharpening) {
    App::OffscreenGpu const gpu{std::string()};
    Developer developer(std::make_unique<GlslSharpener>("to compare alike"));
    App::Image const photo = LargePhoto();
    Recipe const recipe{0.3, sharpening, {{3000.5, 2000.25, 243, 1.5}}};
    Areas const whole = WholePicture(photo);
    Areas const areas = AreasOfSpots(recipe.spots, recipe.sharpening, photo);
    DevelopAreas(developer, photo, areas, recipe); // compiles what is compiled at first use
    oru_bench::Compare(
        state, 1, [&] { DevelopAreas(developer, photo, whole, recipe); },
        [&] { DevelopAreas(developer, photo, areas, recipe); });
    state.counters["share"] = static_cast<double>(areas.target.width() * areas.target.height()) /
                              static_cast<double>(photo.width * photo.height);
}

BENCHMARK_CAPTURE(OnePercentSpot, plain, Sharpening{0, 1})
    ->UseManualTime()
    ->Iterations(7)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(OnePercentSpot, sharpened, Sharpening{0.8, 1.5})
    ->UseManualTime()
    ->Iterations(3)
    ->Unit(benchmark::kMillisecond);

} // namespace
