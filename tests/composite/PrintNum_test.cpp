// PK_PrintNum: where strokes stand, in what ink, and that nothing else changes.

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"
#include "support/FlagScope.h"
#include "support/GuardedRows.h"
#include "support/Random.h"

#include <PixelKiln/Buffers.h>
#include <PixelKiln/Overlay.h>

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

using namespace PKTest;

namespace {

using Unit = std::vector<uint8_t>;

Unit Bytes(std::initializer_list<int> values) {
    Unit unit;
    for (const int value : values) unit.push_back(static_cast<uint8_t>(value));
    return unit;
}

Unit Floats(std::initializer_list<float> values) {
    Unit unit(4 * values.size());
    std::memcpy(unit.data(), std::data(values), unit.size());
    return unit;
}

/// The ink of a raster format, as tabled.
Unit InkOf(PK_PixelFormat format) {
    const bool is8u = (format & 0x1c0) == 0, isTurned = (format & 0x1000) != 0, isYUV = (format & 1) != 0;
    if ((format & 0x30) == 0x10) {
        if (is8u) return isTurned ? Bytes({0x51, 0x5a, 0x51, 0xef}) : Bytes({0x5a, 0x5a, 0xef, 0x51});
        return isTurned ? Floats({0.299f, -0.168736f, 0.299f, 0.5f})
                        : Floats({-0.168736f, 0.299f, 0.5f, 0.299f});
    }
    if (isYUV) {
        if (is8u) return isTurned ? Bytes({0xff, 0x51, 0x5a, 0xef}) : Bytes({0xef, 0x5a, 0x51, 0xff});
        return isTurned ? Floats({1.0f, 0.299f, -0.168736f, 0.5f}) : Floats({0.5f, -0.168736f, 0.299f, 1.0f});
    }
    if (is8u) return isTurned ? Bytes({255, 255, 0, 0}) : Bytes({0, 0, 255, 255});
    return isTurned ? Floats({1, 1, 0, 0}) : Floats({0, 0, 1, 1});
}

struct Line {
    int column, row, length;
    bool isHorizontal;
};

struct Request {
    int32_t width, height, number;
    float size;
    PK_Point position;
    bool decimal;
};

/// All strokes of a request, from the tables: glyphs by segment number.
std::vector<Line> StrokesOf(const Request& request) {
    static const std::map<char, std::string> glyphs = {
        {'0', "123456"}, {'1', "23"},    {'2', "12754"},   {'3', "12734"}, {'4', "2367"},   {'5', "16734"},
        {'6', "134567"}, {'7', "123"},   {'8', "1234567"}, {'9', "12367"}, {'a', "123567"}, {'b', "34567"},
        {'c', "457"},    {'d', "23457"}, {'e', "16754"},   {'f', "1567"}};
    char text[16];
    const int n = std::snprintf(text, sizeof text, request.decimal ? "%d" : "%x", request.number);
    const auto width = static_cast<float>(request.width), height = static_cast<float>(request.height);
    int cell = static_cast<int>(request.size * width) / 2 * 2;
    const int startX = static_cast<int>(std::max(request.position.x * width, 4.0f));
    const int startY = static_cast<int>(std::max(request.position.y * height, 4.0f));
    if (request.width < cell * (n + 1) + startX) cell = (request.width - startX) / (n + 1);
    if (request.height < startY + 2 * cell) cell = (request.height - startY) / 2;
    const int L = cell * 3 / 4 / 2 * 2;
    std::vector<Line> lines;
    for (int i = 0; i < n; ++i) {
        const auto glyph = glyphs.find(text[i]);
        const int x = startX + i * cell, y = startY;
        const Line segments[7] = {{x, y, L, true},         {x + L, y, L, false}, {x + L, y + L, L, false},
                                  {x, y + 2 * L, L, true}, {x, y + L, L, false}, {x, y, L, false},
                                  {x, y + L, L, true}};
        for (const char segment : glyph == glyphs.end() ? "147" : glyph->second)
            lines.push_back(segments[segment - '1']);
    }
    return lines;
}

/// The places, as row and column, that lines cover on a plane that has `divisor` columns (and rows) of the
/// picture in one.
std::set<std::pair<int, int>> Covered(const std::vector<Line>& lines, int columnDivisor, int rowDivisor) {
    std::set<std::pair<int, int>> places;
    for (const Line& line : lines) {
        const int column = line.column / columnDivisor, row = line.row / rowDivisor;
        if (line.isHorizontal)
            for (int i = 0; i < line.length / columnDivisor; ++i) places.emplace(row, column + i);
        else
            for (int i = 0; i < line.length / rowDivisor; ++i) places.emplace(row + i, column);
    }
    return places;
}

PK_Result Print(void* buffer, int32_t rowBytes, PK_PixelFormat format, const Request& request) {
    return PK_PrintNum(buffer, rowBytes, format, request.width, request.height, request.number, request.size,
                       request.position, request.decimal);
}

/// Prints into an image between guard pages and compares every byte.
void CheckRaster(PK_PixelFormat format, const Request& request, bool upward, Random& random) {
    SCOPED_TRACE(testing::Message() << std::hex << "0x" << format << std::dec << ", " << request.width
                                    << " x " << request.height << ", number " << request.number << ", size "
                                    << request.size << " at " << request.position.x << ", "
                                    << request.position.y << ", seed " << random.Seed());
    const int pixels = PK_PixelFormatPackedRowBytes(format, request.width),
              step = pixels + 12 * static_cast<int>(random.Below(2));
    const int extent = request.height == 0 ? 0 : (request.height - 1) * step + pixels;
    const GuardedRows memory(static_cast<size_t>(extent),
                             random.Below(2) != 0 ? Guard::kAfter : Guard::kBefore);
    random.Fill(memory.Bytes(), memory.Size());
    std::vector<uint8_t> expected(memory.Bytes(), memory.Bytes() + memory.Size());

    const Unit ink = InkOf(format);
    const bool is422 = (format & 0x30) == 0x10;
    const bool isFirstRowInMemoryAtTop = upward == PK_IsOriginBottomLeft(format);
    for (const auto& [row, column] : Covered(StrokesOf(request), is422 ? 2 : 1, 1)) {
        const int end = (column + 1) * static_cast<int>(ink.size());
        if (row >= request.height || end > pixels) continue;
        const int memoryRow = isFirstRowInMemoryAtTop ? row : request.height - 1 - row;
        std::copy(ink.begin(), ink.end(),
                  expected.begin() + memoryRow * step + end - static_cast<int>(ink.size()));
    }
    uint8_t* first = memory.Bytes() + (upward && request.height > 0 ? (request.height - 1) * step : 0);
    ASSERT_EQ(Print(first, upward ? -step : step, format, request), PK_Success);
    for (size_t i = 0; i < expected.size(); ++i)
        ASSERT_EQ(memory.Bytes()[i], expected[i])
            << "byte " << i << ", row in memory " << i / static_cast<size_t>(step);
}

void CheckPlanar(PK_PixelFormat format, const Request& request, Random& random) {
    SCOPED_TRACE(testing::Message() << request.width << " x " << request.height << ", number "
                                    << request.number << ", seed " << random.Seed());
    const GuardedRows memory(static_cast<size_t>(PK_PixelFormatSize(format, request.width, request.height)),
                             Guard::kAfter);
    random.Fill(memory.Bytes(), memory.Size());
    std::vector<uint8_t> expected(memory.Bytes(), memory.Bytes() + memory.Size());
    void* planes[3];
    int32_t rowBytes[3];
    ASSERT_EQ(PK_GetPlanarBuffers(expected.data(), format, request.width, request.height, planes, rowBytes),
              PK_Success);
    const uint8_t ink[3] = {0x51, 0x5a, 0xef};
    for (int i = 0; i < 3; ++i) {
        const int divisor = i == 0 ? 1 : 2;
        for (const auto& [row, column] : Covered(StrokesOf(request), divisor, divisor))
            if (row < request.height / divisor && column < request.width / divisor)
                static_cast<uint8_t*>(planes[i])[row * rowBytes[i] + column] = ink[i];
    }
    ASSERT_EQ(Print(memory.Bytes(), static_cast<int32_t>(random.Next()), format, request), PK_Success);
    for (size_t i = 0; i < expected.size(); ++i) ASSERT_EQ(memory.Bytes()[i], expected[i]) << "byte " << i;
}

Request DrawRequest(Random& random) {
    const auto fraction = [&] {
        return static_cast<float>(random.Below(65)) / 64.0f * (random.Below(3) == 0 ? 0.9f : 1.0f);
    };
    const auto place = [&] { return fraction() * (random.Below(2) != 0 ? 0.25f : 1.0f); };
    Request request = {};
    request.width = static_cast<int32_t>(random.Below(150));
    request.height = static_cast<int32_t>(random.Below(70));
    request.number = static_cast<int32_t>(random.Below(4) == 0 ? random.Below(200) - 100 : random.Next());
    request.size = fraction();
    request.position = {place(), place()};
    request.decimal = random.Below(2) != 0;
    return request;
}

/// A picture of one byte a pixel: '#' where a BGRA image became red.
std::vector<std::string> Art(const Request& request) {
    std::vector<uint32_t> pixels(static_cast<size_t>(request.width * request.height));
    EXPECT_EQ(Print(pixels.data(), 4 * request.width, PK_PixelFormat_BGRX_4444_8u, request), PK_Success);
    std::vector<std::string> rows;
    for (int32_t row = request.height - 1; row >= 0; --row) { // stored bottom-up
        std::string text;
        for (int32_t column = 0; column < request.width; ++column)
            text += pixels[static_cast<size_t>(row * request.width + column)] == 0xffff0000 ? '#' : '.';
        rows.push_back(text);
    }
    return rows;
}

constexpr PK_PixelFormat kReversedVUYA8 = 0x1805, kReversedVUYA32 = 0x1905;

} // namespace

