// UTF-8 texts of the programs, and the UTF-16 that Windows takes.
#include "apps/common/unicode.h"

#include <windows.h>

#include <shellapi.h>

#include <memory>

namespace App {

namespace {

std::wstring ToWide(std::string const &text) {
    auto const bytes = static_cast<int>(text.size());
    int const size = ::MultiByteToWideChar(CP_UTF8, 0, text.data(), bytes, nullptr, 0);
    std::wstring wide(static_cast<std::size_t>(size), L'\0');
    ::MultiByteToWideChar(CP_UTF8, 0, text.data(), bytes, wide.data(), size);
    return wide;
}

} // namespace

std::string ToUtf8(std::wstring const &wide) {
    auto const size = static_cast<int>(wide.size());
    int const bytes =
        ::WideCharToMultiByte(CP_UTF8, 0, wide.data(), size, nullptr, 0, nullptr, nullptr);
    std::string text(static_cast<std::size_t>(bytes), '\0');
    ::WideCharToMultiByte(CP_UTF8, 0, wide.data(), size, text.data(), bytes, nullptr, nullptr);
    return text;
}

std::vector<std::string> CommandLineArguments() {
    int count = 0;
    std::unique_ptr<LPWSTR, decltype(&::LocalFree)> const arguments(
        ::CommandLineToArgvW(::GetCommandLineW(), &count), &::LocalFree);
    std::vector<std::string> texts;
    for (int i = 1; arguments && i < count; ++i)
        texts.push_back(ToUtf8(arguments.get()[i]));
    return texts;
}

std::string ToText(std::filesystem::path const &path) {
    return ToUtf8(path.generic_wstring());
}

std::filesystem::path ToPath(std::string const &text) {
    return std::filesystem::path(ToWide(text));
}

std::string FoldCase(std::string const &text) {
    std::wstring wide = ToWide(text);
    ::CharLowerBuffW(wide.data(), static_cast<DWORD>(wide.size()));
    return ToUtf8(wide);
}

void PrepareConsole() {
    ::SetConsoleOutputCP(CP_UTF8);
    HANDLE const console = ::GetStdHandle(STD_OUTPUT_HANDLE);
    DWORD mode = 0;
    if (::GetConsoleMode(console, &mode))
        ::SetConsoleMode(console, mode | ENABLE_VIRTUAL_TERMINAL_PROCESSING);
}

} // namespace App
