// Draws a placed source: copied where it lies pixel on pixel, else sampled row by row, by passes over the fields.

#include "convert/RasterFormats.h"
#include "convert/WorkingRows.h"
#include "filters/GaussianBlur.h"
#include "filters/ResampleKernel.h"
#include "frame/Bands.h"
#include "frame/DebugSwitches.h"
#include "frame/FloatMode.h"
#include "frame/TransientMemory.h"
#include "geometry/MotionBlur.h"
#include "geometry/MotionFields.h"
#include "geometry/MotionJob.h"
#include "geometry/MotionSample.h"
#include "primitives/Thresholds.h"

#include <PixelKiln/Accumulate.h>
#include <PixelKiln/Composite.h>
#include <PixelKiln/Convert.h>

#include <algorithm>
#include <cmath>
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
            return PK_CompositeWithBlendMode(source, sourceStep, format, destination, destinationStep, to,
                                             destination, destinationStep, to, width, height, fJob.opacity,
                                             fJob.blendMode, fJob.quality, fJob.inLinear);
        if (IsFading(fJob))
            return PK_AlphaGain(source, sourceStep, format, destination, destinationStep, to, width, height,
                                fJob.opacity, fJob.quality);
        return PK_Convert(source, sourceStep, format, destination, destinationStep, to, width, height,
                          fJob.quality);
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
    if (fromStep != static_cast<int32_t>(fromStep) || toStep != static_cast<int32_t>(toStep))
        return PK_ErrFailed;
    return RowDrawer(job).Draw(from, static_cast<int32_t>(fromStep), job.source.format, to,
                               static_cast<int32_t>(toStep), job.source.width, height);
}

// Sampled.

/// Rows of a source that one pass over the destination reads.
struct SourceRows {
    const uint8_t* pixels; ///< of place (0, 0) of the rectangle's coordinates
    ptrdiff_t rowBytes;
    PK_PixelFormat format;
    PK_Rect rectangle;
    bool isSameLine;
    int32_t firstRow; ///< of the source, that `pixels` stand in
};

/// The steps over the source with which the destination is walked.
struct Walk {
    PK_Point start, column, row;
    bool isExact; ///< unscaled, not turned, and on whole columns
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

/// A place in pixels that is whole; none where it is between pixels, or far from all of them.
std::optional<int32_t> WholePlace(float x) {
    constexpr float kFar = 1e9f;
    if (!(std::abs(x) < kFar) || !IsWhole(x)) return std::nullopt;
    return static_cast<int32_t>(x);
}

/// What is drawn of a row: pixels of a format from some column of the destination on.
struct DrawnSpan {
    const uint8_t* pixels;
    const ConversionChain* chain; ///< from their format
    int32_t column, count;
};

class SampledRows {
public:
    SampledRows(const MotionJob& job, const DestinationImage& destination, const PK_Rect& box,
                const Walk& walk, PK_PixelFormat sampled, bool isRotated, const ResampleTable& kernelX,
                const ResampleTable& kernelY)
        : fJob(job), fDrawer(job), fDestination(destination), fBox(box), fWalk(walk), fIsRotated(isRotated),
          fKernelX(kernelX), fKernelY(kernelY), fSample(ChooseMotionSampler(sampled, job.quality)),
          fScale(MotionLineScale(job.source.format)),
          fLineFormat(
              Packed4444(With(job.source.format, kOrderMask, kOrderBGRA), kAlphaPremultiplied, kDepth32f)) {}

    /// Whether there are ways to the destination's format.
    bool Build() {
        const PK_PixelFormat to = fDestination.format;
        return fDirect.Build(fJob.source.format, to, fJob.quality) &&
               fLine.Build(fLineFormat, to, fJob.quality);
    }

