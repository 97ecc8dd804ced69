// Pictures in JPEG form, by libjpeg.
#include "apps/common/jpegcodec.h"

#include "apps/common/failure.h"
#include "apps/common/jumpguard.h"
#include "apps/common/orientation.h"

#include <cstdio> // jpeglib.h needs it

#include <jpeglib.h>

#include <jerror.h>

#include <algorithm>

namespace App {

namespace {

/// The library's error manager, which its callbacks get back by the address of its first member.
struct ErrorManager {
    jpeg_error_mgr base;
    JumpGuard guard;
};

[[noreturn]] void Leave(j_common_ptr codec) {
    char text[JMSG_LENGTH_MAX];
    codec->err->format_message(codec, text);
    reinterpret_cast<ErrorManager *>(codec->err)->guard.leave(text);
}

/// Damage that the library fills with grey; its other warnings are about things that do no harm.
bool IsDamage(int message) {
    static constexpr int kDamage[] = {JWRN_ARITH_BAD_CODE, JWRN_HIT_MARKER, JWRN_HUFF_BAD_CODE,
                                      JWRN_JPEG_EOF, JWRN_MUST_RESYNC};
    return std::find(std::begin(kDamage), std::end(kDamage), message) != std::end(kDamage);
}

void OnMessage(j_common_ptr codec, int level) {
    if (level < 0 && IsDamage(codec->err->msg_code))
        Leave(codec);
}

class Decoder {
public:
    Decoder() {
        codec_.err = jpeg_std_error(&errors_.base);
        errors_.base.error_exit = Leave;
        errors_.base.emit_message = OnMessage;
    }
    ~Decoder() { jpeg_destroy_decompress(&codec_); }
    Decoder(Decoder const &) = delete;
    Decoder &operator=(Decoder const &) = delete;

    Image decode(std::vector<unsigned char> const &bytes, SizeLimit limit) {
        run([&] {
            jpeg_create_decompress(&codec_);
            jpeg_save_markers(&codec_, JPEG_APP0 + 1, 0xFFFF);
            jpeg_mem_src(&codec_, bytes.data(), static_cast<unsigned long>(bytes.size()));
            jpeg_read_header(&codec_, TRUE);
        });
        limit.require(codec_.image_width, codec_.image_height);
        Orientation const held = orientation();
        codec_.out_color_space = outputColours();
        run([&] { jpeg_start_decompress(&codec_); });
        Image image({codec_.output_width, codec_.output_height,
                     static_cast<unsigned int>(codec_.output_components), 8});
        run([&] {
            while (codec_.output_scanline < codec_.output_height) {
                JSAMPROW row = image.row(codec_.output_scanline);
                jpeg_read_scanlines(&codec_, &row, 1);
            }
            jpeg_finish_decompress(&codec_);
        });
        return Upright(image, held);
    }

private:
    template<class Step>
    void run(Step const &step) {
        if (Guarded(errors_.guard, step))
            return;
        int const code = errors_.base.msg_code;
        bool const isOfOtherKind = code == JERR_BAD_PRECISION || code == JERR_SOF_UNSUPPORTED ||
                                   code == JERR_ARITH_NOTIMPL;
        throw Failure((isOfOtherKind ? "this kind of JPEG is not supported (8 bits a channel, "
                                       "baseline or progressive, is): "
                                     : "damaged JPEG: ") +
                      errors_.guard.message);
    }

    Orientation orientation() const {
        Orientation found = kUpright;
        for (auto const *marker = codec_.marker_list; marker && found == kUpright;
             marker = marker->next)
            found = ReadOrientation(marker->data, marker->data_length);
        return found;
    }

    J_COLOR_SPACE outputColours() const {
        switch (codec_.jpeg_color_space) {
        case JCS_GRAYSCALE:
            return JCS_GRAYSCALE;
        case JCS_YCbCr:
        case JCS_RGB:
            return JCS_RGB;
        case JCS_CMYK:
        case JCS_YCCK:
            throw Failure("a JPEG in CMYK, which is not supported; convert it to RGB first");
        default:
            throw Failure("a JPEG in an unknown colour space");
        }
    }

    ErrorManager errors_;
    jpeg_decompress_struct codec_ = {};
};

} // namespace

bool IsJpeg(std::vector<unsigned char> const &bytes) {
    return bytes.size() >= 3 && bytes[0] == 0xFF && bytes[1] == 0xD8 && bytes[2] == 0xFF;
}

Image DecodeJpeg(std::vector<unsigned char> const &bytes, SizeLimit limit) {
    return Decoder().decode(bytes, limit);
}

} // namespace App
