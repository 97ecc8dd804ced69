// The forms that a report is written in; each in a file of its own.
#pragma once

#include "apps/oruinfo/report.h"

#include <string>

namespace OruInfo {

/// For people: aligned lines, at most 100 columns where names are listed.
std::string TextOf(Report const &report);

/// For programs; docs/oruinfo.schema.json tells what is in it.
std::string JsonOf(Report const &report);

/// A page that needs no other file.
std::string HtmlOf(Report const &report);

} // namespace OruInfo