    /// All rows of the box, or those of a field.
    /// \param start  of the first row in the source's rows.
    PK_Result Render(const SourceRows& source, PK_Point start, int32_t field) const {
        const int32_t height = fBox.bottom - fBox.top;
        const auto bands = Bands::OfRows(kBandRows).AsTaskIf(height > kBandRows);
        return RunInBands(height, bands, [&](int32_t first, int32_t end) {
            const auto rows = static_cast<float>(first);
            const PK_Point at = {start.x + fWalk.row.x * rows, start.y + fWalk.row.y * rows};
            return RenderBand(source, at, fBox.top + first, fBox.top + end, field);
        });
    }

private:
    int32_t Columns() const { return fBox.right - fBox.left; }

    PK_Result RenderBand(const SourceRows& source, PK_Point at, int32_t first, int32_t end,
                         int32_t field) const {
        RowMemory memory(Columns());
        memory.AddRow(fLineFormat);
        memory.AddChain(fDirect);
        memory.AddChain(fLine);
        return memory.With([&](TemporaryRows& rows) -> PK_Result {
            auto* const line =
                reinterpret_cast<float*>(rows.Take(uint64_t{16} * static_cast<uint32_t>(Columns())));
            for (int32_t row = first; row < end; ++row, at.x += fWalk.row.x, at.y += fWalk.row.y) {
                if (!IsOfField(row, field)) continue;
                const DrawnSpan span = SpanOfRow(source, at, line);
                if (span.count < 1) continue;
                if (const PK_Result result = Draw(span, row, rows.Scratch())) return result;
            }
            return PK_Success;
        });
    }

    bool IsOfField(int32_t row, int32_t field) const {
        return !IsInterlaced(fJob.destinationField) || field == 0 || (row % 2 == 0) == (field == 1);
    }

    DrawnSpan SpanOfRow(const SourceRows& source, PK_Point at, float* line) const {
        if (fWalk.isExact) {
            const auto column = WholePlace(at.x), row = WholePlace(at.y);
            if (column && row) return ExactSpan(source, *column, *row);
        }
        const auto& [left, top, right, bottom] = source.rectangle;
        const MotionRow row = {
            source.pixels, source.rowBytes, left,           top,       right,      bottom,           at.x,
            at.y,          fWalk.column.x,  fWalk.column.y, Columns(), fIsRotated, fJob.smoothEdges, fKernelX,
            fKernelY};
        const MotionSpan span = fSample(row, line);
        if (span.count < 1) return {};
        float* const pixels = line + int64_t{4} * span.first;
        if (fScale) ScaleMotionLine(*fScale, pixels, span.count);
        return {reinterpret_cast<const uint8_t*>(pixels), &fLine, fBox.left + span.first, span.count};
    }

    /// The pixels themselves from a column of the source on, without those beside the rectangle.
    DrawnSpan ExactSpan(const SourceRows& source, int32_t column, int32_t row) const {
        const PK_Rect& rectangle = source.rectangle;
        if (row < rectangle.top || row >= rectangle.bottom) return {};
        const int32_t skipped = std::max(0, rectangle.left - column);
        const int32_t count = std::min(Columns(), rectangle.right - column) - skipped;
        const uint8_t* const pixels = source.pixels + row * source.rowBytes +
                                      (int64_t{column} + skipped) * BytesOfRow(source.format, 1);
        return {pixels, &fDirect, fBox.left + skipped, count};
    }

    PK_Result Draw(const DrawnSpan& span, int32_t row, const ChainScratch& scratch) const {
        uint8_t* const to = fDestination.Row(row) + BytesOfRow(fDestination.format, span.column);
        if (!fDrawer.IsConversion())
            return fDrawer.Draw(span.pixels, 0, span.chain->source, to, 0, span.count, 1);
        span.chain->ConvertRow(span.pixels, to, span.count, scratch);
        return PK_Success;
    }

