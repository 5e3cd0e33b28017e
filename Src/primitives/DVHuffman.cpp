#include "primitives/DVHuffman.h"

#include "primitives/Status.h"

#include <algorithm>
#include <bit>
#include <cstring>

namespace PK {
namespace {

using Symbol = DVHuffmanTable::Symbol;

constexpr uint32_t kIndexBits = DVHuffmanTable::kIndexBits;
constexpr uint32_t kWindowBits = 16; // of the longest code word with its sign
constexpr uint32_t kLongPrefixBits = kWindowBits - kIndexBits;
constexpr int32_t kPlaces = 64;
constexpr uint8_t kPastTheEnd = 2 * kPlaces; // an advance that no two others add up to

constexpr int32_t kMacroblocks = 5;
constexpr int32_t kBlockBytes = 80; // of a DIF block
constexpr int32_t kSegmentBytes = kMacroblocks * kBlockBytes;
constexpr int32_t kFirstArea = 4;
constexpr uint32_t kHeadBits = 12; // DC, mode and class

/// The first bits of a window of 16.
constexpr uint32_t Leading(uint32_t window, uint32_t bits) {
    return window >> (kWindowBits - bits);
}

Symbol WithSign(uint32_t window, uint8_t advance, uint32_t amplitude, uint32_t length) {
    if (amplitude == 0) return {0, advance, static_cast<uint8_t>(length)};
    const bool isNegative = (Leading(window, length + 1) & 1) != 0;
    const auto level = static_cast<int16_t>(amplitude);
    return {isNegative ? static_cast<int16_t>(-level) : level, advance, static_cast<uint8_t>(length + 1)};
}

/// What a window of 16 bits begins with.
Symbol FirstSymbol(std::span<const DVCode> codes, const DVEscape (&escapes)[2], uint32_t window) {
    uint32_t word = 0, length = codes.front().length;
    for (const DVCode& code : codes) {
        word <<= code.length - length;
        length = code.length;
        if (Leading(window, length) == word) {
            const bool isEnd = code.run == kEndOfBlockRun;
            const auto advance = static_cast<uint8_t>(isEnd ? kPastTheEnd : code.run + 1);
            return WithSign(window, advance, code.amplitude, length);
        }
        ++word;
    }
    const auto& [runs, amplitudes] = escapes;
    const bool isRun = Leading(window, kDVEscapePrefixBits) == runs.prefix;
    const uint32_t bits = kDVEscapePrefixBits + (isRun ? runs.bits : amplitudes.bits);
    const uint32_t number = Leading(window, bits) & ((1u << (bits - kDVEscapePrefixBits)) - 1);
    return isRun ? Symbol{0, static_cast<uint8_t>(number + 1), static_cast<uint8_t>(bits)}
                 : WithSign(window, 1, number, bits);
}

constexpr DVHuffmanTable::Pair PairOf(Symbol first, Symbol second) {
    return {first.level,   second.level,
            first.advance, static_cast<uint8_t>(first.advance + second.advance),
            first.bits,    static_cast<uint8_t>(first.bits + second.bits)};
}

uint64_t WordAt(const uint8_t* data) {
    uint64_t word;
    std::memcpy(&word, data, sizeof word);
    return __builtin_bswap64(word);
}

/// What a window may load of what lies behind its bits.
constexpr int32_t kReadAhead = 16;

/// Bits that nobody has read, with kReadAhead bytes of memory behind them.
struct BitRange {
    const uint8_t* data;
    uint32_t position, end;
};

/// The next bits, highest first, and how many of them are there.
class BitWindow {
public:
    explicit BitWindow(BitRange range) : BitWindow(0, 0, range) {}

    /// \param bits   of which the first `count` come before those of the range; the others are 0.
    /// \param count  at most 48
    BitWindow(uint64_t bits, uint32_t count, BitRange range) : fNext(range.data + range.position / 8 + 1) {
        const uint32_t read = range.position % 8;
        const uint64_t first = uint64_t{range.data[range.position / 8]} << (56 + read);
        fBits = bits | first >> count;
        fCount = count + 8 - read;
        Refill();
    }

    /// To at least 56 bits.
    void Refill() {
        fBits |= WordAt(fNext) >> fCount;
        fNext += (63 - fCount) / 8;
        fCount |= 56;
    }
    void Skip(uint32_t count) {
        fBits <<= count;
        fCount -= count;
    }
    uint64_t Leading(uint32_t count) const { return fBits >> (64 - count); }

