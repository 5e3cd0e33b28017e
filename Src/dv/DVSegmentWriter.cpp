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

uint64_t LoadBigEndian(const uint8_t* bytes) {
    uint64_t word;
    std::memcpy(&word, bytes, sizeof word);
    return __builtin_bswap64(word);
}

void StoreBigEndian(uint8_t* bytes, uint64_t word) {
    const uint64_t bigEndian = __builtin_bswap64(word);
    std::memcpy(bytes, &bigEndian, sizeof bigEndian);
}

/// Words one behind the other, the highest bit first, and ones behind them.
class BitWriter {
public:
    explicit BitWriter(uint8_t* bytes) : fFirst(bytes), fNext(bytes) {}

    /// \param bits  up to 32, and none above `count`.
    void Put(uint32_t bits, int32_t count) {
        fCount += count;
        fHeld |= uint64_t{bits} << (kHeld - fCount);
        StoreBigEndian(fNext, fHeld);
        fNext += fCount / kBitsOfByte;
        fHeld <<= fCount & ~(kBitsOfByte - 1);
        fCount %= kBitsOfByte;
    }

    /// \return how many bits there are.
    int32_t Finish() {
        StoreBigEndian(fNext, fHeld | ~uint64_t{0} >> fCount);
        std::memset(fNext + sizeof fHeld, 0xff, sizeof fHeld);
        return static_cast<int32_t>(fNext - fFirst) * kBitsOfByte + fCount;
    }

private:
    static constexpr int32_t kHeld = 64;

    uint8_t *fFirst, *fNext;
    uint64_t fHeld = 0; // at the upper end
    int32_t fCount = 0; // of its bits, below eight between two words
};

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
    fSpare[place] = {bytes, bits.packed, room};
    // Behind the last word there are ones enough for every area. Two copies of eight bytes make eight to sixteen.
    constexpr size_t kHalf = 8;
    std::memcpy(bytes, bits.bytes, kHalf);
    std::memcpy(bytes + area.bytes - kHalf, bits.bytes + area.bytes - kHalf, kHalf);
}

/// By words of the segment as long as there is a whole one, then by bytes. A word may go beyond the area: what it finds there
/// it leaves.
void DVSegmentWriter::Move(Bits& from, Spare& to) const {
    constexpr int32_t kWordBits = 64, kMostAtOnce = 48;
    while (from.packed < from.count && to.next < to.end) {
        uint8_t* const bytes = to.bytes + to.next / kBitsOfByte;
        const int32_t before = to.next % kBitsOfByte;
        const bool isWord = fSegmentEnd - bytes >= kWordBits / kBitsOfByte;
        const int32_t count = std::min(
            {isWord ? kMostAtOnce : kBitsOfByte - before, from.count - from.packed, to.end - to.next});
        const uint64_t taken = LoadBigEndian(from.bytes + from.packed / kBitsOfByte)
                                   << (from.packed % kBitsOfByte) >>
                               (kWordBits - count);
        const int32_t behind = kWordBits - before - count;
        const uint64_t place = ~uint64_t{0} >> (kWordBits - count) << behind;
        const uint64_t held = isWord ? LoadBigEndian(bytes) : uint64_t{*bytes} << (kWordBits - kBitsOfByte);
        const uint64_t filled = (held & ~place) | taken << behind;
        if (isWord)
            StoreBigEndian(bytes, filled);
        else
            *bytes = static_cast<uint8_t>(filled >> (kWordBits - kBitsOfByte));
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
    fSegmentEnd = segment + kSegmentBytes;
    for (int32_t i = 0; i < blocks; ++i) FillOwnArea(i, segment + kDIFBlockBytes * (i / fBlocks));
    for (int32_t i = 0; i < blocks; i += fBlocks) FillSpare(i, i + fBlocks);
    FillSpare(0, blocks);
}

} // namespace PK
