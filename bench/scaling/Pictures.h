#pragma once

// The charts through every way to scale that is shown, side by side, a row a scale.

#include <span>
#include <string>

namespace Scaling {

/// Parts of the scaled zone plate: all of it where it is small, doubled if it is half as large as there is room, else its
/// right lower part.
void DrawPlates(std::span<const double> scales, const std::string& name);

/// The middle of the scaled edge, five times as large.
void DrawEdges(std::span<const double> scales, const std::string& name);

} // namespace Scaling
