#pragma once

// Where the macroblocks of a segment lie in the picture.

#include "dv/DVFormat.h"

namespace PK {

/// Which samples of the picture the blocks of a macroblock hold. x and y are those of its first luma sample.
enum class DVShape : uint8_t {
    k411, ///< Four luma blocks in a row; one of each chroma.
    k411Stacked, ///< Two rows of two luma blocks. The left half of a chroma block is for the upper row, the right half
                 ///< for the lower.
    k420, ///< Two rows of two luma blocks; one of each chroma.
    k422, ///< Two luma blocks beside each other; one of each chroma.
    kHD, ///< Two pieces of two luma blocks and one of each chroma, one below the other or line by line in turns.
    kHDSideBySide ///< The same beside each other: where only eight lines are left.
};

struct DVPlace {
    int16_t x, y;
    DVShape shape;
};

/// The places of the macroblocks of a segment.
/// \param channel   from 0; the second frame of a pair of 720 lines has channels 2 and 3.
/// \param sequence  within the channel.
/// \param segment   0 to 26.
/// \return whether the sequence carries any of the picture.
bool PlaceSegment(const DVFormat& format, int32_t channel, int32_t sequence, int32_t segment,
                  DVPlace (&places)[kMacroblocksOfSegment]);

} // namespace PK
