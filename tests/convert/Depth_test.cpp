// Changes of sample depth: every code, and for floats the borders of every code.

#include "support/KernelRows.h"

#include <cmath>
#include <cstring>
#include <limits>

namespace {

using namespace PKTest;
using enum PK::Kernel;
using PK::Kernel;
using PK::RowKernel;
using PK::Target;

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
constexpr float kHuge = std::numeric_limits<float>::max();

constexpr Kernel kPackBytes[] = {PackFrom32fRow_RGB_8u, PackFrom32fRow_VUYA_8u, PackFrom32fRow_UYVY_8u,
                                 PackFrom32fRow_YUYV_8u};

// Of 1 / 255, 1 / 224 and 1 / 219 the nearest floats.
constexpr float k255th = 0x1.010102p-8f, k224th = 0x1.24924ap-8f, k219th = 0x1.2b404ap-8f;

TEST(ExpandTo32fRow, MapsTheNamedCodes) {
    ExpectRow(ExpandTo32fRow_RGB_8u, 1, Bytes{0, 51, 255, 1}, Floats{0, 51 * k255th, 255 * k255th, k255th});
    ExpectRow(ExpandTo32fRow_VUYA_8u, 1, Bytes{240, 16, 235, 255},
              Floats{0.5f, -0.5f, 219 * k219th, 255 * k255th});
    ExpectRow(ExpandTo32fRow_VUYA_8u, 1, Bytes{16, 0, 16, 51}, Floats{-0.5f, -128 * k224th, 0, 51 * k255th});
    ExpectRow(ExpandTo32fRow_UYVY_8u, 2, Bytes{240, 16, 128, 235}, Floats{0.5f, 0, 0, 219 * k219th});
    ExpectRow(ExpandTo32fRow_YUYV_8u, 2, Bytes{16, 240, 235, 16}, Floats{0, 0.5f, 219 * k219th, -0.5f});
    ExpectRow(ExpandTo32fRow_RGB_15u, 1, Words{0, 16384, 32768, 65535},
              Floats{0, 0.5f, 1, 1.999969482421875f});
    ExpectRow(ExpandTo32fRow_RGB_15u, 1, Words{1, 2, 3, 4}, Floats{0x1p-15f, 0x2p-15f, 0x3p-15f, 0x4p-15f});
}

TEST(ExpandTo32fRow, MapsEveryCodeAtEveryPlace) {
    for (const Kernel kernel :
         {ExpandTo32fRow_RGB_8u, ExpandTo32fRow_VUYA_8u, ExpandTo32fRow_UYVY_8u, ExpandTo32fRow_YUYV_8u})
        ExpectReference(kernel, AllCodesAtEveryPlace<uint8_t>());
    ExpectReference(ExpandTo32fRow_RGB_15u, AllCodesAtEveryPlace<uint16_t>());
}

TEST(PackFrom32fRow, RoundsTheNamedValues) {
    // 127.5, 25.5 and 125.5 go to the even neighbour.
    ExpectRow(PackFrom32fRow_RGB_8u, 1, Floats{0, 0.5f, 1, 0.1f}, Bytes{0, 128, 255, 26});
    ExpectRow(PackFrom32fRow_VUYA_8u, 1, Floats{0, -0.5f, 0.5f, 0.5f}, Bytes{128, 16, 126, 128});
    ExpectRow(PackFrom32fRow_UYVY_8u, 2, Floats{0.5f, 1, -0.5f, 0}, Bytes{240, 235, 16, 16});
    ExpectRow(PackFrom32fRow_YUYV_8u, 1, Floats{1, 0.5f, 0, -0.5f}, Bytes{235, 240, 16, 16});
    ExpectRow(PackFrom32fRow_RGB_15u, 1, Floats{0, 0.5f, 1, 0x1p-16f}, Words{0, 16384, 32768, 1});
}

TEST(PackFrom32fRow, ClampsByValueAndMakesNaNZero) {
    for (const Kernel kernel : kPackBytes)
        for (const auto& [value, code] : {std::pair<float, uint8_t>{kInfinity, 255},
                                          {-kInfinity, 0},
                                          {kNaN, 0},
                                          {-kNaN, 0},
                                          {kHuge, 255},
                                          {-kHuge, 0},
                                          {3e9f, 255},
                                          {-3e9f, 0}})
            ExpectRow(kernel, 1, Floats(4, value), Bytes(4, code));
    ExpectRow(PackFrom32fRow_RGB_15u, 2,
              Floats{kInfinity, -kInfinity, kNaN, kHuge, -kHuge, 3e9f, -3e9f, -kNaN},
              Words{32768, 0, 0, 32768, 0, 32768, 0, 0});
}

TEST(PackFrom32fRow, RoundsTheBordersOfEveryCodeAtEveryPlace) {
    for (const auto& [scale, zero] : {std::pair{255.0f, 0.0f}, {224.0f, 128.0f}, {219.0f, 16.0f}})
        for (const Kernel kernel : kPackBytes)
            ExpectReference(kernel, CodeBordersAtEveryPlace(256, scale, zero));
    ExpectReference(PackFrom32fRow_RGB_15u, CodeBordersAtEveryPlace(32768, 32768));
}

/// Expands a row of bytes into a destination that starts `offset` bytes behind a 16-byte boundary.
Words ExpandAt(RowKernel body, const Bytes& codes, size_t offset) {
    alignas(16) static uint8_t buffer[16 + 8 * 1024];
    Words words(codes.size());
    body(codes.data(), buffer + offset, static_cast<int32_t>(codes.size() / 4));
    if (!words.empty()) std::memcpy(words.data(), buffer + offset, 2 * words.size());
    return words;
}

/// Calls check(name, body, hasBoundary) for all bodies, and for the reference of either rule.
template <class Check>
void ForEachExpansion(Check check) {
    ForEachBody(Expand8uTo15uRow,
                [&](Target target, RowKernel body) { check(body, target != Target::plain); });
    check([](const void* from, void* to,
             int32_t width) { RunExpected(Expand8uTo15uRow, false, from, to, width); },
          false);
    check([](const void* from, void* to,
             int32_t width) { RunExpected(Expand8uTo15uRow, true, from, to, width); },
          true);
}

TEST(Expand8uTo15uRow, TakesTheQuotientBeforeTheBoundaryAndRoundsBehindIt) {
    const Bytes codes = {1, 2, 254, 255, 1, 2, 254, 255, 0, 253, 3, 128};
    const Words quotients = {128, 257, 32639, 32768, 128, 257, 32639, 32768, 0, 32510, 385, 16448};
    const Words rounded = {129, 257, 32640, 32768, 129, 257, 32640, 32768, 0, 32511, 386, 16448};
    ForEachExpansion([&](RowKernel body, bool hasBoundary) {
        for (size_t offset = 0; offset < 16; ++offset) {
            const ptrdiff_t headPixels = !hasBoundary ? 3 : offset == 0 ? 0 : offset < 8 ? 2 : 1;
            Words expected(quotients.begin(), quotients.begin() + 4 * headPixels);
            expected.insert(expected.end(), rounded.begin() + 4 * headPixels, rounded.end());
            EXPECT_EQ(ExpandAt(body, codes, offset), expected) << "offset " << offset;
        }
    });
}

TEST(Expand8uTo15uRow, KeepsAHeadShorterThanTheWayToTheBoundary) {
    ForEachExpansion([](RowKernel body, bool) {
        EXPECT_EQ(ExpandAt(body, {1, 3, 254, 253}, 2), (Words{128, 385, 32639, 32510}));
        EXPECT_EQ(ExpandAt(body, {}, 2), Words{});
    });
}

TEST(Expand8uTo15uRow, MapsEveryCodeInHeadAndBulk) {
    const Bytes codes = AllCodesAtEveryPlace<uint8_t>();
    ForEachBody(Expand8uTo15uRow, [&](Target target, RowKernel body) {
        const auto expected = [&](const void* from, void* to, int32_t width) {
            RunExpected(Expand8uTo15uRow, HasVectorRule(Expand8uTo15uRow, target), from, to, width);
        };
        for (size_t i = 0; i < codes.size(); i += 4) {
            const Bytes row(4 * 21, codes[i]);
            Words words = ExpandAt(body, row, 8), wanted(words.size());
            alignas(16) uint8_t buffer[8 + 8 * 21];
            expected(row.data(), buffer + 8, 21);
            std::memcpy(wanted.data(), buffer + 8, 2 * wanted.size());
            ASSERT_EQ(words, wanted) << "code " << int{codes[i]};
        }
    });
}

TEST(Pack15uTo8uRow, RoundsTheNamedWords) {
    // 64 and 65 are 0.498 and 0.506; 255 / 32768 is a float, so that 16384 falls on the half 127.5
    ExpectRow(Pack15uTo8uRow, 2, Words{0, 64, 65, 129, 16384, 32768, 65535, 32767},
              Bytes{0, 0, 1, 1, 128, 255, 255, 255});
}

TEST(Pack15uTo8uRow, RoundsEveryWordAtEveryPlace) {
    ExpectReference(Pack15uTo8uRow, AllCodesAtEveryPlace<uint16_t>());
}

} // namespace
