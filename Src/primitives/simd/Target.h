#pragma once

// The vector types of the instruction set that this translation unit is compiled for. Kernel sources include
// this header, the fixed-width integer and memory headers, and nothing of the standard library: an
// inline function of the library compiled for AVX2 might be the copy that the linker keeps for all.
//
// Every target has the same types and the same functions on them:
//
//   kTarget                  the target itself
//   F32, I32                 kLanes lanes of float or 32-bit integer; kLanes is a multiple of four, so that a
//                            vector holds whole interleaved four-channel float pixels
//   F64, I64                 a double or 64-bit integer for each lane, where 24 bits are not enough
//   Floats, Ints             one value in every lane; PixelFloats, PixelInts: four values, repeated
//   Min, Max                 the first operand where it is less (greater), else the second, so for NaN too
//   Nearest, Truncate        to integers, by the current rounding mode or towards zero; out of range and
//                            NaN give INT32_MIN
//   Select(mask, a, b)       a where the mask's bits are set, else b
//   ...Pixel...              work on each block of four lanes, that is on each interleaved pixel
//   LoadStreamed             from aligned places, for memory that has no cache in front of it
//   LoadBytes                kLanes bytes to lanes
//   ...Blocks, ...Threes, ...Sixes       work on blocks of four lanes, a wider vector's part each, that have
//                            places of their own in memory
//   PK_FLATTEN               an attribute of loops over groups
//   LoadChannels, ...        kLanes four-channel pixels to and from four vectors, one a channel

#include "primitives/simd/Targets.h"

namespace PK::PK_TARGET {

inline constexpr Target kTarget = Target::PK_TARGET;

} // namespace PK::PK_TARGET

#include PK_TARGET_HEADER

namespace PK::PK_TARGET {

/// Four channels of kLanes pixels, in memory order: B, G, R, A or V, U, Y, A.
struct Channels {
    F32 c0, c1, c2, c3;
};

struct IntChannels {
    I32 c0, c1, c2, c3;
};

inline Channels ToFloat(IntChannels codes) {
    return {ToFloat(codes.c0), ToFloat(codes.c1), ToFloat(codes.c2), ToFloat(codes.c3)};
}

/// The four bytes of each lane.
inline IntChannels ByteChannels(I32 pixels) {
    const I32 low = Ints(0xff);
    return {pixels & low, ShiftRight<8>(pixels) & low, ShiftRight<16>(pixels) & low, ShiftRight<24>(pixels)};
}

/// kLanes pixels of four bytes.
inline IntChannels LoadByteChannels(const void* source) {
    return ByteChannels(LoadInts(source));
}

inline F32 LoadBytesAsFloats(const void* source) {
    return ToFloat(LoadBytes(source));
}

/// 2 x kLanes interleaved lanes to those on even and those on odd places.
inline void LoadLanePairs(const void* source, I32& even, I32& odd) {
    const auto* lanes = static_cast<const int32_t*>(source);
    SeparateLanes(LoadInts(lanes), LoadInts(lanes + kLanes), even, odd);
}

/// Limits x from above, leaving NaN to the conversion that follows, which turns it into INT32_MIN.
inline F32 AtMost(F32 limit, F32 x) {
    return Min(limit, x);
}

/// kLanes interleaved four-channel float pixels, one vector a channel.
inline Channels LoadFloatChannels(const void* source) {
    Channels channels;
    LoadFloatChannels(source, channels.c0, channels.c1, channels.c2, channels.c3);
    return channels;
}

inline void StoreFloatChannels(void* destination, Channels channels) {
    StoreFloatChannels(destination, channels.c0, channels.c1, channels.c2, channels.c3);
}

} // namespace PK::PK_TARGET
