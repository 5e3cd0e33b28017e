#pragma once

// Frames of DV that are put together from code words.

#include "reference/ReferenceDVTables.h"

#include <cstdint>
#include <vector>

namespace PKTest {

/// One block of a macroblock before it is packed.
struct DVBlockBits {
    int dc = 0;
    bool mode = false;
    int classNumber = 0;
    std::string codes; ///< without the end of the block
};

/// Bits of a level behind so many zeros, by the words of the standard: by two where there is none for both.
std::string DVLevelBits(int run, int level);

/// A frame with the header of its format, whose macroblocks are grey without detail.
class DVFrameWriter {
public:
    explicit DVFrameWriter(DVKind kind);

    DVKind Kind() const { return fKind; }
    const DVLayout& Layout() const { return LayoutOf(fKind); }
    int SegmentCount() const { return Layout().channels * Layout().sequences * 27; }
    uint8_t* Segment(int index);
    uint8_t* Bytes() { return fBytes.data(); }
    const uint8_t* Bytes() const { return fBytes.data(); }

    /// Packs five macroblocks by the three passes; bits that find no room are dropped.
    /// \param blocks 6 or 8 for each macroblock
    void Write(int segment, const std::vector<DVBlockBits>& blocks, const std::vector<int>& qno);

private:
    DVKind fKind;
    std::vector<uint8_t> fBytes;
};

} // namespace PKTest
