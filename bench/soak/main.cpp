// Does for long what a host does, and looks at what stays behind.
#include "apps/common/number.h"
#include "apps/common/unicode.h"
#include "bench/soak/soaks.h"

#include <CLI/CLI.hpp>

#include <cstdio>
#include <exception>
#include <functional>

namespace {

/// Runs one of the three and prints its line.
bool Passes(char const *name, std::function<Soak::Verdict()> const &soak) {
    Soak::Verdict verdict;
    try {
        verdict = soak();
    } catch (std::exception const &failure) {
        verdict.figures = failure.what();
    }
    std::printf("%s %s: %s\n", verdict.passed ? "PASS" : "FAIL", name, verdict.figures.c_str());
    std::fflush(stdout);
    return verdict.passed;
}

int Soaks() {
    double minutes = 1;
    bool quick = false;
    std::vector<std::string> names;
    CLI::App app("Does for long what a host does, and looks at what stays behind.", "soak");
    app.allow_windows_style_options(false); // a slash begins a path
    app.add_option(
           "--minutes", minutes,
           "How long threads share; for each minute there are 500 photos and 2,000 contexts")
        ->check(CLI::Range(0.001, 10000.0))
        ->capture_default_str();
    app.add_flag("--quick", quick, "Some seconds only, which say nothing about memory");
    app.add_option("PHOTO", names, "Pictures to develop beside the generated ones")->type_name("");
    std::vector<std::string> arguments = App::CommandLineArguments();
    try {
        app.parse(std::vector<std::string>(arguments.rbegin(), arguments.rend()));
    } catch (CLI::Success const &help) {
        return app.exit(help);
    } catch (CLI::ParseError const &mistake) {
        std::fprintf(stderr, "soak: %s (--help shows what there is)\n", mistake.what());
        return 2;
    }
    if (quick)
        minutes = 1.0 / 60;
    std::vector<std::filesystem::path> photos;
    photos.reserve(names.size());
    for (std::string const &name : names)
        photos.push_back(App::ToPath(name));
    auto const times = [&](double perMinute) {
        return static_cast<std::size_t>(perMinute * minutes + 1);
    };
    bool passed = Passes("contexts", [&] { return Soak::MakeContexts(times(1999)); });
    passed &= Passes("photos", [&] { return Soak::DevelopPhotos(times(499), photos); });
    passed &=
        Passes("sharing", [&] { return Soak::ShareObjects(std::chrono::minutes(1) * minutes); });
    return passed ? 0 : 1;
}

} // namespace

int main() {
    try {
        return Soaks();
    } catch (std::exception const &failure) {
        std::fprintf(stderr, "soak: %s\n", failure.what());
        return 1;
    }
}