    /// The first bits, fewer than 56, with zeros behind them.
    uint64_t Cut(uint32_t count) const { return fBits & ~(~uint64_t{0} >> count); }

private:
    const uint8_t* fNext;
    uint64_t fBits;
    uint32_t fCount;
};

/// A block as far as it was parsed.
struct Block {
    int16_t* coefficients;
    const uint8_t* scan;
    uint32_t place; ///< in the scan, of what was written last
    uint32_t stop;  ///< the block is done with when this place was reached
    bool isDone;
    uint32_t cutBits; ///< of a code word that has its end elsewhere
    uint64_t cut;     ///< begins with them
};

/// Reads code words until the block is done with or no whole one is left: then it keeps what there is of the next.
/// \param left  the bits of the window that may be read.
/// \return those that were not.
uint32_t Parse(const DVHuffmanTable& table, BitWindow window, uint32_t left, Block& block) {
    int16_t* const coefficients = block.coefficients;
    const uint8_t* const scan = block.scan;
    const uint32_t stop = block.stop;
    uint32_t place = block.place;
    bool isDone = false;
    for (;;) {
        const DVHuffmanTable::Pair pair = table.pairs[window.Leading(kIndexBits)];
        const uint32_t last = place + pair.advance;
        if (last < stop && pair.bits <= left) [[likely]] {
            coefficients[scan[place + pair.firstAdvance]] = pair.firstLevel;
            coefficients[scan[last]] = pair.secondLevel;
            place = last;
            left -= pair.bits;
            window.Skip(pair.bits);
            window.Refill();
            continue;
        }
        Symbol symbol = {pair.firstLevel, pair.firstAdvance, pair.firstBits};
        if (symbol.bits == 0) symbol = table.longCodes[window.Leading(kWindowBits) & ((1 << kIndexBits) - 1)];
        if (symbol.bits > left) break;
        left -= symbol.bits;
        window.Skip(symbol.bits);
        place += symbol.advance;
        if (place < kPlaces) coefficients[scan[place]] = symbol.level;
        if (place < stop && pair.bits > symbol.bits) {
            // The second code word of a pair, which has no room or is the last.
            const uint32_t bits = pair.bits - uint32_t{symbol.bits};
            if (bits > left) break;
            left -= bits;
            place = last;
            if (place < kPlaces) coefficients[scan[place]] = pair.secondLevel;
        }
        if (place >= stop) {
            isDone = true;
            break;
        }
        window.Refill();
    }
    block.place = place;
    block.isDone = isDone;
    block.cutBits = isDone ? 0 : std::min(left, kWindowBits - 1); // less than the longest code word has
    block.cut = window.Cut(block.cutBits);
    return isDone ? left : 0;
}

/// Spare bits of a macroblock or a segment, one behind the other.
template <int32_t kBytes>
class BitPool {
public:
    /// Without a branch for what an area leaves, since nobody can guess how much it is.
    void AppendArea(BitRange range) {
        static_assert(2 * kMost >= 8 * 14, "an area");
        const uint32_t count = range.end - range.position, first = std::min(count, kMost);
        AppendBits(range.data, range.position, first);
        AppendBits(range.data, range.position + first, count - first);
    }

    void Append(BitRange range) {
        for (; range.end - range.position > kMost; range.position += kMost)
            AppendBits(range.data, range.position, kMost);
        AppendBits(range.data, range.position, range.end - range.position);
    }

    bool IsEmpty() const { return fEnd == 0; }
    BitRange Rest() const { return {fBytes, fPosition, fEnd}; }

    /// Goes on with blocks that are not done with, in the code word that each was cut in, as long as there are bits.
    /// \param open  a bit for each of them, the lowest for the first
    /// \return those that still are not done with.
    uint64_t Continue(const DVHuffmanTable& table, Block* blocks, uint64_t open) {
        for (uint64_t left = open; left != 0 && fPosition != fEnd; left &= left - 1) {
            const int32_t index = std::countr_zero(left);
            Block& block = blocks[index];
            const BitWindow window(block.cut, block.cutBits, Rest());
            fPosition = fEnd - Parse(table, window, block.cutBits + fEnd - fPosition, block);
            open ^= uint64_t{block.isDone} << index;
        }
        return open;
    }

private:
    static constexpr uint32_t kMost = 56; // bits that a word has at any position

