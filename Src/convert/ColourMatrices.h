#pragma once

// The colour matrices as data, each formula once, and the offsets of 8-bit codes around them: for every
// kernel that applies a matrix, alone or fused with its neighbours.
//
// A channel of Channels is a plane of kLanes samples: B, G, R, A or V, U, Y, A. Alpha passes unchanged. The
// 8-bit matrices work on code values, with the offsets of chroma and luma removed; the float matrices on
// samples, which have none.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// The coefficients of R, G and B, in this order.
struct RGBToYUVMatrix {
    float v[3];
    float u[3];
    float y[3];
};

inline constexpr RGBToYUVMatrix kRGB8ToYUV601 = {{0.43921486f, -0.36778906f, -0.07142578f},
                                                 {-0.14822266f, -0.29099220f, 0.43921486f},
                                                 {0.25678906f, 0.50412893f, 0.09790625f}};
inline constexpr RGBToYUVMatrix kRGB8ToYUV709 = {{0.43921569f, -0.39894217f, -0.04027352f},
                                                 {-0.10064373f, -0.33857197f, 0.43921569f},
                                                 {0.18258588f, 0.61423057f, 0.06200706f}};
inline constexpr RGBToYUVMatrix kRGBToYUV601 = {
    {0.5f, -0.418688f, -0.081312f}, {-0.168736f, -0.331264f, 0.5f}, {0.299f, 0.587f, 0.114f}};
inline constexpr RGBToYUVMatrix kRGBToYUV709 = {
    {0.5f, -0.454153f, -0.045847f}, {-0.114572f, -0.385428f, 0.5f}, {0.2126f, 0.7152f, 0.0722f}};
/// From float samples to 8-bit codes.
inline constexpr RGBToYUVMatrix kRGBToYUV8_601 = {
    {112, -93.78611f, -18.21389f}, {-37.79686f, -74.20313f, 112}, {65.481f, 128.553f, 24.966f}};
inline constexpr RGBToYUVMatrix kRGBToYUV8_709 = {
    {112, -101.73027f, -10.26973f}, {-25.66413f, -86.33588f, 112}, {46.5594f, 156.6288f, 15.8118f}};

struct YUVToRGBMatrix {
    float luma;
    float bFromU;
    float gFromU, gFromV;
    float rFromV;
};

inline constexpr YUVToRGBMatrix kYUV8ToRGB8_601 = {1.16438f, 2.01723f, -0.391762f, -0.812969f, 1.59603f};
inline constexpr YUVToRGBMatrix kYUV8ToRGB8_709 = {1.16438f, 2.1124f, -0.213249f, -0.532909f, 1.79274f};
/// What decoders of DV25 multiply by: the same to one more decimal.
inline constexpr YUVToRGBMatrix kDVToRGB8 = {1.1643828f, 2.0172305f, -0.39176172f, -0.81296873f, 1.5960274f};
/// From 8-bit codes to float samples.
inline constexpr YUVToRGBMatrix kYUV8ToRGB601 = {0.00456621f, 0.00791072f, -0.00153632f, -0.00318811f,
                                                 0.00625893f};
inline constexpr YUVToRGBMatrix kYUV8ToRGB709 = {0.00456621f, 0.00828393f, -0.00083627f, -0.00208984f,
                                                 0.00703036f};
inline constexpr YUVToRGBMatrix kYUVToRGB601 = {1, 1.772f, -0.344136f, -0.714136f, 1.402f};
inline constexpr YUVToRGBMatrix kYUVToRGB709 = {1, 1.8556f, -0.187324f, -0.468124f, 1.5748f};

/// Between BT.601 and BT.709, for codes and samples alike. The coefficient of luma is 1.
struct YUVToYUVMatrix {
    float yFromU, yFromV;
    float uFromU, uFromV;
    float vFromU, vFromV;
};

inline constexpr YUVToYUVMatrix kYUV601To709 = {-0.11554975f, -0.20793764f, 1.01863968f,
                                                0.11461795f,  0.07504945f,  1.02532709f};
inline constexpr YUVToYUVMatrix kYUV709To601 = {0.09931166f,  0.19169955f,  0.98985380f,
                                                -0.11065251f, -0.07245296f, 0.98339784f};

/// coefficient x, where a coefficient of 1 is no multiplication.
inline F32 Term(float coefficient, F32 x) {
    return coefficient == 1 ? x : Floats(coefficient) * x;
}

