// Numbers that people write.
#pragma once

#include <optional>
#include <string>

namespace App {

/// The finite number that the whole of a text is; nothing for any other text.
std::optional<double> ParseNumber(std::string const &text);

} // namespace App
