// Values as people read them.
#pragma once

#include "apps/oruinfo/report.h"

#include <string>

namespace OruInfo {

/// A value in a line: "yes", "16384 texels", "32 MiB (33554432 bytes)", "1-4, 7".
std::string Shown(Value const &value);

/// The same without the exact number of bytes, as a table has little room.
std::string ShownInTable(Value const &value);

/// Whether there is nothing to tell.
bool IsNothing(Value const &value);

/// Whether it is a number, which stands at the right of a column.
bool IsNumber(Value const &value);

/// The names of a list that has some; null for any other value.
Names const *NamesOf(Value const &value);

/// The columns that people read: those that have anything to tell.
std::vector<std::size_t> ShownColumns(Table const &table);

/// How many rows or names a field has; 0 for what is neither.
std::size_t Count(Field const &field);

} // namespace OruInfo
