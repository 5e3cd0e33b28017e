#include "geometry/MotionSource.h"

#include "filters/GaussianBlur.h"
#include "frame/DebugSwitches.h"
#include "geometry/MotionFields.h"

#include <algorithm>

namespace PK {

MotionSourceRows ChooseMotionRows(const MotionJob& job, const SourceImage& source, int32_t left, int32_t top,
                                  int32_t pass) {
    const int64_t column = int64_t{left} * BytesPerPixel(source.format);
    if (!IsInterlaced(job.sourceField))
        return {source.Row(top) + column, source.rowBytes, source.format, job.crop, true, top};
    const FieldOfSource field = ChooseFieldOfSource(job.sourceField, job.destinationField, pass);
    const PK_Rect& crop = job.crop;
    const int32_t firstRow = field.RowFrom(top);
    return {source.pixels + firstRow * source.rowBytes + column,    2 * source.rowBytes, source.format,
            {crop.left, crop.top / 2, crop.right, crop.bottom / 2}, field.isSameLine,    firstRow};
}

BlurredSource::BlurredSource(const MotionJob& job, const SourceImage& source, const MotionBlur& blur,
                             PK_PixelFormat format, int32_t marginX, int32_t marginY)
    : fJob(job), fSource(source), fBlur(blur), fMarginX(marginX), fMarginY(marginY),
      fWidth(job.crop.right - job.crop.left + 2 * marginX), fHeight(RowsOfCrop() + 2 * marginY),
      fFormat(format), fBuffer(format, fWidth, fHeight) {}

PK_Result BlurredSource::Blur(int32_t pass, MotionSourceRows& blurred) const {
    const PK_Rect& crop = fJob.crop;
    const MotionSourceRows from = ChooseMotionRows(fJob, fSource, crop.left, crop.top, pass);
    const int32_t width = crop.right - crop.left, height = HeightOf(from);
    PK_Rect lies = from.rectangle;
    lies.bottom = lies.top + height;
    blurred = from;
    blurred.rectangle = lies;
    if (height < 1) return PK_Success; // no rows, which are not read
    const int32_t direction = (fBlur.x > 0 ? 1 : 0) + (fBlur.y > 0 ? 2 : 0);
    if (const PK_Result result =
            BlurForMotion(from.pixels, from.rowBytes, width, height, fJob.source.format, fBuffer.Pixels(),
                          fBuffer.RowBytes(), fWidth, height + 2 * fMarginY, fFormat, fBlur.x, fBlur.y,
                          !fJob.smoothEdges, sMotionBlurLinear != 0, true, direction, fJob.quality))
        return result;
    blurred.rectangle = {lies.left - fMarginX, lies.top - fMarginY, lies.right + fMarginX,
                         lies.bottom + fMarginY};
    blurred.pixels = fBuffer.Pixels() - int64_t{blurred.rectangle.top} * fBuffer.RowBytes() -
                     int64_t{blurred.rectangle.left} * BytesPerPixel(fFormat);
    blurred.rowBytes = fBuffer.RowBytes();
    blurred.format = fFormat;
    return PK_Success;
}

int32_t BlurredSource::RowsOfCrop() const {
    const PK_Rect& crop = fJob.crop;
    return IsInterlaced(fJob.sourceField) ? crop.bottom / 2 - crop.top / 2 : crop.bottom - crop.top;
}

/// A field of an odd crop may end a row early, or have none.
int32_t BlurredSource::HeightOf(const MotionSourceRows& rows) const {
    if (!IsInterlaced(fJob.sourceField)) return RowsOfCrop();
    return std::min(RowsOfCrop(), (fJob.crop.bottom - rows.firstRow + 1) / 2);
}

} // namespace PK
