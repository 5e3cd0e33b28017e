#include "reference/ReferenceDV.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <numbers>
#include <string>

namespace PKTest {
namespace {

/// One of 6 or 8 of a macroblock.
struct Block {
    int dc = 0;
    bool mode = false;
    int classNumber = 0;
    int place = 0;                ///< in the scan, of the last code
    std::array<int, 64> levels{}; ///< by place in the scan
    bool isEnded = false;
    std::string rest; ///< bits behind the last whole code
};

std::string BitsOf(const uint8_t* bytes, int firstBit, int count) {
    std::string bits;
    for (int i = firstBit; i < firstBit + count; ++i)
        bits += (bytes[i / 8] >> (7 - i % 8) & 1) != 0 ? '1' : '0';
    return bits;
}

/// Reads whole codes off the front of the block's bits.
void ReadCodes(Block& block) {
    const auto& codes = DVCodes();
    size_t at = 0;
    while (!block.isEnded) {
        size_t next = at;
        unsigned word = 1;
        auto code = codes.end();
        while (code == codes.end() && next < block.rest.size()) {
            word = word << 1 | (block.rest[next++] == '1');
            code = codes.find(word);
        }
        if (code == codes.end()) break;
        const DVCode& found = code->second;
        bool isNegative = false;
        if (found.amplitude > 0) {
            if (next == block.rest.size()) break;
            isNegative = block.rest[next++] == '1';
        }
        at = next;
        if (found.is != DVCode::Is::kEnd) block.place += found.run + 1;
        block.isEnded = found.is == DVCode::Is::kEnd || block.place > 63;
        if (!block.isEnded)
            block.levels[static_cast<size_t>(block.place)] = isNegative ? -found.amplitude : found.amplitude;
    }
    block.rest.erase(0, at);
}

/// Lets blocks that have not ended go on from a pool, one after the other, and leaves in it what they do not need.
void ReadFrom(std::string& pool, std::vector<Block>::iterator first, std::vector<Block>::iterator end) {
    for (; first != end; ++first) {
        if (first->isEnded) continue;
        first->rest += pool;
        pool.clear();
        ReadCodes(*first);
        if (first->isEnded) std::swap(pool, first->rest);
    }
}

std::vector<Block> ReadSegment(const DVLayout& layout, const uint8_t* segment) {
    const std::vector<int> areas = layout.Areas();
    std::vector<Block> blocks;
    std::string pools[5];
    for (int macroblock = 0; macroblock < 5; ++macroblock) {
        int bit = 32;
        for (const int area : areas) {
            const std::string bits = BitsOf(segment + 80 * macroblock, bit, area);
            bit += area;
            Block& block = blocks.emplace_back();
            block.dc = std::stoi(bits.substr(0, 9), nullptr, 2);
            if (block.dc >= 256) block.dc -= 512;
            block.mode = bits[9] == '1';
            block.classNumber = std::stoi(bits.substr(10, 2), nullptr, 2);
            block.rest = bits.substr(12);
            ReadCodes(block);
            if (block.isEnded) {
                pools[macroblock] += block.rest;
                block.rest.clear();
            }
        }
    }
    std::string all;
    const auto count = static_cast<ptrdiff_t>(areas.size());
    for (int macroblock = 0; macroblock < 5; ++macroblock) {
        ReadFrom(pools[macroblock], blocks.begin() + macroblock * count,
                 blocks.begin() + (macroblock + 1) * count);
        all += pools[macroblock];
    }
    ReadFrom(all, blocks.begin(), blocks.end());
    return blocks;
}

/// In the raster; whole numbers, halves rounded to the even one, and as great as they come.
using Coefficients = std::array<double, 64>;

Coefficients WithSteps(const Block& block, int qno) {
    Coefficients coefficients{};
    coefficients[0] = 4 * block.dc;
    for (size_t i = 1; i < 64; ++i) {
        const auto [raster, area] = DVScan(block.mode)[i];
        const auto place = static_cast<size_t>(raster);
        const int factor = DVFactors(block.mode)[place] << DVAreaShift(area, block.classNumber, qno);
        coefficients[place] = std::nearbyint(block.levels[i] * factor / 256.0);
    }
    return coefficients;
}

Coefficients WithStepsOfDV100(const Block& block, int qno, const std::array<int, 64>& table) {
    Coefficients coefficients{};
    coefficients[0] = 4 * block.dc;
    for (size_t i = 1; i < 64; ++i) {
        const auto place = static_cast<size_t>(DVScan(false)[i].raster);
        const double product =
            block.levels[i] * DV100Step(qno) * std::pow(2, block.classNumber) * table[place] / 32;
        coefficients[place] = std::floor(product + 0.5);
    }
    return coefficients;
}

double C(int k) {
    return k == 0 ? std::sqrt(1.0 / 8) : 0.5;
}

/// The sample that coefficient (h, v) = 1 gives at (x, y).
double Basis88(int h, int v, int x, int y) {
    constexpr double kPi = std::numbers::pi;
    return C(h) * C(v) * std::cos(kPi * v * (2 * y + 1) / 16) * std::cos(kPi * h * (2 * x + 1) / 16);
}
double Basis248(int h, int v, int x, int y) {
    constexpr double kPi = std::numbers::pi;
    const int u = v % 4, z = y / 2;
    const double sign = v >= 4 && y % 2 == 1 ? -1 : 1;
    return sign * C(h) * C(u) * std::cos(kPi * u * (2 * z + 1) / 8) * std::cos(kPi * h * (2 * x + 1) / 16);
}

struct Bases {
    std::array<Coefficients, 64> samples; ///< of each coefficient
    explicit Bases(double (*basis)(int h, int v, int x, int y)) {
        for (size_t i = 0; i < 64; ++i)
            for (size_t at = 0; at < 64; ++at)
                samples[i][at] = basis(static_cast<int>(i % 8), static_cast<int>(i / 8),
                                       static_cast<int>(at % 8), static_cast<int>(at / 8));
    }
};

using Samples8x8 = std::array<uint8_t, 64>;

Samples8x8 Inverse(const Coefficients& coefficients, bool is248) {
    static const Bases bases[2] = {Bases(Basis88), Bases(Basis248)};
    Coefficients sums{};
    for (size_t i = 0; i < 64; ++i)
        if (coefficients[i] != 0)
            for (size_t at = 0; at < 64; ++at) sums[at] += coefficients[i] * bases[is248].samples[i][at];
    Samples8x8 samples;
    for (size_t at = 0; at < 64; ++at)
        samples[at] = static_cast<uint8_t>(std::clamp(std::floor(sums[at] + 128.5), 0.0, 255.0));
    return samples;
}

/// \param step rows of the plane from one line of the block to the next.
void Place(DVPlane& plane, const Samples8x8& block, int x, int y, int step = 1) {
    for (int i = 0; i < 64; ++i) plane.At(x + i % 8, y + i / 8 * step) = block[static_cast<size_t>(i)];
}

/// The left four columns are eight lines, the right four the eight lines below.
void PlaceEdge(DVPlane& plane, const Samples8x8& block, int x, int y) {
    for (int i = 0; i < 64; ++i)
        plane.At(x + i % 4, y + i / 8 + (i % 8 < 4 ? 0 : 8)) = block[static_cast<size_t>(i)];
}

void PlaceMacroblock(DVPicture& picture, const std::vector<Samples8x8>& blocks, DVPlace place, bool isField) {
    DVPlane &luma = picture.planes[0], &cb = picture.planes[1], &cr = picture.planes[2];
    const auto [shape, x, y] = place;
    const auto placeHD = [&](size_t piece, int pieceX, int pieceY, int step) {
        Place(luma, blocks[2 * piece], pieceX, pieceY, step);
        Place(luma, blocks[2 * piece + 1], pieceX + 8, pieceY, step);
        Place(cr, blocks[4 + piece], pieceX / 2, pieceY, step);
        Place(cb, blocks[6 + piece], pieceX / 2, pieceY, step);
    };
    switch (shape) {
    case DVShape::kUnused:
        break;
    case DVShape::k411:
        for (int i = 0; i < 4; ++i) Place(luma, blocks[static_cast<size_t>(i)], x + 8 * i, y);
        Place(cr, blocks[4], x / 4, y);
        Place(cb, blocks[5], x / 4, y);
        break;
    case DVShape::kEdgeOf411:
    case DVShape::k420:
        for (int i = 0; i < 4; ++i)
            Place(luma, blocks[static_cast<size_t>(i)], x + 8 * (i % 2), y + 8 * (i / 2));
        if (shape == DVShape::k420) {
            Place(cr, blocks[4], x / 2, y / 2);
            Place(cb, blocks[5], x / 2, y / 2);
        } else {
            PlaceEdge(cr, blocks[4], x / 4, y);
            PlaceEdge(cb, blocks[5], x / 4, y);
        }
        break;
    case DVShape::k422:
        Place(luma, blocks[0], x, y);
        Place(luma, blocks[2], x + 8, y);
        Place(cr, blocks[4], x / 2, y);
        Place(cb, blocks[5], x / 2, y);
        break;
    case DVShape::kHD:
        placeHD(0, x, y, isField ? 2 : 1);
        placeHD(1, x, isField ? y + 1 : y + 8, isField ? 2 : 1);
        break;
    case DVShape::kHalfRow:
        placeHD(0, x, y, 1);
        placeHD(1, x + 16, y, 1);
        break;
    }
}

DVPlane PlaneOf(int width, int height) {
    return {width, height, std::vector<uint8_t>(static_cast<size_t>(width) * static_cast<size_t>(height))};
}

} // namespace

DVPicture ReferenceDVPicture(DVKind kind, const uint8_t* frame) {
    const DVLayout& layout = LayoutOf(kind);
    const int chromaWidth = layout.width / layout.lumaPerChromaX,
              chromaHeight = layout.height / layout.lumaPerChromaY;
    DVPicture picture{{PlaneOf(layout.width, layout.height), PlaneOf(chromaWidth, chromaHeight),
                       PlaneOf(chromaWidth, chromaHeight)}};
    const auto count = static_cast<size_t>(layout.BlocksOfMacroblock());
    const bool isSecondOfPair = layout.isDV100 && !layout.is1080 && (frame[1] & 4) == 0;
    const int placements = isSecondOfPair ? 2 : 0;
    for (int i = 0; i < layout.channels * layout.sequences * 27; ++i) {
        const int segment = i % 27, sequence = i / 27 % layout.sequences, channel = i / 27 / layout.sequences;
        const uint8_t* const bytes = frame + PlaceOfSegment(channel, sequence, segment, layout);
        const std::vector<Block> blocks = ReadSegment(layout, bytes);
        for (int macroblock = 0; macroblock < 5; ++macroblock) {
            const int qno = bytes[80 * macroblock + 3] & 15;
            const Block* const first = &blocks[static_cast<size_t>(macroblock) * count];
            std::vector<Samples8x8> samples;
            for (size_t b = 0; b < count; ++b)
                samples.push_back(
                    layout.isDV100
                        ? Inverse(WithStepsOfDV100(first[b], qno, DV100Table(layout.is1080, b >= 4)), false)
                        : Inverse(WithSteps(first[b], qno), first[b].mode));
            PlaceMacroblock(picture, samples,
                            PlaceOf(kind, channel + placements, sequence, segment, macroblock),
                            layout.is1080 && first->mode);
        }
    }
    return picture;
}

} // namespace PKTest
