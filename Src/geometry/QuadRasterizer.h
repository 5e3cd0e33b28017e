#pragma once

// Scan conversion of four-sided polygons into spans, for the quad warp. Place in the source and edge alpha are
// interpolated linearly along edges and spans.

#include "geometry/WarpSpan.h"

#include <array>
#include <cstddef>

namespace PK {

/// A corner: x and y in the destination, u and v in the source, edge alpha from 0 to 255.
struct WarpVertex {
    float x, y, u, v, a;
};

using WarpPolygon = std::array<WarpVertex, 4>;

/// The image that is written. Bounds are inclusive.
struct WarpDestination {
    uint8_t* pixels; // column 0 of row 0
    int32_t stride;  // pixels from one row to the next
    int32_t left, top, right, bottom;
    int32_t field; // 0 all rows, 1 even rows, 2 odd rows; of any other number no row
};

class QuadRasterizer {
public:
    QuadRasterizer(const WarpDestination& destination, const WarpSource& source, const WarpPaint& paint,
                   FillWarpSpan fillSpan)
        : fDestination(destination), fSource(source), fPaint(paint), fFillSpan(fillSpan) {}

    /// Draws a polygon, convex or not, crossing itself or not. One with a coordinate that is not finite is not
    /// drawn. A pixel belongs to it if its centre does. The time goes by the rows that have pixels of it,
    /// but for some ten thousand.
    void Draw(const WarpPolygon& polygon);

private:
    struct Slope {
        float value, change;
    };

    /// Where an edge crosses the scan line in hand, and how that moves to the next.
    struct EdgeState {
        int32_t edge; // its first vertex around the polygon
        Slope x, u, v, a;
    };

    int64_t EndOfEdges(size_t taken, int64_t end) const;
    void SortVertices();
    void VisitVertex(int32_t index, double centre);
    void VisitEdge(int32_t edge, const WarpVertex& other, double centre);
    EdgeState StartEdge(int32_t edge, float centre) const;
    void EndEdge(int32_t edge);
    void SortEdges();
    void AdvanceEdges(int64_t rows);
    bool HasPixels() const;
    bool PassNoCentre(int64_t rows) const;
    int64_t RowsToSkip(int64_t most) const;
    bool IsRowDrawn(int64_t row) const;
    void FillRow(int64_t row) const;
    void FillBetween(const EdgeState& left, const EdgeState& right, int64_t row) const;

    const WarpDestination& fDestination;
    const WarpSource& fSource;
    const WarpPaint& fPaint;
    FillWarpSpan fFillSpan;

    WarpPolygon fPolygon{};
    std::array<int32_t, 4> fSortedVertices{}; // by y
    std::array<EdgeState, 4> fActiveEdges{};  // by x; an edge starts once, so that four are enough
    int32_t fActiveCount = 0;
};

} // namespace PK
