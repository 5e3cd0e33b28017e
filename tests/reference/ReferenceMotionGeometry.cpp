#include "reference/ReferenceMotionGeometry.h"

#include <algorithm>
#include <cmath>
#include <iterator>

namespace PKReference {
namespace {

constexpr float kNegligible = 8e-6f;

bool AreEqual(float a, float b) {
    return std::abs(a - b) < kNegligible;
}

int32_t Limit(float boundary, int32_t end) {
    return static_cast<int32_t>(std::clamp<double>(boundary, 0, end));
}

} // namespace

MotionGeometry::MotionGeometry(const MotionArguments& arguments)
    : fArguments(arguments), fPosition{arguments.position.x, 1 - arguments.position.y},
      fAnchor{arguments.anchor.x, 1 - arguments.anchor.y} {
    const double angle = static_cast<float>(arguments.rotation * 0.017453292519943295);
    fCosine = std::cos(angle);
    fSine = std::sin(angle);
    fIsRotated = fCosine < 0.9999996192282494; // a twentieth of a degree
}

bool MotionGeometry::IsIdentity() const {
    const MotionArguments& a = fArguments;
    return !fIsRotated && AreEqual(a.scale.x, 1) && AreEqual(a.scale.y, 1) &&
           AreEqual(fPosition.x, fAnchor.x) && AreEqual(fPosition.y, fAnchor.y) &&
           a.sourceWidth == a.destinationWidth && a.sourceHeight == a.destinationHeight;
}

double MotionGeometry::Blur(float scale, double acrossFields) const {
    if (fArguments.quality < 3) return 0;
    double sigma = (fArguments.softness * 0.25 + 0.25) / static_cast<double>(scale);
    if (!IsField(fArguments.sourceField) && IsField(fArguments.destinationField))
        sigma *= std::abs(acrossFields);
    return sigma > 0.25 ? sigma : 0;
}

PK_Point MotionGeometry::ToDestination(float x, float y) const {
    const MotionArguments& a = fArguments;
    float fromX = (x - static_cast<float>(a.sourceWidth) * fAnchor.x) * a.scale.x;
    float fromY = (y - static_cast<float>(a.sourceHeight) * fAnchor.y) * a.scale.y;
    if (fIsRotated) {
        const double square =
            fromX * static_cast<float>(a.aspectNum) / static_cast<float>(a.aspectDen); // a float up to here
        const double down = fromY;
        fromX = static_cast<float>((fCosine * square - fSine * down) * a.aspectDen / a.aspectNum);
        fromY = static_cast<float>(fSine * square + fCosine * down);
    }
    return {fromX + static_cast<float>(a.destinationWidth) * fPosition.x,
            fromY + static_cast<float>(a.destinationHeight) * fPosition.y};
}

PK_Point MotionGeometry::ToSource(int32_t column, int32_t row) const {
    const MotionArguments& a = fArguments;
    float u = 0.5f - static_cast<float>(a.destinationWidth) * fPosition.x + static_cast<float>(column);
    float v = 0.5f - static_cast<float>(a.destinationHeight) * fPosition.y + static_cast<float>(row);
    if (fIsRotated) {
        const double square =
            u * static_cast<float>(a.aspectNum) / static_cast<float>(a.aspectDen); // a float up to here
        const double down = v;
        u = static_cast<float>((fSine * down + fCosine * square) * a.aspectDen / a.aspectNum);
        v = static_cast<float>(fCosine * down - fSine * square);
    }
    return {u / a.scale.x + static_cast<float>(a.sourceWidth) * fAnchor.x,
            v / a.scale.y + static_cast<float>(a.sourceHeight) * fAnchor.y};
}

PK_Rect MotionGeometry::BoxOf(const PK_Rect& source) const {
    PK_Point least = {INFINITY, INFINITY}, greatest = {-INFINITY, -INFINITY};
    for (const int32_t x : {source.left, source.right})
        for (const int32_t y : {source.top, source.bottom}) {
            const PK_Point corner = ToDestination(static_cast<float>(x), static_cast<float>(y));
            least = {std::min(least.x, corner.x), std::min(least.y, corner.y)};
            greatest = {std::max(greatest.x, corner.x), std::max(greatest.y, corner.y)};
        }
    const int32_t width = fArguments.destinationWidth, height = fArguments.destinationHeight;
    return {Limit(std::floor(least.x), width), Limit(std::floor(least.y), height),
            Limit(std::ceil(greatest.x), width), Limit(std::ceil(greatest.y), height)};
}

MotionWay MotionGeometry::WayFrom(int32_t column, int32_t row) const {
    const PK_Point start = ToSource(column, row), right = ToSource(column + 1, row),
                   below = ToSource(column, row + 1);
    MotionWay way = {
        start, {right.x - start.x, right.y - start.y}, {below.x - start.x, below.y - start.y}, false};
    way.isExact =
        !fIsRotated && AreEqual(way.column.x, 1) && std::abs(start.x - 0.5f - std::trunc(start.x)) < 5e-5f;
    if (IsField(fArguments.sourceField)) {
        way.start.y = (start.y - 0.5f) * 0.5f + 0.5f;
        way.column.y /= 2;
        way.row.y /= 2;
    }
    return way;
}

MotionField MotionFieldAt(int32_t row, int32_t sourceField, int32_t destinationField, int32_t pass) {
    if (!IsField(sourceField)) return {row, true};
    struct Case {
        int32_t source, destination, pass, offset;
        bool isSameLine;
    };
    constexpr Case kCases[] = {
        {1, 0, 0, 0, true},  {1, 0, 1, 0, true},  {1, 0, 2, 0, true},  // a progressive destination
        {2, 0, 0, 1, false}, {2, 0, 1, 1, false}, {2, 0, 2, 1, false}, //
        {1, 1, 0, 1, true},  {1, 1, 1, 0, true},  {1, 1, 2, 1, false}, // one with the fields of the source
        {2, 2, 0, 1, true},  {2, 2, 1, 0, true},  {2, 2, 2, 1, false}, //
        {1, 2, 0, 0, true},  {1, 2, 1, 1, false}, {1, 2, 2, 0, true},  // one with the other order
        {2, 1, 0, 0, true},  {2, 1, 1, 1, false}, {2, 1, 2, 0, true},
    };
    const auto* const found = std::find_if(std::begin(kCases), std::end(kCases), [&](const Case& c) {
        return c.source == sourceField && c.destination == destinationField && c.pass == pass;
    });
    const int32_t offset = row % 2 == 0 ? found->offset : 1 - found->offset;
    return {row + offset, found->isSameLine};
}

} // namespace PKReference
