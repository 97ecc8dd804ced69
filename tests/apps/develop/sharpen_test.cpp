// The sharpening of develop, on every path, against double precision.
#include "tests/apps/develop/developfixture.h"
#include "tests/support/pictures.h"

#include <map>

using namespace apps_test;
using App::Image;

namespace {

/// Linear light of a picture, alpha as it is stored.
std::vector<double> LightOf(Image const &image) {
    std::vector<double> light(ValueCount(image));
    for (std::size_t i = 0; i < light.size(); ++i)
        light[i] = DecodeSRGB(Value(image, i) / Levels(image));
    return light;
}

/// Blurs along one side of a picture: `step` values from one pixel to the next, `count` of them.
void BlurLine(double const *source, double *target, std::size_t step, std::size_t count,
              double sigma) {
    auto const reach = static_cast<long>(std::ceil(3 * sigma));
    auto const last = static_cast<long>(count) - 1;
    double total = 0;
    for (long k = -reach; k <= reach; ++k)
        total += std::exp(-static_cast<double>(k * k) / (2 * sigma * sigma));
    for (long i = 0; i <= last; ++i) {
        double sum = 0;
        for (long k = -reach; k <= reach; ++k)
            sum += std::exp(-static_cast<double>(k * k) / (2 * sigma * sigma)) *
                   source[static_cast<std::size_t>(std::clamp(i + k, 0L, last)) * step];
        target[static_cast<std::size_t>(i) * step] = sum / total;
    }
}

std::vector<double> Blurred(std::vector<double> const &light, App::Shape const &shape,
                            double sigma) {
    std::vector<double> rows(light.size());
    std::vector<double> all(light.size());
    std::size_t const rowValues = shape.width * shape.channels;
    for (std::size_t first = 0; first < light.size(); first += rowValues)
        for (std::size_t c = 0; c < shape.channels; ++c)
            BlurLine(&light[first + c], &rows[first + c], shape.channels, shape.width, sigma);
    for (std::size_t i = 0; i < rowValues; ++i)
        BlurLine(&rows[i], &all[i], rowValues, shape.height, sigma);
    return all;
}

/// The largest difference of a sharpened picture from the exact one; alpha must not differ.
double WorstSharpeningError(Image const &original, Image const &sharpened, double amount,
                            double sigma, double stops) {
    if (original != static_cast<App::Shape const &>(sharpened))
        return 1e9;
    std::vector<double> const light = LightOf(original);
    std::vector<double> const blurred = Blurred(light, original, sigma);
    double const levels = Levels(original);
    double worst = 0;
    for (std::size_t i = 0; i < light.size(); ++i) {
        double const v = std::max(0.0, light[i] + amount * (light[i] - blurred[i]));
        double const exact =
            IsAlpha(original, i)
                ? Value(original, i)
                : std::round(EncodeSRGB(std::min(1.0, v * std::exp2(stops))) * levels);
        double const error = std::abs(exact - Value(sharpened, i));
        worst = std::max(worst, IsAlpha(original, i) ? 1e6 * error : error);
    }
    return worst;
}

struct Path {
    char const *name;
    std::vector<std::string> arguments;
    char const *tells; ///< what the program says about it
};

std::vector<Path> Paths() {
    std::string const sharingRuntime = App::ToText(ProgramFolder() / "ocl_runtime");
    return {{"shared", {"--opencl", sharingRuntime}, "on the texture shared with OpenGL"},
            {"copy", {}, "on a copy"},
            {"glsl", {"--device", "none"}, "sharpening by GLSL: as wished"},
            {"bare", {"--opencl", "in"}, "sharpening by GLSL: no OpenCL runtime"}};
}

class Sharpen : public DevelopFixture {};

// Every kind of picture, also smaller than the blur, with little, usual and extreme settings.
TEST_F(Sharpen, IsExactOnEveryPath) {
    std::map<std::string, Image> pictures;
    for (App::Shape const &shape : std::vector<App::Shape>{{61, 37, 3, 8},
                                                           {50, 31, 4, 8},
                                                           {40, 7, 1, 8},
                                                           {19, 40, 2, 8},
                                                           {1, 1, 3, 8},
                                                           {33, 1, 3, 16},
                                                           {1, 45, 1, 16},
                                                           {40, 30, 2, 16},
                                                           {29, 30, 4, 16}}) {
        Image const image = RandomPicture(shape, shape.channels);
        pictures[shape.description() + ".png"] = image;
        write("in/" + shape.description() + ".png", image);
    }
    for (Path const &path : Paths())
        for (auto const &[amount, sigma] :
             std::vector<std::pair<std::string, std::string>>{{"5", "0.3"}, {"2", "20"}}) {
            std::string const output = path.name + amount;
            std::vector<std::string> arguments = {"--sharpen", amount,       "--radius",
                                                  sigma,       "--exposure", "-0.5",
                                                  "--output",  output,       "in"};
            arguments.insert(arguments.end(), path.arguments.begin(), path.arguments.end());
            Outcome const outcome = develop(arguments);
            ASSERT_EQ(outcome.exitCode, 0) << outcome.errors;
            ASSERT_NE(outcome.output.find(path.tells), std::string::npos)
                << path.name << " is not what ran: " << outcome.output;
            for (auto const &[name, image] : pictures)
                EXPECT_LE(WorstSharpeningError(image, read(output + "/" + name), std::stod(amount),
                                               std::stod(sigma), -0.5),
                          2 * Tolerance(image))
                    << name << ", path " << path.name << ", amount " << amount;
        }
    // OpenCL computes the same wherever the picture lies.
    for (auto const &entry : pictures)
        EXPECT_EQ(read("shared2/" + entry.first).pixels, read("copy2/" + entry.first).pixels);
}

TEST_F(Sharpen, ReportsPathAndStages) {
    write("a.png", RandomPicture({61, 37, 3, 8}, 1));
    Outcome const outcome = develop({"--sharpen", "1", "--report", "--device", "none", "a.png"});
    ASSERT_EQ(outcome.exitCode, 0) << outcome.errors;
    for (char const *const part : {"61 x 37, RGB, 8 bit: ", "decode ", "upload ", "sharpen ",
                                   "develop ", "read back ", "encode ", " ms"})
        EXPECT_NE(outcome.output.find(part), std::string::npos) << outcome.output;
}

TEST_F(Sharpen, UnknownDevice) {
    write("a.png", RandomPicture({2, 2, 3, 8}, 1));
    Outcome const outcome = develop({"--sharpen", "1", "--device", "abacus", "a.png"});
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_TRUE(Reports(outcome, "GPU", "there is no OpenCL device 'abacus'; there is"));
    EXPECT_TRUE(folder_.list("out").empty());
}

} // namespace
