// Gathers a report.
#pragma once

#include "apps/oruinfo/report.h"

namespace OruInfo {

class Drivers;

/// The ids of all sections in their order.
std::vector<std::string> SectionIds();

/// Asks the drivers. A section that a driver breaks says so, and the others are gathered all the
/// same.
/// @param ids sections that are wanted, all when it is empty; the report has them in its own order
Report Gather(std::vector<std::string> const &ids, Drivers &drivers);

} // namespace OruInfo
