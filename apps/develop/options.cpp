// What the command line of develop asks for.
#include "apps/develop/options.h"

#include <CLI/CLI.hpp>

#include <cmath>

namespace Develop {

namespace {

constexpr int cUsageError = 2;

CLI::Validator Finite() {
    return CLI::Validator(
        [](std::string const &text) {
            double value = 0;
            bool const finite = CLI::detail::lexical_cast(text, value) && std::isfinite(value);
            return finite ? std::string() : "'" + text + "' is not a number";
        },
        std::string());
}

void Describe(CLI::App &app, Options &options) {
    app.allow_windows_style_options(false); // a slash begins a path
    app.set_version_flag("--version", "develop " ORU_VERSION);
    app.add_option("IMAGE", options.inputs, "PNG or JPEG pictures, and folders of them")
        ->type_name("")
        ->option_text("...");
    app.add_option("--exposure", options.exposure, "Brighten by EV stops; negative darkens")
        ->type_name("EV")
        ->check(Finite());
    app.add_option("--output", options.output, "Folder for the developed PNG pictures")
        ->type_name("DIR")
        ->capture_default_str();
    app.add_option("--trace", options.trace, "Write every OpenGL call to a file")
        ->type_name("FILE");
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
        exitCode = cUsageError;
    }
    return std::nullopt;
}

} // namespace Develop