TEST(PrintNum, MinusTwelveIsThreeBarsOneAndTwo) {
    // cell = 0.2 x 48 = 9, made even 8; L = 6; characters at columns 4, 12 and 20 from row 4
    const std::vector<std::string> expected = {
        "................................................", //
        "................................................", //
        "................................................", //
        "................................................", //
        "....######........#.#######.....................", //
        "..................#.......#.....................", //
        "..................#.......#.....................", //
        "..................#.......#.....................", //
        "..................#.......#.....................", //
        "..................#.......#.....................", //
        "....######........#.######......................", //
        "..................#.#...........................", //
        "..................#.#...........................", //
        "..................#.#...........................", //
        "..................#.#...........................", //
        "..................#.#...........................", //
        "....######..........######......................", //
        "................................................", //
        "................................................", //
        "................................................", //
    };
    EXPECT_EQ(Art({48, 20, -12, 0.2f, {0, 0}, true}), expected);
}

TEST(PrintNum, HexadecimalIsLowerCaseAndWithoutSign) {
    EXPECT_EQ(StrokesOf({200, 60, 255, 0.1f, {0, 0}, false}).size(), 8u);      // two f of four strokes each
    const std::vector<std::string> f = Art({24, 20, 15, 0.3f, {0, 0}, false}); // cell 6, L 4
    EXPECT_EQ(f[4], "....####................");
    EXPECT_EQ(f[6], "....#...................");
    EXPECT_EQ(f[8], "....####................");
    EXPECT_EQ(f[11], "....#...................");
    EXPECT_EQ(f[12], "........................");
    // -1 is eight f, INT32_MIN an 8 and seven 0
    EXPECT_EQ(Art({200, 40, -1, 0.05f, {0, 0}, false}),
              Art({200, 40, static_cast<int32_t>(0xffffffff), 0.05f, {0, 0}, false}));
    EXPECT_NE(Art({200, 40, -1, 0.05f, {0, 0}, false}), Art({200, 40, -1, 0.05f, {0, 0}, true}));
}

