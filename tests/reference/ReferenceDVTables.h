#pragma once

// The tables of the DV standards as they stand in tests/data/dv, and what the nine formats are made of.

#include <PixelKiln/PixelFormat.h>

#include <array>
#include <string>
#include <unordered_map>
#include <vector>

namespace PKTest {

enum class DVKind {
    k525of411,
    k625of411,
    k625of420,
    k525of422,
    k625of422,
    k720p60,
    k720p50,
    k1080i60,
    k1080i50
};
inline constexpr std::array kDVKinds = {DVKind::k525of411, DVKind::k625of411, DVKind::k625of420,
                                        DVKind::k525of422, DVKind::k625of422, DVKind::k720p60,
                                        DVKind::k720p50,   DVKind::k1080i60,  DVKind::k1080i50};

struct DVLayout {
    const char* name; ///< as the placements are named
    PK_PixelFormat format;
    int width, height;
    int lumaPerChromaX, lumaPerChromaY;
    int channels, sequences; ///< of a frame, and of a channel
    bool isDV100, is1080;

    int Bytes() const { return channels * sequences * 12000; }
    int BlocksOfMacroblock() const { return isDV100 ? 8 : 6; }
    /// Bits of the fixed area of each block.
    std::vector<int> Areas() const {
        if (isDV100) return {80, 80, 80, 80, 80, 80, 64, 64};
        return {112, 112, 112, 112, 80, 80};
    }
};
const DVLayout& LayoutOf(DVKind kind);

/// Where a segment's first block begins in its frame.
int PlaceOfSegment(int channel, int sequence, int segment, const DVLayout& layout);

enum class DVShape { kUnused, k411, kEdgeOf411, k420, k422, kHD, kHalfRow };

struct DVPlace {
    DVShape shape;
    int x, y;
};
/// \param channel 0 to 3; 2 and 3 of 720 lines are the second frame of a pair.
DVPlace PlaceOf(DVKind kind, int channel, int sequence, int segment, int macroblock);

struct DVCode {
    enum class Is { kEnd, kZeros, kLevel } is;
    int run, amplitude; ///< kZeros moves run + 1 places; a sign bit follows kLevel
};
/// Code words without sign, by their bits with a 1 ahead of them. Escapes stand for any number that their bits can say.
const std::unordered_map<unsigned, DVCode>& DVCodes();
/// The bits of each code word that the standard names.
std::string BitsOfLevel(int run, int amplitude); ///< empty where there is none
std::string BitsOfZeros(int run);
inline constexpr const char* kDVEndOfBlock = "0110";

struct DVScanPlace {
    int raster, area;
};
const std::array<DVScanPlace, 64>& DVScan(bool is248);

int DVAreaShift(int area, int classNumber, int qno);

/// What a level is multiplied by in 256ths, before the shift of its area, by its place in the raster.
const std::array<int, 64>& DVFactors(bool is248);

const std::array<int, 64>& DV100Table(bool is1080, bool isChroma);
int DV100Step(int qno);

} // namespace PKTest
