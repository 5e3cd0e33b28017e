#pragma once

// Video of 8 bits a sample: planes of 4:4:4 or 4:2:0, and scenes that formulas draw into either, each sample in its true
// place.

#include <cstddef>
#include <cstdint>
#include <functional>
#include <vector>

namespace ChromaBench {

struct Plane {
    Plane(int32_t theWidth, int32_t theHeight)
        : width(theWidth), height(theHeight),
          samples(static_cast<size_t>(theWidth) * static_cast<size_t>(theHeight)) {}

    uint8_t* Row(int32_t y) { return samples.data() + static_cast<ptrdiff_t>(y) * width; }
    const uint8_t* Row(int32_t y) const { return samples.data() + static_cast<ptrdiff_t>(y) * width; }

    int32_t width, height;
    std::vector<uint8_t> samples;
};

struct Video {
    Plane y, u, v;
};

/// Of 4:4:4, and of 4:2:0.
inline Video EmptyPixels(int32_t width, int32_t height) {
    return {{width, height}, {width, height}, {width, height}};
}
inline Video EmptyPlanes(int32_t width, int32_t height) {
    return {{width, height}, {width / 2, height / 2}, {width / 2, height / 2}};
}

/// Where chroma of 4:2:0 lies. In coordinates of pixels, whose centres are whole numbers, that of column k and row r lies
/// at x = 2 k on the left or 2 k + 1/2 in the centre, and y = 2 r + 1/2; of fields too, where row r belongs to the field of
/// the rows that are even or odd as it is.
struct Kind {
    const char* name;
    bool isCentred, areFields;

    double X(int32_t column) const { return 2.0 * column + (isCentred ? 0.5 : 0); }
    static double Y(int32_t row) { return 2.0 * row + 0.5; }
    /// That of a row of pixels or of chroma: 1 for the second field.
    int32_t Time(int32_t row) const { return areFields ? row % 2 : 0; }
};
inline constexpr Kind kLeft = {"Frames, chroma on the left", false, false};
inline constexpr Kind kCentred = {"Frames, centred chroma", true, false};
inline constexpr Kind kFields = {"Fields, chroma on the left", false, true};

struct Codes {
    double y, u, v;
};
/// What is seen at a place, at the time of the first field or the second.
using Scene = std::function<Codes(double x, double y, int32_t time)>;

Video PixelsOf(const Scene& scene, int32_t width, int32_t height, const Kind& kind);
Video PlanesOf(const Scene& scene, int32_t width, int32_t height, const Kind& kind);

/// The rows of one field, or of both in turns.
Video FieldOf(const Video& frame, int32_t field);
Video Interleaved(const Video& first, const Video& second);

} // namespace ChromaBench