TEST(PrintNum, ShrinksTheCellToFitTenDigits) {
    // (100 - 4) / 11 = 8, L = 6: the last of ten begins at column 76
    const std::vector<std::string> rows = Art({100, 40, 1111111111, 0.5f, {0, 0}, true});
    std::string expected(100, '.');
    for (size_t i = 0; i < 10; ++i) expected[4 + 8 * i + 6] = '#';
    EXPECT_EQ(rows[4], expected);
    EXPECT_EQ(rows[15], expected);
    EXPECT_EQ(rows[16], std::string(100, '.'));
    EXPECT_EQ(rows[3], std::string(100, '.'));
}

TEST(PrintNum, EveryRasterFormatGetsItsInkAndNothingElse) {
    Random random(462);
    const FlagScope flags;
    for (PK_PixelFormat format : PK::kRasterFormats) {
        if ((format & PK::kDepthMask) == PK::kDepth15u) continue;
        for (const bool allTopLeft : {false, true}) {
            PK::sAllOriginsTopLeft = allTopLeft;
            for (const bool upward : {false, true}) {
                CheckRaster(format, {60, 30, 1234567890, 0.2f, {0.1f, 0.1f}, true}, upward, random);
                CheckRaster(format, {121, 30, 0x2abcdef, 0.15f, {0.1f, 0.3f}, false}, upward, random);
                for (int i = 0; i < 20; ++i) CheckRaster(format, DrawRequest(random), upward, random);
            }
        }
    }
    for (const PK_PixelFormat format : {kReversedVUYA8, kReversedVUYA32})
        for (int i = 0; i < 20; ++i) CheckRaster(format, DrawRequest(random), false, random);
}

