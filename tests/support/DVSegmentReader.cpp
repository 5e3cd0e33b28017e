#include "support/DVSegmentReader.h"

#include "primitives/DVCodes.h"

#include <cstddef>
#include <deque>
#include <map>
#include <utility>

namespace PKTest {
namespace {

using Bits = std::deque<bool>;

/// Words by length and bits.
const std::map<std::pair<int, uint32_t>, PK::DVCode>& Words() {
    static const auto words = [] {
        std::map<std::pair<int, uint32_t>, PK::DVCode> all;
        uint32_t word = 0;
        int length = 2;
        for (const PK::DVCode& code : PK::kDVCodes) {
            word <<= code.length - length;
            length = code.length;
            all[{length, word++}] = code;
        }
        return all;
    }();
    return words;
}

uint32_t Number(const Bits& bits, size_t first, size_t count) {
    uint32_t number = 0;
    for (size_t i = 0; i < count; ++i) number = number << 1 | (bits[first + i] ? 1 : 0);
    return number;
}

class BlockReader {
public:
    ReadBlock block;
    Bits bits; ///< as far as they were given, from the head on

    /// Reads as many words as there are.
    void Read() {
        if (fNext == 0) ReadHead();
        while (!block.hasEnded && ReadWord()) {
        }
        block.bits = fNext;
    }

    Bits TakeRest() {
        Bits rest(bits.begin() + static_cast<ptrdiff_t>(fNext), bits.end());
        bits.resize(fNext);
        return rest;
    }

private:
    void ReadHead() {
        const auto dc = static_cast<int32_t>(Number(bits, 0, 9));
        block.dc = dc >= 256 ? dc - 512 : dc;
        block.mode = static_cast<int32_t>(Number(bits, 9, 1));
        block.classNumber = static_cast<int32_t>(Number(bits, 10, 2));
        fNext = 12;
    }

    bool Has(size_t count) const { return bits.size() - fNext >= count; }

    void Put(int32_t run, int32_t level) {
        fPlace += run + 1;
        if (level != 0 && fPlace < 64) block.levels[static_cast<size_t>(fPlace)] = level;
    }

    bool ReadWord() {
        if (Has(7) && Number(bits, fNext, 7) == 0x7e) return ReadEscape(6);
        if (Has(7) && Number(bits, fNext, 7) == 0x7f) return ReadEscape(9);
        for (size_t length = 2; length <= 12 && Has(length); ++length) {
            const auto word = Words().find({static_cast<int>(length), Number(bits, fNext, length)});
            if (word == Words().end()) continue;
            const PK::DVCode& code = word->second;
            if (code.amplitude != 0 && !Has(length + 1)) return false;
            fNext += length;
            if (code.run == PK::kEndOfBlockRun) {
                block.hasEnded = true;
            } else if (code.amplitude == 0) {
                Put(code.run, 0);
            } else {
                Put(code.run, bits[fNext++] ? -code.amplitude : code.amplitude);
            }
            return true;
        }
        return false;
    }

    bool ReadEscape(size_t more) {
        if (!Has(7 + more)) return false;
        const auto value = static_cast<int32_t>(Number(bits, fNext + 7, more));
        fNext += 7 + more;
        if (more == 6)
            Put(value, 0);
        else
            Put(0, (value & 1) != 0 ? -(value >> 1) : value >> 1);
        return true;
    }

    size_t fNext = 0;
    int32_t fPlace = 0;
};

/// What blocks have left, to those that have not ended, in turns.
void Share(std::vector<BlockReader>& readers, size_t first, size_t end, Bits& pool) {
    for (size_t i = first; i < end; ++i)
        while (!readers[i].block.hasEnded && !pool.empty()) {
            readers[i].bits.push_back(pool.front());
            pool.pop_front();
            readers[i].Read();
        }
}

} // namespace

ReadSegment ReadDVSegment(const uint8_t* segment, int32_t blocks) {
    const std::vector<int> bytes = blocks == 8 ? std::vector<int>{10, 10, 10, 10, 10, 10, 8, 8}
                                               : std::vector<int>{14, 14, 14, 14, 10, 10};
    ReadSegment read;
    std::vector<BlockReader> readers;
    Bits ofSegment;
    for (size_t m = 0; m < 5; ++m) {
        const uint8_t* at = segment + 80 * m + 3;
        read.status[m] = *at >> 4;
        read.qno[m] = *at++ & 15;
        const size_t first = readers.size();
        Bits pool;
        for (const int count : bytes) {
            BlockReader& reader = readers.emplace_back();
            for (int i = 0; i < 8 * count; ++i) reader.bits.push_back((at[i / 8] >> (7 - i % 8) & 1) != 0);
            at += count;
            reader.Read();
            if (!reader.block.hasEnded) continue;
            const Bits rest = reader.TakeRest();
            pool.insert(pool.end(), rest.begin(), rest.end());
        }
        Share(readers, first, readers.size(), pool);
        ofSegment.insert(ofSegment.end(), pool.begin(), pool.end());
    }
    Share(readers, 0, readers.size(), ofSegment);
    for (const BlockReader& reader : readers) read.blocks.push_back(reader.block);
    return read;
}

} // namespace PKTest
