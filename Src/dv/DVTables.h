#pragma once

// The numbers of the quantisation of DV: the orders of coefficients, weights, and steps.
//
// A coefficient has the place 8 v + h in its block, for column h and line v. In the scan, places 0 to 5 are area 0, 6 to
// 20 area 1, 21 to 42 area 2 and the others area 3.

#include "primitives/DVHuffman.h"

#include <array>
#include <cstdint>

namespace PK {

inline constexpr int32_t kCoefficients = 64;
inline constexpr int32_t kDVAreas = 4;
inline constexpr int32_t kDVClasses = 4;
inline constexpr int32_t kDVQuantisers = 16; ///< values of QNO

/// By mode: 8-8 and 2-4-8.
inline constexpr int32_t kDVModes = 2;
inline constexpr DVScan kScan[kDVModes] = {
    {0,  1,  8,  16, 9,  2,  3,  10, 17, 24, 32, 25, 18, 11, 4,  5,  12, 19, 26, 33, 40, 48,
     41, 34, 27, 20, 13, 6,  7,  14, 21, 28, 35, 42, 49, 56, 57, 50, 43, 36, 29, 22, 15, 23,
     30, 37, 44, 51, 58, 59, 52, 45, 38, 31, 39, 46, 53, 60, 61, 54, 47, 55, 62, 63},
    {0,  32, 1,  33, 8,  40, 2,  34, 9,  41, 16, 48, 24, 56, 17, 49, 10, 42, 3,  35, 4,  36,
     11, 43, 18, 50, 25, 57, 26, 58, 19, 51, 12, 44, 5,  37, 6,  38, 13, 45, 20, 52, 27, 59,
     28, 60, 21, 53, 14, 46, 7,  39, 15, 47, 22, 54, 29, 61, 30, 62, 23, 55, 31, 63},
};

/// The first place of the scan behind each area.
inline constexpr int32_t kAreaEnds[kDVAreas] = {6, 21, 43, 64};

constexpr int32_t AreaOf(int32_t scanPlace) {
    int32_t area = 0;
    while (scanPlace >= kAreaEnds[area]) ++area;
    return area;
}

/// By class and QNO, a row of kDVRowShifts.
inline constexpr uint8_t kDVQuantRow[kDVClasses][kDVQuantisers] = {
    {5, 5, 4, 4, 3, 3, 2, 2, 1, 0, 0, 0, 0, 0, 0, 0},
    {7, 6, 6, 5, 5, 4, 4, 3, 3, 2, 2, 1, 0, 0, 0, 0},
    {8, 8, 7, 7, 6, 6, 5, 5, 4, 4, 3, 3, 2, 2, 1, 0},
    {13, 12, 12, 8, 8, 11, 11, 6, 6, 5, 5, 4, 4, 10, 9, 9},
};

inline constexpr int32_t kDVQuantRows = 14;

/// The steps of the areas, as powers of two.
inline constexpr uint8_t kDVRowShifts[kDVQuantRows][kDVAreas] = {
    {0, 0, 0, 0}, {0, 0, 0, 1}, {0, 0, 1, 1}, {0, 1, 1, 2}, {1, 1, 2, 2}, {1, 2, 2, 3}, {2, 2, 3, 3},
    {2, 3, 3, 4}, {3, 3, 4, 4}, {1, 1, 1, 1}, {1, 1, 1, 2}, {2, 3, 3, 4}, {3, 4, 4, 5}, {4, 4, 5, 5},
};

/// W(0) to W(7) of the weights, with c(m) = cos(m pi / 16): 1, c4 / (4 c7 c2), c4 / (2 c6), 1 / (2 c5), 7/8, c4 / c3,
/// c4 / c2, c4 / c1. The weight of an AC coefficient is W(h) W(v) / 2, or W(h) W(2 (v mod 4)) / 2 in 2-4-8 mode.
inline constexpr double kDVWeights[8] = {1.0,   0.9807852804032303, 0.9238795325112866, 0.8999762231364156,
                                         0.875, 0.8504300947672565, 0.7653668647301796, 0.720959822006948};

/// W(h) W(v), in its mode, of a place in the block.
constexpr double WeightProduct(int32_t mode, int32_t place) {
    const int32_t h = place % 8, v = place / 8;
    return kDVWeights[h] * kDVWeights[mode == 0 ? v : 2 * (v % 4)];
}

using DVFactors = std::array<int16_t, kCoefficients>;

/// What a level is multiplied by, in 256ths, by mode and row: the step, and the inverse of half the weight. DC, whose step
/// is 4, has half of it here.
inline constexpr float kDVDequantUnit = 256;
inline constexpr auto kDVDequant = [] {
    std::array<std::array<DVFactors, kDVQuantRows>, kDVModes> factors{};
    for (int32_t mode = 0; mode < kDVModes; ++mode)
        for (int32_t row = 0; row < kDVQuantRows; ++row)
            for (int32_t i = 0; i < kCoefficients; ++i) {
                const int32_t place = kScan[mode][i];
                const auto factor = static_cast<int32_t>(512 / WeightProduct(mode, place));
                const int32_t shift = i == 0 ? 0 : kDVRowShifts[row][AreaOf(i)];
                factors[mode][row][place] = static_cast<int16_t>(factor << shift);
            }
    return factors;
}();

/// The right shifts of areas 0 to 3 in bytes 0 to 3, at class + 4 QNO.
inline constexpr auto kAreaShift = [] {
    std::array<uint32_t, kDVClasses * kDVQuantisers> words{};
    for (int32_t i = 0; i < kDVClasses * kDVQuantisers; ++i) {
        const auto& shifts = kDVRowShifts[kDVQuantRow[i % kDVClasses][i / kDVClasses]];
        for (int32_t area = 0; area < kDVAreas; ++area) words[i] |= uint32_t{shifts[area]} << (8 * area);
    }
    return words;
}();
static_assert(kAreaShift[0] == 0x03020201 && kAreaShift[3] == 0x05050404 && kAreaShift[63] == 0x01010101);

/// The weights of the forward transforms as 16-bit fractions, those of AC rounded before they are halved; 1/4 for DC. The
/// one weight of 1/2, of the difference of the fields, does not fit a signed value: it stands there as -1/2, and who weighs
/// turns the sign of the product back, which so is as exact as the others.
inline constexpr auto kForwardWeights = [] {
    std::array<DVFactors, kDVModes> weights{};
    for (int32_t mode = 0; mode < kDVModes; ++mode)
        for (int32_t place = 0; place < kCoefficients; ++place) {
            const auto whole = static_cast<int32_t>(65536 * WeightProduct(mode, place) + 0.5);
            weights[mode][place] = static_cast<int16_t>(place == 0 ? 16384 : whole / 2);
        }
    return weights;
}();
inline constexpr const DVFactors& kWeights88 = kForwardWeights[0];
inline constexpr const DVFactors& kWeights248 = kForwardWeights[1];
static_assert(kWeights88[2] == 30273 && kWeights88[7] == 23624 && kWeights88[9] == 31521 &&
              kWeights88[11] == 28924);
static_assert(kWeights248[32] == INT16_MIN && kWeights248[8] == 30273 && kWeights248[10] == 27969 &&
              kWeights248[15] == 21826);

/// DV100: what a step is multiplied by, in parts of this unit, by place: of luma and of chroma for 1080 lines, and then for 720.
/// Chroma of 720 at column 5, line 4 is not as its mirror; streams have it so.
inline constexpr float kDV100WeightUnit = 32;
inline constexpr DVFactors kDV100Weights[4] = {
    {128, 16, 17, 18,  18, 19, 42, 44, 16, 17, 18,  18,  19, 38, 43, 45, 17,  18,  19,  19, 40, 41,
     45,  48, 18, 18,  19, 40, 41, 42, 46, 49, 18,  19,  40, 41, 42, 43, 48,  101, 19,  38, 41, 42,
     43,  44, 98, 104, 42, 43, 45, 46, 48, 98, 109, 116, 44, 45, 48, 49, 101, 104, 116, 123},
    {128, 16,  17,  25,  26, 26, 42, 44, 16,  17,  25,  25,  26, 38, 43, 91,  17,  25,  26,  27, 40, 41,
     91,  96,  25,  25,  27, 40, 41, 84, 93,  197, 26,  26,  40, 41, 84, 86,  191, 203, 26,  38, 41, 84,
     86,  177, 197, 209, 42, 43, 91, 93, 191, 197, 219, 232, 44, 91, 96, 197, 203, 209, 232, 246},
    {128, 16, 17,  18,  18, 19, 42, 44, 16, 17,  18,  18,  19, 38, 43, 68, 17,  18,  19,  19, 40, 41,
     68,  96, 18,  18,  19, 40, 41, 63, 92, 98,  18,  19,  40, 41, 63, 86, 96,  202, 19,  38, 41, 63,
     86,  88, 196, 208, 42, 43, 68, 92, 96, 196, 218, 232, 44, 68, 96, 98, 202, 208, 232, 246},
    {128, 24,  26,  36,  36, 38, 84,  88,  24,  26,  36,  36,  38, 76,  86,  182, 26,  36,  38,  38, 80, 82,
     182, 192, 36,  36,  38, 80, 82,  168, 186, 394, 36,  38,  80, 82,  168, 192, 382, 406, 38,  76, 82, 168,
     172, 354, 394, 418, 84, 86, 182, 186, 382, 394, 438, 464, 88, 182, 192, 394, 406, 418, 464, 492},
};

/// DV100: the step of each QNO.
inline constexpr uint8_t kDV100Steps[kDVQuantisers] = {1, 1, 2, 3, 4, 5, 6, 7, 8, 16, 18, 20, 22, 24, 28, 52};

/// A quantiser of DV100: what all levels are divided by, and the QNO and class that say so.
struct DV100Quantiser {
    int16_t step;
    uint8_t qno, classNumber;
};

/// By rising step: all that there are up to 96, and two coarse ones. The last is the coarsest there is.
inline constexpr DV100Quantiser kDV100QNO[] = {
    {1, 1, 0},   {2, 2, 0},   {3, 3, 0},   {4, 4, 0},   {5, 5, 0},   {6, 6, 0},    {7, 7, 0},    {8, 8, 0},
    {10, 5, 1},  {12, 6, 1},  {14, 7, 1},  {16, 9, 0},  {18, 10, 0}, {20, 11, 0},  {22, 12, 0},  {24, 13, 0},
    {28, 14, 0}, {32, 9, 1},  {36, 10, 1}, {40, 11, 1}, {44, 12, 1}, {48, 13, 1},  {52, 15, 0},  {56, 14, 1},
    {64, 9, 2},  {72, 10, 2}, {80, 11, 2}, {88, 12, 2}, {96, 13, 2}, {192, 13, 3}, {416, 15, 3},
};

} // namespace PK
