// What the command line of develop asks for.
#include "apps/develop/options.h"

#include "apps/common/number.h"
#include "oru/version.h"

#include <CLI/CLI.hpp>

#include <algorithm>
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

/// The words that an option takes, as a line.
std::string Listed(std::vector<std::string> const &words) {
    std::string line;
    for (std::string const &word : words)
        line += (line.empty() ? "" : ", ") + word;
    return line;
}

CLI::Validator OneOf(std::vector<std::string> const &words) {
    return CLI::Validator(
        [words](std::string const &text) {
            bool const isKnown = std::find(words.begin(), words.end(), text) != words.end();
            return isKnown ? std::string() : "'" + text + "' is none of " + Listed(words);
        },
        std::string());
}

std::optional<App::FileKind> KindOfFormat(std::string const &format) {
    if (format == "same")
        return std::nullopt;
    return format == "jpeg"   ? App::FileKind::Jpeg
           : format == "tiff" ? App::FileKind::Tiff
                              : App::FileKind::Png;
}

void DescribeFiles(CLI::App &app, Options &options) {
    app.add_option("IMAGE", options.inputs, "PNG, JPEG or TIFF pictures, and folders of them")
        ->type_name("")
        ->option_text("...");
    app.add_option(
           "--list", options.list,
           "Further ones: a file with a path in each line, in UTF-8; - reads the list from\n"
           "the standard input")
        ->type_name("FILE");
    app.add_option("--output", options.output, "Folder for the developed pictures")
        ->type_name("DIR")
        ->capture_default_str();
    app.add_option_function<std::string>(
           "--format",
           [&options](std::string const &format) { options.kind = KindOfFormat(format); },
           "Their kind: png, jpeg, tiff, or same for each photo's own")
        ->type_name("KIND")
        ->check(OneOf({"png", "jpeg", "tiff", "same"}))
        ->default_str("png");
    app.add_option("--quality", options.quality, "Of JPEG files, 1 to 100")
        ->type_name("N")
        ->check(Between(1, 100))
        ->capture_default_str();
    app.add_flag("--skip-existing", options.skipExisting,
                 "Leave out the photos whose developed picture exists");
}

void DescribeReports(CLI::App &app, Options &options) {
    app.add_option("--trace", options.trace, "Write every OpenGL call to a file")
        ->type_name("FILE");
    app.add_flag("--report", options.report, "Tell how each picture was made, and the times");
    app.add_option(
           "--json", options.json,
           "Write what became of each photo to a file, at the end; - writes to the standard\n"
           "output, and all other lines go to the error output")
        ->type_name("FILE");
    app.add_flag("--quiet", options.quiet, "Print problems only");
}

void Describe(CLI::App &app, Options &options) {
    app.allow_windows_style_options(false); // a slash begins a path
    app.set_version_flag("--version",
                         std::string("develop " ORU_VERSION_STRING ", oru.dll ") + ORU::Version());
    DescribeFiles(app, options);
    app.add_option(
           "--convert-to", options.convertTo,
           "Convert to the colours of srgb or p3 (Display P3), and not keep the photo's own")
        ->type_name("SPACE")
        ->check(OneOf({"srgb", "p3"}));
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
    DescribeReports(app, options);
    app.footer(
        "Exit code: 0 when every picture was developed or skipped, 1 when one was not, 2 when\n"
        "the command line is wrong, 130 when Ctrl-C ended the work: the photos under way\n"
        "leave no file then, and a second Ctrl-C does not wait for that.");
}

} // namespace

std::optional<Options> ParseOptions(std::vector<std::string> const &arguments, int &exitCode) {
    Options options;
    CLI::App app("Develops photos on the GPU.", "develop");
    Describe(app, options);
    try {
        app.parse(std::vector<std::string>(arguments.rbegin(), arguments.rend()));
        // Asked for here, or a mistyped option would be reported as a missing picture.
        if (options.inputs.empty() && options.list.empty())
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
