#pragma once

// How rows of pixels come onto motion's destination: over it, faded, or in its place.

#include "geometry/MotionJob.h"

namespace PK {

class MotionDrawer {
public:
    explicit MotionDrawer(const MotionJob& job) : fJob(job) {}

    /// Whether nothing but a conversion is asked for, which a chain does.
    bool IsConversion() const { return !fJob.composites && !IsFading(); }

    /// Rows of one format drawn to those of another.
    PK_Result Draw(const uint8_t* source, int32_t sourceStep, PK_PixelFormat sourceFormat,
                   uint8_t* destination, int32_t destinationStep, PK_PixelFormat destinationFormat,
                   int32_t width, int32_t height) const;

private:
    bool IsFading() const;

    const MotionJob& fJob;
};

} // namespace PK
