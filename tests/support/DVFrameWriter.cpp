#include "support/DVFrameWriter.h"

#include <algorithm>
#include <cstdlib>

namespace PKTest {
namespace {

std::string Binary(int value, int length) {
    std::string bits;
    for (int i = length - 1; i >= 0; --i) bits += (value >> i & 1) != 0 ? '1' : '0';
    return bits;
}

/// Moves as much from the surplus to the area as that has room for.
void Fill(std::string& area, size_t room, std::string& surplus) {
    const size_t count = std::min(room - area.size(), surplus.size());
    area += surplus.substr(0, count);
    surplus.erase(0, count);
}

/// Spare room of the areas takes the surplus in order.
void FillAll(std::vector<std::string>& areas, const std::vector<size_t>& rooms,
             std::vector<std::string>& surplus, size_t first, size_t end) {
    for (size_t area = first; area < end; ++area)
        for (size_t block = first; block < end; ++block) Fill(areas[area], rooms[area], surplus[block]);
}

/// The identification of each block and the header's content, which is all that a decoder looks at.
std::vector<uint8_t> EmptyFrame(DVKind kind) {
    const DVLayout& layout = LayoutOf(kind);
    std::vector<uint8_t> bytes(static_cast<size_t>(layout.Bytes()), 0xff);
    const bool is625 = layout.sequences == 12, isIEC = kind == DVKind::k625of420;
    for (int block = 0; block < layout.Bytes() / 80; ++block) {
        const int sequence = block / 150, inSequence = block % 150, channel = sequence / layout.sequences;
        const bool isAudio = inSequence >= 6 && (inSequence - 6) % 16 == 0;
        const int section = inSequence == 0  ? 0x1f
                            : inSequence < 3 ? 0x3f
                            : inSequence < 6 ? 0x56
                            : isAudio        ? 0x76
                                             : 0x96;
        uint8_t* const id = &bytes[static_cast<size_t>(80 * block)];
        id[0] = static_cast<uint8_t>(section);
        id[1] = static_cast<uint8_t>(sequence % layout.sequences << 4 | (channel & 1) << 3 |
                                     (channel < 2) << 2 | 3);
        if (inSequence != 0) continue;
        id[2] = 0;
        id[3] = is625 ? 0xbf : 0x3f;
        id[4] = isIEC ? 0xf8 : 0xf9;
        for (int i = 5; i < 8; ++i) id[i] = isIEC ? 0x78 : 0x79;
    }
    return bytes;
}

} // namespace

std::string DVLevelBits(int run, int level) {
    const int amplitude = std::abs(level);
    std::string bits = BitsOfLevel(run, amplitude);
    if (bits.empty()) bits = (run > 0 ? BitsOfZeros(run - 1) : "") + BitsOfLevel(0, amplitude);
    return bits + (level < 0 ? '1' : '0');
}

DVFrameWriter::DVFrameWriter(DVKind kind) : fKind(kind), fBytes(EmptyFrame(kind)) {
    const std::vector<DVBlockBits> grey(static_cast<size_t>(5 * Layout().BlocksOfMacroblock()));
    for (int i = 0; i < SegmentCount(); ++i) Write(i, grey, std::vector<int>(5, 15));
}

uint8_t* DVFrameWriter::Segment(int index) {
    const int sequences = Layout().sequences;
    const int place = PlaceOfSegment(index / 27 / sequences, index / 27 % sequences, index % 27, Layout());
    return &fBytes[static_cast<size_t>(place)];
}

void DVFrameWriter::Write(int segment, const std::vector<DVBlockBits>& blocks, const std::vector<int>& qno) {
    const auto count = static_cast<size_t>(Layout().BlocksOfMacroblock());
    const std::vector<int> areaBits = Layout().Areas();
    std::vector<std::string> areas, surplus;
    std::vector<size_t> rooms;
    for (size_t i = 0; i < 5 * count; ++i) {
        const DVBlockBits& block = blocks.at(i);
        rooms.push_back(static_cast<size_t>(areaBits[i % count]));
        surplus.push_back(Binary(block.dc, 9) + (block.mode ? '1' : '0') + Binary(block.classNumber, 2) +
                          block.codes + kDVEndOfBlock);
        areas.emplace_back();
        Fill(areas[i], rooms[i], surplus[i]);
    }
    for (size_t first = 0; first < 5 * count; first += count)
        FillAll(areas, rooms, surplus, first, first + count);
    FillAll(areas, rooms, surplus, 0, 5 * count);
    for (size_t macroblock = 0; macroblock < 5; ++macroblock) {
        uint8_t* const bytes = Segment(segment) + 80 * macroblock;
        bytes[3] = static_cast<uint8_t>(qno.at(macroblock));
        std::string bits;
        for (size_t i = macroblock * count; i < (macroblock + 1) * count; ++i)
            bits += areas[i] + std::string(rooms[i] - areas[i].size(), '1');
        for (size_t i = 0; i < 76; ++i)
            bytes[4 + i] = static_cast<uint8_t>(std::stoi(bits.substr(8 * i, 8), nullptr, 2));
    }
}

} // namespace PKTest
