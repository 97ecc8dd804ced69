// Pictures in JPEG form, written row by row, by libjpeg.
#include "apps/common/jpegwriter.h"

#include "apps/common/jpegerrors.h"
#include "apps/common/jpegmarkers.h"

#include <jerror.h>

#include <array>

namespace App {

namespace {

constexpr std::size_t kBufferBytes = std::size_t{64} * 1024;

/// Takes the library's bytes to a sink.
struct JpegTarget {
    explicit JpegTarget(std::unique_ptr<Sink> to) : sink(std::move(to)) {
        base.init_destination = [](j_compress_ptr codec) { Of(codec).clear(); };
        base.empty_output_buffer = [](j_compress_ptr codec) {
            Of(codec).pass(codec, kBufferBytes);
            return boolean{TRUE};
        };
        base.term_destination = [](j_compress_ptr codec) {
            Of(codec).pass(codec, kBufferBytes - Of(codec).base.free_in_buffer);
        };
    }

    static JpegTarget &Of(j_compress_ptr codec) {
        return *reinterpret_cast<JpegTarget *>(codec->dest);
    }

    void clear() {
        base.next_output_byte = buffer.data();
        base.free_in_buffer = buffer.size();
    }

    void pass(j_compress_ptr codec, std::size_t count) {
        auto *const common = reinterpret_cast<j_common_ptr>(codec);
        if (!JpegErrors::GuardOf(common).keep(
                [&] { sink->write(position, buffer.data(), count); })) {
            codec->err->msg_code = JERR_FILE_WRITE;
            JpegErrors::Leave(common);
        }
        position += count;
        clear();
    }

    jpeg_destination_mgr base = {};
    std::unique_ptr<Sink> sink;
    std::uint64_t position = 0;
    std::array<unsigned char, kBufferBytes> buffer;
};

class JpegWriter : public PictureWriter {
public:
    JpegWriter(std::unique_ptr<Sink> sink, PictureHead const &head, Encoding const &encoding)
        : target_(std::move(sink)), shape_(head) {
        codec_.err = &errors_.base;
        try {
            begin(head, encoding);
        } catch (...) {
            jpeg_destroy_compress(&codec_);
            throw;
        }
    }
    ~JpegWriter() override { jpeg_destroy_compress(&codec_); }

    void write(unsigned char const *rows, std::size_t count) override {
        run([&] {
            for (std::size_t i = 0; i < count; ++i) {
                // The library takes what it only reads as if it wrote there.
                auto *row = const_cast<JSAMPROW>(rows + i * shape_.rowBytes());
                jpeg_write_scanlines(&codec_, &row, 1);
            }
        });
    }

    void finish() override {
        run([&] { jpeg_finish_compress(&codec_); });
        target_.sink->finish();
    }

private:
    void begin(PictureHead const &head, Encoding const &encoding) {
        std::vector<JpegMarker> const markers = JpegMarkersOf(head, losses_);
        run([&] {
            jpeg_create_compress(&codec_);
            codec_.dest = &target_.base;
            codec_.image_width = static_cast<JDIMENSION>(shape_.width);
            codec_.image_height = static_cast<JDIMENSION>(shape_.height);
            codec_.input_components = static_cast<int>(shape_.channels);
            codec_.in_color_space = shape_.channels == 1 ? JCS_GRAYSCALE : JCS_RGB;
            jpeg_set_defaults(&codec_);
            jpeg_set_quality(&codec_, encoding.quality, TRUE);
            if (shape_.channels == 3) {
                codec_.comp_info[0].h_samp_factor = encoding.sampling.horizontal;
                codec_.comp_info[0].v_samp_factor = encoding.sampling.vertical;
            }
            if (head.metadata.resolution)
                SetJpegDensity(&codec_, *head.metadata.resolution);
            jpeg_start_compress(&codec_, TRUE);
            for (JpegMarker const &marker : markers)
                jpeg_write_marker(&codec_, marker.marker, marker.bytes.data(),
                                  static_cast<unsigned int>(marker.bytes.size()));
        });
    }

    template<class Step>
    void run(Step const &step) {
        if (!Guarded(errors_.guard, step))
            errors_.guard.raise("cannot be encoded: ");
    }

    JpegErrors errors_;
    JpegTarget target_;
    Shape shape_;
    jpeg_compress_struct codec_ = {};
};

} // namespace

std::unique_ptr<PictureWriter> CreateJpeg(std::unique_ptr<Sink> sink, PictureHead const &head,
                                          Encoding const &encoding) {
    if (head.hasAlpha())
        throw Failure("JPEG holds no transparency");
    if (head.bitsPerChannel != 8)
        throw Failure("JPEG holds 8 bits a channel, not " + std::to_string(head.bitsPerChannel));
    if (head.width > JPEG_MAX_DIMENSION || head.height > JPEG_MAX_DIMENSION)
        throw Failure("JPEG holds at most " + std::to_string(JPEG_MAX_DIMENSION) +
                      " pixels a side");
    return std::make_unique<JpegWriter>(std::move(sink), head, encoding);
}

} // namespace App
