// A photo on its way from stage to stage.
#include "apps/develop/photowork.h"

namespace Develop {

void PhotoWork::fail(std::exception_ptr const &failure) {
    std::lock_guard<std::mutex> const lock(mutex_);
    if (hasFailed_)
        return;
    result.failure = failure;
    hasFailed_ = true;
}

} // namespace Develop
