// Draws a placed source: copied where it lies pixel on pixel, else sampled row by row, by passes over the fields.

#include "convert/WorkingRows.h"
#include "filters/GaussianBlur.h"
#include "filters/ResampleKernel.h"
#include "frame/Bands.h"
#include "frame/DebugSwitches.h"
#include "frame/FloatMode.h"
#include "geometry/MotionBlur.h"
#include "geometry/MotionFields.h"
#include "geometry/MotionJob.h"
#include "geometry/MotionSampleChoice.h"
#include "primitives/Thresholds.h"

#include <PixelKiln/Accumulate.h>
#include <PixelKiln/Convert.h>

#include <cmath>
#include <memory>
#include <optional>

namespace PK {
namespace {

constexpr int32_t kCubicQuality = 5;
constexpr int32_t kKeysCubic = 2; // kind of resample kernel
constexpr int32_t kBandRows = 32;
constexpr int32_t kSoftMargin = 4; // pixels around a blurred source, for its edge to fade

bool IsFading(const MotionJob& job) {
    return job.opacity - 1 < -kNegligible;
}

/// Rows of one format drawn to the destination as the job has it: over it, faded, or in its place.
class RowDrawer {
public:
    RowDrawer(const MotionJob& job) : fJob(job) {}

    PK_Result Draw(const uint8_t* source, int32_t sourceStep, PK_PixelFormat format, uint8_t* destination,
                   int32_t destinationStep, int32_t width, int32_t height) const {
        const PK_PixelFormat to = fJob.destination.format;
        if (fJob.composites)
            return PK_CompositeWithBlendMode(source, sourceStep, format, destination, destinationStep, to, destination,
                                             destinationStep, to, width, height, fJob.opacity, fJob.blendMode,
                                             fJob.quality, fJob.inLinear);
        if (IsFading(fJob))
            return PK_AlphaGain(source, sourceStep, format, destination, destinationStep, to, width, height, fJob.opacity,
                                fJob.quality);
        return PK_Convert(source, sourceStep, format, destination, destinationStep, to, width, height, fJob.quality);
    }

    /// Whether nothing but a conversion is asked for, which a chain does.
    bool IsConversion() const { return !fJob.composites && !IsFading(fJob); }

private:
    const MotionJob& fJob;
};

// Pixel on pixel.

bool IsPureCopy(const MotionJob& job, const MotionPlacement& placement, bool needsBlur) {
    return !placement.IsRotated() && placement.IsUnscaled() && placement.IsCentred() && !needsBlur &&
           job.source.width == job.destination.width && job.source.height == job.destination.height &&
           job.sourceField == job.destinationField && static_cast<float>(job.softness) - kNegligible <= 0;
}

/// The crop is not looked at here.
PK_Result CopyWhole(const MotionJob& job) {
    const uint8_t* from = job.source.pixels;
    uint8_t* to = job.destination.pixels;
    int64_t fromStep = job.source.rowBytes, toStep = job.destination.rowBytes;
    int32_t height = job.source.height;
    if (job.renderField != 0) {
        const bool isTopLeft = PK_IsOriginTopLeft(job.destination.format), isFirst = job.renderField == 1;
        if (isFirst) from += fromStep;
        if (isFirst != isTopLeft) to += toStep;
        fromStep *= 2;
        toStep *= 2;
        height /= 2;
    }
    if (fromStep != static_cast<int32_t>(fromStep) || toStep != static_cast<int32_t>(toStep)) return PK_ErrFailed;
    return RowDrawer(job).Draw(from, static_cast<int32_t>(fromStep), job.source.format, to, static_cast<int32_t>(toStep),
                               job.source.width, height);
}

// Sampled.

/// Rows of a source that one pass over the destination reads.
struct SourceRows {
    const uint8_t* pixels; ///< of place (0, 0) of the rectangle's coordinates
    ptrdiff_t rowBytes;
    PK_PixelFormat format;
    PK_Rect rectangle;
    bool isSameLine;
};

/// The steps over the source with which the destination is walked.
struct Walk {
    PK_Point start, column, row;
    bool isExact; ///< unscaled, not turned, and on whole columns

    PK_Point StartOfRow(int32_t row_) const {
        const auto rows = static_cast<float>(row_);
        return {start.x + row.x * rows, start.y + row.y * rows};
    }
};

PK_Point operator-(PK_Point a, PK_Point b) {
    return {a.x - b.x, a.y - b.y};
}

bool IsWhole(float x) {
    return std::abs(x - 0.5f - std::trunc(x)) < 5e-5f;
}

Walk ChooseWalk(const MotionPlacement& placement, const PK_Rect& box, bool isInterlaced) {
    Walk walk;
    walk.start = placement.ToSource(box.left, box.top);
    walk.column = placement.ToSource(box.left + 1, box.top) - walk.start;
    walk.isExact =
        !placement.IsRotated() && std::abs(walk.column.x - 1) < kNegligible && IsWhole(walk.start.x);
    walk.row = placement.ToSource(box.left, box.top + 1) - walk.start;
    if (isInterlaced) { // fields are half as high
        walk.start.y = (walk.start.y - 0.5f) * 0.5f + 0.5f;
        walk.column.y *= 0.5f;
        walk.row.y *= 0.5f;
    }
    return walk;
}

} // namespace
} // namespace PK
