#include "reference/ReferenceQuadWarp.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <cstdlib>
#include <vector>

namespace PKReference {

namespace {

// Attributes of a corner, an edge or a place on a row.
enum { X, Y, U, V, A, kAttributes };
using Corner = std::array<float, kAttributes>;
using Polygon = std::vector<Corner>;
using Pixel = std::array<int, 4>;

int Div255(int n) {
    return (n + 128 + ((n + 128) >> 8)) >> 8;
}

struct Painter {
    const QuadWarp& warp;

    Pixel Source(int row, int column) const {
        const int stride = std::abs(warp.sourceRowBytes) / 4;
        const uint8_t* bytes = warp.source + (std::ptrdiff_t{row} * stride + column) * 4;
        return {bytes[0], bytes[1], bytes[2], bytes[3]};
    }

    uint8_t* Destination(int row, int column) const {
        const int stride = std::abs(warp.destinationRowBytes) / 4;
        return warp.destination + (std::ptrdiff_t{row} * stride + column) * 4;
    }

    bool IsBilinear() const { return warp.quality > 2; }

    Pixel SampleNearest(float u, float v) const {
        const PK_Rect& rect = warp.sourceRect;
        const int column = std::clamp(static_cast<int>(std::lrint(u)), rect.left, rect.right - 1);
        const int row = std::clamp(static_cast<int>(std::lrint(v)), rect.top, rect.bottom - 1);
        return Source(row, column);
    }

    Pixel SampleBilinear(float u, float v) const {
        const PK_Rect& rect = warp.sourceRect;
        const int lastColumn = rect.right - 1, lastRow = rect.bottom - 1;
        const float x = std::clamp(u - 0.5f, static_cast<float>(rect.left), static_cast<float>(lastColumn));
        const int i = static_cast<int>(std::lrint(x));
        const float fx = x - static_cast<float>(i);
        const int right = i == lastColumn ? i : i + 1;

        float y = std::clamp(v - 0.5f, static_cast<float>(rect.top), static_cast<float>(lastRow));
        int j = 0, below = 0;
        float fy = 0;
        if (warp.field == 0 || warp.ignoreFields) {
            j = static_cast<int>(std::lrint(y));
            fy = y - static_cast<float>(j);
            below = j == lastRow ? j : j + 1;
        } else {
            const int odd = warp.field == 2 ? 1 : 0;
            y = odd ? y * 0.5f + 0.5f : y * 0.5f;
            const int inField = static_cast<int>(std::lrint(y));
            fy = y - static_cast<float>(inField);
            j = 2 * inField - odd;
            if (j > lastRow) j -= 2; // so it is the last of its field inside
            below = j + 2 > lastRow ? j : j + 2;
        }
        j = std::max(j, rect.top);
        below = std::max(below, rect.top);

        const Pixel topLeft = Source(j, i), topRight = Source(j, right);
        const Pixel bottomLeft = Source(below, i), bottomRight = Source(below, right);
        Pixel result{};
        for (size_t c = 0; c < 4; ++c) {
            const auto at = [c](const Pixel& pixel) { return static_cast<float>(pixel[c]); };
            const float p0 = at(topLeft) + (at(bottomLeft) - at(topLeft)) * fy;
            const float p1 = at(topRight) + (at(bottomRight) - at(topRight)) * fy;
            result[c] = std::clamp(static_cast<int>(std::lrint(p0 + (p1 - p0) * fx)), 0, 255);
        }
        return result;
    }

    void Composite(const Pixel& s, int a, uint8_t* t) const {
        const int d = t[3];
        if (a == 0) return;
        if (a >= 255 || d == 0) {
            for (size_t c = 0; c < 3; ++c) t[c] = static_cast<uint8_t>(s[c]);
            t[3] = static_cast<uint8_t>(a);
            return;
        }
        const int r = a + d - Div255(a * d);
        const int ws = a * 255, wd = (255 - a) * d, n = r * 255;
        const bool isVUYA = warp.format == 0x805;
        if (warp.format != 4 && !isVUYA) return;
        const int zero[3] = {isVUYA ? 128 : 0, isVUYA ? 128 : 0, isVUYA ? 16 : 0};
        for (size_t c = 0; c < 3; ++c) {
            const int mixed = ((s[c] - zero[c]) * ws + (t[c] - zero[c]) * wd) / n + zero[c];
            t[c] = static_cast<uint8_t>(std::clamp(mixed, 0, 255));
        }
        t[3] = static_cast<uint8_t>(std::min(r, 255));
    }

