// PK_WarpAffineQuad: the polygon, its soft rim and the choice of kernels.

#include "frame/Arguments.h"
#include "geometry/QuadRasterizer.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/QuadWarp.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>

namespace PK {

namespace {

constexpr int32_t kBestNearestQuality = 2; // bilinear above
constexpr float kNoLength = 1e-09f;        // stands in for a length of 0

/// Row bytes of either sign; rows go downward in memory whatever the sign.
int32_t StrideInPixels(int32_t rowBytes) {
    return static_cast<int32_t>(std::abs(int64_t{rowBytes}) / 4);
}

bool IsEmpty(const PK_Rect& rect) {
    return rect.right <= rect.left || rect.bottom <= rect.top;
}

/// Whether a field is the whole frame or one of its two.
bool HasRows(int32_t field) {
    return field >= 0 && field <= 2;
}

/// The corners from the fourth to the first.
WarpPolygon Corners(const double sourceQuad[8], const double destinationQuad[8]) {
    WarpPolygon corners{};
    for (int32_t i = 0; i < 4; ++i) {
        const int32_t from = 2 * (3 - i);
        corners[i] = {static_cast<float>(destinationQuad[from]),
                      static_cast<float>(destinationQuad[from + 1]), static_cast<float>(sourceQuad[from]),
                      static_cast<float>(sourceQuad[from + 1]), 255};
    }
    return corners;
}

struct Vector {
    float x, y;
};

Vector UnitVector(Vector vector) {
    const float length = std::sqrt(vector.x * vector.x + vector.y * vector.y);
    const float divisor = length == 0 ? kNoLength : length;
    return {vector.x / divisor, vector.y / divisor};
}

/// From a corner along its bisector, `feather` long, given the ways to its neighbours.
Vector Inset(Vector toOne, Vector toOther, float feather) {
    const Vector one = UnitVector(toOne), other = UnitVector(toOther);
    const Vector bisector = UnitVector({(one.x + other.x) / 2, (one.y + other.y) / 2});
    return {bisector.x * feather, bisector.y * feather};
}

WarpPolygon InsetCorners(const WarpPolygon& corners, float feather) {
    WarpPolygon inset = corners;
    for (size_t i = 0; i < corners.size(); ++i) {
        const WarpVertex &corner = corners[i], &before = corners[(i + 3) % 4], &after = corners[(i + 1) % 4];
        const Vector place = Inset({before.x - corner.x, before.y - corner.y},
                                   {after.x - corner.x, after.y - corner.y}, feather);
        const Vector texel = Inset({before.u - corner.u, before.v - corner.v},
                                   {after.u - corner.u, after.v - corner.v}, feather);
        inset[i] = {corner.x + place.x, corner.y + place.y, corner.u + texel.x, corner.v + texel.y, corner.a};
    }
    return inset;
}

/// The rim: a strip for each edge, from alpha 0 outside to 255 at the inset edge.
void DrawRim(QuadRasterizer& rasterizer, WarpPolygon outer, const WarpPolygon& inner) {
    for (WarpVertex& corner : outer) corner.a = 0;
    for (size_t i = 0; i < outer.size(); ++i) {
        const size_t next = (i + 1) % outer.size();
        rasterizer.Draw({outer[i], outer[next], inner[next], inner[i]});
    }
}

/// \param field  0 for the whole frame, else 1 or 2.
WarpSource MakeSource(const void* pixels, int32_t rowBytes, const PK_Rect& rect, int32_t field) {
    WarpSource source{};
    source.pixels = static_cast<const uint8_t*>(pixels);
    source.stride = StrideInPixels(rowBytes);
    source.left = rect.left;
    source.top = rect.top;
    source.right = rect.right - 1;
    source.bottom = rect.bottom - 1;

    const bool isFrame = field == 0, isOdd = field == 2;
    source.rowScale = isFrame ? 1.0f : 0.5f;
    source.rowOffset = isOdd ? 0.5f : 0.0f;
    source.rowStep = isFrame ? 1 : 2;
    source.rowShift = isOdd ? 1 : 0;
    const bool endsInField = isFrame || (source.bottom & 1) == source.rowShift;
    source.lastRow = endsInField || source.bottom == source.top ? source.bottom : source.bottom - 1;

    const auto fits = [&source](int64_t row, int64_t column) {
        const int64_t offset = row * source.stride + column;
        return offset == static_cast<int32_t>(offset);
    };
    source.offsetsFit = fits(source.top, source.left) && fits(source.top, source.right) &&
                        fits(source.bottom, source.left) && fits(source.bottom, source.right);
    return source;
}

WarpDestination MakeDestination(void* pixels, int32_t rowBytes, const PK_Rect& rect, int32_t field) {
    return {.pixels = static_cast<uint8_t*>(pixels),
            .stride = StrideInPixels(rowBytes),
            .left = rect.left,
            .top = rect.top,
            .right = rect.right - 1,
            .bottom = rect.bottom - 1,
            .field = field};
}

template <class Kernels>
FillWarpSpan ChooseRule(const Kernels& kernels, bool featherOver, bool blend, PK_PixelFormat format) {
    if (featherOver) return kernels.featherOver;
    if (!blend) return kernels.copy;
    if (format == PK_PixelFormat_BGRA_4444_8u) return kernels.blendBGRA;
    if (format == PK_PixelFormat_VUYA_4444_8u) return kernels.blendVUYA;
    return kernels.blendOther;
}

FillWarpSpan ChooseKernel(bool bilinear, bool featherOver, bool blend, PK_PixelFormat format) {
    return bilinear ? ChooseRule(Best<WarpBilinearKernels>(), featherOver, blend, format)
                    : ChooseRule(Best<WarpNearestKernels>(), featherOver, blend, format);
}

/// Without a rim there is nothing between the corners and their insets: so for a feather that is negative or
/// no number.
void Draw(QuadRasterizer& rasterizer, const WarpPolygon& corners, float feather, bool bilinear) {
    if (!(feather > 0)) {
        rasterizer.Draw(corners);
        return;
    }
    const WarpPolygon inset = InsetCorners(corners, feather);
    rasterizer.Draw(inset);
    if (bilinear) DrawRim(rasterizer, corners, inset);
}

} // namespace

} // namespace PK

