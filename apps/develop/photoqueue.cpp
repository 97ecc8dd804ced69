// Photos on their way through decoding, the GPU and encoding.
#include "apps/develop/photoqueue.h"

#include "apps/develop/decodestage.h"
#include "apps/develop/developstage.h"
#include "apps/develop/encodestage.h"

#include <algorithm>
#include <exception>
#include <memory>
#include <thread>

namespace Develop {

namespace {

/// What joins the threads.
struct Belt {
    BandPool pool;
    Channel<Piece> decoded;
    Channel<Piece> developed;
    Channel<std::shared_ptr<PhotoWork>> done;

    /// Lets all threads come to their end.
    void close() {
        pool.close();
        decoded.close();
        developed.close();
    }
};

/// A thread that works at a belt, for a scope.
class Worker {
public:
    template<class Work>
    Worker(Belt &belt, Work const &work) : belt_(belt), thread_([this, work] { attempt(work); }) {}
    ~Worker() {
        if (!thread_.joinable())
            return;
        belt_.close(); // a failure ends the scope early
        thread_.join();
    }
    Worker(Worker const &) = delete;
    Worker &operator=(Worker const &) = delete;

    /// Waits for the end of the work. @throws what it threw
    void join() {
        thread_.join();
        if (failure_)
            std::rethrow_exception(failure_);
    }

private:
    template<class Work>
    void attempt(Work const &work) {
        try {
            work();
        } catch (...) { // no memory, for what fails otherwise is the photo's failure
            failure_ = std::current_exception();
            belt_.close();
        }
    }

    Belt &belt_;
    std::exception_ptr failure_;
    std::thread thread_;
};

} // namespace

PhotoQueue::PhotoQueue(Developer &developer, Recipe const &recipe,
                       std::filesystem::path const &base, bool withReport,
                       BandPlan::Limits const &limits)
    : developer_(developer), recipe_(recipe), base_(base), withReport_(withReport),
      limits_(limits) {
    limits_.side = std::min(limits_.side, developer_.sizeLimit());
}

void PhotoQueue::run(std::vector<Photo> const &photos,
                     std::function<void(PhotoResult const &)> const &onDone,
                     std::atomic<bool> const &isCancelled,
                     std::function<void(double share)> const &onBand) {
    Belt belt;
    Worker decoder(belt, [&] {
        DecodeStage stage(base_, recipe_.reach(), limits_, belt.pool, belt.decoded);
        for (Photo const &photo : photos) {
            if (isCancelled)
                break;
            stage.run(std::make_shared<PhotoWork>(photo, isCancelled));
        }
        belt.decoded.close();
    });
    Worker encoder(belt, [&] {
        EncodeStage stage(recipe_.quality, withReport_, belt.pool, belt.done);
        while (std::optional<Piece> piece = belt.developed.pop())
            stage.run(std::move(*piece));
    });
    auto const tell = [&] {
        while (auto const work = belt.done.tryPop())
            if ((*work)->isComplete || (*work)->result.failure)
                onDone((*work)->result);
    };
    DevelopStage stage(developer_, recipe_, !base_.empty(), withReport_);
    while (std::optional<Piece> piece = belt.decoded.pop()) {
        stage.run(*piece);
        if (onBand && piece->bands)
            onBand(static_cast<double>(piece->number + 1) /
                   static_cast<double>(piece->work->plan->bands()));
        belt.developed.push(std::move(*piece));
        tell();
    }
    belt.developed.close();
    decoder.join();
    encoder.join();
    tell();
}

} // namespace Develop
