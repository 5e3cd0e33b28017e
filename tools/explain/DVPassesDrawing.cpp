#include "DVDrawingParts.h"
#include "DVDrawings.h"

#include <algorithm>
#include <array>
#include <vector>

namespace tool {
namespace {

// What the blocks of a segment have, in bytes with their heads, and the areas that are there for them.
constexpr int32_t kBlocks = 6;
using PerBlock = std::array<int32_t, kBlocks>;
constexpr PerBlock kAreas = {14, 14, 14, 14, 10, 10};
constexpr PerBlock kNeeds[PK::kMacroblocksOfSegment] = {{9, 22, 14, 8, 6, 5},
                                                        {20, 18, 30, 12, 7, 9},
                                                        {6, 5, 7, 6, 4, 4},
                                                        {14, 16, 12, 10, 8, 16},
                                                        {17, 25, 13, 11, 6, 6}};

/// Some bytes of a block in the area of one.
struct Piece {
    int32_t owner, block; ///< macroblock and block whose bytes they are
    int32_t area, areaBlock;
    int32_t first, bytes;
    int32_t pass;
};

class Packing {
public:
    Packing() {
        for (int32_t i = 0; i < PK::kMacroblocksOfSegment; ++i)
            for (int32_t block = 0; block < kBlocks; ++block) {
                fLeft[i][block] = kNeeds[i][block];
                Move(i, block, i, block, 1);
            }
        for (int32_t i = 0; i < PK::kMacroblocksOfSegment; ++i) MoveAll(i, i, i, i, 2);
        MoveAll(0, PK::kMacroblocksOfSegment - 1, 0, PK::kMacroblocksOfSegment - 1, 3);
    }

    const std::vector<Piece>& Pieces() const { return fPieces; }

private:
    /// Surplus of the macroblocks from one to another, in order, to what is spare in those from one to another.
    void MoveAll(int32_t firstOwner, int32_t lastOwner, int32_t firstArea, int32_t lastArea, int32_t pass) {
        for (int32_t owner = firstOwner; owner <= lastOwner; ++owner)
            for (int32_t block = 0; block < kBlocks; ++block)
                for (int32_t area = firstArea; area <= lastArea; ++area)
                    for (int32_t areaBlock = 0; areaBlock < kBlocks; ++areaBlock)
                        Move(owner, block, area, areaBlock, pass);
    }

    void Move(int32_t owner, int32_t block, int32_t area, int32_t areaBlock, int32_t pass) {
        int32_t& left = fLeft[owner][block];
        int32_t& used = fUsed[area][areaBlock];
        const int32_t bytes = std::min(left, kAreas[areaBlock] - used);
        if (bytes == 0) return;
        fPieces.push_back({owner, block, area, areaBlock, used, bytes, pass});
        left -= bytes;
        used += bytes;
    }

    PerBlock fLeft[PK::kMacroblocksOfSegment] = {}, fUsed[PK::kMacroblocksOfSegment] = {};
    std::vector<Piece> fPieces;
};

constexpr double kSegmentLeft = kMargin, kUnit = (kWidth - 2 * kMargin) / 5 / 76;

double AreaLeft(int32_t area, int32_t block) {
    double x = kSegmentLeft + area * 76 * kUnit;
    for (int32_t i = 0; i < block; ++i) x += kAreas[i] * kUnit;
    return x;
}

void DrawPass(cairo_t* context, double top, int32_t pass) {
    constexpr double kHeight = 42;
    for (int32_t i = 0; i < PK::kMacroblocksOfSegment; ++i)
        for (int32_t block = 0; block < kBlocks; ++block)
            FillBox(context, AreaLeft(i, block), top, kAreas[block] * kUnit, kHeight, kWhite);
    static const Packing packing;
    for (const Piece& piece : packing.Pieces()) {
        if (piece.pass > pass) continue;
        const double x = AreaLeft(piece.area, piece.areaBlock) + piece.first * kUnit;
        FillBox(context, x, top, piece.bytes * kUnit, kHeight,
                Mixed(kMacroblocks[piece.owner], piece.pass == pass && pass > 1 ? 0.05 : 0.45));
        if (piece.pass == pass && pass > 1 && piece.bytes >= 3)
            DrawText(context, std::string(1, "abcde"[piece.owner]) + std::to_string(piece.block),
                     x + piece.bytes * kUnit / 2, top + kHeight / 2 + 4, {10, true, Align::Centre, kWhite});
    }
    for (int32_t i = 0; i < PK::kMacroblocksOfSegment; ++i) {
        for (int32_t block = 0; block < kBlocks; ++block)
            StrokeBox(context, AreaLeft(i, block), top, kAreas[block] * kUnit, kHeight, kPaleInk, 0.75);
        StrokeBox(context, AreaLeft(i, 0), top, 76 * kUnit, kHeight, kInk, 1.5);
    }
}

/// What does not fit where it belongs, as bars over the segment.
void DrawNeeds(cairo_t* context, double bottom) {
    constexpr double kByte = 2.2;
    for (int32_t i = 0; i < PK::kMacroblocksOfSegment; ++i)
        for (int32_t block = 0; block < kBlocks; ++block) {
            const double x = AreaLeft(i, block), width = kAreas[block] * kUnit;
            const double height = kNeeds[i][block] * kByte, room = kAreas[block] * kByte;
            FillBox(context, x + 3, bottom - height, width - 6, height, Mixed(kMacroblocks[i], 0.45));
            if (height > room)
                FillBox(context, x + 3, bottom - height, width - 6, height - room, kMacroblocks[i]);
            StrokeBox(context, x + 3, bottom - room, width - 6, room, kPaleInk, 0.75);
            DrawText(context, std::string(1, "abcde"[i]) + std::to_string(block), x + width / 2, bottom + 14,
                     {10, false, Align::Centre, kPaleInk});
        }
}

} // namespace

void DrawDVPasses(const std::string& name) {
    WritePngDrawing(
        kWidth, 462,
        [](cairo_t* context) {
            DrawHeading(context, "What five macroblocks of six blocks need, and the room of their areas", 34);
            DrawNeeds(context, 140);
            constexpr const char* kPasses[] = {
                "First pass: each block fills its own area",
                "Second pass: within a macroblock, what is left over goes to what is spare",
                "Third pass: within the segment, from the first macroblock to the last"};
            for (int32_t pass = 1; pass <= 3; ++pass) {
                const double top = 198 + 100 * (pass - 1);
                DrawHeading(context, kPasses[pass - 1], top - 10);
                DrawPass(context, top, pass);
            }
        },
        name);
}

} // namespace tool
