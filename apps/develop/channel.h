// What is handed from thread to thread.
#pragma once

#include <condition_variable>
#include <deque>
#include <mutex>
#include <optional>
#include <utility>

namespace Develop {

/// Passes things on in their order, until it is closed.
template<class T>
class Channel {
public:
    /// Lost when the channel is closed.
    void push(T thing) {
        {
            std::lock_guard<std::mutex> const lock(mutex_);
            if (isClosed_)
                return;
            things_.push_back(std::move(thing));
        }
        changed_.notify_one();
    }

    /// Waits for the next thing.
    /// @return nothing when the channel is closed and empty
    std::optional<T> pop() {
        std::unique_lock<std::mutex> lock(mutex_);
        changed_.wait(lock, [this] { return isClosed_ || !things_.empty(); });
        return take();
    }

    /// The next thing, if there is one already.
    std::optional<T> tryPop() {
        std::lock_guard<std::mutex> const lock(mutex_);
        return take();
    }

    /// What was pushed before can still be taken.
    void close() {
        {
            std::lock_guard<std::mutex> const lock(mutex_);
            isClosed_ = true;
        }
        changed_.notify_all();
    }

private:
    std::optional<T> take() {
        if (things_.empty())
            return std::nullopt;
        T thing = std::move(things_.front());
        things_.pop_front();
        return thing;
    }

    std::mutex mutex_;
    std::condition_variable changed_;
    std::deque<T> things_;
    bool isClosed_ = false;
};

} // namespace Develop
