#pragma once

// The frames of DV25, DV50 and DV100: pictures, and how many DIF sequences of how many channels carry one.
//
// A DIF block has 80 bytes, of which the first three are its ID. A sequence has 150 blocks: a header, two of subcode, three
// of VAUX, then nine times one of audio and 15 of video. A frame is channel after channel, each of as many sequences. Five
// video blocks in a row are a segment, and each of them is a macroblock.
//
// Sources: IEC 61834-2 (DV25), SMPTE 314M (DV25 and DV50), SMPTE 370M (DV100).

#include "frame/PixelFormat.h"

#include <PixelKiln/PixelFormat.h>

#include <cstdint>

namespace PK {

inline constexpr int32_t kDIFBlockBytes = 80;
inline constexpr int32_t kSequenceBlocks = 150;
inline constexpr int32_t kSequenceBytes = kSequenceBlocks * kDIFBlockBytes;
inline constexpr int32_t kMacroblocksOfSegment = 5;
inline constexpr int32_t kSegmentBytes = kMacroblocksOfSegment * kDIFBlockBytes;
inline constexpr int32_t kSegmentsOfSequence = 27;

/// Where a segment begins in its sequence: behind the blocks of the header, and of audio as many as have come.
constexpr int32_t SegmentOffset(int32_t segment) {
    constexpr int32_t kFirst = 7, kSegmentsBetweenAudio = 3;
    return kDIFBlockBytes * (kFirst + kMacroblocksOfSegment * segment + segment / kSegmentsBetweenAudio);
}

/// Which samples of chroma a picture has, and which samples a macroblock.
enum class DVSampling : uint8_t {
    k411, ///< DV25: 32 x 8 luma samples, or 16 x 16 in the last column; 8 x 8 of each chroma.
    k420, ///< DV25: 16 x 16 luma samples, 8 x 8 of each chroma.
    k422, ///< DV50: 16 x 8 luma samples, 8 x 8 of each chroma.
    kHD,  ///< DV100: 16 x 16 luma samples, 8 x 16 of each chroma.
};

struct DVFormat {
    PK_PixelFormat stream;
    DVSampling sampling;
    bool is625;         ///< Of 50 fields or frames a second, with 12 sequences a channel rather than 10.
    bool isProgressive; ///< 720 lines.
    int32_t width, height;
    int32_t channels;
    int32_t type; ///< STYPE of the VAUX source pack.

    constexpr int32_t Sequences() const { return is625 ? 12 : 10; } ///< of a channel
    constexpr int32_t FrameBytes() const { return channels * Sequences() * kSequenceBytes; }
    constexpr bool IsHD() const { return sampling == DVSampling::kHD; }
    constexpr int32_t BlocksOfMacroblock() const { return IsHD() ? 8 : 6; }
    /// How many columns of luma share a sample of chroma, as a shift.
    constexpr int32_t ChromaShift() const { return sampling == DVSampling::k411 ? 2 : 1; }
};

inline constexpr DVFormat kDVFormats[] = {
    {PK_PixelFormat_NTSCDV25, DVSampling::k411, false, false, 720, 480, 1, 0},
    {PK_PixelFormat_PALDV25, DVSampling::k420, true, false, 720, 576, 1, 0},
    {PK_PixelFormat_NTSCDV50, DVSampling::k422, false, false, 720, 480, 2, 4},
    {PK_PixelFormat_PALDV50, DVSampling::k422, true, false, 720, 576, 2, 4},
    {PK_PixelFormat_NTSC_DV100_720p, DVSampling::kHD, false, true, 960, 720, 2, 0x18},
    {PK_PixelFormat_PAL_DV100_720p, DVSampling::kHD, true, true, 960, 720, 2, 0x18},
    {PK_PixelFormat_NTSC_DV100_1080i, DVSampling::kHD, false, false, 1280, 1080, 4, 0x14},
    {PK_PixelFormat_PAL_DV100_1080i, DVSampling::kHD, true, false, 1440, 1080, 4, 0x14},
};

/// The other DV25 of 625 lines, which has no number of its own: a frame tells by its header.
inline constexpr DVFormat kDVCPROPAL25 = {
    PK_PixelFormat_PALDV25, DVSampling::k411, true, false, 720, 576, 1, 0};

/// The format of a number, by which DV25 of 625 lines is 4:2:0; null for one that is no DV.
constexpr const DVFormat* FindDVFormat(PK_PixelFormat stream) {
    for (const DVFormat& format : kDVFormats)
        if (format.stream == stream) return &format;
    return nullptr;
}

} // namespace PK
