#include "geometry/MotionRows.h"

#include "convert/RasterFormats.h"
#include "frame/Bands.h"
#include "geometry/MotionFields.h"
#include "geometry/V210Groups.h"
#include "primitives/Thresholds.h"

#include <algorithm>
#include <cmath>

namespace PK {
namespace {

constexpr int32_t kBandRows = 32;

PK_Point operator-(PK_Point a, PK_Point b) {
    return {a.x - b.x, a.y - b.y};
}

bool IsWhole(float x) {
    return std::abs(x - 0.5f - std::trunc(x)) < 5e-5f;
}

/// A place in pixels that is whole; none where it is between pixels, or far from all of them.
std::optional<int32_t> WholePlace(float x) {
    constexpr float kFar = 1e9f;
    if (!(std::abs(x) < kFar) || !IsWhole(x)) return std::nullopt;
    return static_cast<int32_t>(x);
}

constexpr uint64_t BytesOfInts(int32_t count) {
    return sizeof(int32_t) * static_cast<uint64_t>(count);
}

/// Four channels, premultiplied floats, B, G, R, A or V, U, Y, A.
PK_PixelFormat LineFormat(PK_PixelFormat source) {
    return Packed4444(With(source, kOrderMask, kOrderBGRA), kAlphaPremultiplied, kDepth32f);
}

} // namespace

MotionSteps ChooseMotionSteps(const MotionPlacement& placement, const PK_Rect& box, bool isInterlaced) {
    MotionSteps steps;
    steps.start = placement.ToSource(box.left, box.top);
    steps.column = placement.ToSource(box.left + 1, box.top) - steps.start;
    steps.isExact =
        !placement.IsRotated() && std::abs(steps.column.x - 1) < kNegligible && IsWhole(steps.start.x);
    steps.row = placement.ToSource(box.left, box.top + 1) - steps.start;
    if (isInterlaced) { // fields are half as high
        steps.start.y = (steps.start.y - 0.5f) * 0.5f + 0.5f;
        steps.column.y *= 0.5f;
        steps.row.y *= 0.5f;
    }
    return steps;
}

/// What is drawn of a row: pixels of a format from some column of the destination on.
struct MotionRows::Span {
    const uint8_t* pixels;
    PK_PixelFormat format;
    const ConversionChain* chain; ///< from it to the destination's
    int32_t column, count;
};

MotionRows::MotionRows(const MotionJob& job, const DestinationImage& destination, const PK_Rect& box,
                       const MotionSteps& steps, PK_PixelFormat sampled, bool isRotated,
                       const ResampleTable& kernelX, const ResampleTable& kernelY)
    : fJob(job), fDrawer(job), fDestination(destination), fBox(box), fSteps(steps), fIsRotated(isRotated),
      fIsOpaque(AlphaOf(sampled) == kAlphaMeaningless), fKernelX(kernelX), fKernelY(kernelY),
      fSample(ChooseMotionSampler(sampled, job.quality)), fScale(MotionLineScale(job.source.format)),
      fLineFormat(LineFormat(job.source.format)), fRowMemory(ColumnsOfUnits()) {}

PK_Result MotionRows::Build() {
    const PK_PixelFormat to = fDestination.format;
    if (!fDirect.Build(fJob.source.format, to, fJob.quality) || !fLine.Build(fLineFormat, to, fJob.quality))
        return PK_ErrFailed;
    fRowMemory.AddRow(fLineFormat);
    fRowMemory.AddBytes(2 * BytesOfInts(SharedColumns()));
    fRowMemory.AddChain(fDirect);
    fRowMemory.AddChain(fLine);
    if (HasUnits()) {
        const PK_PixelFormat parted = Packed4444(to, kAlphaMeaningless, kDepth32f);
        if (!fFromUnits.Build(to, parted, fJob.quality) || !fToUnits.Build(parted, to, fJob.quality))
            return PK_ErrFailed;
        fRowMemory.AddRow(parted);
        fRowMemory.AddChain(fFromUnits);
        fRowMemory.AddChain(fToUnits);
    }
    return fBandMemory.emplace(fRowMemory.Bytes()).Result();
}

bool MotionRows::HasUnits() const {
    return UnitOfRow(fDestination.format).pixels > 1;
}

/// Those of the box, and of units that it has in part.
int32_t MotionRows::ColumnsOfUnits() const {
    return Columns() + 2 * UnitOfRow(fDestination.format).pixels;
}

PK_Result MotionRows::Draw(const MotionSourceRows& source, PK_Point start, int32_t field) const {
    const int32_t height = fBox.bottom - fBox.top;
    const auto bands = Bands::OfRows(kBandRows).AsTaskIf(height > kBandRows);
    return RunInBands(height, bands, [&](int32_t first, int32_t end) {
        const auto before = static_cast<float>(first);
        const PK_Point at = {start.x + fSteps.row.x * before, start.y + fSteps.row.y * before};
        return fBandMemory->With([&](uint8_t* memory) {
            TemporaryRows rows = fRowMemory.In(memory);
            return DrawBand(source, at, fBox.top + first, fBox.top + end, field, rows);
        });
    });
}

PK_Result MotionRows::DrawBand(const MotionSourceRows& source, PK_Point at, int32_t first, int32_t end,
                               int32_t field, TemporaryRows& rows) const {
    auto* const line = reinterpret_cast<float*>(rows.Take(BytesOfRow(fLineFormat, ColumnsOfUnits())));
    uint8_t* const units = HasUnits() ? rows.Take(BytesOfRow(fToUnits.source, ColumnsOfUnits())) : nullptr;
    auto* const numbers = reinterpret_cast<int32_t*>(rows.Take(2 * BytesOfInts(SharedColumns())));
    MotionColumns columns = {numbers, numbers + SharedColumns()};
    for (int32_t row = first; row < end; ++row, at.x += fSteps.row.x, at.y += fSteps.row.y) {
        if (!IsOfField(row, field)) continue;
        float* const own = LineOf(row);
        const Span span = SpanOfRow(source, at, columns, own != nullptr ? own : line);
        if (span.count < 1 || IsDrawn(span, own)) continue;
        if (const PK_Result result = DrawSpan(span, row, rows.Scratch(), units)) return result;
    }
    return PK_Success;
}

/// The row of the destination itself, where it is one of lines that nothing more happens to.
float* MotionRows::LineOf(int32_t row) const {
    uint8_t* const line = fDestination.Row(row) + int64_t{fBox.left} * BytesPerPixel(fLineFormat);
    const bool isAligned = reinterpret_cast<uintptr_t>(line) % alignof(float) == 0;
    return fLine.IsCopy() && fDrawer.IsConversion() && isAligned ? reinterpret_cast<float*>(line) : nullptr;
}

/// Sampled where it belongs.
bool MotionRows::IsDrawn(const Span& span, const float* own) const {
    return own != nullptr && span.chain == &fLine;
}

bool MotionRows::IsOfField(int32_t row, int32_t field) const {
    return !IsInterlaced(fJob.destinationField) || field == 0 || (row % 2 == 0) == (field == 1);
}

MotionRows::Span MotionRows::SpanOfRow(const MotionSourceRows& source, PK_Point at, MotionColumns& columns,
                                       float* line) const {
    if (fSteps.isExact) {
        const auto column = WholePlace(at.x), row = WholePlace(at.y);
        if (column && row) return ExactSpan(source, *column, *row);
    }
    const auto& [left, top, right, bottom] = source.rectangle;
    const MotionRow row = {source.pixels,
                           source.rowBytes,
                           left,
                           top,
                           right,
                           bottom,
                           at.x,
                           at.y,
                           fSteps.column.x,
                           fSteps.column.y,
                           Columns(),
                           fIsRotated,
                           fJob.smoothEdges,
                           fIsOpaque,
                           fKernelX,
                           fKernelY,
                           &columns};
    const MotionSpan span = fSample(row, line);
    if (span.count < 1) return {};
    float* const pixels = line + int64_t{4} * span.first;
    if (fScale) ScaleMotionLine(*fScale, pixels, span.count);
    return {reinterpret_cast<const uint8_t*>(pixels), fLineFormat, &fLine, fBox.left + span.first,
            span.count};
}

/// The pixels themselves from a column of the source on, without those beside the rectangle.
MotionRows::Span MotionRows::ExactSpan(const MotionSourceRows& source, int32_t column, int32_t row) const {
    const PK_Rect& rectangle = source.rectangle;
    if (row < rectangle.top || row >= rectangle.bottom) return {};
    const int32_t skipped = std::max(0, rectangle.left - column);
    const int32_t count = std::min(Columns(), rectangle.right - column) - skipped;
    const uint8_t* const pixels =
        source.pixels + row * source.rowBytes + (int64_t{column} + skipped) * BytesPerPixel(source.format);
    // What is only converted counts as the source's own format, even if it is blurred and has alpha in it.
    const PK_PixelFormat format = fDrawer.IsConversion() ? fDirect.source : source.format;
    return {pixels, format, &fDirect, fBox.left + skipped, count};
}

PK_Result MotionRows::DrawSpan(const Span& span, int32_t row, const ChainScratch& scratch,
                               uint8_t* units) const {
    uint8_t* const destination = fDestination.Row(row);
    if (!IsOfWholeUnits(span)) return DrawInUnits(span, destination, scratch, units);
    uint8_t* const to = destination + BytesOfRow(fDestination.format, span.column);
    if (!fDrawer.IsConversion())
        return fDrawer.Draw(span.pixels, 0, span.format, to, 0, fDestination.format, span.count, 1);
    span.chain->ConvertRow(span.pixels, to, span.count, scratch);
    return PK_Success;
}

/// Units that the span has in part keep their other pixels: all are parted, drawn to and joined again.
PK_Result MotionRows::DrawInUnits(const Span& span, uint8_t* row, const ChainScratch& scratch,
                                  uint8_t* units) const {
    const PK_PixelFormat parted = fToUnits.source;
    const int32_t unit = UnitOfRow(fDestination.format).pixels;
    const int32_t first = span.column / unit * unit, spanEnd = span.column + span.count;
    const int32_t last = (spanEnd - 1) / unit * unit; // where the last unit begins
    const int32_t count = std::min(last + unit, fDestination.width) - first;
    uint8_t* const to = row + BytesOfRow(fDestination.format, first);
    fFromUnits.ConvertRow(to, units, count, scratch);
    if (const PK_Result result =
            fDrawer.Draw(span.pixels, 0, span.format, units + BytesOfRow(parted, span.column - first), 0,
                         parted, span.count, 1))
        return result;
    if (!IsV210(fDestination.format)) {
        fToUnits.ConvertRow(units, to, count, scratch);
        return PK_Success;
    }
    // Its chroma reaches across pairs.
    uint8_t* const lastTo = row + BytesOfRow(fDestination.format, last);
    const V210Group firstGroup(to), lastGroup(lastTo);
    fToUnits.ConvertRow(units, to, count, scratch);
    firstGroup.RestoreBeside(to, span.column - first, unit);
    lastGroup.RestoreBeside(lastTo, 0, spanEnd - last);
    return PK_Success;
}

bool MotionRows::IsOfWholeUnits(const Span& span) const {
    const int32_t unit = UnitOfRow(fDestination.format).pixels, end = span.column + span.count;
    return span.column % unit == 0 && (end % unit == 0 || end == fDestination.width);
}

} // namespace PK
