// The memory of bands, used again and again.
#include "apps/develop/bandpool.h"

namespace Develop {

std::unique_ptr<BandPair> BandPool::take(std::size_t limit) {
    std::unique_lock<std::mutex> lock(mutex_);
    changed_.wait(lock, [&] { return isClosed_ || underWay_ < limit; });
    if (isClosed_)
        return nullptr;
    ++underWay_;
    if (free_.empty())
        return std::make_unique<BandPair>();
    std::unique_ptr<BandPair> pair = std::move(free_.back());
    free_.pop_back();
    return pair;
}

void BandPool::giveBack(std::unique_ptr<BandPair> pair) {
    {
        std::lock_guard<std::mutex> const lock(mutex_);
        free_.push_back(std::move(pair));
        --underWay_;
    }
    changed_.notify_all();
}

void BandPool::close() {
    {
        std::lock_guard<std::mutex> const lock(mutex_);
        isClosed_ = true;
    }
    changed_.notify_all();
}

} // namespace Develop