/// sum + coefficient x. A negative term is subtracted, as the formulas are written: under a directed rounding
/// mode this differs from adding the negative product.
inline F32 AddTerm(F32 sum, float coefficient, F32 x) {
    return coefficient < 0 ? sum - Floats(-coefficient) * x : sum + Floats(coefficient) * x;
}

inline F32 WeighRGB(const float (&coefficients)[3], Channels bgra) {
    const F32 red = Term(coefficients[0], bgra.c2);
    return AddTerm(AddTerm(red, coefficients[1], bgra.c1), coefficients[2], bgra.c0);
}

template <const RGBToYUVMatrix& kMatrix>
inline Channels RGBToYUV(Channels bgra) {
    return {WeighRGB(kMatrix.v, bgra), WeighRGB(kMatrix.u, bgra), WeighRGB(kMatrix.y, bgra), bgra.c3};
}

template <const YUVToRGBMatrix& kMatrix>
inline Channels YUVToRGB(Channels vuya) {
    const F32 luma = Term(kMatrix.luma, vuya.c2);
    return {AddTerm(luma, kMatrix.bFromU, vuya.c1),
            AddTerm(AddTerm(luma, kMatrix.gFromU, vuya.c1), kMatrix.gFromV, vuya.c0),
            AddTerm(luma, kMatrix.rFromV, vuya.c0), vuya.c3};
}

template <const YUVToYUVMatrix& kMatrix>
inline Channels YUVToYUV(Channels vuya) {
    return {AddTerm(Term(kMatrix.vFromU, vuya.c1), kMatrix.vFromV, vuya.c0),
            AddTerm(Term(kMatrix.uFromU, vuya.c1), kMatrix.uFromV, vuya.c0),
            AddTerm(AddTerm(vuya.c2, kMatrix.yFromU, vuya.c1), kMatrix.yFromV, vuya.c0), vuya.c3};
}

/// V, U, Y, A codes with chroma counted from 128 and luma from 16.
inline Channels RemoveOffsets(Channels vuya) {
    return {vuya.c0 - Floats(128), vuya.c1 - Floats(128), vuya.c2 - Floats(16), vuya.c3};
}

/// The same from integers, for results that are codes again: faster, and all that can differ is the sign of a
/// zero when rounding is set downwards.
inline Channels RemoveOffsets(IntChannels vuya) {
    return ToFloat(IntChannels{vuya.c0 - Ints(128), vuya.c1 - Ints(128), vuya.c2 - Ints(16), vuya.c3});
}

inline Channels AddOffsets(Channels vuya) {
    return {vuya.c0 + Floats(128), vuya.c1 + Floats(128), vuya.c2 + Floats(16), vuya.c3};
}

/// Rounds colour codes, which must lie within 32 bits, and packs them with an alpha that is given in
/// integers.
inline I32 PackCodes(Channels codes, I32 alpha) {
    return PackByteChannels(Nearest(codes.c0), Nearest(codes.c1), Nearest(codes.c2), alpha);
}

/// Rounds and packs codes of any size: NaN gives 0.
inline I32 PackAnyCodes(Channels codes) {
    const F32 limit = Floats(255);
    return PackByteChannels(Nearest(AtMost(limit, codes.c0)), Nearest(AtMost(limit, codes.c1)),
                            Nearest(AtMost(limit, codes.c2)), Nearest(AtMost(limit, codes.c3)));
}

// Whole 8-bit pixels, from codes in integers to packed codes.

template <const RGBToYUVMatrix& kMatrix>
inline I32 RGB8ToYUV8(IntChannels bgra) {
    return PackCodes(AddOffsets(RGBToYUV<kMatrix>(ToFloat(bgra))), bgra.c3);
}

template <const YUVToRGBMatrix& kMatrix>
inline I32 YUV8ToRGB8(IntChannels vuya) {
    return PackCodes(YUVToRGB<kMatrix>(RemoveOffsets(vuya)), vuya.c3);
}

template <const YUVToYUVMatrix& kMatrix>
inline I32 YUV8ToYUV8(IntChannels vuya) {
    return PackCodes(AddOffsets(YUVToYUV<kMatrix>(RemoveOffsets(vuya))), vuya.c3);
}

} // namespace PK::PK_TARGET
