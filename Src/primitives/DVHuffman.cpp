#include "primitives/DVHuffman.h"

#include "primitives/Status.h"

#include <algorithm>
#include <cstring>

namespace PK {
namespace {

using Symbol = DVHuffmanTable::Symbol;

constexpr uint32_t kIndexBits = DVHuffmanTable::kIndexBits;
constexpr uint32_t kWindowBits = 16; // of the longest code word with its sign
constexpr uint32_t kLongPrefixBits = kWindowBits - kIndexBits;
constexpr int32_t kPlaces = 64;
constexpr uint8_t kPastTheEnd = 2 * kPlaces; // an advance that no two others add up to

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

/// At least 57 bits from a position on, the first of them highest.
uint64_t Window(const uint8_t* data, uint32_t position) {
    uint64_t word;
    std::memcpy(&word, data + position / 8, sizeof word);
    return __builtin_bswap64(word) << (position % 8);
}

/// Bits that are still to be read, with eight bytes of memory behind them.
struct BitRange {
    const uint8_t* data;
    uint32_t position, end;

    uint32_t Count() const { return end - position; }
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

/// Reads code words until the block is done with or no whole one is left.
void Parse(const DVHuffmanTable& table, BitRange& bits, Block& block) {
    const uint8_t* const data = bits.data;
    const uint32_t end = bits.end, stop = block.stop;
    uint32_t position = bits.position, place = block.place;
    for (;;) {
        const uint64_t window = Window(data, position);
        const DVHuffmanTable::Pair pair = table.pairs[window >> (64 - kIndexBits)];
        const uint32_t last = place + pair.advance;
        if (last < stop && position + pair.bits <= end) [[likely]] {
            block.coefficients[block.scan[place + pair.firstAdvance]] = pair.firstLevel;
            block.coefficients[block.scan[last]] = pair.secondLevel;
            place = last;
            position += pair.bits;
            continue;
        }
        Symbol symbol = {pair.firstLevel, pair.firstAdvance, pair.firstBits};
        if (symbol.bits == 0)
            symbol = table.longCodes[(window >> (64 - kWindowBits)) & ((1 << kIndexBits) - 1)];
        if (position + symbol.bits > end) break;
        position += symbol.bits;
        place += symbol.advance;
        if (place < kPlaces) block.coefficients[block.scan[place]] = symbol.level;
        if (place >= stop) {
            block.isDone = true;
            break;
        }
    }
    bits.position = position;
    block.place = place;
}

/// Spare bits of a macroblock or a segment, one behind the other.
class BitPool {
public:
    void Clear() { fPosition = fEnd = kHeadBits; }

    void Append(BitRange bits) {
        constexpr uint32_t kMost = 56; // that a word takes at any position
        while (bits.position < bits.end) {
            const uint32_t count = std::min(bits.Count(), kMost);
            Replace(fEnd, Window(bits.data, bits.position), count);
            fEnd += count;
            bits.position += count;
        }
    }

    BitRange Rest() const { return {fBytes, fPosition, fEnd}; }

    /// Goes on with a block: the code word that it was cut in is put before what the pool still has.
    void Continue(const DVHuffmanTable& table, Block& block) {
        fPosition -= block.cutBits;
        Replace(fPosition, block.cut, block.cutBits);
        BitRange bits = Rest();
        Parse(table, bits, block);
        if (!block.isDone) Cut(bits, block);
        fPosition = bits.position;
    }

    /// Keeps what is left of bits that end in a code word of the block.
    static void Cut(BitRange& bits, Block& block) {
        block.cutBits = bits.Count();
        block.cut = Window(bits.data, bits.position);
        bits.position = bits.end;
    }

private:
    static constexpr uint32_t kHeadBits = 64; // room to put bits back

    /// Puts the first bits of a word to a position.
    void Replace(uint32_t position, uint64_t bits, uint32_t count) {
        if (count == 0) return;
        uint8_t* const place = fBytes + position / 8;
        uint64_t word;
        std::memcpy(&word, place, sizeof word);
        word = __builtin_bswap64(word);
        const uint32_t shift = position % 8;
        const uint64_t mask = ~uint64_t{0} << (64 - count) >> shift;
        word = __builtin_bswap64((word & ~mask) | (bits >> shift & mask));
        std::memcpy(place, &word, sizeof word);
    }

