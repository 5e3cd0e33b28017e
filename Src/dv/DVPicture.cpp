#include "dv/DVPicture.h"

#include "dv/DVTables.h"
#include "primitives/Dispatch.h"

#include <algorithm>
#include <cstdlib>

namespace PK {
namespace {

constexpr int32_t kSide = 8;
constexpr int32_t kPieceWidth = 16; // pixels: two blocks of luma, one of each chroma

using Block = int16_t[kCoefficients];

/// The blocks of a macroblock of DV100 that lie one below the other.
constexpr int32_t kUpperAndLower[][2] = {{0, 2}, {1, 3}, {4, 5}, {6, 7}};

/// How much less the lines of each field differ than those of the frame, in two blocks one below the other.
int32_t GainOfFields(const int16_t* upper, const int16_t* lower) {
    const auto line = [&](int32_t i) { return (i < kSide ? upper : lower) + kSide * (i % kSide); };
    int32_t gain = 0;
    for (int32_t i = 0; i + 2 < 2 * kSide; ++i)
        for (int32_t x = 0; x < kSide; ++x)
            gain += std::abs(line(i + 1)[x] - line(i)[x]) - std::abs(line(i + 2)[x] - line(i)[x]);
    return gain;
}

/// Where a colour moves, luma may be smoother in fields and chroma not. Chroma counts for more than its samples: with the
/// weight of one, moving colours lose 1 dB of it, and from 3 on nothing is gained any more.
bool IsSmootherInFields(const int16_t* blocks) {
    constexpr int32_t kFirstChroma = 4, kChromaWeight = 3;
    int32_t gain = 0;
    for (const auto& [upper, lower] : kUpperAndLower)
        gain += (upper < kFirstChroma ? 1 : kChromaWeight) *
                GainOfFields(blocks + kCoefficients * upper, blocks + kCoefficients * lower);
    return gain > 0;
}

/// Of two blocks one below the other, the even lines to the first and the odd ones to the second.
void PartFields(int16_t* upper, int16_t* lower) {
    int16_t lines[2 * kSide][kSide];
    std::copy_n(upper, kCoefficients, lines[0]);
    std::copy_n(lower, kCoefficients, lines[kSide]);
    for (int32_t i = 0; i < kSide; ++i) {
        std::copy_n(lines[2 * i], kSide, upper + kSide * i);
        std::copy_n(lines[2 * i + 1], kSide, lower + kSide * i);
    }
}

/// Cr stands before Cb.
DVMacroblockSource::ChromaBlocks ChromaAt(int16_t* blocks, int32_t place) {
    return {blocks + kCoefficients * (place + 1), blocks + kCoefficients * place};
}

} // namespace

DVMacroblockSource::DVMacroblockSource(const DVPicture& picture, int32_t sampleBits)
    : fPicture(picture), fBits(sampleBits),
      fLoad(picture.isLumaFirst ? Best<DVSampleKernels>().loadYUYV : Best<DVSampleKernels>().loadUYVY) {}

void DVMacroblockSource::TakePiece(int32_t x, int32_t y, int16_t* luma, const ChromaBlocks& chroma,
                                   int32_t lumaStride) const {
    constexpr int32_t kBytesOfPixel = 2;
    fLoad(fPicture.pixels + y * fPicture.rowBytes + kBytesOfPixel * x, fPicture.rowBytes,
          {luma, chroma.cb, chroma.cr, lumaStride, fBits});
}

/// Every second sample of chroma, which lies on the first of four pixels, with a quarter of each neighbour: the decoder goes
/// in straight lines from one such sample to the next.
void DVMacroblockSource::QuarterChroma(int32_t x, int32_t y, int32_t columns,
                                       const ChromaBlocks& blocks) const {
    constexpr int32_t kBytesOfPair = 4, kMiddle = 4 * 128;
    const int32_t before = x == 0 ? 0 : -kBytesOfPair;
    for (int32_t line = 0; line < kSide; ++line) {
        const uint8_t* pair = fPicture.pixels + (y + line) * fPicture.rowBytes + 2 * x;
        const uint8_t* neighbour = pair + before;
        for (int32_t i = 0; i < columns; ++i) {
            const auto mean = [&](int32_t byte) {
                const int32_t sum = neighbour[byte] + 2 * pair[byte] + pair[kBytesOfPair + byte];
                return static_cast<int16_t>(((sum - kMiddle) * (1 << fBits) + (fBits == 0 ? 2 : 0)) >> 2);
            };
            blocks.cb[kSide * line + i] = mean(fPicture.isLumaFirst ? 1 : 0);
            blocks.cr[kSide * line + i] = mean(fPicture.isLumaFirst ? 3 : 2);
            neighbour = pair + kBytesOfPair;
            pair += 2 * kBytesOfPair;
        }
    }
}

void DVMacroblockSource::Take411(const DVPlace& place, int16_t* blocks) const {
    alignas(64) Block unused[2];
    for (int32_t i = 0; i < 2; ++i)
        TakePiece(place.x + kPieceWidth * i, place.y, blocks + 2 * kCoefficients * i, {unused[0], unused[1]});
    QuarterChroma(place.x, place.y, kSide, ChromaAt(blocks, 4));
}

void DVMacroblockSource::Take411Stacked(const DVPlace& place, int16_t* blocks) const {
    alignas(64) Block unused[2];
    const ChromaBlocks chroma = ChromaAt(blocks, 4);
    for (int32_t i = 0; i < 2; ++i) {
        const int32_t y = place.y + kSide * i, column = kSide / 2 * i;
        TakePiece(place.x, y, blocks + 2 * kCoefficients * i, {unused[0], unused[1]});
        QuarterChroma(place.x, y, kSide / 2, {chroma.cb + column, chroma.cr + column});
    }
}

/// A line of chroma is the mean of two lines of one field.
void DVMacroblockSource::Take420(const DVPlace& place, int16_t* blocks) const {
    alignas(64) int16_t both[2][2 * kCoefficients]; // of each chroma, the second block below the first
    for (int32_t i = 0; i < 2; ++i)
        TakePiece(place.x, place.y + kSide * i, blocks + 2 * kCoefficients * i,
                  {both[0] + kCoefficients * i, both[1] + kCoefficients * i});
    const ChromaBlocks chroma = ChromaAt(blocks, 4);
    const int32_t halfUnit = fBits == 0 ? 1 : 0;
    for (int32_t line = 0; line < kSide; ++line) {
        const int32_t first = line / 2 * 4 + line % 2;
        for (int32_t i = 0; i < kSide; ++i) {
            const auto mean = [&](const int16_t* lines) {
                const int16_t* const at = lines + kSide * first + i;
                return static_cast<int16_t>((at[0] + at[2 * kSide] + halfUnit) >> 1);
            };
            chroma.cb[kSide * line + i] = mean(both[0]);
            chroma.cr[kSide * line + i] = mean(both[1]);
        }
    }
}

void DVMacroblockSource::TakeHD(const DVPlace& place, int16_t* blocks) const {
    const bool isSideBySide = place.shape == DVShape::kHDSideBySide;
    constexpr int32_t kFirstCr = 4, kFirstCb = 6;
    for (int32_t i = 0; i < 2; ++i)
        TakePiece(place.x + (isSideBySide ? kPieceWidth * i : 0), place.y + (isSideBySide ? 0 : kSide * i),
                  blocks + 2 * kCoefficients * i,
                  {blocks + kCoefficients * (kFirstCb + i), blocks + kCoefficients * (kFirstCr + i)});
}

bool DVMacroblockSource::Take(const DVPlace& place, bool mayBeOfFields, int16_t* blocks) const {
    switch (place.shape) {
    case DVShape::k411:
        Take411(place, blocks);
        return false;
    case DVShape::k411Stacked:
        Take411Stacked(place, blocks);
        return false;
    case DVShape::k420:
        Take420(place, blocks);
        return false;
    case DVShape::k422:
        // With a dummy block behind each of luma.
        TakePiece(place.x, place.y, blocks, ChromaAt(blocks, 4), 2 * kCoefficients);
        return false;
    case DVShape::kHD:
    case DVShape::kHDSideBySide:
        TakeHD(place, blocks);
        break;
    }
    if (!mayBeOfFields || place.shape != DVShape::kHD || !IsSmootherInFields(blocks)) return false;
    for (const auto& [upper, lower] : kUpperAndLower)
        PartFields(blocks + kCoefficients * upper, blocks + kCoefficients * lower);
    return true;
}

} // namespace PK
