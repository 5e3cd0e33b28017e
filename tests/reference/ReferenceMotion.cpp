#include "reference/ReferenceMotion.h"

#include "reference/ReferenceCubic.h"
#include "reference/ReferenceMotionGeometry.h"
#include "reference/ReferenceMotionSample.h"

#include <PixelKiln/Accumulate.h>
#include <PixelKiln/Composite.h>
#include <PixelKiln/Convert.h>
#include <PixelKiln/Deinterlace.h>
#include <PixelKiln/GaussianBlur.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstring>
#include <vector>

namespace PKReference {
namespace {

// Fields of a format.
constexpr uint32_t kYUV = 1, kAlpha = 0xc, kPremultiplied = 8, kDepth = 0x1c0, k8 = 0, k15 = 0x80,
                   kFloat = 0x100, kAlphaFirst = 0x1000;

constexpr int32_t kCubic = 5; // quality
constexpr int32_t kBandRows = 32, kSoftMargin = 4;

PK_PixelFormat Premultiplied(PK_PixelFormat format) {
    return (format & ~kAlpha) | kPremultiplied;
}

/// Premultiplied floats, alpha last, of the source's family.
PK_PixelFormat LineFormat(PK_PixelFormat source) {
    return Premultiplied(source & ~(kDepth | kAlphaFirst)) | kFloat;
}

bool IsFading(const MotionArguments& a) {
    return a.opacity - 1 < -8e-6f;
}

PK_Result Draw(const MotionArguments& a, const uint8_t* from, int32_t fromStep, PK_PixelFormat format,
               uint8_t* to, int32_t toStep, int32_t width, int32_t height) {
    const PK_PixelFormat toFormat = a.destinationFormat;
    if (a.composites)
        return PK_CompositeWithBlendMode(from, fromStep, format, to, toStep, toFormat, to, toStep, toFormat,
                                         width, height, a.opacity, a.mode, a.quality, a.inLinear);
    if (IsFading(a))
        return PK_AlphaGain(from, fromStep, format, to, toStep, toFormat, width, height, a.opacity,
                            a.quality);
    return PK_Convert(from, fromStep, format, to, toStep, toFormat, width, height, a.quality);
}

/// The images as they are, or every other row of them.
PK_Result Copy(const MotionArguments& a) {
    const bool isBottomLeft = PK_IsOriginBottomLeft(a.destinationFormat);
    const int32_t step = a.renderField == 0 ? 1 : 2;
    const int64_t from = a.renderField == 1 ? 1 : 0;
    const int64_t to = a.renderField == 1 ? isBottomLeft : a.renderField == 2 ? !isBottomLeft : 0;
    return Draw(a, a.source + from * a.sourceRowBytes, step * a.sourceRowBytes, a.sourceFormat,
                a.destination + to * a.destinationRowBytes, step * a.destinationRowBytes, a.sourceWidth,
                a.sourceHeight / step);
}

/// What a pass samples.
struct PassSource {
    MotionSource image;
    std::vector<uint8_t> memory; ///< of a blurred one
};

class Renderer {
public:
    explicit Renderer(const MotionArguments& arguments)
        : a(arguments), fGeometry(arguments), fCubicX(arguments.scale.x), fCubicY(arguments.scale.y),
          fNeedsBlur(a.quality != kCubic && (fGeometry.BlurX() > 0 || fGeometry.BlurY() > 0)) {}

    PK_Result Render() {
        const bool isCopy = fGeometry.IsIdentity() && !fNeedsBlur && a.sourceField == a.destinationField &&
                            static_cast<float>(a.softness) - 8e-6f <= 0;
        if (isCopy) return Copy(a);
        fMarginX = a.smoothEdges && fGeometry.BlurX() > 0 ? kSoftMargin : 0;
        fMarginY = a.smoothEdges && fGeometry.BlurY() > 0 ? kSoftMargin : 0;
        fBox = fGeometry.BoxOf(Grown(a.crop));
        if (fBox.left >= fBox.right || fBox.top >= fBox.bottom) return PK_Success;
        fWay = fGeometry.WayFrom(fBox.left, fBox.top);
        const PK_Rect rows = Grown(CropInRows());
        if (fNeedsBlur && rows.top == rows.bottom) return PK_ErrOutOfMemory; // there is no image of no rows
        const bool hasTwoPasses =
            a.renderField == 0 && IsField(a.destinationField) &&
            (!fNeedsBlur || IsField(a.sourceField)); // a blurred frame serves both fields
        if (!hasTwoPasses) return Pass(a.renderField, false);
        const PK_Result result = Pass(1, true);
        return result == PK_Success ? Pass(2, true) : result;
    }

private:
    PK_Rect Grown(const PK_Rect& rect) const {
        return {rect.left - fMarginX, rect.top - fMarginY, rect.right + fMarginX, rect.bottom + fMarginY};
    }

