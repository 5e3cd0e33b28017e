#pragma once

// What a way to scale does, in figures. docs/scaling.md defines each.

#include "Scaler.h"

namespace Scaling {

/// dB of the picture scaled there and back again, without 32 pixels at each border.
double ThereAndBack(const Scaler& scaler, const Grey& picture, double scale);

/// Shares of the mean square of the zone plate's rings.
struct PlateFigures {
    double aliasing; ///< what is left of rings that are too fine for the result
    double error;    ///< of rings that it can hold well, against the plate itself
};
PlateFigures MeasurePlate(const Scaler& scaler, double scale);

/// Where the slanted edge comes to lie, less where it should, in pixels of the result; of the edge, and of the same
/// turned on its side.
struct EdgeFigures {
    double meanX, meanY;
    double wobble;    ///< the largest departure of a row from the mean
    double overshoot; ///< beyond the bright side, as a share of the step, far from all borders
};
EdgeFigures MeasureEdge(const Scaler& scaler, double scale);

struct Range {
    double least, most;
};
/// What becomes of white, which only borders can change.
Range MeasureWhite(const Scaler& scaler, double scale);

/// The same mean for an edge at a part of a row of 1920 pixels.
double MeasureEdgeOfRow(const Scaler& scaler, double scale, double part);

/// A side of the result.
int32_t ScaledSide(int32_t side, double scale);

} // namespace Scaling
