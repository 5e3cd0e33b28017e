#pragma once

// Frames of 3840 x 2160 halved by every way: how long that takes, how near it comes to the ideal, and how it looks.

#include <string>
#include <vector>

namespace Scaling {

/// Prints a table for each format that is reduced.
/// \param photographs  names of PNG files.
/// \param name         of the picture.
void MeasureAndDrawReductions(const std::vector<std::string>& photographs, const std::string& name);

} // namespace Scaling