    /// Both images from the top: sources lie from the bottom in memory.
    const uint8_t* SourceRow(int32_t row) const {
        return a.source + int64_t{a.sourceHeight - 1 - row} * a.sourceRowBytes;
    }
    uint8_t* DestinationRow(int32_t row) const {
        const bool isTurned = PK_IsOriginBottomLeft(a.destinationFormat);
        return a.destination +
               int64_t{isTurned ? a.destinationHeight - 1 - row : row} * a.destinationRowBytes;
    }

    int32_t RowStep() const { return IsField(a.sourceField) ? 2 : 1; }
    /// The crop in rows of a field counts from half its top, rounded down.
    PK_Rect CropInRows() const {
        return {a.crop.left, a.crop.top / RowStep(), a.crop.right, a.crop.bottom / RowStep()};
    }

    PK_Result Pass(int32_t pass, bool isOneOfTwo) {
        const MotionField field =
            MotionFieldAt(fNeedsBlur ? a.crop.top : 0, a.sourceField, a.destinationField, pass);
        PassSource source;
        PK_Point start = fWay.start;
        if (fNeedsBlur) {
            if (const PK_Result result = Blur(field.firstRow, source)) return result;
            if (isOneOfTwo && !field.isSameLine) start = {start.x - fWay.row.x, start.y - fWay.row.y};
        } else {
            source.image = {SourceRow(field.firstRow), -int64_t{RowStep()} * a.sourceRowBytes, CropInRows(),
                            a.sourceFormat, a.smoothEdges};
            if (!field.isSameLine) start.y -= 0.5f;
        }
        return DrawRows(source.image, start, pass);
    }

    /// A field may have a row less than the crop has in both, or none, which shows as a rectangle without rows.
    PK_Result Blur(int32_t firstRow, PassSource& blurred) const {
        const PK_PixelFormat format = Premultiplied(a.sourceFormat);
        PK_Rect rect = CropInRows();
        const int32_t rows = (a.crop.bottom - firstRow + RowStep() - 1) / RowStep();
        rect.bottom = std::min(rect.bottom, rect.top + rows);
        blurred.image = {nullptr, 0, rect, format, a.smoothEdges};
        if (rect.bottom <= rect.top) return PK_Success;
        const PK_Rect grown = Grown(rect);
        const int32_t width = grown.right - grown.left, height = grown.bottom - grown.top;
        const int32_t rowBytes = PK_PixelFormatRowBytes(format, width);
        blurred.memory.resize(static_cast<size_t>(rowBytes) * static_cast<size_t>(height));
        const int32_t pixel = PK_PixelFormatPackedRowBytes(format, 1);
        blurred.image.rect = grown;
        blurred.image.rowBytes = rowBytes;
        blurred.image.pixels =
            blurred.memory.data() - int64_t{grown.top} * rowBytes - int64_t{grown.left} * pixel;
        const double x = fGeometry.BlurX(), y = fGeometry.BlurY();
        return PK_GaussianBlur(SourceRow(firstRow) + int64_t{rect.left} * pixel,
                               -RowStep() * a.sourceRowBytes, rect.right - rect.left, rect.bottom - rect.top,
                               a.sourceFormat, blurred.memory.data(), rowBytes, width, height, format, x, y,
                               !a.smoothEdges, a.blursInLinear, (x > 0 ? 1 : 0) + (y > 0 ? 2 : 0), a.quality);
    }

    /// Every 32 rows are reached from the start at once, and the others from the row above; fewer than 33 belong together.
    PK_Result DrawRows(const MotionSource& source, PK_Point start, int32_t field) const {
        PK_Point at = start;
        for (int32_t row = fBox.top; row < fBox.bottom; ++row, at = {at.x + fWay.row.x, at.y + fWay.row.y}) {
            const int32_t passed = row - fBox.top;
            if (passed % kBandRows == 0) {
                const auto rows = static_cast<float>(passed);
                at = {start.x + fWay.row.x * rows, start.y + fWay.row.y * rows};
            }
            if (IsField(a.destinationField) && field != 0 && row % 2 != (field == 1 ? 0 : 1)) continue;
            if (const PK_Result result = DrawRow(source, at, row)) return result;
        }
        return PK_Success;
    }

    PK_Result DrawRow(const MotionSource& source, PK_Point at, int32_t row) const {
        const auto column = static_cast<int32_t>(at.x), sourceRow = static_cast<int32_t>(at.y);
        const auto isWhole = [](float place, int32_t pixel) {
            return std::abs(place - 0.5f - static_cast<float>(pixel)) < 5e-5f;
        };
        if (fWay.isExact && isWhole(at.x, column) && isWhole(at.y, sourceRow))
            return CopyRow(source, column, sourceRow, row);
        return SampleRow(source, at, row);
    }

    /// Pixels beside the rectangle are not drawn. A blurred row that is no more than converted counts as it was before.
    PK_Result CopyRow(const MotionSource& source, int32_t column, int32_t sourceRow, int32_t row) const {
        const PK_Rect& rect = source.rect;
        const int32_t first = std::max(column, rect.left);
        const int32_t count = std::min(column + fBox.right - fBox.left, rect.right) - first;
        if (sourceRow < rect.top || sourceRow >= rect.bottom || count < 1) return PK_Success;
        const uint8_t* const from = source.pixels + sourceRow * source.rowBytes +
                                    int64_t{first} * PK_PixelFormatPackedRowBytes(source.format, 1);
        return DrawSpan(from, a.composites || IsFading(a) ? source.format : a.sourceFormat,
                        fBox.left + first - column, count, row);
    }

