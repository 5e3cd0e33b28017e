#include "Measures.h"

#include "Scenes.h"

#include <algorithm>
#include <cmath>

namespace ChromaBench {
namespace {

constexpr int32_t kBorder = 8; // pixels, where neighbours are missing

/// Adds up the errors of samples.
class Sum {
public:
    void Add(double error) {
        fSquares += error * error;
        fMost = std::max(fMost, std::abs(error));
        ++fCount;
    }
    Error Result() const { return {std::sqrt(fSquares / static_cast<double>(fCount)), fMost}; }

private:
    double fSquares = 0, fMost = 0;
    int64_t fCount = 0;
};

template <typename Place>
Error ErrorOf(const Video& video, int32_t border, Place place) {
    Sum sum;
    for (int32_t row = border; row < video.u.height - border; ++row)
        for (int32_t column = border; column < video.u.width - border; ++column) {
            const Codes exact = place(column, row);
            sum.Add(video.u.Row(row)[column] - exact.u);
            sum.Add(video.v.Row(row)[column] - exact.v);
        }
    return sum.Result();
}

} // namespace

Error ErrorOfPixels(const Video& pixels, const Scene& scene, const Kind& kind) {
    return ErrorOf(pixels, kBorder,
                   [&](int32_t column, int32_t row) { return scene(column, row, kind.Time(row)); });
}

Error ErrorOfPlanes(const Video& planes, const Scene& scene, const Kind& kind) {
    return ErrorOf(planes, kBorder / 2, [&](int32_t column, int32_t row) {
        return scene(kind.X(column), Kind::Y(row), kind.Time(row));
    });
}

Errors Measure(const Way& way, const Scene& scene, const Kind& kind) {
    const Video pixels = PixelsOf(scene, kSide, kSide, kind), planes = PlanesOf(scene, kSide, kSide, kind);
    const Video encoded = way.encode(pixels, kind);
    return {ErrorOfPixels(way.decode(planes, kind), scene, kind), ErrorOfPlanes(encoded, scene, kind),
            ErrorOfPixels(way.decode(encoded, kind), scene, kind)};
}

} // namespace ChromaBench
