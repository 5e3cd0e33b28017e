#include "dv/DVDecode.h"

#include "frame/FloatMode.h"
#include "primitives/DVMacroblocks.h"

#include <algorithm>
#include <cstring>
#include <span>

namespace PK {
namespace {

constexpr int32_t kLuma = 0, kU = 1, kV = 2;
constexpr int32_t kSide = 8;

/// Where a block stands in its macroblock, in blocks of its plane. Of a chroma block that two rows of luma share, the left
/// half of its columns is for the upper and the right half for the lower.
enum class Part : uint8_t { Whole, LeftHalf, RightHalf };
struct BlockPlace {
    uint8_t block, plane;
    uint8_t x, y;
    Part part = Part::Whole;
};

constexpr BlockPlace k411Blocks[] = {{0, kLuma, 0, 0}, {1, kLuma, 1, 0}, {2, kLuma, 2, 0},
                                     {3, kLuma, 3, 0}, {4, kV, 0, 0},    {5, kU, 0, 0}};
constexpr BlockPlace kStackedBlocks[] = {{0, kLuma, 0, 0},
                                         {1, kLuma, 1, 0},
                                         {2, kLuma, 0, 1},
                                         {3, kLuma, 1, 1},
                                         {4, kV, 0, 0, Part::LeftHalf},
                                         {4, kV, 0, 1, Part::RightHalf},
                                         {5, kU, 0, 0, Part::LeftHalf},
                                         {5, kU, 0, 1, Part::RightHalf}};
constexpr BlockPlace k420Blocks[] = {{0, kLuma, 0, 0}, {1, kLuma, 1, 0}, {2, kLuma, 0, 1},
                                     {3, kLuma, 1, 1}, {4, kV, 0, 0},    {5, kU, 0, 0}};
constexpr BlockPlace k422Blocks[] = {{0, kLuma, 0, 0}, {2, kLuma, 1, 0}, {4, kV, 0, 0}, {5, kU, 0, 0}};
constexpr BlockPlace kHDBlocks[] = {{0, kLuma, 0, 0}, {1, kLuma, 1, 0}, {2, kLuma, 0, 1}, {3, kLuma, 1, 1},
                                    {4, kV, 0, 0},    {5, kV, 0, 1},    {6, kU, 0, 0},    {7, kU, 0, 1}};
constexpr BlockPlace kSideBySideBlocks[] = {{0, kLuma, 0, 0}, {1, kLuma, 1, 0}, {2, kLuma, 2, 0},
                                            {3, kLuma, 3, 0}, {4, kV, 0, 0},    {5, kV, 1, 0},
                                            {6, kU, 0, 0},    {7, kU, 1, 0}};

std::span<const BlockPlace> BlocksOf(DVShape shape) {
    switch (shape) {
    case DVShape::k411:
        return k411Blocks;
    case DVShape::k411Stacked:
        return kStackedBlocks;
    case DVShape::k420:
        return k420Blocks;
    case DVShape::k422:
        return k422Blocks;
    case DVShape::kHD:
        return kHDBlocks;
    case DVShape::kHDSideBySide:
        break;
    }
    return kSideBySideBlocks;
}

/// Frames of 720 lines come in pairs, of which the second has its blocks marked as those of channels 2 and 3.
int32_t FirstChannel(const uint8_t* frame, const DVFormat& format) {
    constexpr uint8_t kOfFirst = 0x04;
    return format.isProgressive && (frame[1] & kOfFirst) == 0 ? 2 : 0;
}

/// Decodes the segments that have some of the picture, one after the other.
/// \param write  takes the decoded segment and the places of its macroblocks.
template <class Write>
void ForEachSegment(const uint8_t* frame, const DecodedPicture& picture, const Write& write) {
    const DVFormat& format = picture.format;
    const InitialFloatMode mode; // a frame stands for the same samples whatever the caller's mode is
    const int32_t firstChannel = FirstChannel(frame, format);
    DVDecodeState state(format, picture.size);
    for (int32_t channel = 0; channel < format.channels; ++channel)
        for (int32_t sequence = 0; sequence < format.Sequences(); ++sequence, frame += kSequenceBytes)
            for (int32_t segment = 0; segment < kSegmentsOfSequence; ++segment) {
                DVPlace places[kMacroblocksOfSegment];
                if (!PlaceSegment(format, firstChannel + channel, sequence, segment, places)) continue;
                state.Decode(frame + SegmentOffset(segment), places);
                write(state, places);
            }
}

/// Lines of a block, and the rows that they go to.
struct Lines {
    int32_t first, step, count;
    int32_t row, rowStep;
};

/// The wanted ones of a block at full size whose first line is row y of the picture, and the next so many rows further on.
Lines LinesAt(const DecodedPicture& picture, int32_t y, int32_t lineStep) {
    if (picture.field == 0) return {0, 1, kSide, y, lineStep};
    const int32_t parity = picture.field - 1;
    if (lineStep == 1) return {parity, 2, kSide / 2, y / 2, 1};
    return {0, 1, y % 2 == parity ? kSide : 0, y / 2, 1};
}

/// By the size, so that the few samples of small blocks are moved without loops.
template <DVSize kSize>
class PlaneWriter {
public:
    PlaneWriter(const DecodedPicture& picture, const DestinationPlanes& planes)
        : fPicture(picture), fPlanes(planes) {}

