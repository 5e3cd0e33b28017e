#pragma once

#include <string>

namespace ChromaBench {

/// U of the charts, as it is and encoded and decoded by every way.
void DrawCharts(const std::string& name);

/// A picture of fields, as it is and decoded by every rule: all rows, those of the first field alone, and a detail.
void DrawRules(const std::string& name);

} // namespace ChromaBench
