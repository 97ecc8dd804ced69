// Failures of libjpeg.
#pragma once

#include "apps/common/jumpguard.h"

#include <cstdio> // jpeglib.h needs it

#include <jpeglib.h>

namespace App {

/// The library's error manager, which its callbacks get back by the address of its first member.
struct JpegErrors {
    /// Installs itself, leaving by its guard when the library fails or meets damage.
    JpegErrors();

    /// The guard of a codec whose error manager is one of these.
    static JumpGuard &GuardOf(j_common_ptr codec);

    /// Has a callback's library call fail.
    [[noreturn]] static void Leave(j_common_ptr codec);

    jpeg_error_mgr base;
    JumpGuard guard;
};

} // namespace App
