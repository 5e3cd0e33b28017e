#include "Centring.h"

#include <algorithm>
#include <cstring>

namespace tool {
namespace {

/// Pixels or rows from one picture to another.
struct Range {
    Range(int32_t from, int32_t to)
        : source(std::max(0, (from - to) / 2)), destination(std::max(0, (to - from) / 2)),
          count(std::min(from, to)) {}

    int32_t source, destination, count;
};

} // namespace

Frame Centred(const Frame& picture, int32_t width, int32_t height) {
    Frame result(picture.Format(), width, height);
    Require(PK_FillWithOpaqueBlack(result.Pixels(), result.RowBytes(), width, height, result.Format()),
            "fill", result);
    const Range columns(picture.Width(), width), rows(picture.Height(), height);
    const auto bytes = [&](int32_t pixels) {
        return static_cast<size_t>(PK_PixelFormatPackedRowBytes(picture.Format(), pixels));
    };
    for (int32_t row = 0; row < rows.count; ++row)
        std::memcpy(result.Row(rows.destination + row) + bytes(columns.destination),
                    picture.Row(rows.source + row) + bytes(columns.source), bytes(columns.count));
    return result;
}

} // namespace tool
