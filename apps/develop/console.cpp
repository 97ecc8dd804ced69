// What develop prints: lines, problems, and a progress bar on a terminal.
#include "apps/develop/console.h"

#include "apps/common/unicode.h"

#include <io.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>

namespace Develop {

namespace {

constexpr std::size_t cBarCells = 24;
constexpr std::size_t cNameBytes = 40;

/// ORU_TERMINAL tells of a terminal behind the pipe that a script put between.
bool HasTerminal() {
    return _isatty(_fileno(stdout)) || std::getenv("ORU_TERMINAL") != nullptr;
}

/// A text without the drive that ORU_ROOT_DRIVE names: a script that runs on a system without
/// drives put it before absolute paths, and who gave those shall see them again.
std::string WithoutDrive(std::string text) {
    char const *const drive = std::getenv("ORU_ROOT_DRIVE");
    if (drive == nullptr || *drive == '\0')
        return text;
    std::string const root = drive + std::string("/");
    for (std::size_t at = text.find(root); at != std::string::npos; at = text.find(root, at))
        text.erase(at, root.size() - 1);
    return text;
}

void Write(std::FILE *file, std::string const &text) {
    std::fwrite(text.data(), 1, text.size(), file);
    std::fflush(file);
}

/// The end of a name that is too long for a line, cut between characters of UTF-8.
std::string Shortened(std::string const &name) {
    if (name.size() <= cNameBytes)
        return name;
    std::size_t begin = name.size() - cNameBytes;
    while (begin < name.size() && (static_cast<unsigned char>(name[begin]) & 0xC0u) == 0x80u)
        ++begin;
    return "..." + name.substr(begin);
}

} // namespace

Console::Console(bool quiet) : quiet_(quiet), hasBar_(!quiet && HasTerminal()) {
    App::PrepareConsole();
}

Console::~Console() {
    clearBar();
}

void Console::line(std::string const &text) {
    if (quiet_)
        return;
    clearBar();
    Write(stdout, WithoutDrive(text) + "\n");
    drawBar();
}

void Console::problem(std::string const &name, std::string const &reason) {
    hadProblems_ = true;
    clearBar();
    Write(stderr, WithoutDrive("develop: " + name + ": " + reason) + "\n");
    drawBar();
}

void Console::progress(std::size_t done, std::size_t total, std::string const &current) {
    if (!hasBar_ || total < 2)
        return;
    clearBar();
    std::size_t const filled = cBarCells * done / total;
    bar_ = "[" + std::string(filled, '#') + std::string(cBarCells - filled, '.') + "] " +
           std::to_string(done) + "/" + std::to_string(total) + " " + Shortened(current);
    drawBar();
}

void Console::clearBar() {
    if (!bar_.empty())
        Write(stdout, "\r\x1b[K");
}

void Console::drawBar() {
    Write(stdout, bar_);
}

} // namespace Develop