    void operator()(const DVDecodeState& state, const DVPlace (&places)[kMacroblocksOfSegment]) const {
        for (int32_t i = 0; i < kMacroblocksOfSegment; ++i)
            for (const BlockPlace& place : BlocksOf(places[i].shape))
                WriteBlock(state.Block(i, place.block), places[i], place, state.HasLinesInTurns(i));
    }

private:
    static constexpr int32_t kShift = static_cast<int32_t>(kSize), kSamples = SideOfBlock(kSize); // of a line

    void ToBytes(const int16_t* block, uint8_t* bytes) const {
        if constexpr (kSize == DVSize::Full) {
            fKernels.toBytes(block, bytes);
        } else {
            for (int32_t i = 0; i < kSamples * kSamples; ++i)
                bytes[i] = static_cast<uint8_t>(std::clamp<int32_t>(block[i], -128, 127) + 128);
        }
    }

    void WriteBlock(const int16_t* block, const DVPlace& origin, const BlockPlace& place,
                    bool inTurns) const {
        const bool isLuma = place.plane == kLuma;
        const int32_t firstColumn = isLuma ? origin.x : origin.x >> fPicture.format.ChromaShift();
        const bool hasHalfTheRows = !isLuma && fPicture.format.sampling == DVSampling::k420;
        const int32_t firstRow = hasHalfTheRows ? origin.y / 2 : origin.y;
        const Lines lines = LinesOf(firstRow, place.y, inTurns);
        uint8_t bytes[kSamples * kSamples];
        ToBytes(block, bytes);
        const Plane<uint8_t>& plane = fPlanes[place.plane];
        uint8_t* const to = plane.Row(lines.row) + ((firstColumn + kSide * place.x) >> kShift);
        constexpr int32_t kHalf = kSamples / 2;
        if (place.part == Part::Whole)
            CopyLines<kSamples>(bytes, lines, to, plane.rowBytes);
        else // a lone column is for both
            CopyLines<std::max(kHalf, 1)>(bytes + (place.part == Part::RightHalf ? kHalf : 0), lines, to,
                                          plane.rowBytes);
    }

    /// Of a block so many further down in a macroblock that begins at a row.
    Lines LinesOf(int32_t firstRow, int32_t blocksBelow, bool inTurns) const {
        const int32_t row = firstRow + kSide * blocksBelow;
        if constexpr (kSize != DVSize::Full) return {0, 1, kSamples, row >> kShift, 1};
        return inTurns ? LinesAt(fPicture, firstRow + blocksBelow, 2) : LinesAt(fPicture, row, 1);
    }

    template <size_t kColumns>
    static void CopyLines(const uint8_t* bytes, const Lines& lines, uint8_t* to, ptrdiff_t rowBytes) {
        const uint8_t* from = bytes + kSamples * lines.first;
        for (int32_t i = 0; i < lines.count; ++i) {
            std::memcpy(to, from, kColumns);
            from += kSamples * lines.step;
            to += rowBytes * lines.rowStep;
        }
    }

    const DecodedPicture& fPicture;
    const DestinationPlanes& fPlanes;
    const DVMacroblockKernels& fKernels = Best<DVMacroblockKernels>();
};

class YUYVWriter {
public:
    YUYVWriter(const DecodedPicture& picture, uint8_t* pixels, ptrdiff_t rowBytes)
        : fPicture(picture), fPixels(pixels), fRowBytes(rowBytes) {}

    void operator()(const DVDecodeState& state, const DVPlace (&places)[kMacroblocksOfSegment]) const {
        if (fPicture.format.IsHD())
            WriteHD(state, places);
        else
            Write50(state, places);
    }

private:
    uint8_t* At(int32_t x, int32_t row) const { return fPixels + row * fRowBytes + 2 * x; }