    const MotionJob& fJob;
    RowDrawer fDrawer;
    DestinationImage fDestination;
    PK_Rect fBox;
    Walk fWalk;
    bool fIsRotated;
    ResampleTable fKernelX, fKernelY;
    SampleMotionRow fSample;
    std::optional<LineScale> fScale;
    PK_PixelFormat fLineFormat;
    ConversionChain fDirect, fLine;
};

/// Those of a source that is walked from its top. The crop's rows count in both fields.
/// \param left, top  the place that the pixels are those of.
SourceRows ChooseRows(const MotionJob& job, const SourceImage& source, int32_t left, int32_t top,
                      int32_t pass) {
    const int64_t column = int64_t{left} * BytesOfRow(source.format, 1);
    if (!IsInterlaced(job.sourceField))
        return {source.Row(top) + column, source.rowBytes, source.format, job.crop, true, top};
    const FieldOfSource field = ChooseFieldOfSource(job.sourceField, job.destinationField, pass);
    const PK_Rect& crop = job.crop;
    const int32_t firstRow = field.RowFrom(top);
    return {source.pixels + firstRow * source.rowBytes + column,    2 * source.rowBytes, source.format,
            {crop.left, crop.top / 2, crop.right, crop.bottom / 2}, field.isSameLine,    firstRow};
}

PK_Result DrawSharp(const MotionJob& job, const SourceImage& source, const Walk& walk,
                    const SampledRows& rows) {
    const auto draw = [&](int32_t pass) {
        const SourceRows from = ChooseRows(job, source, 0, 0, pass);
        const PK_Point start = {walk.start.x, from.isSameLine ? walk.start.y : walk.start.y - 0.5f};
        return rows.Render(from, start, pass);
    };
    if (!IsInterlaced(job.destinationField) || job.renderField != 0) return draw(job.renderField);
    if (const PK_Result result = draw(1)) return result;
    return draw(2);
}

/// A crop of the source, blurred, as if it lay where the source lies.
class BlurredSource {
public:
    BlurredSource(const MotionJob& job, const SourceImage& source, const MotionBlur& blur,
                  PK_PixelFormat format, int32_t marginX, int32_t marginY)
        : fJob(job), fSource(source), fBlur(blur), fMarginX(marginX), fMarginY(marginY),
          fWidth(job.crop.right - job.crop.left + 2 * marginX), fHeight(RowsOfCrop() + 2 * marginY),
          fFormat(format), fBuffer(format, fWidth, fHeight) {}

    bool HasMemory() const { return fBuffer.Pixels() != nullptr; }

    /// Blurs the rows of a pass anew.
    PK_Result Blur(int32_t pass, SourceRows& blurred) const {
        const PK_Rect& crop = fJob.crop;
        const SourceRows from = ChooseRows(fJob, fSource, crop.left, crop.top, pass);
        const int32_t width = crop.right - crop.left, height = HeightOf(from);
        const int32_t direction = (fBlur.x > 0 ? 1 : 0) + (fBlur.y > 0 ? 2 : 0);
        if (const PK_Result result = BlurForMotion(
                from.pixels, static_cast<int32_t>(from.rowBytes), width, height, fJob.source.format,
                fBuffer.Pixels(), fBuffer.RowBytes(), fWidth, fHeight, fFormat, fBlur.x, fBlur.y,
                !fJob.smoothEdges, sMotionBlurLinear != 0, true, direction, fJob.quality))
            return result;
        const PK_Rect& lies = from.rectangle;
        const int64_t above = lies.top - (fHeight - height) / 2, before = lies.left - (fWidth - width) / 2;
        blurred = {fBuffer.Pixels() - above * fBuffer.RowBytes() - before * BytesOfRow(fFormat, 1),
                   fBuffer.RowBytes(),
                   fFormat,
                   {lies.left - fMarginX, lies.top - fMarginY, lies.right + fMarginX, lies.bottom + fMarginY},
                   from.isSameLine,
                   from.firstRow};
        return PK_Success;
    }

private:
    int32_t RowsOfCrop() const {
        const PK_Rect& crop = fJob.crop;
        return IsInterlaced(fJob.sourceField) ? crop.bottom / 2 - crop.top / 2 : crop.bottom - crop.top;
    }

