// One photo through all stages, from its file to the developed one.
#include "apps/develop/photojob.h"

#include "apps/common/failure.h"
#include "apps/common/imagefile.h"
#include "apps/common/unicode.h"
#include "apps/develop/stopwatch.h"

#include <algorithm>
#include <cstdio>

namespace Develop {

using ORU::IntegerRect;

namespace {

App::Image DevelopAreas(Developer &developer, App::Image const &photo, Areas const &areas,
                        Recipe const &recipe, StageTimes &times) {
    times.measure("upload", [&] { developer.upload(photo, areas); });
    if (recipe.sharpening.isOn())
        times.measure("sharpen", [&] { developer.sharpen(recipe); });
    times.measure("develop", [&] { developer.develop(recipe); });
    return times.measure("read back", [&] { return developer.readBack(); });
}

/// Writes a part of a picture over it.
void Paste(App::Image const &part, IntegerRect const &area, App::Image &picture) {
    std::size_t const left = static_cast<std::size_t>(area.offset().x) * picture.bytesPerPixel();
    auto const top = static_cast<std::size_t>(area.offset().y);
    for (std::size_t y = 0; y < part.height; ++y)
        std::copy_n(part.row(y), part.rowBytes(), picture.row(top + y) + left);
}

std::string Percent(IntegerRect const &area, App::Shape const &picture) {
    char text[32];
    std::snprintf(text, sizeof text, "%.2f %%",
                  100.0 * static_cast<double>(area.width() * area.height()) /
                      static_cast<double>(picture.width * picture.height));
    return text;
}

} // namespace

PhotoJob::PhotoJob(Developer &developer, Recipe const &recipe, App::SizeLimit limit,
                   std::filesystem::path const &base, bool withReport)
    : developer_(developer), recipe_(recipe), limit_(limit), base_(base), withReport_(withReport) {}

ReportLines PhotoJob::run(std::filesystem::path const &input, std::filesystem::path const &output) {
    ReportLines report;
    StageTimes times(withReport_);
    App::Image const photo = times.measure("decode", [&] { return App::ReadImage(input, limit_); });
    App::Image developed;
    if (base_.empty()) {
        developed = DevelopAreas(developer_, photo, WholePicture(photo), recipe_, times);
    } else {
        App::Image base = times.measure("read base", [&] { return readBase(photo); });
        developed = times.measure("local edit",
                                  [&] { return developLocally(photo, std::move(base), report); });
    }
    times.measure("encode", [&] { App::WriteImage(output, developed); });
    if (withReport_)
        report.push_back(photo.description() + ": " + times.text());
    return report;
}

App::Image PhotoJob::readBase(App::Shape const &photo) const {
    std::string const name = "its base " + App::ToText(base_) + ": ";
    try {
        App::Image base = App::ReadImage(base_, limit_);
        if (photo != base)
            throw App::Failure("is " + base.description() + ", not " + photo.description());
        return base;
    } catch (App::Failure const &failure) {
        throw App::Failure(name + failure.what());
    }
}

App::Image PhotoJob::developLocally(App::Image const &photo, App::Image base, ReportLines &report) {
    Areas const areas = AreasOfSpots(recipe_.spots, recipe_.sharpening, photo);
    StageTimes local(withReport_);
    if (!areas.target.isEmpty())
        Paste(DevelopAreas(developer_, photo, areas, recipe_, local), areas.target, base);
    if (withReport_) {
        // The full frame is developed for the comparison's sake alone.
        StageTimes full(true);
        DevelopAreas(developer_, photo, WholePicture(photo), recipe_, full);
        report.push_back("pixels processed: " + Percent(areas.target, photo) + ", in " +
                         Milliseconds(local.total()) + "; the full frame takes " +
                         Milliseconds(full.total()));
    }
    return base;
}

} // namespace Develop