    void AppendBits(const uint8_t* data, uint32_t position, uint32_t count) {
        const uint64_t bits = WordAt(data + position / 8) << position % 8 & ~(~uint64_t{0} >> count);
        const uint64_t word = fBegun | bits >> fEnd % 8;
        const uint64_t bytes = __builtin_bswap64(word);
        std::memcpy(fBytes + fEnd / 8, &bytes, sizeof bytes);
        const uint32_t end = fEnd + count;
        fBegun = word << 8 * (end / 8 - fEnd / 8);
        fEnd = end;
    }

    uint8_t fBytes[kBytes + kReadAhead] = {};
    uint64_t fBegun = 0; ///< bits of the last byte, highest first
    uint32_t fPosition = 0, fEnd = 0;
};

struct Layout50 {
    static constexpr uint8_t kAreaBytes[] = {14, 14, 14, 14, 10, 10};
};
struct Layout100 {
    static constexpr uint8_t kAreaBytes[] = {10, 10, 10, 10, 10, 10, 8, 8};
};

/// Where the parse of a segment takes its scans from, by the mode, and writes to.
struct Target {
    const uint8_t* scans[2];
    int16_t* coefficients;
    uint32_t* parameters;
};

constexpr DVParseDepth kWhole = {};

template <class Layout>
class Segment {
public:
    Segment(const uint8_t* segment, const DVHuffmanTable& table, const Target& target)
        : fTable(table), fTarget(target) {
        std::memcpy(fBytes, segment, kSegmentBytes);
    }

    void Parse() {
        for (int32_t i = 0; i < kMacroblocks; ++i) ParseAreas(i, kWhole);
        ParseSpareBits();
    }

    /// Until every block has reached the last place that is wanted. Most do so in their own areas; where one does not, only
    /// whole blocks tell what they leave to others.
    void ParseTo(DVParseDepth depth) {
        for (int32_t i = 0; i < kMacroblocks; ++i) {
            ParseAreas(i, depth);
            if (fOpen[i] == 0) continue;
            ParseAgain(i);
            ParseSpareBitsOfMacroblock(i);
            if (!HasReached(i, depth)) return ParseAllAgain();
        }
    }

private:
    static constexpr int32_t kBlocks = std::size(Layout::kAreaBytes); // of a macroblock

    /// The blocks of a macroblock, each in its own area.
    void ParseAreas(int32_t macroblock, DVParseDepth depth) {
        uint64_t open = 0;
        const uint8_t* area = fBytes + kBlockBytes * macroblock + kFirstArea;
        const uint32_t quantiser = area[-1] & 0xf;
        for (int32_t i = 0; i < kBlocks; ++i) {
            const bool is248 = (area[1] & 0x40) != 0;
            const int32_t index = kBlocks * macroblock + i;
            int16_t* const coefficients = fTarget.coefficients + kPlaces * index;
            fTarget.parameters[index] = area[1] | quantiser << 16;
            coefficients[0] = static_cast<int16_t>(static_cast<int16_t>(area[0] << 8 | area[1]) >> 7);
            const uint32_t stop = is248 ? depth.stop248 : depth.stop88;
            Block& block = fBlocks[index];
            block = {coefficients, fTarget.scans[is248 ? 1 : 0], 0, stop, false, 0, 0};
            const auto begin = static_cast<uint32_t>(area - fBytes) * 8;
            area += Layout::kAreaBytes[i];
            const BitRange codes = {fBytes, begin + kHeadBits, static_cast<uint32_t>(area - fBytes) * 8};
            const uint32_t left = PK::Parse(fTable, BitWindow(codes), codes.end - codes.position, block);
            fRest[macroblock][i] = {fBytes, codes.end - left, codes.end};
            open |= uint64_t{!block.isDone} << i;
        }
        fOpen[macroblock] = open;
    }

    /// To the end of the blocks.
    void ParseAgain(int32_t macroblock) {
        std::fill_n(fTarget.coefficients + kBlocks * macroblock * kPlaces, kBlocks * kPlaces, int16_t{0});
        ParseAreas(macroblock, kWhole);
    }

    void ParseAllAgain() {
        for (int32_t i = 0; i < kMacroblocks; ++i) ParseAgain(i);
        for (auto& pool : fPools) pool = {};
        ParseSpareBits();
    }

    bool HasReached(int32_t macroblock, DVParseDepth depth) const {
        const std::span blocks(fBlocks + kBlocks * macroblock, kBlocks);
        return std::ranges::all_of(blocks, [&](const Block& block) {
            return block.place >= (block.scan == fTarget.scans[0] ? depth.stop88 : depth.stop248);
        });
    }

