#include "results/Image.h"

#include "results/Formats.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>

namespace PKResults {

namespace {

constexpr size_t kMargin = 64;

template <class Sample, class Draw>
void FillWith(uint8_t* samples, size_t bytes, Draw draw) {
    for (size_t i = 0; i + sizeof(Sample) <= bytes; i += sizeof(Sample)) {
        const Sample sample = draw();
        std::memcpy(samples + i, &sample, sizeof sample);
    }
}

uint8_t EdgeByte(Random& random) {
    constexpr uint8_t bytes[] = {0, 1, 15, 16, 127, 128, 235, 240, 254, 255};
    return bytes[random.Below(std::size(bytes))];
}

uint16_t EdgeWord(Random& random) {
    constexpr uint16_t words[] = {0, 1, 127, 128, 16383, 16384, 32767, 32768, 32769, 65408, 65535};
    return words[random.Below(std::size(words))];
}

uint32_t EdgeFloat(Content content, Random& random) {
    constexpr uint32_t patterns[] = {
        0x00000000, // zero
        0x3f800000, // 1
        0x3f7fffff, // below 1
        0x3f800001, // above 1
        0x3f000000, // 0.5
        0x36eae18b, // 7e-6, and the next, on both sides of a threshold
        0x37063822, // 8.0000006e-6
        0x3bc0c0c1, // 1.5 / 255
        0x3effffff, // below 0.5
        0x00000001, // the least number
        0x007fffff, // the largest denormal one
        0x00800000, // the least normal one
        0x40000000, // 2
        0x437f0000, // 255
        0x47000000, // 32768
        0x4f000000, // 2^31
        0x7149f2ca, // 1e30
        0x7f7fffff, // the largest number
        0x7f800000, // infinity
        0x7fc00000, // quiet not-a-number
        0x7fa12345, // signalling not-a-number
    };
    constexpr uint32_t kNaNPatterns = 2;
    const uint32_t count = std::size(patterns) - (content == Content::kNaNs ? 0 : kNaNPatterns);
    const uint32_t sign = random.Below(2) << 31;
    return patterns[random.Below(count)] | sign;
}

} // namespace

Image::Image(size_t rowLength, int32_t rows, const Walk& walk, Random& random)
    : fRowLength(rowLength), fRows(rows), fWalk(walk) {
    const size_t bytes = kMargin + walk.lead + (rowLength + walk.gap) * static_cast<size_t>(rows) + kMargin;
    fBlock.resize((bytes + sizeof(Unit) - 1) / sizeof(Unit));
    random.Fill(fBlock.data(), fBlock.size() * sizeof(Unit));
}

Image::Image(PK_PixelFormat format, int32_t width, int32_t rows, const Walk& walk, Random& random)
    : Image(static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width)), rows, walk, random) {}

uint8_t* Image::Row(int32_t row) {
    const auto place = static_cast<size_t>(fWalk.upwards ? fRows - 1 - row : row);
    auto* const begin = reinterpret_cast<uint8_t*>(fBlock.data());
    return begin + kMargin + fWalk.lead + place * (fRowLength + fWalk.gap);
}

int32_t Image::Step() const {
    const auto step = static_cast<int32_t>(fRowLength + fWalk.gap);
    return fWalk.upwards ? -step : step;
}

void Image::Fill(PK_PixelFormat format, Content content, Random& random) {
    for (int32_t row = 0; row < fRows; ++row) FillSamples(format, content, Row(row), fRowLength, random);
}

void Image::UniteNaNs() {
    constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
    for (int32_t row = 0; row < fRows; ++row)
        for (size_t i = 0; i + sizeof(float) <= fRowLength; i += sizeof(float)) {
            float sample;
            std::memcpy(&sample, Row(row) + i, sizeof sample);
            if (std::isnan(sample)) std::memcpy(Row(row) + i, &kNaN, sizeof kNaN);
        }
}

void Image::AddTo(Digest& results) const {
    results.AddBytes(fBlock.data(), fBlock.size() * sizeof(Unit));
}

void FillSamples(PK_PixelFormat format, Content content, uint8_t* samples, size_t bytes, Random& random) {
    const auto isEdge = [&] { return content != Content::kOrdinary && random.Below(4) == 0; };
    if (IsFloat(format))
        FillWith<uint32_t>(samples, bytes, [&] {
            if (isEdge()) return EdgeFloat(content, random);
            const float sample = random.Between(-0.5f, 1.5f);
            uint32_t bits;
            std::memcpy(&bits, &sample, sizeof bits);
            return bits;
        });
    else if ((format & 0x1c0) == 0x80)
        FillWith<uint16_t>(samples, bytes, [&] {
            return isEdge() ? EdgeWord(random) : static_cast<uint16_t>(random.Below(32769));
        });
    else // bytes, and words of ten bits of which any may be set
        FillWith<uint8_t>(samples, bytes,
                          [&] { return isEdge() ? EdgeByte(random) : static_cast<uint8_t>(random.Next()); });
}

} // namespace PKResults
