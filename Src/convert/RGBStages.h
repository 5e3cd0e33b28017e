#pragma once

// Stages from 8-bit BGR to YUV for what works on chroma and luma afterwards (DownsampleRow.h tells what a stage is).

#include "convert/ColourMatrices.h"
#include "convert/DownsampleRow.h"
#include "primitives/lanes/ByteScale.h"

namespace PK::PK_TARGET {

/// The matrix on bytes stays within bytes, so that nothing needs clamping here.
template <const RGBToYUVMatrix& kMatrix>
inline YUVPixels ToYUV(IntChannels bgra) {
    const Channels vuya = AddOffsets(RGBToYUV<kMatrix>(ToFloat(bgra)));
    return {Nearest(vuya.c1) | ShiftLeft<16>(Nearest(vuya.c0)), Nearest(vuya.c2)};
}

template <const RGBToYUVMatrix& kMatrix>
struct OpaqueRGB {
    static void Load(const uint8_t* source, YUVPixels& first, YUVPixels& second) {
        first = ToYUV<kMatrix>(LoadByteChannels(source));
        second = ToYUV<kMatrix>(LoadByteChannels(source + 4 * kLanes));
    }
};

/// Straight alpha is multiplied in on the way, but for groups that have none to multiply in.
template <const RGBToYUVMatrix& kMatrix>
struct StraightRGB {
    static void Load(const uint8_t* source, YUVPixels& first, YUVPixels& second) {
        OpaqueRGB<kMatrix>::Load(source, first, second);
        const I32 firstAlpha = ShiftRight<24>(LoadInts(source));
        const I32 secondAlpha = ShiftRight<24>(LoadInts(source + 4 * kLanes));
        if (!AnyNegative(Not(Equal(firstAlpha & secondAlpha, Ints(255))))) return;
        first.chroma = ScaleHalves<kChromaZeros>(first.chroma, InBothHalves(firstAlpha));
        second.chroma = ScaleHalves<kChromaZeros>(second.chroma, InBothHalves(secondAlpha));

        const I32 alphas = firstAlpha | ShiftLeft<16>(secondAlpha);
        const I32 lumas = ScaleHalves<kLumaZeros>(first.luma | ShiftLeft<16>(second.luma), alphas);
        first.luma = lumas & Ints(0xffff);
        second.luma = ShiftRight<16>(lumas);
    }
};

} // namespace PK::PK_TARGET