    PK_Result SampleRow(const MotionSource& source, PK_Point at, int32_t row) const {
        const MotionLine line = {at, fWay.column, fBox.right - fBox.left, fGeometry.IsRotated()};
        const MotionPlaces walk = WalkMotionLine(source.rect, line, a.quality == kCubic ? 6 : 2);
        if (walk.places.empty()) return PK_Success;
        std::vector<float> pixels;
        for (const MotionPlace& place : walk.places)
            for (const float sample : Sample(source, place)) pixels.push_back(sample);
        return DrawSpan(reinterpret_cast<const uint8_t*>(pixels.data()), LineFormat(a.sourceFormat),
                        fBox.left + walk.first, static_cast<int32_t>(walk.places.size()), row);
    }

    /// Summed in double precision, then brought to 0 to 1 in float, so that codes half way between two round alike.
    std::array<float, 4> Sample(const MotionSource& source, const MotionPlace& place) const {
        const auto sums = a.quality == kCubic
                              ? SampleByWeights(source, place.at, fCubicX.Weights(), fCubicY.Weights()).pixel
                              : SampleBilinear<double>(source, place);
        std::array<float, 4> pixel;
        std::copy(sums.begin(), sums.end(), pixel.begin());
        const uint32_t depth = a.sourceFormat & kDepth;
        if (depth == k8 && (a.sourceFormat & kYUV) != 0)
            return {(pixel[0] - 128) * (1.0f / 224), (pixel[1] - 128) * (1.0f / 224),
                    (pixel[2] - 16) * (1.0f / 219), pixel[3] * (1.0f / 255)};
        for (float& sample : pixel) sample *= depth == k8 ? 1.0f / 255 : depth == k15 ? 0x1p-15f : 1.0f;
        return pixel;
    }

    PK_Result DrawSpan(const uint8_t* from, PK_PixelFormat format, int32_t column, int32_t count,
                       int32_t row) const {
        const int32_t bytesBefore =
            column == 0 ? 0 : PK_PixelFormatPackedRowBytes(a.destinationFormat, column);
        return Draw(a, from, 0, format, DestinationRow(row) + bytesBefore, 0, count, 1);
    }

    const MotionArguments& a;
    MotionGeometry fGeometry;
    ReferenceCubic fCubicX, fCubicY;
    bool fNeedsBlur;
    int32_t fMarginX = 0, fMarginY = 0;
    PK_Rect fBox{};
    MotionWay fWay{};
};

/// An interlaced source made progressive by rebuilding one of its fields.
PK_Result RenderRebuilt(MotionArguments a, bool field, int32_t renderField) {
    const int32_t rowBytes = PK_PixelFormatRowBytes(a.sourceFormat, a.sourceWidth);
    std::vector<uint8_t> frame(static_cast<size_t>(rowBytes) * static_cast<size_t>(a.sourceHeight));
    for (int32_t row = 0; row < a.sourceHeight; ++row)
        std::memcpy(frame.data() + int64_t{row} * rowBytes, a.source + int64_t{row} * a.sourceRowBytes,
                    static_cast<size_t>(PK_PixelFormatPackedRowBytes(a.sourceFormat, a.sourceWidth)));
    if (const PK_Result result = PK_Deinterlace(frame.data(), rowBytes, a.sourceFormat, a.sourceWidth,
                                                a.sourceHeight, field, a.quality))
        return result;
    a.source = frame.data();
    a.sourceRowBytes = rowBytes;
    a.sourceField = 0;
    a.renderField = renderField;
    return Renderer(a).Render();
}

PK_Result RenderInterlacedCubic(const MotionArguments& a) {
    const bool isFirst = a.sourceField == 1;
    if (a.renderField != 0 || !IsField(a.destinationField)) {
        const bool isOther = a.renderField == 3 - a.destinationField && IsField(a.destinationField);
        return RenderRebuilt(a, isOther ? isFirst : !isFirst, a.renderField);
    }
    const PK_Result result = RenderRebuilt(a, !isFirst, a.destinationField);
    return result == PK_Success ? RenderRebuilt(a, isFirst, 3 - a.destinationField) : result;
}

} // namespace

PK_Result DrawMotion(const MotionArguments& arguments) {
    MotionArguments a = arguments;
    const bool isPremultipliedRGBFloat =
        (a.sourceFormat & (kYUV | kAlpha | kDepth)) == (kPremultiplied | kFloat);
    if (!isPremultipliedRGBFloat) a.quality = std::min(a.quality, 4);
    if (a.quality == kCubic && IsField(a.sourceField)) return RenderInterlacedCubic(a);
    return Renderer(a).Render();
}

} // namespace PKReference
