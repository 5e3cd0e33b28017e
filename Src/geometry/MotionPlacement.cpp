#include "geometry/MotionPlacement.h"

#include "primitives/Thresholds.h"

#include <algorithm>
#include <cmath>

namespace PK {
namespace {

constexpr double kRadians = 0.017453292519943295;
constexpr double kCosineOfATwentieth = 0x1.fffff3393210cp-1; // of a degree

bool AreEqual(float a, float b) {
    return std::abs(a - b) < kNegligible;
}

/// A pixel boundary from 0 to an end, of any number.
int32_t Boundary(float x, int32_t end) {
    return x > 0 ? x < static_cast<float>(end) ? static_cast<int32_t>(x) : end : 0;
}

} // namespace

MotionPlacement::MotionPlacement(const MotionGeometry& geometry) : fGeometry(geometry) {
    const auto angle = static_cast<double>(static_cast<float>(geometry.rotation * kRadians));
    fCosine = std::cos(angle);
    fSine = std::sin(angle);
    fIsRotated = fCosine < kCosineOfATwentieth;
}

bool MotionPlacement::IsUnscaled() const {
    return AreEqual(fGeometry.scale.x, 1) && AreEqual(fGeometry.scale.y, 1);
}

bool MotionPlacement::IsCentred() const {
    return AreEqual(fGeometry.position.x, fGeometry.anchor.x) &&
           AreEqual(fGeometry.position.y, fGeometry.anchor.y);
}

PK_Point MotionPlacement::ToDestination(float x, float y) const {
    const auto& [sourceWidth, sourceHeight, width, height, aspectNum, aspectDen, position, anchor, scale,
                 rotation] = fGeometry;
    float x1 = (x - static_cast<float>(sourceWidth) * anchor.x) * scale.x;
    float y1 = (y - static_cast<float>(sourceHeight) * anchor.y) * scale.y;
    if (fIsRotated) {
        const float square = x1 * static_cast<float>(aspectNum) / static_cast<float>(aspectDen);
        const double turned = fCosine * square - fSine * y1;
        y1 = static_cast<float>(fSine * square + fCosine * y1);
        x1 = static_cast<float>(turned * aspectDen / aspectNum);
    }
    return {x1 + static_cast<float>(width) * position.x, y1 + static_cast<float>(height) * position.y};
}

PK_Point MotionPlacement::ToSource(int32_t column, int32_t row) const {
    const auto& [sourceWidth, sourceHeight, width, height, aspectNum, aspectDen, position, anchor, scale,
                 rotation] = fGeometry;
    float u = 0.5f - static_cast<float>(width) * position.x + static_cast<float>(column);
    float v = 0.5f - static_cast<float>(height) * position.y + static_cast<float>(row);
    if (fIsRotated) {
        const float square = u * static_cast<float>(aspectNum) / static_cast<float>(aspectDen);
        u = static_cast<float>((fSine * v + fCosine * square) * aspectDen / aspectNum);
        v = static_cast<float>(fCosine * v - fSine * square);
    }
    return {u / scale.x + static_cast<float>(sourceWidth) * anchor.x,
            v / scale.y + static_cast<float>(sourceHeight) * anchor.y};
}

PK_Rect MotionPlacement::Reach(const PK_Rect& source, int32_t marginX, int32_t marginY) const {
    const auto left = static_cast<float>(source.left - marginX),
               right = static_cast<float>(source.right + marginX);
    const auto top = static_cast<float>(source.top - marginY),
               bottom = static_cast<float>(source.bottom + marginY);
    const PK_Point corners[] = {ToDestination(left, top), ToDestination(right, top),
                                ToDestination(left, bottom), ToDestination(right, bottom)};
    float xs[4], ys[4];
    for (int i = 0; i < 4; ++i) {
        if (std::isnan(corners[i].x) || std::isnan(corners[i].y)) return {};
        xs[i] = corners[i].x;
        ys[i] = corners[i].y;
    }
    const auto [leastX, greatestX] = std::ranges::minmax(xs);
    const auto [leastY, greatestY] = std::ranges::minmax(ys);
    const PK_Rect reach = {Boundary(std::floor(leastX), fGeometry.destinationWidth),
                           Boundary(std::floor(leastY), fGeometry.destinationHeight),
                           Boundary(std::ceil(greatestX), fGeometry.destinationWidth),
                           Boundary(std::ceil(greatestY), fGeometry.destinationHeight)};
    return reach.left < reach.right && reach.top < reach.bottom ? reach : PK_Rect{};
}

} // namespace PK
