// UTF-8 texts of the programs, and the UTF-16 that Windows takes.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace App {

/// The arguments of the running program as UTF-8, without the program's name.
std::vector<std::string> CommandLineArguments();

/// The UTF-8 of a text of Windows. What is no valid UTF-16 becomes U+FFFD.
std::string ToUtf8(std::wstring const &wide);

/// The path with slashes, as UTF-8. What is no valid UTF-16 becomes U+FFFD.
std::string ToText(std::filesystem::path const &path);

/// The path of a UTF-8 text.
std::filesystem::path ToPath(std::string const &text);

/// The UTF-8 text folded to lower case, for comparing names as the file system does.
std::string FoldCase(std::string const &text);

/// Lets a console of Windows show UTF-8 and obey escape sequences.
void PrepareConsole();

} // namespace App
