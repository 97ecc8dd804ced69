// What the command line of develop asks for.
#include "apps/develop/options.h"

#include "apps/common/number.h"
#include "oru/version.h"

#include <CLI/CLI.hpp>

#include <sstream>

namespace Develop {

namespace {

constexpr int kUsageError = 2;

/// A check that a number lies between two others. (CLI::Range lets through what is no number.)
CLI::Validator Between(double least, double most) {
    return CLI::Validator(
        [=](std::string const &text) {
            std::optional<double> const value = App::ParseNumber(text);
            std::ostringstream complaint;
            if (!value || *value < least || *value > most)
                complaint << "'" << text << "' is not a number from " << least << " to " << most;
            return complaint.str();
        },
        std::string());
}

void Describe(CLI::App &app, Options &options) {
    app.allow_windows_style_options(false); // a slash begins a path
    app.set_version_flag("--version",
                         std::string("develop " ORU_VERSION_STRING ", oru.dll ") + ORU::Version());
    app.add_option("IMAGE", options.inputs, "PNG or JPEG pictures, and folders of them")
        ->type_name("")
        ->option_text("...");
    app.add_option("--exposure", options.exposure, "Brighten by EV stops; negative darkens")
        ->type_name("EV")
        ->check(Between(-100, 100));
    auto *const sharpen = app.add_option("--sharpen", options.sharpening.amount,
                                         "Sharpen by an unsharp mask of this strength, 0 to 100")
                              ->type_name("AMOUNT")
                              ->check(Between(0, 100));
    app.add_option("--radius", options.sharpening.sigma,
                   "Standard deviation of its blur in pixels, 0.3 to 20")
        ->type_name("SIGMA")
        ->check(Between(0.3, 20))
        ->needs(sharpen)
        ->capture_default_str();
    app.add_option("--device", options.device,
                   "Sharpen on this OpenCL device: its numbers as in 0.1 or a part of its name;\n"
                   "none for OpenGL alone")
        ->type_name("DEVICE");
    app.add_option("--opencl", options.openCLFolder, "Folder of the OpenCL.dll to use")
        ->type_name("DIR");
    auto *const spots =
        app.add_option("--spots", options.spots,
                       "Local edits: a file with centre x, centre y, radius and EV in each line")
            ->type_name("FILE");
    app.add_option("--base", options.base,
                   "The picture developed without the spots; only they are then computed")
        ->type_name("PICTURE")
        ->needs(spots);
    app.add_option("--output", options.output, "Folder for the developed PNG pictures")
        ->type_name("DIR")
        ->capture_default_str();
    app.add_option("--trace", options.trace, "Write every OpenGL call to a file")
        ->type_name("FILE");
    app.add_flag("--report", options.report, "Tell how each picture was made, and the times");
    app.add_flag("--quiet", options.quiet, "Print problems only");
    app.footer("Exit code: 0 when every picture was developed, 1 when one was not, 2 when the\n"
               "command line is wrong.");
}

} // namespace

std::optional<Options> ParseOptions(std::vector<std::string> const &arguments, int &exitCode) {
    Options options;
    CLI::App app("Develops photos on the GPU.", "develop");
    Describe(app, options);
    try {
        app.parse(std::vector<std::string>(arguments.rbegin(), arguments.rend()));
        // Asked for here, or a mistyped option would be reported as a missing picture.
        if (options.inputs.empty())
            throw CLI::RequiredError("at least one picture or folder");
        return options;
    } catch (CLI::Success const &helpOrVersion) {
        exitCode = app.exit(helpOrVersion);
    } catch (CLI::ParseError const &mistake) {
        std::cerr << "develop: " << mistake.what() << " (--help shows what there is)\n";
        exitCode = kUsageError;
    }
    return std::nullopt;
}

} // namespace Develop
