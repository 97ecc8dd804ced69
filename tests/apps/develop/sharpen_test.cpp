// The sharpening of develop, on every path, against double precision.
#include "tests/apps/develop/developfixture.h"

#include <map>

using namespace apps_test;
using App::Image;

namespace {

/// The linear light of a picture.
std::vector<double> LightOf(Image const &image) {
    std::vector<double> light(ValueCount(image));
    for (std::size_t i = 0; i < light.size(); ++i)
        light[i] = Light(image, i);
    return light;
}

enum class Along { Rows, Columns };

/// Light blurred in one direction; the outermost pixels go on beyond the edges.
std::vector<double> Blurred(std::vector<double> const &light, App::Shape const &shape, Along along,
                            double sigma) {
    auto const reach = static_cast<long>(std::ceil(3 * sigma));
    std::size_t const step = shape.channels * (along == Along::Rows ? 1 : shape.width);
    std::size_t const count = along == Along::Rows ? shape.width : shape.height;
    std::vector<double> blurred(light.size());
    for (std::size_t i = 0; i < light.size(); ++i) {
        auto const place = static_cast<long>(i / step % count);
        double sum = 0, total = 0;
        for (long k = -reach; k <= reach; ++k) {
            double const weight = std::exp(-static_cast<double>(k * k) / (2 * sigma * sigma));
            auto const tap = std::clamp(place + k, 0L, static_cast<long>(count) - 1);
            sum += weight * light[i + static_cast<std::size_t>(tap - place) * step];
            total += weight;
        }
        blurred[i] = sum / total;
    }
    return blurred;
}

using Sharpen = DevelopFixture;

// Every kind of picture, also smaller than the blur, with little, usual and extreme settings.
TEST_F(Sharpen, IsExactOnEveryPath) {
    App::Shape const shapes[] = {{61, 37, 3, 8}, {50, 31, 4, 8},  {40, 7, 1, 8},
                                 {19, 40, 2, 8}, {1, 1, 3, 8},    {33, 1, 3, 16},
                                 {1, 45, 1, 16}, {40, 30, 2, 16}, {29, 30, 4, 16}};
    std::map<std::string, Image> pictures;
    for (App::Shape const &shape : shapes) {
        std::string const name = shape.description() + ".png";
        pictures[name] = RandomPicture(shape, shape.channels);
        write("in/" + name, pictures[name]);
    }
    struct Path {
        std::string name, options;
        char const *tells; ///< what the program says about it
    };
    Path const paths[] = {{"shared",
                           "--opencl \"" + App::ToText(ProgramFolder() / "ocl_runtime") + "\"",
                           "on the texture shared with OpenGL"},
                          {"copy", "--device 0.0", "on a copy"},
                          {"glsl", "--device none", "sharpening by GLSL: as wished"},
                          {"bare", "--opencl in", "sharpening by GLSL: no OpenCL runtime"}};
    for (auto const &[amount, sigma] :
         std::map<std::string, std::string>{{"5", "0.3"}, {"2", "20"}}) {
        for (Path const &path : paths)
            EXPECT_THAT(tellsOf("--exposure -0.5 --sharpen " + amount + " --radius " + sigma + " " +
                                path.options + " --output " + path.name + amount + " in"),
                        testing::HasSubstr(path.tells));
        for (auto const &[name, image] : pictures) {
            std::vector<double> const light = LightOf(image);
            std::vector<double> const blurred =
                Blurred(Blurred(light, image, Along::Rows, std::stod(sigma)), image, Along::Columns,
                        std::stod(sigma));
            auto const exact = [&, strength = std::stod(amount)](std::size_t i) {
                return (light[i] + strength * (light[i] - blurred[i])) * std::exp2(-0.5);
            };
            for (Path const &path : paths)
                EXPECT_LE(WorstError(image, read(path.name + amount + "/" + name), exact),
                          2 * Tolerance(image))
                    << name << ", path " << path.name << ", amount " << amount;
        }
    }
    // OpenCL computes the same wherever the picture lies.
    for (auto const &entry : pictures)
        EXPECT_EQ(read("shared2/" + entry.first).pixels, read("copy2/" + entry.first).pixels);
}

} // namespace