PK_Result PK_WarpAffineQuad(const void*, const void*, const void* source, int32_t sourceRowBytes,
                            const PK_Rect* sourceRect, const double sourceQuad[8], void* destination,
                            int32_t destinationRowBytes, const PK_Rect* destinationRect,
                            const double destinationQuad[8], int32_t quality, int32_t opacity, bool blend,
                            bool keepSourceAlpha, PK_PixelFormat format, int32_t field, bool ignoreFields,
                            bool featherOver, float feather) noexcept {
    using namespace PK;
    if (destination == nullptr) return PK_ErrNullDestination;
    if (source == nullptr) return PK_ErrNullSource;
    if (sourceRowBytes == 0 || destinationRowBytes == 0) return PK_ErrFailed;
    if (HasNull({sourceRect, sourceQuad, destinationRect, destinationQuad})) return PK_ErrFailed;
    if (IsEmpty(*sourceRect) || IsEmpty(*destinationRect) || !HasRows(field)) return PK_Success;

    const bool bilinear = quality > kBestNearestQuality;
    const WarpSource from = MakeSource(source, sourceRowBytes, *sourceRect, ignoreFields ? 0 : field);
    const WarpDestination to = MakeDestination(destination, destinationRowBytes, *destinationRect, field);
    const WarpPaint paint = {.opacity = std::clamp(opacity, 0, 255),
                             .writesEdgeAlpha = opacity >= 255 && !keepSourceAlpha};
    QuadRasterizer rasterizer(to, from, paint, ChooseKernel(bilinear, featherOver, blend, format));
    Draw(rasterizer, Corners(sourceQuad, destinationQuad), feather, bilinear);
    return PK_Success;
}
