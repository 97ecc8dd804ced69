// Failures of libjpeg.
#include "apps/common/jpegerrors.h"

#include <jerror.h>

#include <algorithm>
#include <iterator>

namespace App {

namespace {

/// Damage that the library fills with grey; its other warnings are about things that do no harm.
bool IsDamage(int message) {
    static constexpr int kDamage[] = {JWRN_ARITH_BAD_CODE, JWRN_HIT_MARKER, JWRN_HUFF_BAD_CODE,
                                      JWRN_JPEG_EOF, JWRN_MUST_RESYNC};
    return std::find(std::begin(kDamage), std::end(kDamage), message) != std::end(kDamage);
}

void OnMessage(j_common_ptr codec, int level) {
    if (level < 0 && IsDamage(codec->err->msg_code))
        JpegErrors::Leave(codec);
}

} // namespace

JpegErrors::JpegErrors() {
    jpeg_std_error(&base);
    base.error_exit = Leave;
    base.emit_message = OnMessage;
}

JumpGuard &JpegErrors::GuardOf(j_common_ptr codec) {
    return reinterpret_cast<JpegErrors *>(codec->err)->guard;
}

void JpegErrors::Leave(j_common_ptr codec) {
    char text[JMSG_LENGTH_MAX];
    codec->err->format_message(codec, text);
    GuardOf(codec).leave(text);
}

} // namespace App