    /// Goes on with the blocks of a macroblock that are not done with in what its others leave; the rest stays in the pool.
    void ParseSpareBitsOfMacroblock(int32_t macroblock) {
        BitPool<kBlockBytes>& pool = fPools[macroblock];
        for (const BitRange& rest : fRest[macroblock]) pool.AppendArea(rest);
        fOpen[macroblock] = pool.Continue(fTable, fBlocks + kBlocks * macroblock, fOpen[macroblock]);
    }

    /// And with those that are left in what all macroblocks leave.
    void ParseSpareBits() {
        uint64_t open = 0;
        for (int32_t i = 0; i < kMacroblocks; ++i) {
            if (fOpen[i] != 0) ParseSpareBitsOfMacroblock(i);
            open |= fOpen[i] << kBlocks * i;
        }
        if (open == 0) return;
        BitPool<kSegmentBytes> ofSegment;
        for (int32_t i = 0; i < kMacroblocks; ++i) {
            if (fPools[i].IsEmpty())
                for (const BitRange& rest : fRest[i]) ofSegment.AppendArea(rest);
            else
                ofSegment.Append(fPools[i].Rest());
        }
        ofSegment.Continue(fTable, fBlocks, open);
    }

    const DVHuffmanTable& fTable;
    const Target& fTarget;
    uint8_t fBytes[kSegmentBytes + kReadAhead] = {};
    Block fBlocks[kMacroblocks * kBlocks];
    uint64_t fOpen[kMacroblocks]; ///< The blocks of each that are not done with, a bit for each.
    BitRange fRest[kMacroblocks][kBlocks];
    BitPool<kBlockBytes> fPools[kMacroblocks];
};

template <class Layout>
int32_t DecodeSegment(const uint8_t* segment, const DVHuffmanTable* table, const Target& target,
                      DVParseDepth depth) {
    if (segment == nullptr || table == nullptr || target.coefficients == nullptr ||
        target.parameters == nullptr)
        return kStatusNullPointer;
    Segment<Layout> parse(segment, *table, target);
    if (depth.stop88 == kWhole.stop88)
        parse.Parse();
    else
        parse.ParseTo(depth);
    return kStatusOk;
}

} // namespace

int32_t InitDVHuffmanTable(std::span<const DVCode> codes, const DVEscape (&escapes)[2],
                           DVHuffmanTable* table) noexcept {
    if (table == nullptr) return kStatusNullPointer;
    constexpr uint32_t kEntries = 1 << kIndexBits, kLongPrefix = ((1 << kLongPrefixBits) - 1) << kIndexBits;
    for (uint32_t i = 0; i < kEntries; ++i)
        table->longCodes[i] = FirstSymbol(codes, escapes, kLongPrefix | i);
    for (uint32_t i = 0; i < kEntries; ++i) {
        const uint32_t window = i << kLongPrefixBits;
        const Symbol first = FirstSymbol(codes, escapes, window);
        if (first.bits > kIndexBits) {
            table->pairs[i] = {0, 0, 0, kPastTheEnd, 0, 0};
            continue;
        }
        const Symbol second = FirstSymbol(codes, escapes, (window << first.bits) & 0xffff);
        const bool isWhole = first.bits + second.bits <= kIndexBits && first.advance != kPastTheEnd;
        table->pairs[i] = PairOf(first, isWhole ? second : Symbol{first.level, 0, 0});
    }
    return kStatusOk;
}

int32_t HuffmanDecodeSegmentDV(const uint8_t* segment, const DVScan (&scans)[2], const DVHuffmanTable* table,
                               int16_t* coefficients, uint32_t* blockParams, DVParseDepth depth) noexcept {
    return DecodeSegment<Layout50>(segment, table,
                                   {{scans[0].data(), scans[1].data()}, coefficients, blockParams}, depth);
}

int32_t HuffmanDecodeSegmentDV100(const uint8_t* segment, const DVScan& scan, const DVHuffmanTable* table,
                                  int16_t* coefficients, uint32_t* blockParams, DVParseDepth depth) noexcept {
    depth.stop248 = depth.stop88;
    return DecodeSegment<Layout100>(segment, table, {{scan.data(), scan.data()}, coefficients, blockParams},
                                    depth);
}

} // namespace PK
