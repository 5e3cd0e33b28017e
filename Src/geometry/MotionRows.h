#pragma once

// Rows of motion's destination, sampled along a walk over the source or copied where they lie pixel on pixel.

#include "convert/ConversionChain.h"
#include "convert/Image.h"
#include "convert/WorkingRows.h"
#include "frame/BandMemory.h"
#include "geometry/MotionDrawer.h"
#include "geometry/MotionSample.h"
#include "geometry/MotionSource.h"

#include <optional>

namespace PK {

/// The steps over the source with which the destination is walked.
struct MotionSteps {
    PK_Point start, column, row;
    bool isExact; ///< unscaled, not turned, and on whole columns
};

/// From the first column and row of a box of the destination on.
MotionSteps ChooseMotionSteps(const MotionPlacement& placement, const PK_Rect& box, bool isInterlaced);

class MotionRows {
public:
    /// \param destination  walked from its top.
    /// \param sampled      format of what is sampled: the source, or its blurred copy.
    MotionRows(const MotionJob& job, const DestinationImage& destination, const PK_Rect& box,
               const MotionSteps& steps, PK_PixelFormat sampled, bool isRotated, const ResampleTable& kernelX,
               const ResampleTable& kernelY);

    /// Finds the ways to the destination's format, and memory for all passes. PK_ErrFailed, PK_ErrOutOfMemory.
    PK_Result Build();

    /// Draws all rows of the box, or those of a field.
    /// \param start  of the first row in the source's rows.
    PK_Result Draw(const MotionSourceRows& source, PK_Point start, int32_t field) const;

private:
    struct Span;

    int32_t Columns() const { return fBox.right - fBox.left; }
    bool HasUnits() const;
    int32_t ColumnsOfUnits() const;
    int32_t SharedColumns() const { return Columns() + MotionColumns::kMore; }
    PK_Result DrawBand(const MotionSourceRows& source, PK_Point at, int32_t first, int32_t end, int32_t field,
                       TemporaryRows& rows) const;
    bool IsOfField(int32_t row, int32_t field) const;
    float* LineOf(int32_t row) const;
    bool IsDrawn(const Span& span, const float* own) const;
    Span SpanOfRow(const MotionSourceRows& source, PK_Point at, MotionColumns& columns, float* line) const;
    Span ExactSpan(const MotionSourceRows& source, int32_t column, int32_t row) const;
    PK_Result DrawSpan(const Span& span, int32_t row, const ChainScratch& scratch, uint8_t* units) const;
    PK_Result DrawInUnits(const Span& span, uint8_t* row, const ChainScratch& scratch, uint8_t* units) const;
    bool IsOfWholeUnits(const Span& span) const;

    const MotionJob& fJob;
    MotionDrawer fDrawer;
    DestinationImage fDestination;
    PK_Rect fBox;
    MotionSteps fSteps;
    bool fIsRotated, fIsOpaque;
    ResampleTable fKernelX, fKernelY;
    SampleMotionRow fSample;
    std::optional<LineScale> fScale;
    PK_PixelFormat fLineFormat;
    ConversionChain fDirect, fLine;
    // Where a row of the destination cannot be parted between any two pixels.
    ConversionChain fFromUnits, fToUnits;
    RowMemory fRowMemory;
    mutable std::optional<BandMemory> fBandMemory;
};

} // namespace PK
