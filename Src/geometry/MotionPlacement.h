#pragma once

// How a source lies in a destination: moved by an anchor to a position, scaled, and turned in square pixels.
//
// Coordinates are in pixels from the top left corner, y down, the centre of pixel (c, r) at (c + 0.5, r + 0.5). They are
// floats, turned in double precision; what is drawn follows from their last bit.

#include <PixelKiln/Types.h>

#include <cstdint>

namespace PK {

struct MotionGeometry {
    int32_t sourceWidth, sourceHeight, destinationWidth, destinationHeight;
    uint32_t aspectNum, aspectDen;
    PK_Point position, anchor; ///< fractions of destination and source, y from the top
    PK_Point scale;
    double rotation; ///< degrees, clockwise on the screen
};

class MotionPlacement {
public:
    explicit MotionPlacement(const MotionGeometry& geometry);

    /// Turned by a twentieth of a degree at least.
    bool IsRotated() const { return fIsRotated; }
    bool IsUnscaled() const;
    /// Anchor and position are the same fractions.
    bool IsCentred() const;

    PK_Point Scale() const { return fGeometry.scale; }
    double Cosine() const { return fCosine; }
    double Sine() const { return fSine; }

    /// Where a point of the source comes to lie.
    PK_Point ToDestination(float x, float y) const;

    /// The point of the source that lies on the centre of a pixel of the destination.
    PK_Point ToSource(int32_t column, int32_t row) const;

    /// The pixels of the destination that a rectangle of the source reaches, grown by a margin on each side; an empty
    /// rectangle, at the left top corner, where it reaches none or is not to be told.
    PK_Rect Reach(const PK_Rect& source, int32_t marginX, int32_t marginY) const;

private:
    MotionGeometry fGeometry;
    double fCosine, fSine;
    bool fIsRotated;
};

} // namespace PK
