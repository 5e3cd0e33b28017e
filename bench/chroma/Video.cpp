#include "Video.h"

#include <algorithm>
#include <cmath>

namespace ChromaBench {
namespace {

uint8_t Code(double value) {
    return static_cast<uint8_t>(std::lround(std::clamp(value, 0.0, 255.0)));
}

Plane RowsOf(const Plane& plane, int32_t first) {
    Plane rows(plane.width, (plane.height - first + 1) / 2);
    for (int32_t row = 0; row < rows.height; ++row)
        std::copy_n(plane.Row(2 * row + first), plane.width, rows.Row(row));
    return rows;
}

Plane InTurns(const Plane& first, const Plane& second) {
    Plane rows(first.width, first.height + second.height);
    for (int32_t row = 0; row < rows.height; ++row)
        std::copy_n((row % 2 == 0 ? first : second).Row(row / 2), rows.width, rows.Row(row));
    return rows;
}

void DrawLuma(const Scene& scene, const Kind& kind, Plane& luma) {
    for (int32_t y = 0; y < luma.height; ++y)
        for (int32_t x = 0; x < luma.width; ++x) luma.Row(y)[x] = Code(scene(x, y, kind.Time(y)).y);
}

} // namespace

Video PixelsOf(const Scene& scene, int32_t width, int32_t height, const Kind& kind) {
    Video video = EmptyPixels(width, height);
    DrawLuma(scene, kind, video.y);
    for (int32_t y = 0; y < height; ++y)
        for (int32_t x = 0; x < width; ++x) {
            const Codes codes = scene(x, y, kind.Time(y));
            video.u.Row(y)[x] = Code(codes.u);
            video.v.Row(y)[x] = Code(codes.v);
        }
    return video;
}

Video PlanesOf(const Scene& scene, int32_t width, int32_t height, const Kind& kind) {
    Video video = EmptyPlanes(width, height);
    DrawLuma(scene, kind, video.y);
    for (int32_t row = 0; row < video.u.height; ++row)
        for (int32_t column = 0; column < video.u.width; ++column) {
            const Codes codes = scene(kind.X(column), Kind::Y(row), kind.Time(row));
            video.u.Row(row)[column] = Code(codes.u);
            video.v.Row(row)[column] = Code(codes.v);
        }
    return video;
}

Video FieldOf(const Video& frame, int32_t field) {
    return {RowsOf(frame.y, field), RowsOf(frame.u, field), RowsOf(frame.v, field)};
}

Video Interleaved(const Video& first, const Video& second) {
    return {InTurns(first.y, second.y), InTurns(first.u, second.u), InTurns(first.v, second.v)};
}

} // namespace ChromaBench
