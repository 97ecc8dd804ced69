// The memory of bands, used again and again.
#pragma once

#include "apps/develop/band.h"

#include <condition_variable>
#include <cstddef>
#include <memory>
#include <mutex>
#include <vector>

namespace Develop {

/// A band on its way: rows of the photo with those that they depend on, and the developed rows.
struct BandPair {
    Band photo;
    Band developed;
};

/// Gives out pairs of bands and takes them back. What is under way at once is limited, which bounds
/// the memory and makes a fast thread wait for the slower ones.
class BandPool {
public:
    /// Waits until fewer pairs than `limit` are under way.
    /// @return null when the pool is closed
    std::unique_ptr<BandPair> take(std::size_t limit);

    void giveBack(std::unique_ptr<BandPair> pair);

    /// Nobody shall wait any longer.
    void close();

private:
    std::mutex mutex_;
    std::condition_variable changed_;
    std::vector<std::unique_ptr<BandPair>> free_;
    std::size_t underWay_ = 0;
    bool isClosed_ = false;
};

} // namespace Develop
