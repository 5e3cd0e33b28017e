#include "support/Samples.h"

#include "frame/PixelFormat.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <sstream>

namespace PKTest {
namespace {

using namespace PK;

constexpr std::array<uint8_t, 10> kEdgeBytes = {0, 1, 15, 16, 127, 128, 235, 240, 254, 255};
constexpr std::array<uint16_t, 8> kEdgeWords = {0, 1, 127, 16384, 32767, 32768, 32769, 65535};
constexpr std::array<uint32_t, 6> kEdgeIntegers = {0, 1, 0xffffffff, 0x7fffffff, 0x80000000, 0x80000001};
constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr std::array<float, 20> kEdgeFloats = {0.0f,
                                               -0.0f,
                                               1.0f,
                                               -1.0f,
                                               0.5f,
                                               -0.5f,
                                               7e-6f,
                                               8e-6f,
                                               0x1p-149f,
                                               -0x1p-130f,
                                               1e30f,
                                               -1e30f,
                                               3e38f,
                                               kInfinity,
                                               2.0f,
                                               255.0f,
                                               0.99999994f,
                                               -kInfinity,
                                               std::numeric_limits<float>::quiet_NaN(),
                                               1.5f / 255.0f};

template <class Sample>
void StoreSample(uint8_t* at, Sample sample) {
    std::memcpy(at, &sample, sizeof sample);
}

template <class Sample>
Sample LoadSample(const uint8_t* at) {
    Sample sample;
    std::memcpy(&sample, at, sizeof sample);
    return sample;
}

float RandomFloat(Random& random) {
    return static_cast<float>(random.Next()) * 0x1p-31f - 0.5f;
}

/// Those of 10 bits in a word may have any bit set.
Samples SamplesOf(PK_PixelFormat format) {
    switch (format & kDepthMask) {
    case kDepth32f:
        return Samples::Floats;
    case kDepth15u:
        return Samples::Words;
    case kDepth10u:
        return Samples::Bits;
    default:
        return Samples::Bytes;
    }
}

void Fill(Samples samples, uint8_t* row, size_t bytes, Random& random, bool withEdges) {
    const auto isEdge = [&] { return withEdges && random.Below(8) == 0; };
    const auto pick = [&](const auto& values) {
        return values[random.Below(static_cast<uint32_t>(values.size()))];
    };
    switch (samples) {
    case Samples::Floats:
        for (size_t i = 0; i + 4 <= bytes; i += 4)
            StoreSample(row + i, isEdge() ? pick(kEdgeFloats) : RandomFloat(random));
        break;
    case Samples::Words:
        for (size_t i = 0; i + 2 <= bytes; i += 2)
            StoreSample(row + i, isEdge() ? pick(kEdgeWords) : static_cast<uint16_t>(random.Below(32769)));
        break;
    case Samples::SignedWords:
        for (size_t i = 0; i + 2 <= bytes; i += 2)
            StoreSample(row + i, isEdge() ? pick(kEdgeWords) : static_cast<uint16_t>(random.Next()));
        break;
    case Samples::Integers:
        for (size_t i = 0; i + 4 <= bytes; i += 4)
            StoreSample(row + i, isEdge() ? pick(kEdgeIntegers) : random.Next());
        break;
    case Samples::Bytes:
    case Samples::Bits:
        for (size_t i = 0; i < bytes; ++i)
            row[i] = isEdge() ? pick(kEdgeBytes) : static_cast<uint8_t>(random.Next());
    }
}

/// Distance in units in the last place, counted through zero.
int64_t UlpsApart(float a, float b) {
    if (std::isnan(a) || std::isnan(b)) return std::isnan(a) && std::isnan(b) ? 0 : INT64_MAX;
    const auto ordered = [](float x) {
        const auto bits = LoadSample<int32_t>(reinterpret_cast<const uint8_t*>(&x));
        return bits >= 0 ? int64_t{bits} : int64_t{INT32_MIN} - bits;
    };
    return std::llabs(ordered(a) - ordered(b));
}

template <class Sample, class Agree>
std::string FirstDifferenceOf(size_t bytes, const uint8_t* expected, const uint8_t* actual, Agree agree) {
    for (size_t i = 0; i + sizeof(Sample) <= bytes; i += sizeof(Sample)) {
        const auto want = LoadSample<Sample>(expected + i), have = LoadSample<Sample>(actual + i);
        if (agree(want, have)) continue;
        std::ostringstream text;
        text << "sample " << i / sizeof(Sample) << " (byte " << i << "): expected " << +want << ", is "
             << +have;
        if constexpr (sizeof(Sample) == 4) {
            text << std::hex << " (0x" << LoadSample<uint32_t>(expected + i) << ", 0x"
                 << LoadSample<uint32_t>(actual + i) << ")";
        }
        return text.str();
    }
    return {};
}

} // namespace

void FillSamples(Samples samples, uint8_t* row, size_t bytes, Random& random) {
    Fill(samples, row, bytes, random, true);
}

void FillSamples(PK_PixelFormat format, uint8_t* row, size_t bytes, Random& random) {
    FillSamples(SamplesOf(format), row, bytes, random);
}

void FillOrdinarySamples(Samples samples, uint8_t* row, size_t bytes, Random& random) {
    Fill(samples, row, bytes, random, false);
}

void FillOrdinarySamples(PK_PixelFormat format, uint8_t* row, size_t bytes, Random& random) {
    FillOrdinarySamples(SamplesOf(format), row, bytes, random);
}

std::string FirstDifference(Samples samples, size_t bytes, const uint8_t* expected, const uint8_t* actual,
                            int64_t ulps) {
    const auto same = [](auto a, auto b) { return a == b; };
    switch (samples) {
    case Samples::Floats:
        return FirstDifferenceOf<float>(bytes, expected, actual, [ulps](float a, float b) {
            return UlpsApart(a, b) <= ulps &&
                   (ulps > 0 || std::isnan(a) || std::signbit(a) == std::signbit(b));
        });
    case Samples::Words:
        return FirstDifferenceOf<uint16_t>(bytes, expected, actual, same);
    case Samples::SignedWords:
        return FirstDifferenceOf<int16_t>(bytes, expected, actual, same);
    case Samples::Integers:
    case Samples::Bits:
        return FirstDifferenceOf<uint32_t>(bytes, expected, actual, same);
    default:
        return FirstDifferenceOf<uint8_t>(bytes, expected, actual, same);
    }
}

std::string FirstDifference(PK_PixelFormat format, size_t bytes, const uint8_t* expected,
                            const uint8_t* actual, int64_t ulps) {
    return FirstDifference(SamplesOf(format), bytes, expected, actual, ulps);
}

std::string FirstDifferenceBeyond(PK_PixelFormat format, size_t bytes, const uint8_t* expected,
                                  const uint8_t* actual) {
    const auto nearCodes = [](int a, int b) { return std::abs(a - b) <= 1; };
    switch (format & kDepthMask) {
    case kDepth32f:
        return FirstDifferenceOf<float>(bytes, expected, actual, [](float a, float b) {
            const float scale = std::max({1.0f, std::abs(a), std::abs(b)});
            return std::abs(a - b) <= 4e-6f * scale || a == b || (std::isnan(a) && std::isnan(b));
        });
    case kDepth15u:
        return FirstDifferenceOf<uint16_t>(bytes, expected, actual, nearCodes);
    case kDepth10u: {
        const int firstBit = IsYUV(format) ? 0 : 2;
        return FirstDifferenceOf<uint32_t>(bytes, expected, actual, [=](uint32_t a, uint32_t b) {
            const auto sample = [](uint32_t word, int bit) { return static_cast<int>(word >> bit & 1023); };
            for (int bit = firstBit; bit < firstBit + 30; bit += 10)
                if (!nearCodes(sample(a, bit), sample(b, bit))) return false;
            return true;
        });
    }
    default:
        return FirstDifferenceOf<uint8_t>(bytes, expected, actual, nearCodes);
    }
}

} // namespace PKTest