    /// The later field of a crop may have one row less.
    int32_t HeightOf(const SourceRows& rows) const {
        if (!IsInterlaced(fJob.sourceField)) return RowsOfCrop();
        return std::min(RowsOfCrop(), (fJob.crop.bottom - rows.firstRow + 1) / 2);
    }

    const MotionJob& fJob;
    const SourceImage& fSource;
    MotionBlur fBlur;
    int32_t fMarginX, fMarginY, fWidth, fHeight;
    PK_PixelFormat fFormat;
    TransientPixelBuffer fBuffer;
};

PK_Result DrawBlurred(const MotionJob& job, const BlurredSource& source, const Walk& walk,
                      const SampledRows& rows) {
    const auto draw = [&](int32_t pass, bool isOneOfTwo) {
        SourceRows from;
        if (const PK_Result result = source.Blur(pass, from)) return result;
        return rows.Render(from, isOneOfTwo && !from.isSameLine ? walk.start - walk.row : walk.start, pass);
    };
    if (!IsInterlaced(job.sourceField) || job.renderField != 0 || !IsInterlaced(job.destinationField))
        return draw(job.renderField, false);
    if (const PK_Result result = draw(1, true)) return result;
    return draw(2, true);
}

void Scale(ResampleKernel& kernel, float scale) {
    if (scale > 1)
        kernel.ScaleForUpSample(scale);
    else
        kernel.ScaleForDownSample(scale, scale);
}

ResampleTable TableOf(const ResampleKernel& kernel) {
    return {kernel.Weights(), kernel.Width()};
}

PK_Result DrawSampled(const MotionJob& job, const MotionPlacement& placement, const MotionBlur& blur,
                      bool needsBlur) {
    ResampleKernel kernelX(kKeysCubic), kernelY(kKeysCubic);
    if (job.quality == kCubicQuality) {
        Scale(kernelX, placement.Scale().x);
        Scale(kernelY, placement.Scale().y);
        if (kernelX.Width() < 1 || kernelY.Width() < 1) return PK_ErrOutOfMemory;
    }
    const int32_t marginX = job.smoothEdges && blur.x > 0 ? kSoftMargin : 0;
    const int32_t marginY = job.smoothEdges && blur.y > 0 ? kSoftMargin : 0;
    const PK_Rect box = placement.Reach(job.crop, marginX, marginY);
    if (box.left == box.right) return PK_Success;

    const SourceImage source = Reversed(job.source); // four channels are stored from the bottom
    const Walk walk = ChooseWalk(placement, box, IsInterlaced(job.sourceField));
    const PK_PixelFormat sampled =
        needsBlur ? WithAlpha(job.source.format, kAlphaPremultiplied) : job.source.format;
    SampledRows rows(job, FromTop(job.destination), box, walk, sampled, placement.IsRotated(),
                     TableOf(kernelX), TableOf(kernelY));
    if (!rows.Build()) return PK_ErrFailed;
    if (!needsBlur) return DrawSharp(job, source, walk, rows);
    const BlurredSource blurred(job, source, blur, sampled, marginX, marginY);
    if (!blurred.HasMemory()) return PK_ErrOutOfMemory;
    return DrawBlurred(job, blurred, walk, rows);
}

} // namespace

PK_Result RunMotion(const MotionJob& job) {
    const FloatMode mode;
    const MotionPlacement placement(job.geometry);
    const MotionBlur blur =
        ChooseMotionBlur(placement, job.softness, job.sourceField, job.destinationField, job.quality);
    const bool needsBlur = blur.IsAny() && job.quality != kCubicQuality;
    if (IsPureCopy(job, placement, needsBlur)) return CopyWhole(job);
    return DrawSampled(job, placement, blur, needsBlur);
}

} // namespace PK
