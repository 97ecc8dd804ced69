// What the command line of oruinfo asks for.
#include "apps/oruinfo/options.h"

#include "apps/oruinfo/gather.h"
#include "oru/version.h"

#include <CLI/CLI.hpp>

namespace OruInfo {

namespace {

std::string Joined(std::vector<std::string> const &names) {
    std::string text;
    for (std::string const &name : names)
        text += (text.empty() ? "" : ", ") + name;
    return text;
}

CLI::Validator OneOf(std::vector<std::string> const &names) {
    return CLI::Validator(
        [names](std::string const &text) {
            bool const known = std::find(names.begin(), names.end(), text) != names.end();
            return known ? std::string()
                         : "'" + text + "' is no section; there are " + Joined(names);
        },
        std::string());
}

void Describe(CLI::App &app, Options &options) {
    app.allow_windows_style_options(false); // a slash begins a path
    app.set_version_flag("--version",
                         std::string("oruinfo " ORU_VERSION_STRING ", oru.dll ") + ORU::Version());
    auto *const json = app.add_flag("--json", options.json, "Write JSON instead of text");
    auto *const html =
        app.add_flag("--html", options.html, "Write a page for browsers instead of text")
            ->excludes(json);
    auto *const section =
        app.add_option("--section", options.sections,
                       "Only this section; may be given several times:\n" + Joined(SectionIds()))
            ->type_name("NAME")
            ->expected(1)
            ->take_all()
            ->check(OneOf(SectionIds()));
    app.add_option("--output", options.output, "Write to this file, whole or not at all")
        ->type_name("FILE");
    auto *const openCL =
        app.add_option("--opencl", options.openCLFolder, "Folder of the OpenCL.dll to use")
            ->type_name("DIR");
    app.add_option("--diff", options.diff, "Tell what changed between two reports in JSON")
        ->type_name("A.json B.json")
        ->expected(2)
        ->excludes(json)
        ->excludes(html)
        ->excludes(section)
        ->excludes(openCL);
    app.footer(
        "Exit code: 0 when a report was written, whatever it says, 1 when it could not be\n"
        "written, 2 when the command line is wrong. With --diff: 0 when the reports say the\n"
        "same, 1 when they differ, 2 when one of them is none.");
}

} // namespace

std::optional<Options> ParseOptions(std::vector<std::string> const &arguments, int &exitCode) {
    Options options;
    CLI::App app("Tells what this machine offers to programs that use ORU.", "oruinfo");
    Describe(app, options);
    try {
        app.parse(std::vector<std::string>(arguments.rbegin(), arguments.rend()));
        return options;
    } catch (CLI::Success const &helpOrVersion) {
        exitCode = app.exit(helpOrVersion);
    } catch (CLI::ParseError const &mistake) {
        std::cerr << "oruinfo: " << mistake.what() << " (--help shows what there is)\n";
        exitCode = EXIT_BAD_INPUT;
    }
    return std::nullopt;
}

} // namespace OruInfo