TEST(PrintNum, PlanesAreDrawnInTheirBlock) {
    Random random(463);
    for (PK_PixelFormat kind = 9; kind <= 12; ++kind)
        for (const PK_PixelFormat low : {0x831u, 0x031u, 0xa31u, 0x231u})
            for (int i = 0; i < 20; ++i) {
                Request request = DrawRequest(random);
                request.width += 130; // planes wider than the padding of rows
                request.height += 1;
                CheckPlanar(kind << 24 | low, request, random);
            }
}

TEST(PrintNum, EverySmallImageSurvives) {
    Random random(464);
    for (int32_t width = 0; width <= 14; ++width)
        for (int32_t height = 0; height <= 14; ++height)
            for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u,
                                                PK_PixelFormat_V210_422_10u, PK_PixelFormat_RGB_444_10u})
                CheckRaster(
                    format,
                    {width, height, INT32_MIN, 1.0f, {random.Below(2) != 0 ? 1.0f : 0.0f, 0.5f}, true},
                    random.Below(2) != 0, random);
}

TEST(PrintNum, HeightsThatFloatCannotTellAreCutOff) {
    uint8_t row[4 * 64] = {}; // all rows are one
    const Request request = {64, INT32_MAX, 8, 0.5f, {0, 1.0f}, true};
    EXPECT_EQ(Print(row, 0, PK_PixelFormat_RGB_444_10u, request), PK_Success);
    EXPECT_EQ(Print(row, 0, PK_PixelFormat_BGRA_4444_8u, request), PK_Success);
    for (const uint8_t byte : row) ASSERT_EQ(byte, 0);
}

TEST(PrintNum, RefusesInOrderFormatSizesFractionsAndPointers) {
    uint8_t pixels[64] = {};
    const PK_PixelFormat fine = PK_PixelFormat_BGRA_4444_8u;
    const Request good = {4, 4, 1, 0.5f, {0.5f, 0.5f}, true};
    const auto with = [&](auto change) {
        Request request = good;
        change(request);
        return request;
    };
    const Request allBad = {-1, -1, 1, 2.0f, {2.0f, 2.0f}, true};
    for (const PK_PixelFormat format :
         {PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_XRGB_4444_15u, PK_PixelFormat_NTSCDV25,
          PK_PixelFormat_PALDV50, PK_PixelFormat_Invalid, PK_PixelFormat{0x0d000831},
          PK_PixelFormat{0x09000821}, PK_PixelFormat{0x09000830}, PK_PixelFormat{0x090008b1},
          PK_PixelFormat{0xffffffff}, PK_PixelFormat{0x30}, PK_PixelFormat{0x2004}})
        EXPECT_EQ(Print(nullptr, 0, format, allBad), PK_ErrBadDstFormat) << std::hex << format;

    EXPECT_EQ(Print(nullptr, 0, fine, allBad), PK_ErrBadPosX);
    EXPECT_EQ(Print(nullptr, 0, fine, with([](Request& r) { r.width = -1; })), PK_ErrBadPosX);
    EXPECT_EQ(Print(nullptr, 0, fine, with([](Request& r) {
                        r.height = r.width = -7;
                        r.width = 0;
                    })),
              PK_ErrBadPosY);
    constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
    for (const float bad : {-0.001f, 1.001f, kNaN, -HUGE_VALF, HUGE_VALF}) {
        EXPECT_EQ(Print(nullptr, 0, fine, with([bad](Request& r) { r.size = bad; })), PK_ErrFailed) << bad;
        EXPECT_EQ(Print(pixels, 16, fine, with([bad](Request& r) { r.position.x = bad; })), PK_ErrFailed)
            << bad;
        EXPECT_EQ(Print(pixels, 16, fine, with([bad](Request& r) { r.position.y = bad; })), PK_ErrFailed)
            << bad;
    }
    EXPECT_EQ(Print(nullptr, 16, fine, good), PK_ErrFailed);
    EXPECT_EQ(Print(nullptr, 16, fine, with([](Request& r) { r.width = 0; })), PK_Success);
    EXPECT_EQ(Print(nullptr, 16, fine, with([](Request& r) { r.height = 0; })), PK_Success);
    EXPECT_EQ(Print(pixels, 16, fine, with([](Request& r) { r.width = INT32_MAX / 16 + 1; })), PK_ErrFailed);
    EXPECT_EQ(Print(pixels, 16, PK_PixelFormat_YUV_420_MPEG2_FRAME,
                    with([](Request& r) { r.width = r.height = 40000; })),
              PK_ErrFailed); // 2.4e9 bytes
    EXPECT_EQ(Print(pixels, 16, fine, with([](Request& r) { r.size = r.position.x = r.position.y = 1.0f; })),
              PK_Success);
    for (const uint8_t byte : pixels) ASSERT_EQ(byte, 0);
}