    void Write50(const DVDecodeState& state, const DVPlace (&places)[kMacroblocksOfSegment]) const {
        const int16_t* blocks[kMacroblocksOfSegment];
        uint8_t* destination[kMacroblocksOfSegment];
        int32_t lineStep = 1;
        for (int32_t i = 0; i < kMacroblocksOfSegment; ++i) {
            const Lines lines = LinesAt(fPicture, places[i].y, 1);
            blocks[i] = state.Block(i, 0) + kSide * lines.first;
            destination[i] = At(places[i].x, lines.row);
            lineStep = lines.step;
        }
        PackMacroblocksDV50(blocks, destination, fRowBytes, lineStep);
    }

    DVPiece PieceAt(int32_t x, int32_t y, int32_t lineStep) const {
        const Lines lines = LinesAt(fPicture, y, lineStep);
        return {lines.count == 0 ? nullptr : At(x, lines.row), lines.rowStep * fRowBytes, lines.first,
                lines.step};
    }

    void WriteHD(const DVDecodeState& state, const DVPlace (&places)[kMacroblocksOfSegment]) const {
        constexpr int32_t kPieceWidth = 16;
        DVPiece pieces[kMacroblocksOfSegment][2];
        for (int32_t i = 0; i < kMacroblocksOfSegment; ++i) {
            const auto& [x, y, shape] = places[i];
            const bool inTurns = state.HasLinesInTurns(i), isBeside = shape == DVShape::kHDSideBySide;
            const int32_t lineStep = inTurns ? 2 : 1;
            pieces[i][0] = PieceAt(x, y, lineStep);
            pieces[i][1] =
                isBeside ? PieceAt(x + kPieceWidth, y, 1) : PieceAt(x, y + (inTurns ? 1 : kSide), lineStep);
        }
        PackMacroblocksDV100(state.Block(0, 0), pieces);
    }

    const DecodedPicture& fPicture;
    uint8_t* fPixels;
    ptrdiff_t fRowBytes;
};

struct PlaneSizes {
    int32_t width, height;
    int32_t chromaWidth, chromaHeight;

    size_t LumaBytes() const { return static_cast<size_t>(width) * static_cast<size_t>(height); }
    size_t ChromaBytes() const {
        return static_cast<size_t>(chromaWidth) * static_cast<size_t>(chromaHeight);
    }
};

PlaneSizes SizesOf(const DecodedPicture& picture) {
    const int32_t width = picture.Width(), height = picture.Height();
    const int32_t sharing = 1 << picture.format.ChromaShift();
    const bool is420 = picture.format.sampling == DVSampling::k420;
    return {width, height, (width + sharing - 1) / sharing, is420 ? height / 2 : height};
}

} // namespace

DestinationPlanes DVPlanesIn(uint8_t* block, const DecodedPicture& picture) {
    const PlaneSizes sizes = SizesOf(picture);
    uint8_t* const u = block + sizes.LumaBytes();
    const int32_t chromaWidth = sizes.chromaWidth, chromaHeight = sizes.chromaHeight;
    return {{{block, picture.Width(), picture.Width(), picture.Height()},
             {u, chromaWidth, chromaWidth, chromaHeight},
             {u + sizes.ChromaBytes(), chromaWidth, chromaWidth, chromaHeight}}};
}

size_t DVPlanesBytes(const DecodedPicture& picture) {
    const PlaneSizes sizes = SizesOf(picture);
    return sizes.LumaBytes() + 2 * sizes.ChromaBytes();
}

void DecodeDVToPlanes(const uint8_t* frame, const DecodedPicture& picture, const DestinationPlanes& planes) {
    switch (picture.size) {
    case DVSize::Full:
        return ForEachSegment(frame, picture, PlaneWriter<DVSize::Full>(picture, planes));
    case DVSize::Half:
        return ForEachSegment(frame, picture, PlaneWriter<DVSize::Half>(picture, planes));
    case DVSize::Quarter:
        return ForEachSegment(frame, picture, PlaneWriter<DVSize::Quarter>(picture, planes));
    case DVSize::Eighth:
        return ForEachSegment(frame, picture, PlaneWriter<DVSize::Eighth>(picture, planes));
    }
}

void DecodeDVToYUYV(const uint8_t* frame, const DecodedPicture& picture, uint8_t* pixels,
                    ptrdiff_t rowBytes) {
    ForEachSegment(frame, picture, YUYVWriter(picture, pixels, rowBytes));
}

} // namespace PK
