// A photo on its way from stage to stage.
#pragma once

#include "apps/develop/bandplan.h"
#include "apps/develop/bandpool.h"
#include "apps/develop/photoqueue.h"
#include "apps/develop/stopwatch.h"

#include <atomic>
#include <cstddef>
#include <exception>
#include <memory>
#include <mutex>
#include <optional>

namespace Develop {

/// What the stages know of a photo. One stage after the other has it, but for what is said to be
/// for all at any time.
class PhotoWork {
public:
    PhotoWork(Photo const &photo, std::atomic<bool> const &isCancelled)
        : isCancelled_(isCancelled) {
        result.photo = photo;
    }

    /// Keeps why the photo fails, unless something else was the reason already. For all.
    void fail(std::exception_ptr const &failure);

    /// Whether nothing more is to be done for the photo. For all.
    bool isOver() const { return hasFailed_ || isCancelled_; }

    /// Runs a piece of work, unless the photo is over; what it throws is why the photo fails.
    template<class Work>
    void attempt(Work const &work) {
        if (isOver())
            return;
        try {
            work();
        } catch (...) {
            fail(std::current_exception());
        }
    }

    PhotoResult result;
    bool isComplete = false; ///< whether the file has its name
    std::optional<BandPlan> plan;
    App::PictureHead developedHead;
    Stopwatch sinceBegin;
    double decoding = 0, developing = 0, encoding = 0; ///< milliseconds

private:
    std::atomic<bool> const &isCancelled_;
    std::atomic<bool> hasFailed_ = false;
    std::mutex mutex_;
};

/// A band of a photo, or its end.
struct Piece {
    std::shared_ptr<PhotoWork> work;
    std::size_t number = 0;          ///< of the band
    std::unique_ptr<BandPair> bands; ///< null for the end
};

} // namespace Develop
