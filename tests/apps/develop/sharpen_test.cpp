// The sharpening of develop, on every path, against double precision.
#include "tests/apps/develop/developfixture.h"

#include <map>

using namespace apps_test;
using App::Image;

namespace {

/// Light blurred along values of which `count` follow at a distance of `step`; the outermost go on
/// beyond the edges.
std::vector<double> Blurred(std::vector<double> const &light, std::size_t step, std::size_t count,
                            double sigma) {
    auto const reach = static_cast<long>(std::ceil(3 * sigma));
    std::vector<double> blurred;
    for (std::size_t i = 0; i < light.size(); ++i) {
        auto const place = static_cast<long>(i / step % count);
        double sum = 0, total = 0;
        for (long k = -reach; k <= reach; ++k) {
            double const weight = std::exp(-static_cast<double>(k * k) / (2 * sigma * sigma));
            auto const tap = std::clamp(place + k, 0L, static_cast<long>(count) - 1);
            sum += weight * light[i + static_cast<std::size_t>(tap - place) * step];
            total += weight;
        }
        blurred.push_back(sum / total);
    }
    return blurred;
}

using Sharpen = DevelopFixture;

// Every kind of picture, also smaller than the blur, with little, usual and extreme settings.
TEST_F(Sharpen, IsExactOnEveryPath) {
    App::Shape const shapes[] = {{61, 37, 3, 8}, {7, 40, 1, 8},   {1, 1, 3, 8},
                                 {33, 1, 3, 16}, {40, 30, 2, 16}, {29, 30, 4, 16}};
    std::map<std::string, Image> pictures;
    for (App::Shape const &shape : shapes) {
        std::string const name = shape.description() + ".png";
        pictures[name] = RandomPicture(shape, shape.channels);
        write("in/" + name, pictures[name]);
    }
    struct Path {
        std::string name, options, tells;
    };
    Path const paths[] = {{"shared",
                           "--opencl \"" + App::ToText(ProgramFolder() / "ocl_runtime") + "\"",
                           "on the texture shared with OpenGL"},
                          {"alone", "--device 0.0", "like all else"},
                          {"glsl", "--device none", "sharpening by GLSL: as wished"},
                          {"bare", "--opencl in", "sharpening by GLSL: no OpenCL runtime"}};
    for (auto const &[strength, sigma] : {std::pair(5, 0.3), std::pair(2, 20.0)}) {
        std::string const amount = std::to_string(strength);
        for (Path const &path : paths)
            EXPECT_THAT(tellsOf("--exposure -0.5 --sharpen " + amount + " --radius " +
                                std::to_string(sigma) + " " + path.options + " --output " +
                                path.name + amount + " in"),
                        testing::HasSubstr(path.tells));
        for (auto const &[name, image] : pictures) {
            std::vector<double> light;
            for (std::size_t i = 0; i < ValueCount(image); ++i)
                light.push_back(Light(image, i));
            auto const rows = Blurred(light, image.channels, image.width, sigma);
            auto const blurred = Blurred(rows, image.channels * image.width, image.height, sigma);
            std::vector<double> exact;
            for (std::size_t i = 0; i < light.size(); ++i)
                exact.push_back((light[i] + strength * (light[i] - blurred[i])) * std::exp2(-0.5));
            for (Path const &path : paths)
                EXPECT_LE(WorstError(image, read(path.name + amount + "/" + name),
                                     [&](std::size_t i) { return exact[i]; }),
                          2 * Tolerance(image))
                    << name << ", path " << path.name << ", amount " << amount;
        }
    }
}

} // namespace
