// Pictures in JPEG form, read row by row, by libjpeg.
#include "apps/common/jpegreader.h"

#include "apps/common/jpegerrors.h"
#include "apps/common/jpegmarkers.h"
#include "apps/common/uprightreader.h"

#include <jerror.h>

#include <algorithm>
#include <array>

namespace App {

namespace {

constexpr std::size_t kBufferBytes = std::size_t{64} * 1024;

/// Hands the library the bytes of a source.
struct JpegSource {
    explicit JpegSource(std::unique_ptr<Source> from) : source(std::move(from)) {
        base.init_source = [](j_decompress_ptr) {};
        base.fill_input_buffer = Fill;
        base.skip_input_data = Skip;
        base.resync_to_restart = jpeg_resync_to_restart;
        base.term_source = [](j_decompress_ptr) {};
    }

    static JpegSource &Of(j_decompress_ptr codec) {
        return *reinterpret_cast<JpegSource *>(codec->src);
    }

    static boolean Fill(j_decompress_ptr codec) {
        JpegSource &self = Of(codec);
        auto *const common = reinterpret_cast<j_common_ptr>(codec);
        std::size_t count = 0;
        bool const isRead = JpegErrors::GuardOf(common).keep([&] {
            count = self.source->read(self.position, self.buffer.data(), self.buffer.size());
        });
        if (!isRead || count == 0) {
            codec->err->msg_code = JWRN_JPEG_EOF;
            JpegErrors::Leave(common);
        }
        self.position += count;
        self.base.next_input_byte = self.buffer.data();
        self.base.bytes_in_buffer = count;
        return TRUE;
    }

    static void Skip(j_decompress_ptr codec, long count) {
        if (count <= 0)
            return;
        JpegSource &self = Of(codec);
        auto const skipped = static_cast<std::size_t>(count);
        std::size_t const here = std::min(skipped, self.base.bytes_in_buffer);
        self.base.next_input_byte += here;
        self.base.bytes_in_buffer -= here;
        self.position += skipped - here;
    }

    jpeg_source_mgr base = {};
    std::unique_ptr<Source> source;
    std::uint64_t position = 0; ///< of what follows the buffer
    std::array<unsigned char, kBufferBytes> buffer;
};

class JpegReader : public PictureReader {
public:
    explicit JpegReader(std::unique_ptr<Source> source) : source_(std::move(source)) {
        codec_.err = &errors_.base;
        try {
            readHeader();
        } catch (...) {
            jpeg_destroy_decompress(&codec_);
            throw;
        }
    }
    ~JpegReader() override { jpeg_destroy_decompress(&codec_); }

    Orientation orientation() const { return orientation_; }

    std::string wholeReason() const override { return wholeReason_; }

    void read(unsigned char *rows, std::size_t count) override {
        run([&] {
            if (!isStarted_)
                jpeg_start_decompress(&codec_);
            isStarted_ = true;
            JDIMENSION const end = codec_.output_scanline + static_cast<JDIMENSION>(count);
            while (codec_.output_scanline < end) {
                JSAMPROW row = rows;
                rows += jpeg_read_scanlines(&codec_, &row, 1) * head_.rowBytes();
            }
            if (end == codec_.output_height)
                jpeg_finish_decompress(&codec_);
        });
    }

private:
    void readHeader() {
        run([&] {
            jpeg_create_decompress(&codec_);
            codec_.src = &source_.base;
            SaveJpegMarkers(&codec_);
            jpeg_read_header(&codec_, TRUE);
        });
        RequirePixels(codec_.image_width, codec_.image_height);
        head_.kind = FileKind::Jpeg;
        head_.width = codec_.image_width;
        head_.height = codec_.image_height;
        orientation_ = TakeJpegMarkers(codec_, head_);
        codec_.out_color_space = outputColours();
        head_.channels = codec_.out_color_space == JCS_GRAYSCALE ? 1 : 3;
        if (head_.channels == 3)
            head_.sampling = sampling();
        if (jpeg_has_multiple_scans(&codec_)) {
            wholeReason_ = codec_.progressive_mode ? "progressive JPEG" : "JPEG in several scans";
            requireJustifiedSize();
        }
    }

    template<class Step>
    void run(Step const &step) {
        if (Guarded(errors_.guard, step))
            return;
        int const code = errors_.base.msg_code;
        bool const isOfOtherKind = code == JERR_BAD_PRECISION || code == JERR_SOF_UNSUPPORTED ||
                                   code == JERR_ARITH_NOTIMPL;
        errors_.guard.raise(isOfOtherKind
                                ? "this kind of JPEG is not supported (8 bits a channel, baseline "
                                  "or progressive, is): "
                                : "damaged JPEG: ");
    }

    /// Memory for all coefficients is taken only for a file that can fill them: each block of 64
    /// takes a bit at least of Huffman's codes, and some hundredth of arithmetic ones.
    void requireJustifiedSize() const {
        std::uint64_t const most = codec_.arith_code ? 64 * 8 * 128 : 64 * 8;
        if (std::uint64_t{head_.width} * head_.height / most > source_.source->size())
            throw Failure("damaged JPEG: the file is cut off");
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

    std::optional<Sampling> sampling() const {
        jpeg_component_info const *const components = codec_.comp_info;
        auto const ratio = [&](int jpeg_component_info::*factor) {
            int const luma = components[0].*factor, chroma = components[1].*factor;
            return chroma == components[2].*factor && luma % chroma == 0 ? luma / chroma : 0;
        };
        Sampling const found = {ratio(&jpeg_component_info::h_samp_factor),
                                ratio(&jpeg_component_info::v_samp_factor)};
        bool const isUsual = found.horizontal * found.vertical > 0;
        return isUsual ? std::optional<Sampling>(found) : std::nullopt;
    }

    JpegErrors errors_;
    JpegSource source_;
    jpeg_decompress_struct codec_ = {};
    Orientation orientation_ = kUpright;
    bool isStarted_ = false;
    std::string wholeReason_;
};

} // namespace

bool IsJpeg(Bytes const &beginning) {
    return beginning.size() >= 3 && beginning[0] == 0xFF && beginning[1] == 0xD8 &&
           beginning[2] == 0xFF;
}

std::unique_ptr<PictureReader> OpenJpeg(std::unique_ptr<Source> source) {
    auto reader = std::make_unique<JpegReader>(std::move(source));
    Orientation const orientation = reader->orientation();
    return Upright(std::move(reader), orientation);
}

} // namespace App
