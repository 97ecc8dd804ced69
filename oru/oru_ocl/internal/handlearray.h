// The handles of a list of wrappers, as the runtime takes them.
#pragma once

#include "oru/oru_ocl/openclheaders.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <vector>

namespace ORU::OCL {

/// A count and an array of handles of type `T`; allocates only for more than a few.
template<class T>
class HandleArray {
public:
    template<class Wrapper>
    explicit HandleArray(std::vector<Wrapper> const &wrappers) : count_(wrappers.size()) {
        T *handles = inline_.data();
        if (count_ > inline_.size()) {
            many_.resize(count_);
            handles = many_.data();
        }
        std::transform(wrappers.begin(), wrappers.end(), handles,
                       [](Wrapper const &wrapper) { return wrapper.id(); });
    }

    cl_uint count() const { return static_cast<cl_uint>(count_); }

    /// Null for an empty list, which is how the runtime wants it.
    T const *data() const {
        if (count_ == 0)
            return nullptr;
        return count_ > inline_.size() ? many_.data() : inline_.data();
    }

private:
    std::size_t count_;
    std::array<T, 16> inline_;
    std::vector<T> many_;
};

} // namespace ORU::OCL
