#pragma once

// The picture that the encoders of DV take, and its samples as blocks of a macroblock.

#include "dv/DVPlacement.h"
#include "dv/DVSampleKernels.h"
#include "dv/DVTables.h"

namespace PK {

/// Pixels in pairs of 4:2:2, from the top of the picture.
struct DVPicture {
    const uint8_t* pixels;
    int64_t rowBytes; ///< of either sign
    bool isLumaFirst; ///< YUYV, else UYVY
};

/// Takes macroblocks from a picture.
class DVMacroblockSource {
public:
    struct ChromaBlocks {
        int16_t *cb, *cr;
    };

    /// \param sampleBits  samples less 128 are taken 2^sampleBits times.
    DVMacroblockSource(const DVPicture& picture, int32_t sampleBits);

    /// Writes the blocks of a macroblock one behind the other, in the order that they have there.
    /// \param mayBeOfFields  of a macroblock of DV100, takes the lines in turns where those of one field differ less.
    /// \return whether they were taken in turns.
    bool Take(const DVPlace& place, bool mayBeOfFields, int16_t* blocks) const;

private:
    void TakePiece(int32_t x, int32_t y, int16_t* luma, const ChromaBlocks& chroma,
                   int32_t lumaStride = kCoefficients) const;
    void Take411(const DVPlace& place, int16_t* blocks) const;
    void Take411Stacked(const DVPlace& place, int16_t* blocks) const;
    void Take420(const DVPlace& place, int16_t* blocks) const;
    void TakeHD(const DVPlace& place, int16_t* blocks) const;
    void QuarterChroma(int32_t x, int32_t y, int32_t columns, const ChromaBlocks& blocks) const;

    DVPicture fPicture;
    int32_t fBits;
    DVSampleKernels::Load fLoad;
};

} // namespace PK