    uint8_t fBytes[kHeadBits / 8 + 400 + 8] = {};
    uint32_t fPosition = kHeadBits, fEnd = kHeadBits;
};

constexpr int32_t kMacroblocks = 5;
constexpr int32_t kBlockBytes = 80; // of a DIF block
constexpr int32_t kSegmentBytes = kMacroblocks * kBlockBytes;
constexpr int32_t kFirstArea = 4;
constexpr uint32_t kHeadBits = 12; // DC, mode and class

struct Layout50 {
    static constexpr uint8_t kAreaBytes[] = {14, 14, 14, 14, 10, 10};
};
struct Layout100 {
    static constexpr uint8_t kAreaBytes[] = {10, 10, 10, 10, 10, 10, 8, 8};
};

template <class Layout>
class Segment {
public:
    static constexpr int32_t kBlocks = std::size(Layout::kAreaBytes); // of a macroblock

    Segment(const uint8_t* segment, const DVHuffmanTable& table) : fTable(table) {
        std::memcpy(fBytes, segment, kSegmentBytes);
    }

    /// Each block in its own area.
    /// \param scans  by the mode; of one mode, the same twice.
    /// \return whether all are done with.
    bool ParseAreas(const uint8_t* const (&scans)[2], int16_t* coefficients, uint32_t* parameters,
                    const uint8_t (&stops)[2]) {
        bool isDone = true;
        for (int32_t i = 0; i < kMacroblocks; ++i) {
            const uint8_t* const block = fBytes + kBlockBytes * i;
            const uint32_t quantiser = block[kFirstArea - 1] & 0xf;
            const uint8_t* area = block + kFirstArea;
            for (int32_t j = 0; j < kBlocks; ++j, coefficients += kPlaces) {
                const uint32_t mode = area[1] >> 6 & 1;
                *parameters++ = area[1] | quantiser << 16;
                coefficients[0] = static_cast<int16_t>(static_cast<int16_t>(area[0] << 8 | area[1]) >> 7);
                Block& parsed = fBlocks[i][j];
                parsed = {coefficients, scans[mode], 0, stops[mode], false, 0, 0};
                BitRange& rest = fRest[i][j];
                const auto begin = static_cast<uint32_t>(area - fBytes) * 8;
                area += Layout::kAreaBytes[j];
                rest = {fBytes, begin + kHeadBits, static_cast<uint32_t>(area - fBytes) * 8};
                Parse(fTable, rest, parsed);
                if (!parsed.isDone) {
                    BitPool::Cut(rest, parsed);
                    isDone = false;
                }
            }
        }
        return isDone;
    }

    /// Goes on with the blocks that are not done with in what the others leave.
    void ParseSpareBits() {
        BitPool ofSegment;
        for (int32_t i = 0; i < kMacroblocks; ++i) {
            fPool.Clear();
            for (const BitRange& rest : fRest[i]) fPool.Append(rest);
            for (Block& block : fBlocks[i])
                if (!block.isDone) fPool.Continue(fTable, block);
            ofSegment.Append(fPool.Rest());
        }
        for (auto& blocks : fBlocks)
            for (Block& block : blocks)
                if (!block.isDone) ofSegment.Continue(fTable, block);
    }

private:
    const DVHuffmanTable& fTable;
    uint8_t fBytes[kSegmentBytes + 8] = {};
    Block fBlocks[kMacroblocks][kBlocks];
    BitRange fRest[kMacroblocks][kBlocks];
    BitPool fPool;
};

template <class Layout>
int32_t DecodeSegment(const uint8_t* segment, const uint8_t* const (&scans)[2], const DVHuffmanTable* table,
                      int16_t* coefficients, uint32_t* blockParams, DVParseDepth depth) {
    if (segment == nullptr || table == nullptr || coefficients == nullptr || blockParams == nullptr)
        return kStatusNullPointer;
    Segment<Layout> parse(segment, *table);
    if (parse.ParseAreas(scans, coefficients, blockParams, {depth.stop88, depth.stop248})) return kStatusOk;
    constexpr uint8_t kAll = DVParseDepth::kAll;
    if (depth.stop88 != kAll) {
        // Only whole blocks tell what they leave to others.
        std::fill_n(coefficients, kMacroblocks * Segment<Layout>::kBlocks * kPlaces, int16_t{0});
        if (parse.ParseAreas(scans, coefficients, blockParams, {kAll, kAll})) return kStatusOk;
    }
    parse.ParseSpareBits();
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
    return DecodeSegment<Layout50>(segment, {scans[0].data(), scans[1].data()}, table, coefficients,
                                   blockParams, depth);
}

int32_t HuffmanDecodeSegmentDV100(const uint8_t* segment, const DVScan& scan, const DVHuffmanTable* table,
                                  int16_t* coefficients, uint32_t* blockParams, DVParseDepth depth) noexcept {
    depth.stop248 = depth.stop88;
    return DecodeSegment<Layout100>(segment, {scan.data(), scan.data()}, table, coefficients, blockParams,
                                    depth);
}

} // namespace PK
