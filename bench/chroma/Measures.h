#pragma once

// Errors of chroma against what a scene has at the very places of the samples.

#include "Way.h"

namespace ChromaBench {

/// In codes of 8 bits, over U and V.
struct Error {
    double rms, most;
};

Error ErrorOfPixels(const Video& pixels, const Scene& scene, const Kind& kind);
Error ErrorOfPlanes(const Video& planes, const Scene& scene, const Kind& kind);

struct Errors {
    Error decoded, encoded, both;
};
/// From exact planes, to planes from exact pixels, and there and back again.
Errors Measure(const Way& way, const Scene& scene, const Kind& kind);

} // namespace ChromaBench
