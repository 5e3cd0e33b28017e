#include "support/ByteStream.h"

#include <algorithm>
#include <cstring>
#include <iterator>
#include <limits>
#include <random>

namespace PKFuzz {

namespace {

constexpr int32_t kEdgesOfI32[] = {
    0, 1, -1, 2, -2, std::numeric_limits<int32_t>::max(), std::numeric_limits<int32_t>::min(), INT32_MAX / 16,
};

// As words in memory order: the float values, and the pairs of 16-bit samples that share their bits.
constexpr uint32_t kEdgeSamples[] = {
    0x00000000, // 0
    0x80000000, // -0, or a full 15-bit sample
    0x3f800000, // 1
    0xbf800000, // -1
    0x00000001, // the least denormal
    0x80800000, // the least normal, negative
    0x7f7fffff, // the greatest
    0x7f800000, // infinity
    0xff800000, // negative infinity
    0x7fc00000, // not a number
    0x7fa00000, // not a number, signalling
    0x4f000000, // 2^31
    0xffffffff,
    0x80008000, // two full 15-bit samples
    0x3fffffff, // three full 10-bit samples
};

uint32_t NoiseWord(std::minstd_rand& engine) {
    return static_cast<uint32_t>(engine()) ^ static_cast<uint32_t>(engine()) << 16;
}

float UnitFloat(std::minstd_rand& engine) {
    constexpr float kRange = 1.5f;
    return static_cast<float>(engine() & 0xffff) / 65536 * kRange - 0.25f;
}

uint32_t SampleWord(std::minstd_rand& engine) {
    switch (engine() >> 8 & 7) {
    case 0:
        return kEdgeSamples[(engine() >> 8) % std::size(kEdgeSamples)];
    case 1:
        return NoiseWord(engine);
    default: {
        const float value = UnitFloat(engine);
        uint32_t word = 0;
        std::memcpy(&word, &value, sizeof word);
        return word;
    }
    }
}

template <class DrawWord>
void FillWords(uint8_t* bytes, size_t count, DrawWord draw) {
    for (size_t i = 0; i < count; i += sizeof(uint32_t)) {
        const uint32_t word = draw();
        std::memcpy(bytes + i, &word, std::min(sizeof word, count - i));
    }
}

} // namespace

uint32_t ByteStream::U32() {
    uint32_t value = 0;
    for (int i = 0; i < 4; ++i) value = value << 8 | Byte();
    return value;
}

uint64_t ByteStream::U64() {
    const uint64_t high = U32();
    return high << 32 | U32();
}

uint32_t ByteStream::Below(uint32_t count) {
    return (count <= 256 ? Byte() : U32()) % count;
}

int32_t ByteStream::Between(int32_t low, int32_t high) {
    return low + static_cast<int32_t>(Below(static_cast<uint32_t>(high - low + 1)));
}

int32_t ByteStream::AnyI32() {
    if (Bool()) return static_cast<int32_t>(U32());
    return kEdgesOfI32[Below(std::size(kEdgesOfI32))];
}

void ByteStream::Fill(uint8_t* bytes, size_t count) {
    const uint32_t style = Below(4);
    std::minstd_rand engine(U32());
    switch (style) {
    case 0:
        FillWords(bytes, count, [&] { return SampleWord(engine); });
        break;
    case 1:
        FillWords(bytes, count, [&] { return NoiseWord(engine); });
        break;
    case 2:
        std::fill_n(bytes, count, Byte());
        break;
    default:
        std::generate_n(bytes, count, [&] { return Byte(); });
    }
}

} // namespace PKFuzz
