// Writes a photo of any size, for what tools/bench measures of develop: a sample enlarged, with the
// noise of a sensor, since a smooth picture would be compressed and so read and written too easily.
//
// Usage: makephoto SAMPLE WIDTH HEIGHT FILE
#include "apps/common/imagefile.h"
#include "apps/common/picturefile.h"
#include "apps/common/unicode.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <exception>

namespace {

/// Where a pixel of the large picture lies in the sample, along one side.
struct Place {
    std::size_t first, second;
    float weight; ///< of the second

    Place(std::size_t at, std::size_t size, std::size_t sampleSize) {
        float const exact = (static_cast<float>(at) + 0.5f) * static_cast<float>(sampleSize) /
                                static_cast<float>(size) -
                            0.5f;
        float const whole = std::floor(exact);
        auto const inside = [sampleSize](float value) {
            return static_cast<std::size_t>(
                std::clamp(value, 0.0f, static_cast<float>(sampleSize - 1)));
        };
        first = inside(whole);
        second = inside(whole + 1);
        weight = exact - whole;
    }
};

/// About normal, with a standard deviation of 1.2 codes.
class Noise {
public:
    float next() {
        state_ ^= state_ << 13;
        state_ ^= state_ >> 7;
        state_ ^= state_ << 17;
        int sum = 0;
        for (unsigned int byte = 0; byte < 4; ++byte)
            sum += static_cast<int>(state_ >> (8 * byte) & 0xff);
        return static_cast<float>(sum - 510) * (1.2f / 147.8f);
    }

private:
    std::uint64_t state_ = 0x9e3779b97f4a7c15u;
};

void MakePhoto(App::Image const &sample, App::PictureHead const &head, App::PictureWriter &file) {
    std::vector<Place> columns;
    for (std::size_t x = 0; x < head.width; ++x)
        columns.emplace_back(x, head.width, sample.width);
    std::vector<unsigned char> row(head.rowBytes());
    std::size_t const channels = head.channels;
    Noise noise;
    for (std::size_t y = 0; y < head.height; ++y) {
        Place const line(y, head.height, sample.height);
        unsigned char const *const above = sample.row(line.first);
        unsigned char const *const below = sample.row(line.second);
        for (std::size_t x = 0; x < head.width; ++x)
            for (std::size_t c = 0; c < channels; ++c) {
                Place const &column = columns[x];
                std::size_t const left = column.first * channels + c;
                std::size_t const right = column.second * channels + c;
                auto const mix = [](float a, float b, float weight) {
                    return a + (b - a) * weight;
                };
                float const value = mix(mix(above[left], above[right], column.weight),
                                        mix(below[left], below[right], column.weight), line.weight);
                row[x * channels + c] = static_cast<unsigned char>(
                    std::clamp(value + noise.next() + 0.5f, 0.0f, 255.0f));
            }
        file.write(row.data(), 1);
    }
    file.finish();
}

} // namespace

int main() {
    try {
        std::vector<std::string> const arguments = App::CommandLineArguments();
        if (arguments.size() != 4) {
            std::fputs("makephoto: give SAMPLE WIDTH HEIGHT FILE\n", stderr);
            return 2;
        }
        App::Image const sample = App::ReadImage(App::ToPath(arguments[0]), App::SizeLimit{65535});
        App::PictureHead head;
        static_cast<App::Shape &>(head) = sample;
        head.width = std::stoull(arguments[1]);
        head.height = std::stoull(arguments[2]);
        auto const path = App::ToPath(arguments[3]);
        App::Encoding encoding;
        encoding.kind = App::KindOfName(path).value_or(App::FileKind::Png);
        MakePhoto(sample, head, *App::CreatePicture(path, head, encoding));
    } catch (std::exception const &failure) {
        std::fprintf(stderr, "makephoto: %s\n", failure.what());
        return 1;
    }
    return 0;
}
