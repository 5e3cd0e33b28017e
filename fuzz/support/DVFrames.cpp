#include "support/DVFrames.h"

#include "dv/DVFormat.h"

#include <PixelKiln/Convert.h>

#include <algorithm>
#include <cstring>
#include <fstream>
#include <iterator>
#include <map>
#include <random>

namespace PKFuzz {
namespace {

using Bytes = std::vector<uint8_t>;
using PK::kDIFBlockBytes;

/// Gradients with noise in places, encoded. Every call gives the same.
Bytes MakeFrame(const PK::DVFormat& format, int32_t quality) {
    constexpr PK_PixelFormat kPixels = PK_PixelFormat_YUYV_422_8u;
    const int32_t rowBytes = 2 * format.width;
    Bytes picture(static_cast<size_t>(rowBytes) * static_cast<size_t>(format.height)),
        frame(static_cast<size_t>(format.FrameBytes()));
    std::minstd_rand engine(static_cast<uint32_t>(format.stream));
    for (int32_t y = 0; y < format.height; ++y)
        for (int32_t x = 0; x < rowBytes; ++x) {
            const bool isNoisy = (x / 128 + y / 64) % 3 == 0;
            const uint32_t noise = isNoisy ? static_cast<uint32_t>(engine()) >> 8 & 127 : 0;
            picture[static_cast<size_t>(y * rowBytes + x)] =
                static_cast<uint8_t>(static_cast<uint32_t>(x / 16 + y / 4) + noise);
        }
    PK_Convert(picture.data(), rowBytes, kPixels, frame.data(), format.FrameBytes(), format.stream,
               format.width, format.height, quality);
    return frame;
}

const Bytes& MadeFrame(const PK::DVFormat& format, bool isBest) {
    static std::map<std::pair<PK_PixelFormat, bool>, Bytes> frames;
    Bytes& frame = frames[{format.stream, isBest}];
    if (frame.empty()) frame = MakeFrame(format, isBest ? 5 : 0);
    return frame;
}

/// Where the tree is at hand; else those that are made stand for them.
constexpr const char* kKept[] = {"dv25_525_411_astronaut",
                                 "dv25_625_420_coffee",
                                 "dv25_625_411_chelsea",
                                 "dv50_525_coffee",
                                 "dv50_625_astronaut",
                                 "dv100_720p60_chelsea",
                                 "dv100_720p60_chelsea_second",
                                 "dv100_720p50_astronaut",
                                 "dv100_1080i60_coffee",
                                 "dv100_1080i50_astronaut",
                                 "stress_dv25_525_411",
                                 "stress_dv25_625_420",
                                 "stress_dv50_525"};

const Bytes& KeptFrame(size_t index) {
    static std::map<size_t, Bytes> frames;
    Bytes& frame = frames[index];
    if (frame.empty()) {
        std::ifstream file(std::string(PIXELKILN_MEDIA_DIR "/dv/") + kKept[index] + ".dif", std::ios::binary);
        frame.assign(std::istreambuf_iterator<char>(file), {});
    }
    return frame;
}

void FillNoise(ByteStream& stream, uint8_t* bytes, size_t count) {
    std::minstd_rand engine(stream.U32());
    std::generate_n(bytes, count, [&] { return static_cast<uint8_t>(engine() >> 8); });
}

void SetHeader(const PK::DVFormat& format, bool is420, Bytes& frame) {
    constexpr uint8_t kHeader[] = {0x1f, 0x07, 0x00, 0x3f, 0xf9, 0x79, 0x79, 0x79};
    std::ranges::copy(kHeader, frame.begin());
    if (format.is625) frame[3] |= 0x80;
    if (is420)
        for (const size_t byte : {4, 5, 6, 7}) frame[byte] &= 0xf8;
}

Bytes DrawWhole(ByteStream& stream, const PK::DVFormat& format) {
    const uint32_t kind = stream.Below(8);
    if (kind < 3) return MadeFrame(format, stream.Bool());
    if (kind < 6) {
        const Bytes& kept = KeptFrame(stream.Below(std::size(kKept)));
        return kept.size() == static_cast<size_t>(format.FrameBytes()) ? kept : MadeFrame(format, true);
    }
    Bytes frame(static_cast<size_t>(format.FrameBytes()));
    FillNoise(stream, frame.data(), frame.size());
    if (kind == 6) SetHeader(format, stream.Bool(), frame);
    return frame;
}

size_t DrawBlock(ByteStream& stream, const Bytes& frame) {
    return size_t{stream.U32()} % (frame.size() / kDIFBlockBytes) * kDIFBlockBytes;
}

/// From a bit of a block to its end, all alike.
void CutBlock(ByteStream& stream, uint8_t* block) {
    const uint32_t bit = stream.U32() % (8 * kDIFBlockBytes), byte = bit / 8;
    const auto rest = static_cast<uint8_t>(0xff >> bit % 8);
    const bool isOnes = stream.Bool();
    block[byte] = static_cast<uint8_t>(isOnes ? block[byte] | rest : block[byte] & ~rest);
    std::memset(block + byte + 1, isOnes ? 0xff : 0, kDIFBlockBytes - 1 - byte);
}

void Damage(ByteStream& stream, Bytes& frame) {
    switch (stream.Below(6)) {
    case 0:
        for (uint32_t flips = stream.Below(64); flips != 0; --flips)
            frame[stream.U32() % frame.size()] ^= static_cast<uint8_t>(1U << stream.Below(8));
        return;
    case 1: {
        const size_t block = DrawBlock(stream, frame), other = DrawBlock(stream, frame);
        std::swap_ranges(frame.begin() + static_cast<ptrdiff_t>(block),
                         frame.begin() + static_cast<ptrdiff_t>(block + kDIFBlockBytes),
                         frame.begin() + static_cast<ptrdiff_t>(block == other ? block : other));
        return;
    }
    case 2: {
        const size_t first = stream.U32() % frame.size();
        return FillNoise(stream, frame.data() + first,
                         std::min<size_t>(frame.size() - first, stream.U32() % 2000));
    }
    case 3: {
        const size_t first = stream.U32() % frame.size();
        std::fill_n(frame.begin() + static_cast<ptrdiff_t>(first),
                    std::min<size_t>(frame.size() - first, stream.U32() % 2000), stream.Byte());
        return;
    }
    case 4:
        for (uint32_t blocks = stream.Below(64); blocks != 0; --blocks)
            CutBlock(stream, frame.data() + DrawBlock(stream, frame));
        return;
    default: // the head of a macroblock, or of the frame
        frame[DrawBlock(stream, frame) + stream.Below(6)] = stream.Byte();
        if (stream.OneIn(8)) frame[stream.Below(8)] = stream.Byte();
    }
}

} // namespace

PK_PixelFormat DrawDVFormat(ByteStream& stream) {
    const uint32_t last = stream.OneIn(6) ? std::size(PK::kDVFormats) : 4;
    return PK::kDVFormats[stream.Below(last)].stream;
}

DVFrame DrawDVFrame(ByteStream& stream, PK_PixelFormat number) {
    const PK::DVFormat& format = *PK::FindDVFormat(number);
    DVFrame frame = {number, {format.width, format.height}, DrawWhole(stream, format)};
    const uint32_t damages = stream.Bool() ? stream.Below(2) : stream.Below(24);
    for (uint32_t i = 0; i < damages; ++i) Damage(stream, frame.bytes);
    return frame;
}

bool HasGoodHeader(const DVFrame& frame) {
    if (PK::FindDVFormat(frame.format)->channels != 1) return true;
    const auto last3 = [&](size_t byte) { return frame.bytes[byte] & 7; };
    return last3(4) <= 1 && last3(5) <= 1 && last3(5) == last3(6) && last3(5) == last3(7);
}

} // namespace PKFuzz
