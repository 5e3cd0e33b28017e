#include "dv/DVSegmentWriter.h"

#include "dv/DVCodeWords.h"

#include <algorithm>
#include <bit>
#include <cstring>

namespace PK {
namespace {

constexpr DVArea kAreas[] = {{4, 14}, {18, 14}, {32, 14}, {46, 14}, {60, 10}, {70, 10}};
constexpr DVArea kAreasHD[] = {{4, 10}, {14, 10}, {24, 10}, {34, 10}, {44, 10}, {54, 10}, {64, 8}, {72, 8}};

constexpr int32_t kBitsOfByte = 8;

/// Words one behind the other, the highest bit first.
class BitWriter {
public:
    explicit BitWriter(uint8_t* bytes) : fFirst(bytes), fNext(bytes) {}

    /// \param bits  up to 32, and none above `count`.
    void Put(uint32_t bits, int32_t count) {
        fHeld = fHeld << count | bits;
        fCount += count;
        if (fCount < kWord) return;
        fCount -= kWord;
        Store(static_cast<uint32_t>(fHeld >> fCount));
        fNext += kWord / kBitsOfByte;
    }

    /// \return how many bits there are.
    int32_t Finish() {
        Store(static_cast<uint32_t>(fHeld << (kWord - fCount)));
        return static_cast<int32_t>(fNext - fFirst) * kBitsOfByte + fCount;
    }

private:
    static constexpr int32_t kWord = 32;

    void Store(uint32_t word) {
        const uint32_t bigEndian = __builtin_bswap32(word);
        std::memcpy(fNext, &bigEndian, sizeof bigEndian);
    }

    uint8_t *fFirst, *fNext;
    uint64_t fHeld = 0;
    int32_t fCount = 0;
};

/// Up to eight bits from any place on, at the upper end of a byte; the bits behind them are of no meaning.
uint32_t BitsAt(const uint8_t* bytes, int32_t place) {
    const uint8_t* const first = bytes + place / kBitsOfByte;
    return (uint32_t{first[0]} << kBitsOfByte | first[1]) >> (kBitsOfByte - place % kBitsOfByte) & 0xff;
}

} // namespace

std::span<const DVArea> AreasOfMacroblock(int32_t blocks) {
    if (blocks == std::ssize(kAreasHD)) return kAreasHD;
    return kAreas;
}

int32_t BitsOfBlock(const DVLevels& levels) {
    int32_t bits = kDVLeastBits, behindLast = 1;
    for (uint64_t left = levels.nonZero; left != 0; left &= left - 1) {
        const int32_t place = std::countr_zero(left);
        bits += kVLCLength[place - behindLast][levels.level[place]];
        behindLast = place + 1;
    }
    return bits;
}

void DVSegmentWriter::SetBlock(int32_t place, const DVBlock& block, const DVLevels& levels) {
    Bits& bits = fBits[place];
    BitWriter writer(bits.bytes);
    const uint32_t dc = static_cast<uint32_t>(block.dc) & 0x1ff;
    writer.Put(dc << 3 | uint32_t{block.mode} << 2 | block.classNumber, kDVHeadBits);
    int32_t behindLast = 1;
    for (uint64_t left = levels.nonZero; left != 0; left &= left - 1) {
        const int32_t at = std::countr_zero(left), run = at - behindLast, amplitude = levels.level[at];
        const uint32_t isNegative = block.coefficients[at] < 0 ? 1 : 0;
        writer.Put(kVLCCode[run][amplitude] | isNegative, kVLCLength[run][amplitude]);
        behindLast = at + 1;
    }
    writer.Put(kDVEndOfBlock.code, kDVEndOfBlock.length);
    bits.count = writer.Finish();
    bits.packed = 0;
}

void DVSegmentWriter::FillOwnArea(int32_t place, uint8_t* macroblock) {
    const DVArea& area = fAreas[static_cast<size_t>(place % fBlocks)];
    Bits& bits = fBits[place];
    uint8_t* const bytes = macroblock + area.offset;
    const int32_t room = kBitsOfByte * area.bytes;
    bits.packed = std::min(bits.count, room);
    std::memcpy(bytes, bits.bytes, area.bytes);
    fSpare[place] = {bytes, bits.packed, room};
    if (bits.packed == room) return;
    uint8_t* const last = bytes + bits.packed / kBitsOfByte;
    *last |= static_cast<uint8_t>(0xff >> bits.packed % kBitsOfByte);
    std::fill(last + 1, bytes + area.bytes, uint8_t{0xff});
}

/// Byte by byte of the area. Its bits from `next` on are ones.
void DVSegmentWriter::Move(Bits& from, Spare& to) {
    while (from.packed < from.count && to.next < to.end) {
        const int32_t before = to.next % kBitsOfByte;
        const int32_t count = std::min(kBitsOfByte - before, from.count - from.packed);
        const uint32_t taken = BitsAt(from.bytes, from.packed) >> (kBitsOfByte - count);
        const int32_t behind = kBitsOfByte - before - count;
        const uint32_t others = ~(((1u << count) - 1) << behind);
        to.bytes[to.next / kBitsOfByte] &= static_cast<uint8_t>(others | taken << behind);
        from.packed += count;
        to.next += count;
    }
}

void DVSegmentWriter::FillSpare(int32_t firstBlock, int32_t endBlock) {
    int32_t spare = firstBlock;
    for (int32_t block = firstBlock; block < endBlock; ++block)
        while (fBits[block].packed < fBits[block].count) {
            while (spare < endBlock && fSpare[spare].next == fSpare[spare].end) ++spare;
            if (spare == endBlock) return;
            Move(fBits[block], fSpare[spare]);
        }
}

void DVSegmentWriter::Pack(uint8_t* segment) {
    const int32_t blocks = kMacroblocksOfSegment * fBlocks;
    for (int32_t i = 0; i < blocks; ++i) FillOwnArea(i, segment + kDIFBlockBytes * (i / fBlocks));
    for (int32_t i = 0; i < blocks; i += fBlocks) FillSpare(i, i + fBlocks);
    FillSpare(0, blocks);
}

} // namespace PK
