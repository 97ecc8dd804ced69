// The whole run of oruinfo.
#include "apps/oruinfo/job.h"

#include "apps/common/failure.h"
#include "apps/common/file.h"
#include "apps/common/unicode.h"
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/gather.h"
#include "apps/oruinfo/options.h"
#include "apps/oruinfo/reportdiff.h"
#include "apps/oruinfo/writers.h"

#include <cstdio>

namespace OruInfo {

namespace {

void Write(Options const &options, std::string const &text) {
    if (options.output.empty()) {
        App::PrepareConsole();
        if (std::fwrite(text.data(), 1, text.size(), stdout) != text.size() ||
            std::fflush(stdout) != 0)
            throw App::Failure("the standard output cannot be written");
        return;
    }
    try {
        App::WriteFile(App::ToPath(options.output), {text.begin(), text.end()});
    } catch (App::Failure const &failure) {
        throw App::Failure(options.output + ": " + failure.what());
    }
}

int WriteDiff(Options const &options) {
    std::vector<std::string> const lines =
        DiffReports(App::ToPath(options.diff[0]), App::ToPath(options.diff[1]));
    std::string text;
    for (std::string const &line : lines)
        text += line + "\n";
    Write(options, lines.empty() ? "The reports say the same.\n" : text);
    return lines.empty() ? EXIT_DONE : EXIT_DIFFERENT;
}

void WriteReport(Options const &options) {
    Drivers drivers(options.openCLFolder);
    Report const report = Gather(options.sections, drivers);
    Write(options, options.json ? JsonOf(report) : options.html ? HtmlOf(report) : TextOf(report));
}

} // namespace

int RunJob(Options const &options) {
    try {
        if (!options.diff.empty())
            return WriteDiff(options);
        WriteReport(options);
        return EXIT_DONE;
    } catch (std::exception const &failure) {
        std::fprintf(stderr, "oruinfo: %s\n", failure.what());
        return options.diff.empty() ? EXIT_NOT_WRITTEN : EXIT_BAD_INPUT;
    }
}

} // namespace OruInfo
