#include "geometry/QuadRasterizer.h"

#include "geometry/RepeatedSum.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <utility>

namespace PK {

namespace {

/// So many rows are walked one by one, as many as pictures have: edges that meet exactly are then in the order in
/// which they met, which a leap does not tell.
constexpr int64_t kShortWay = 1 << 15;

/// The first of the pixels low to high whose centre is not before the position; high + 1 if there is none, or
/// if the position is no number.
int64_t FirstCentre(float position, int32_t low, int32_t high) {
    const double first = std::ceil(position - 0.5f);
    if (!(first <= high)) return int64_t{high} + 1;
    return first > low ? static_cast<int64_t>(first) : low;
}

/// The last of the pixels low to high whose centre is not behind the position; low - 1 if there is none, or if
/// the position is no number.
int64_t LastCentre(float position, int32_t low, int32_t high) {
    const double last = std::floor(position - 0.5f);
    if (!(last >= low)) return int64_t{low} - 1;
    return last < high ? static_cast<int64_t>(last) : high;
}

bool IsFinite(const WarpPolygon& polygon) {
    return std::all_of(polygon.begin(), polygon.end(), [](const WarpVertex& vertex) {
        return std::isfinite(vertex.x) && std::isfinite(vertex.y) && std::isfinite(vertex.u) &&
               std::isfinite(vertex.v) && std::isfinite(vertex.a);
    });
}

/// Sorts a handful. Equal elements keep their order, and comparisons with not-a-number do no harm.
template <class Iterator, class Less>
void SortFew(Iterator first, Iterator last, Less isLess) {
    for (Iterator next = first; next != last; ++next)
        for (Iterator place = next; place != first && isLess(*place, *(place - 1)); --place)
            std::swap(*place, *(place - 1));
}

float NonZero(float divisor) {
    return divisor == 0 ? 1 : divisor;
}

} // namespace

void QuadRasterizer::Draw(const WarpPolygon& polygon) {
    if (!IsFinite(polygon)) return;
    fPolygon = polygon;
    fActiveCount = 0;
    SortVertices();
    const auto& order = fSortedVertices;
    const int64_t first = FirstCentre(fPolygon[order.front()].y, fDestination.top, fDestination.bottom);
    const int64_t last = LastCentre(fPolygon[order.back()].y, fDestination.top, fDestination.bottom);

    size_t taken = 0;
    for (int64_t row = first; row <= last;) {
        // In double precision, so that a row is told from the next however far down it lies.
        const double centre = static_cast<double>(row) + 0.5;
        while (taken < order.size() && fPolygon[order[taken]].y <= centre)
            VisitVertex(order[taken++], centre);
        SortEdges();
        const bool hasPixels = HasPixels();
        if (hasPixels && IsRowDrawn(row)) FillRow(row);
        const int64_t rows = hasPixels ? 1 : RowsToSkip(EndOfEdges(taken, last + 1) - row);
        AdvanceEdges(rows);
        row += rows;
    }
}

/// The first row at which a vertex is visited that has not been taken yet, at most `end`.
int64_t QuadRasterizer::EndOfEdges(size_t taken, int64_t end) const {
    if (taken == fSortedVertices.size()) return end;
    const double row = std::ceil(static_cast<double>(fPolygon[fSortedVertices[taken]].y) - 0.5);
    return row < static_cast<double>(end) ? static_cast<int64_t>(row) : end;
}

void QuadRasterizer::SortVertices() {
    fSortedVertices = {0, 1, 2, 3};
    SortFew(fSortedVertices.begin(), fSortedVertices.end(),
            [this](int32_t a, int32_t b) { return fPolygon[a].y < fPolygon[b].y; });
}

void QuadRasterizer::VisitVertex(int32_t index, double centre) {
    const int32_t before = (index + 3) % 4, after = (index + 1) % 4;
    VisitEdge(before, fPolygon[before], centre);
    VisitEdge(index, fPolygon[after], centre);
}

/// \param other  the end of the edge that is not being visited.
void QuadRasterizer::VisitEdge(int32_t edge, const WarpVertex& other, double centre) {
    if (other.y <= centre - 1)
        EndEdge(edge);
    else if (other.y > centre)
        fActiveEdges[fActiveCount++] = StartEdge(edge, static_cast<float>(centre));
}

QuadRasterizer::EdgeState QuadRasterizer::StartEdge(int32_t edge, float centre) const {
    const WarpVertex &first = fPolygon[edge], &second = fPolygon[(edge + 1) % 4];
    const WarpVertex& upper = first.y < second.y ? first : second;
    const WarpVertex& lower = first.y < second.y ? second : first;
    const float height = NonZero(lower.y - upper.y);
    const float above = centre - upper.y;
    const auto slope = [height, above](float from, float to) {
        const float change = (to - from) / height;
        return Slope{from + change * above, change};
    };
    return {edge, slope(upper.x, lower.x), slope(upper.u, lower.u), slope(upper.v, lower.v),
            slope(upper.a, lower.a)};
}

void QuadRasterizer::EndEdge(int32_t edge) {
    const auto end = fActiveEdges.begin() + fActiveCount;
    const auto kept = std::remove_if(fActiveEdges.begin(), end,
                                     [edge](const EdgeState& state) { return state.edge == edge; });
    fActiveCount = static_cast<int32_t>(kept - fActiveEdges.begin());
}

void QuadRasterizer::SortEdges() {
    SortFew(fActiveEdges.begin(), fActiveEdges.begin() + fActiveCount,
            [](const EdgeState& a, const EdgeState& b) { return a.x.value < b.x.value; });
}

void QuadRasterizer::AdvanceEdges(int64_t rows) {
    for (int32_t i = 0; i < fActiveCount; ++i)
        for (Slope* slope : {&fActiveEdges[i].x, &fActiveEdges[i].u, &fActiveEdges[i].v, &fActiveEdges[i].a})
            slope->value = RepeatedSum(slope->value, slope->change, rows);
}

/// Whether the scan line in hand has a pixel inside the rectangle, be the row drawn or not.
bool QuadRasterizer::HasPixels() const {
    for (int32_t i = 0; i + 1 < fActiveCount; i += 2) {
        const float left = fActiveEdges[i].x.value, right = fActiveEdges[i + 1].x.value;
        if (FirstCentre(left, fDestination.left, fDestination.right) <=
            LastCentre(right, fDestination.left, fDestination.right))
            return true;
    }
    return false;
}

/// Whether each edge stands between the same centres of the rectangle's columns some rows further on, and so all
/// the way there: an edge goes in one direction.
bool QuadRasterizer::PassNoCentre(int64_t rows) const {
    const int32_t left = fDestination.left, right = fDestination.right;
    return std::all_of(fActiveEdges.begin(), fActiveEdges.begin() + fActiveCount, [&](const EdgeState& edge) {
        const float now = edge.x.value, then = RepeatedSum(now, edge.x.change, rows);
        return FirstCentre(now, left, right) == FirstCentre(then, left, right) &&
               LastCentre(now, left, right) == LastCentre(then, left, right);
    });
}

/// How many of `most` rows to go on from one without pixels to another that may have some. No edge may begin or
/// end among them. The way is doubled as long as it is right, and then halved.
int64_t QuadRasterizer::RowsToSkip(int64_t most) const {
    int64_t rows = 1, step = 1;
    if (most <= kShortWay) return rows;
    for (; rows + step <= most && PassNoCentre(rows + step - 1); step *= 2) rows += step;
    for (step /= 2; step > 0; step /= 2)
        if (rows + step <= most && PassNoCentre(rows + step - 1)) rows += step;
    return rows;
}

bool QuadRasterizer::IsRowDrawn(int64_t row) const {
    if (fDestination.field == 0) return true;
    const bool isOdd = (row & 1) != 0;
    return fDestination.field == (isOdd ? 2 : 1);
}

void QuadRasterizer::FillRow(int64_t row) const {
    for (int32_t i = 0; i + 1 < fActiveCount; i += 2) FillBetween(fActiveEdges[i], fActiveEdges[i + 1], row);
}

void QuadRasterizer::FillBetween(const EdgeState& left, const EdgeState& right, int64_t row) const {
    const int64_t first = FirstCentre(left.x.value, fDestination.left, fDestination.right);
    const int64_t last = LastCentre(right.x.value, fDestination.left, fDestination.right);
    if (last < first) return;

    const float width = NonZero(right.x.value - left.x.value);
    const float inside = static_cast<float>(first) + 0.5f - left.x.value;
    WarpSpan span{};
    span.du = (right.u.value - left.u.value) / width;
    span.dv = (right.v.value - left.v.value) / width;
    span.da = (right.a.value - left.a.value) / width;
    span.u = left.u.value + inside * span.du;
    span.v = left.v.value + inside * span.dv;
    span.a = left.a.value + inside * span.da;
    span.pixels = fDestination.pixels + 4 * (row * fDestination.stride + first);
    span.count = last - first + 1;
    fFillSpan(fSource, fPaint, span);
}

} // namespace PK
