// The first stage: photos are read.
#include "apps/develop/decodestage.h"

#include "apps/common/failure.h"
#include "apps/common/unicode.h"

#include <algorithm>

namespace Develop {

namespace {

// Of all bands together. With fewer than three the stages wait for each other, more than six make
// nothing faster.
constexpr std::size_t kMostBytes = std::size_t{64} << 20;
constexpr std::size_t kFewestBands = 2;
constexpr std::size_t kMostBands = 6;

std::size_t BandsAtOnce(BandPlan const &plan, App::Shape const &picture) {
    std::size_t const bytes =
        (plan.source(0).count() + plan.target(0).count()) * picture.rowBytes();
    return std::clamp(kMostBytes / bytes, kFewestBands, kMostBands);
}

void CopyRows(Band const &from, Rows const &rows, Band &to) {
    if (rows.count() > 0)
        std::copy_n(from.row(rows.first), rows.count() * from.rowBytes(), to.row(rows.first));
}

} // namespace

void DecodeStage::run(std::shared_ptr<PhotoWork> const &work) {
    work->attempt([&] {
        open(*work);
        readBands(work);
    });
    photo_.reset();
    baseReader_.reset();
    next_.push({work, 0, nullptr});
}

void DecodeStage::open(PhotoWork &work) {
    TimedScope const timed(work.decoding);
    photo_ = App::OpenPicture(work.result.photo.input);
    App::PictureHead const &head = photo_->head();
    work.result.head = head;
    if (!photo_->wholeReason().empty())
        work.result.notes.push_back(photo_->wholeReason() +
                                    ": the whole picture has to be in memory");
    if (!base_.empty())
        baseReader_ = openBase(head);
    work.plan.emplace(head, reach_, limits_);
    kept_.hold({0, 0}, head);
}

std::unique_ptr<App::PictureReader> DecodeStage::openBase(App::Shape const &photo) const {
    try {
        std::unique_ptr<App::PictureReader> base = App::OpenPicture(base_);
        if (photo != base->head())
            throw App::Failure("is " + base->head().description() + ", not " + photo.description());
        return base;
    } catch (App::Failure const &failure) {
        throw App::Failure("its base " + App::ToText(base_) + ": " + failure.what());
    }
}

void DecodeStage::readBands(std::shared_ptr<PhotoWork> const &work) {
    std::size_t const atOnce = BandsAtOnce(*work->plan, photo_->head());
    for (std::size_t number = 0; number < work->plan->bands() && !work->isOver(); ++number) {
        std::unique_ptr<BandPair> bands = pool_.take(atOnce);
        if (!bands)
            return;
        work->attempt([&] { readBand(*work, number, *bands); });
        next_.push({work, number, std::move(bands)});
    }
}

void DecodeStage::readBand(PhotoWork &work, std::size_t number, BandPair &bands) {
    TimedScope const timed(work.decoding);
    App::Shape const &shape = photo_->head();
    BandPlan const &plan = *work.plan;
    Rows const rows = plan.source(number);
    bands.photo.hold(rows, shape);
    CopyRows(kept_, kept_.rows(), bands.photo);
    std::size_t const next = kept_.rows().count() > 0 ? kept_.rows().end : rows.first;
    if (next < rows.end)
        photo_->read(bands.photo.row(next), rows.end - next);
    if (number + 1 < plan.bands()) {
        kept_.hold({plan.source(number + 1).first, rows.end}, shape);
        CopyRows(bands.photo, kept_.rows(), kept_);
    }
    bands.developed.hold(plan.target(number), shape);
    if (baseReader_) {
        Rows const target = plan.target(number);
        baseReader_->read(bands.developed.row(target.first), target.count());
    }
}

} // namespace Develop
