#pragma once

// The rows of a source that one pass over motion's destination reads: all of them, those of a field, or a blurred copy.

#include "frame/TransientMemory.h"
#include "geometry/MotionBlur.h"
#include "geometry/MotionJob.h"

namespace PK {

struct MotionSourceRows {
    const uint8_t* pixels; ///< of place (0, 0) of the rectangle's coordinates
    ptrdiff_t rowBytes;
    PK_PixelFormat format;
    PK_Rect rectangle;
    bool isSameLine;  ///< else they lie half a row higher
    int32_t firstRow; ///< of the source, that `pixels` stand in
};

/// Those of a source that is walked from its top, with the pixels of a place of the source. In both fields the crop has
/// half its rows from half its top, rounded down.
MotionSourceRows ChooseMotionRows(const MotionJob& job, const SourceImage& source, int32_t left, int32_t top,
                                  int32_t pass);

/// The crop of a source that is walked from its top, blurred, as if it lay where the source lies.
class BlurredSource {
public:
    /// \param format  of the blurred pixels.
    BlurredSource(const MotionJob& job, const SourceImage& source, const MotionBlur& blur,
                  PK_PixelFormat format, int32_t marginX, int32_t marginY);

    bool HasMemory() const { return fBuffer.Pixels() != nullptr; }

    /// Blurs the rows of a pass anew.
    PK_Result Blur(int32_t pass, MotionSourceRows& blurred) const;

private:
    int32_t RowsOfCrop() const;
    int32_t HeightOf(const MotionSourceRows& rows) const;

    const MotionJob& fJob;
    const SourceImage& fSource;
    MotionBlur fBlur;
    int32_t fMarginX, fMarginY, fWidth, fHeight;
    PK_PixelFormat fFormat;
    TransientPixelBuffer fBuffer;
};

} // namespace PK
