// A pair of sizes: width and height.
#include "oru/core/utility/size2.h"

#include <ostream>

namespace ORU {

std::ostream &operator<<(std::ostream &os, size2 const &size) {
    return os << "(" << size[0] << ", " << size[1] << ")";
}

} // namespace ORU
