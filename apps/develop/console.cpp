// What develop prints: lines, problems, and a progress bar on a terminal.
#include "apps/develop/console.h"

#include "apps/common/unicode.h"

#include <io.h>

#include <cstdlib>

namespace Develop {

namespace {

constexpr std::size_t kBarCells = 24;

/// ORU_TERMINAL tells of a terminal behind the pipe that a script put at the standard output.
bool IsTerminal(std::FILE *file) {
    return _isatty(_fileno(file)) || (file == stdout && std::getenv("ORU_TERMINAL") != nullptr);
}

void Write(std::FILE *file, std::string const &text) {
    std::fwrite(text.data(), 1, text.size(), file);
    std::fflush(file);
}

} // namespace

std::string WithoutDrive(std::string text) {
    char const *const drive = std::getenv("ORU_ROOT_DRIVE");
    if (drive == nullptr || *drive == '\0')
        return text;
    std::string const root = drive + std::string("/");
    for (std::size_t at = text.find(root); at != std::string::npos; at = text.find(root, at))
        text.erase(at, root.size() - 1);
    return text;
}

Console::Console(bool quiet, std::FILE *output)
    : quiet_(quiet), output_(output), hasBar_(!quiet && IsTerminal(output)) {
    App::PrepareConsole();
}

Console::~Console() {
    endProgress();
}

void Console::line(std::string const &text) {
    if (quiet_)
        return;
    clearBar();
    Write(output_, WithoutDrive(text) + "\n");
    drawBar();
}

void Console::problem(std::string const &text) {
    hadProblems_ = true;
    notice(text);
}

void Console::notice(std::string const &text) {
    clearBar();
    Write(stderr, WithoutDrive("develop: " + text) + "\n");
    drawBar();
}

void Console::progress(double share, std::string const &text) {
    if (!hasBar_)
        return;
    clearBar();
    auto const filled = static_cast<std::size_t>(share * kBarCells);
    bar_ = "[" + std::string(filled, '#') + std::string(kBarCells - filled, '.') + "] " + text;
    drawBar();
}

void Console::endProgress() {
    clearBar();
    bar_.clear();
}

void Console::clearBar() {
    if (!bar_.empty())
        Write(output_, "\r\x1b[K");
}

void Console::drawBar() {
    Write(output_, bar_);
}

} // namespace Develop
