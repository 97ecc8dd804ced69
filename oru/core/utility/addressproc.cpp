// A place where a host leaves a function that resolves addresses, for code that asks for it.
#include "oru/core/utility/addressproc.h"

namespace ORU {

namespace {

ZURGetAddressProc gProc = nullptr;

} // namespace

void SetZURGetAddressProc(ZURGetAddressProc proc) {
    gProc = proc;
}

ZURGetAddressProc GetZURGetAddressProc() {
    return gProc;
}

} // namespace ORU
