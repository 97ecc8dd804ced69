// The middle stage: photos are developed.
#include "apps/develop/developstage.h"

#include "apps/common/picturefile.h"

#include <cstdio>
#include <string>
#include <utility>

namespace Develop {

namespace {

std::string Percent(std::size_t pixels, App::Shape const &picture) {
    char text[32];
    std::snprintf(text, sizeof text, "%.2f %%",
                  100.0 * static_cast<double>(pixels) /
                      (static_cast<double>(picture.width) * static_cast<double>(picture.height)));
    return text;
}

/// The head of the developed picture.
App::PictureHead DevelopedHead(PhotoResult const &result, ColourSpace const &space) {
    App::PictureHead head = result.head;
    head.kind = App::KindOfName(result.photo.output).value_or(App::FileKind::Png);
    head.colour = space.tags(head);
    return head;
}

/// The records that a photo brings, for people.
std::string History(App::Metadata const &metadata) {
    std::string text;
    for (auto const &[record, name] :
         {std::pair(&metadata.exif, "Exif"), std::pair(&metadata.xmp, "XMP"),
          std::pair(&metadata.iptc, "IPTC")})
        if (!record->empty())
            text += (text.empty() ? "" : ", ") + std::string(name);
    return text.empty() ? "none" : text;
}

} // namespace

DevelopStage::Current::Current(PhotoWork const &photo, ColourSpace const &space,
                               Recipe const &recipe)
    : task(photo.result.head, space, recipe),
      spotAreas(recipe.spots, photo.result.head, recipe.reach()) {}

void DevelopStage::run(Piece const &piece) {
    PhotoWork &work = *piece.work;
    work.attempt([&] {
        if (piece.bands)
            develop(work, piece);
        else if (withReport_ && isLocal_)
            report(work);
    });
    if (!piece.bands)
        current_.reset();
}

void DevelopStage::begin(PhotoWork &work) {
    ColourSpace const space =
        ColourSpace::Of(work.result.head.colour, work.result.head, work.result.notes);
    work.developedHead = DevelopedHead(work.result, recipe_.convertTo.value_or(space));
    if (withReport_) {
        work.result.report.push_back("colours: " + space.description());
        work.result.report.push_back("history: " + History(work.result.head.metadata));
    }
    current_.emplace(work, space, recipe_);
    developer_.begin(current_->task);
}

void DevelopStage::develop(PhotoWork &work, Piece const &piece) {
    TimedScope const timed(work.developing);
    if (!current_)
        begin(work);
    BandPlan const &plan = *work.plan;
    std::vector<ORU::IntegerRect> const whole = {plan.area(piece.number)};
    BandPair &bands = *piece.bands;
    for (Tile const &tile : plan.tiles(isLocal_ ? current_->spotAreas.in(whole[0]) : whole)) {
        developer_.develop(bands.photo, tile, bands.developed);
        current_->pixels += tile.target.width() * tile.target.height();
    }
    if (!isLocal_ || !withReport_)
        return;
    unused_.hold(plan.target(piece.number), work.result.head);
    TimedScope const full(current_->fullFrame);
    for (Tile const &tile : plan.tiles(whole))
        developer_.develop(bands.photo, tile, unused_);
}

void DevelopStage::report(PhotoWork &work) const {
    work.developing -= current_->fullFrame;
    work.result.report.push_back(
        "pixels processed: " + Percent(current_->pixels, work.result.head) + ", in " +
        Milliseconds(work.developing) + "; the full frame takes " +
        Milliseconds(current_->fullFrame));
}

} // namespace Develop