    void PaintNearest(float u, float v, uint8_t* t) const {
        const Pixel s = SampleNearest(u, v);
        const int alpha = s[3], faded = Div255(warp.opacity * alpha);
        if (!warp.featherOver && warp.blend) {
            Composite(s, warp.opacity == 255 ? alpha : faded, t);
            return;
        }
        for (size_t c = 0; c < 3; ++c) t[c] = static_cast<uint8_t>(Div255(s[c] * 255));
        if (warp.featherOver)
            t[3] = static_cast<uint8_t>(alpha);
        else if (warp.opacity == 255)
            t[3] = static_cast<uint8_t>(warp.keepSourceAlpha ? alpha : 255);
        else
            t[3] = static_cast<uint8_t>(faded);
    }

    void PaintBilinear(float u, float v, float edgeAlpha, uint8_t* t) const {
        const Pixel s = SampleBilinear(u, v);
        const int e = std::clamp(static_cast<int>(std::lrint(edgeAlpha)), 0, 255);
        const int m = Div255(e * s[3]);
        if (warp.featherOver) {
            for (size_t c = 0; c < 3; ++c) t[c] = static_cast<uint8_t>(Div255(t[c] * (255 - e) + s[c] * e));
            t[3] = static_cast<uint8_t>(s[3]);
        } else if (warp.blend) {
            Composite(s, warp.opacity == 255 ? m : Div255(warp.opacity * m), t);
        } else {
            for (size_t c = 0; c < 3; ++c) t[c] = static_cast<uint8_t>(s[c]);
            if (warp.opacity != 255)
                t[3] = static_cast<uint8_t>(Div255(m * warp.opacity));
            else
                t[3] = static_cast<uint8_t>(warp.keepSourceAlpha ? m : e);
        }
    }

    void Span(int row, const Corner& left, const Corner& right) const {
        const PK_Rect& rect = warp.destinationRect;
        const int first = std::max(rect.left, static_cast<int>(std::ceil(left[X] - 0.5f)));
        const int last = std::min(rect.right - 1, static_cast<int>(std::floor(right[X] - 0.5f)));
        if (last < first) return;
        float w = right[X] - left[X];
        if (w == 0) w = 1;
        const float t = static_cast<float>(first) + 0.5f - left[X];
        Corner slope{}, place{};
        for (const int k : {U, V, A}) {
            slope[k] = (right[k] - left[k]) / w;
            place[k] = left[k] + t * slope[k];
        }
        for (int column = first; column <= last; ++column) {
            if (IsBilinear())
                PaintBilinear(place[U], place[V], place[A], Destination(row, column));
            else
                PaintNearest(place[U], place[V], Destination(row, column));
            for (const int k : {U, V, A}) place[k] += slope[k];
        }
    }

    bool IsInField(int row) const {
        return warp.field == 0 || (warp.field == 1 && row % 2 == 0) || (warp.field == 2 && row % 2 != 0);
    }

