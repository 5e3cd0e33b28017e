#include "geometry/SpanClip.h"

#include "primitives/Thresholds.h"

#include <algorithm>
#include <cmath>

namespace PK {
namespace {

/// One coordinate of the line, and the sides of the rectangle that it crosses.
struct Crossing {
    int32_t low, high;
    float at, step;

    /// Whether a line that keeps the coordinate is inside.
    bool IsInside() const {
        return !(at - static_cast<float>(low) < kNegligible) &&
               !(at - static_cast<float>(high) >= -kNegligible);
    }
    bool IsKept() const { return std::abs(step) < kNegligible; }
    double TimeOf(int32_t side) const {
        return (static_cast<double>(side) - static_cast<double>(at)) / static_cast<double>(step);
    }
    bool Reaches(double time) const {
        const double place = static_cast<double>(at) + time * static_cast<double>(step);
        return place >= low && place <= high;
    }
};

bool ClipByOne(const Crossing& kept, const Crossing& moving, double& t0, double& t1) {
    if (!kept.IsInside()) return false;
    t0 = moving.TimeOf(moving.low);
    t1 = moving.TimeOf(moving.high);
    if (t1 < t0) std::swap(t0, t1);
    return true;
}

/// Exchanges where the order is wrong, and so leaves what is no number where it stands.
void Order(double& first, double& second) {
    if (second < first) std::swap(first, second);
}

int32_t Moved(int32_t side, int32_t by) {
    return static_cast<int32_t>(std::clamp<int64_t>(int64_t{side} + by, INT32_MIN, INT32_MAX));
}

bool ClipToGrown(const MotionRow& row, int32_t margin, double& t0, double& t1) {
    const PK_Rect rectangle = {Moved(row.left, -margin), Moved(row.top, -margin), Moved(row.right, margin),
                               Moved(row.bottom, margin)};
    return ClipSpanToRect(rectangle, {row.x, row.y}, {row.stepX, row.stepY}, t0, t1);
}

/// Of a whole number; what is none counts as 0.
int32_t LimitColumn(double column, int32_t columns) {
    if (!(column > 0)) return 0;
    return column < columns ? static_cast<int32_t>(column) : columns;
}

} // namespace

bool ClipSpanToRect(const PK_Rect& rectangle, PK_Point position, PK_Point step, double& t0,
                    double& t1) noexcept {
    if (rectangle.right < rectangle.left || rectangle.bottom < rectangle.top) return false;
    const Crossing x = {rectangle.left, rectangle.right, position.x, step.x};
    const Crossing y = {rectangle.top, rectangle.bottom, position.y, step.y};
    if (x.IsKept()) return ClipByOne(x, y, t0, t1);
    if (y.IsKept()) return ClipByOne(y, x, t0, t1);
    double times[] = {x.TimeOf(x.low), x.TimeOf(x.high), y.TimeOf(y.low), y.TimeOf(y.high)};
    Order(times[0], times[1]);
    Order(times[2], times[3]);
    Order(times[0], times[2]);
    Order(times[1], times[3]);
    Order(times[1], times[2]);
    const double middle = (times[1] + times[2]) * 0.5;
    if (!x.Reaches(middle) || !y.Reaches(middle)) return false;
    t0 = times[1];
    t1 = times[2];
    return true;
}

MotionParts PartsOfRow(const MotionRow& row, int32_t margin) noexcept {
    double t0 = 0, t1 = 0;
    if (!ClipToGrown(row, margin, t0, t1)) return {row.columns, row.columns, row.columns, row.columns};
    const int32_t first = LimitColumn(std::floor(t0), row.columns);
    const int32_t end = std::max(LimitColumn(std::ceil(t1), row.columns), first);
    if (!ClipToGrown(row, -margin, t0, t1)) return {first, end, end, end};
    // Inside the outer stretch whatever the quotients have rounded to.
    const int32_t right = std::clamp(LimitColumn(std::floor(t1), row.columns), first, end);
    const int32_t inner = std::clamp(LimitColumn(std::ceil(t0), row.columns), first, right);
    return {first, inner, right, end};
}

} // namespace PK
