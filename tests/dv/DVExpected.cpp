#include "dv/DVExpected.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <sstream>

namespace PKTest {
namespace {

/// Of 4:1:1, with weights 4-0, 3-1, 2-2 and 1-3, cut.
int ChromaOf411(const DVPlane& plane, int x, int y) {
    const int k = x / 4, j = x % 4;
    const int left = plane.At(k, y), right = plane.At(std::min(k + 1, plane.width - 1), y);
    return ((4 - j) * left + j * right) >> 2;
}

/// Of 4:2:0 in one column of chroma: a sample lies half-way between two lines of its field.
int ChromaOf420(const DVPlane& plane, int column, int y) {
    const int field = y % 2, line = y / 2, own = line / 2, last = plane.height / 2 - 1;
    const int other = std::clamp(line % 2 == 0 ? own - 1 : own + 1, 0, last);
    return (6 * plane.At(column, 2 * own + field) + 2 * plane.At(column, 2 * other + field) + 4) >> 3;
}

int ChromaOf(DVKind kind, const DVPlane& plane, int x, int y) {
    const DVLayout& layout = LayoutOf(kind);
    if (layout.lumaPerChromaX == 4) return ChromaOf411(plane, x, y);
    if (layout.lumaPerChromaY == 1) return plane.At(x / 2, y);
    const int here = ChromaOf420(plane, x / 2, y);
    if (x % 2 == 0) return here;
    return (here + ChromaOf420(plane, std::min(x / 2 + 1, plane.width - 1), y) + 1) >> 1;
}

} // namespace

DVPixels DVExpectedPixels(DVKind kind, const DVPicture& picture) {
    const auto& [luma, cb, cr] = picture.planes;
    DVPixels pixels(luma.width, luma.height);
    for (int y = 0; y < luma.height; ++y)
        for (int x = 0; x < luma.width; ++x)
            pixels.At(x, y) = {luma.At(x, y), ChromaOf(kind, cb, x, y), ChromaOf(kind, cr, x, y)};
    return pixels;
}

DVPixels OneFieldOf(const DVPixels& frame, int first) {
    DVPixels field(frame.width, frame.height / 2);
    for (int y = 0; y < field.height; ++y)
        for (int x = 0; x < field.width; ++x) field.At(x, y) = frame.At(x, 2 * y + first);
    return field;
}

DVDecoded DecodeDV(PK_PixelFormat stream, const uint8_t* frame, PK_PixelFormat format, int width, int height,
                   int quality) {
    constexpr size_t kPadding = 36;
    constexpr uint8_t kUntouched = 0xa5;
    const auto length = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
    const size_t step = length + kPadding;
    std::vector<uint8_t> memory(step * static_cast<size_t>(height), kUntouched);
    DVDecoded decoded{PK_Convert(frame, 0, stream, memory.data(), static_cast<int32_t>(step), format, width,
                                 height, quality),
                      {}};
    for (size_t at = 0; at < memory.size(); at += step) {
        const auto row = memory.begin() + static_cast<ptrdiff_t>(at),
                   end = row + static_cast<ptrdiff_t>(length);
        decoded.rows.insert(decoded.rows.end(), row, end);
        EXPECT_EQ(std::count(end, end + kPadding, kUntouched), static_cast<ptrdiff_t>(kPadding))
            << "padding of row " << at / step;
    }
    const auto untouched = std::count(decoded.rows.begin(), decoded.rows.end(), kUntouched);
    EXPECT_TRUE(decoded.result == PK_Success || untouched == static_cast<ptrdiff_t>(decoded.rows.size()))
        << "a refused frame wrote";
    return decoded;
}

DVPixels DVPixelsFromMemory(const std::vector<uint8_t>& rows, PK_PixelFormat format, int width, int height) {
    DVPixels pixels(width, height);
    const auto rowBytes = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
    const bool is422 = (format & 0x30) == 0x10, isYUYV = (format & 0x1000) != 0;
    for (int y = 0; y < height; ++y) {
        const int inMemory = PK_IsOriginBottomLeft(format) ? height - 1 - y : y;
        const uint8_t* const row = &rows.at(rowBytes * static_cast<size_t>(inMemory));
        for (int x = 0; x < width; ++x) {
            const uint8_t* const pair = row + x / 2 * 4;
            const uint8_t* const pixel = row + x * 4;
            if (!is422)
                pixels.At(x, y) = {pixel[2], pixel[1], pixel[0]};
            else if (isYUYV)
                pixels.At(x, y) = {pair[x % 2 * 2], pair[1], pair[3]};
            else
                pixels.At(x, y) = {pair[x % 2 * 2 + 1], pair[0], pair[2]};
        }
    }
    return pixels;
}

std::string DVDifference(const DVPixels& expected, const DVPixels& actual, bool is422, int tolerance) {
    if (expected.width != actual.width || expected.height != actual.height) return "another size";
    int worst = 0;
    size_t count = 0;
    std::ostringstream where;
    for (int y = 0; y < expected.height; ++y)
        for (int x = 0; x < expected.width; ++x)
            for (size_t i = 0; i < 3; ++i) {
                if (is422 && i > 0 && x % 2 == 1) continue;
                const int right = expected.At(x, y)[i], is = actual.At(x, y)[i];
                const int off = std::abs(right - is);
                if (off <= tolerance) continue;
                ++count;
                if (off <= worst) continue;
                worst = off;
                where.str("");
                where << "YUV"[i] << " at " << x << ", " << y << ": expected " << right << ", is " << is;
            }
    if (count == 0) return "";
    where << "; " << count << " samples are off by more than " << tolerance;
    return where.str();
}

} // namespace PKTest