    // An edge is crossed by a row whose centre is at or below its upper end and above its lower end. Edges that
    // cross at one place stay in the order in which their upper ends were passed.
    void Fill(const Polygon& polygon) const {
        const PK_Rect& rect = warp.destinationRect;
        float least = polygon[0][Y], greatest = least;
        for (const Corner& corner : polygon) {
            least = std::min(least, corner[Y]);
            greatest = std::max(greatest, corner[Y]);
        }
        const int first = std::max(rect.top, static_cast<int>(std::ceil(least - 0.5f)));
        const int last = std::min(rect.bottom - 1, static_cast<int>(std::floor(greatest - 0.5f)));

        std::vector<Corner> values(polygon.size()), changes(polygon.size());
        std::vector<size_t> crossed, vertices = {0, 1, 2, 3}; // those not yet passed, by y
        std::stable_sort(vertices.begin(), vertices.end(),
                         [&](size_t a, size_t b) { return polygon[a][Y] < polygon[b][Y]; });
        for (int row = first; row <= last; ++row) {
            const float centre = static_cast<float>(row) + 0.5f;
            std::vector<size_t> remaining;
            for (const size_t edge : crossed)
                if (std::max(polygon[edge][Y], polygon[(edge + 1) % 4][Y]) > centre)
                    remaining.push_back(edge);
            crossed = remaining;
            while (!vertices.empty() && polygon[vertices.front()][Y] <= centre) {
                const size_t v = vertices.front();
                vertices.erase(vertices.begin());
                for (const size_t edge : {(v + 3) % 4, v}) {
                    const Corner& upper = polygon[v];
                    const Corner& lower = polygon[edge == v ? (v + 1) % 4 : edge];
                    if (lower[Y] <= centre) continue;
                    crossed.push_back(edge);
                    for (const int k : {X, U, V, A}) {
                        changes[edge][k] = (lower[k] - upper[k]) / (lower[Y] - upper[Y]);
                        values[edge][k] = upper[k] + changes[edge][k] * (centre - upper[Y]);
                    }
                }
            }
            std::stable_sort(crossed.begin(), crossed.end(),
                             [&](size_t a, size_t b) { return values[a][X] < values[b][X]; });
            if (IsInField(row))
                for (size_t i = 0; i + 1 < crossed.size(); i += 2)
                    Span(row, values[crossed[i]], values[crossed[i + 1]]);
            for (const size_t edge : crossed)
                for (const int k : {X, U, V, A}) values[edge][k] += changes[edge][k];
        }
    }
};

float OrTiny(float length) {
    return length == 0 ? 1e-09f : length;
}

/// The corner's two coordinates from `k` on, moved along the bisector.
void Move(const Corner& before, const Corner& corner, const Corner& after, int k, float feather,
          Corner& moved) {
    float sum[2] = {0, 0};
    for (const Corner* neighbour : {&before, &after}) {
        const float x = (*neighbour)[k] - corner[k], y = (*neighbour)[k + 1] - corner[k + 1];
        const float length = OrTiny(std::sqrt(x * x + y * y));
        sum[0] += x / length;
        sum[1] += y / length;
    }
    const float x = sum[0] / 2, y = sum[1] / 2;
    const float length = OrTiny(std::sqrt(x * x + y * y));
    moved[k] = corner[k] + x / length * feather;
    moved[k + 1] = corner[k + 1] + y / length * feather;
}

} // namespace

void DrawQuadWarp(const QuadWarp& warp) {
    const Painter painter{warp};
    Polygon outer;
    for (int i = 3; i >= 0; --i)
        outer.push_back({static_cast<float>(warp.destinationQuad[2 * i]),
                         static_cast<float>(warp.destinationQuad[2 * i + 1]),
                         static_cast<float>(warp.sourceQuad[2 * i]),
                         static_cast<float>(warp.sourceQuad[2 * i + 1]), 255});
    if (!(warp.feather > 0)) {
        painter.Fill(outer);
        return;
    }
    Polygon inner = outer;
    for (size_t i = 0; i < 4; ++i) {
        Move(outer[(i + 3) % 4], outer[i], outer[(i + 1) % 4], X, warp.feather, inner[i]);
        Move(outer[(i + 3) % 4], outer[i], outer[(i + 1) % 4], U, warp.feather, inner[i]);
    }
    painter.Fill(inner);
    if (!painter.IsBilinear()) return;
    for (Corner& corner : outer) corner[A] = 0;
    for (size_t i = 0; i < 4; ++i) painter.Fill({outer[i], outer[(i + 1) % 4], inner[(i + 1) % 4], inner[i]});
}

} // namespace PKReference
