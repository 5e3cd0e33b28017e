#pragma once

// What there is to do with the blocks of a vector that is one: included by those of four lanes.

namespace PK::PK_TARGET {

/// Block i is loaded from offsets[4 x i], in bytes.
inline F32 LoadFloatBlocksAt(const uint8_t* base, const int64_t* offsets) {
    return LoadFloats(base + *offsets);
}

/// Of floats side by side, one for each block, in all its lanes.
inline F32 LoadOnePerBlock(const float* source) {
    return Floats(*source);
}

/// Blocks of floats side by side by their numbers.
[[gnu::always_inline]] inline F32 LoadBlocksOf(const float* blocks, const int32_t* index) {
    return LoadFloats(blocks + int64_t{4} * *index);
}

/// The same of no more blocks than a vector has, with the lanes of the numbers: lane i of a block is 4 x number + i.
inline F32 LoadBlocksNear(const float* blocks, I32) {
    return LoadFloats(blocks);
}
inline I32 LoadOneIntPerBlock(const int32_t* source) {
    return Ints(*source);
}

/// The first kBlocks, and 0 behind them; a vector of no more is loaded whole.
template <int kBlocks>
inline F32 LoadFirstBlocks(const float* source) {
    return LoadFloats(source);
}

/// For each block a vector, whose blocks it sums: the halves are added, and then their halves.
inline F32 SumsOfBlocks(const F32 (&vectors)[1]) {
    return vectors[0];
}

} // namespace PK::PK_TARGET
