// The version that the library was built as.
#include "oru/version.h"

namespace ORU {

char const *Version() noexcept {
    return ORU_VERSION_STRING;
}

} // namespace ORU
