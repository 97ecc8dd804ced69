// The sizes of a kernel launch.
#include "oru/oru_ocl/range.h"

namespace ORU::OCL {

// The layout that clGetDeviceInfo and clEnqueueNDRangeKernel read and write.
static_assert(sizeof(Range<1>) == 1 * sizeof(std::size_t));
static_assert(sizeof(Range<2>) == 2 * sizeof(std::size_t));
static_assert(sizeof(Range<3>) == 3 * sizeof(std::size_t));

template class Range<1>;
template class Range<2>;
template class Range<3>;

} // namespace ORU::OCL
