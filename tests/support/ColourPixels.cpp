#include "support/ColourPixels.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <sstream>

namespace PKTest {

float Uniform(Random& random, float least, float most) {
    return least + (most - least) * static_cast<float>(random.Next() >> 8) * 0x1p-24f;
}

namespace {

constexpr uint32_t kEdgePatterns[] = {
    0x00000000, // zero
    0x00000001, // the least number
    0x00400000, // a denormal one
    0x007fffff, // the largest denormal one
    0x00800000, // the least normal one
    0x00800001,
    0x32000000, // 2^-27
    0x3b4d2e1c, // the thresholds of sRGB
    0x3d25aee6,
    0x3dcccccd, // 0.1
    0x3effffff, // below 0.5
    0x3f000000, // 0.5
    0x3f7fffff, // below 1
    0x3f800000, // 1
    0x3f800001, // above 1
    0x40000000, // 2
    0x42c80000, // 100
    0x5f000000, // 2^63
    0x7effffff,
    0x7f7fffff, // the largest number
    0x7f800000, // infinity
    0x7f800001, // signalling not-a-number
    0x7fa12345,
    0x7fc00000, // quiet not-a-number
    0x7fffffff,
};

float AnyBits(Random& random) {
    return std::bit_cast<float>(random.Next());
}

float EdgeValue(Random& random) {
    const uint32_t pattern = kEdgePatterns[random.Below(std::size(kEdgePatterns))];
    return std::bit_cast<float>(pattern | (random.Next() & 0x80000000));
}

float WideValue(Random& random) {
    switch (random.Below(16)) {
    case 0:
        return 0;
    case 1:
        return 1;
    default:
        return Uniform(random, -0.5f, 3);
    }
}

float MixedValue(Random& random) {
    switch (random.Below(8)) {
    case 0:
        return EdgeValue(random);
    case 1:
        return AnyBits(random);
    case 2:
        return Uniform(random, -10, 110);
    default:
        return Uniform(random, -0.25f, 1.25f);
    }
}

void Print(std::ostream& stream, const ColourPixel& pixel) {
    for (const float v : pixel)
        stream << ' ' << v << std::hex << " (0x" << std::bit_cast<uint32_t>(v) << ")" << std::dec;
}

} // namespace

const char* ContentName(Content content) {
    constexpr const char* names[] = {"ordinary", "wide", "highlights", "edges", "any bits", "mixed"};
    return names[static_cast<size_t>(content)];
}

float MakeFloat(Content content, Random& random) {
    switch (content) {
    case Content::kOrdinary:
        return Uniform(random, 0, 1);
    case Content::kWide:
        return WideValue(random);
    case Content::kHighlights:
        return Uniform(random, 0, 10);
    case Content::kEdges:
        return EdgeValue(random);
    case Content::kMixed:
        return MixedValue(random);
    case Content::kAnyBits:
        break;
    }
    return AnyBits(random);
}

ColourPixels MakePixels(Content content, size_t count, Random& random) {
    ColourPixels pixels(count);
    for (ColourPixel& pixel : pixels) {
        for (float& v : pixel) v = MakeFloat(content, random);
        if (content == Content::kWide && random.Below(4) == 0) pixel[1] = pixel[2] = pixel[0];
        pixel[3] = AnyBits(random);
    }
    return pixels;
}

ColourPixels UniformPixels(Random& random, size_t count, float least, float most) {
    ColourPixels pixels(count);
    for (ColourPixel& pixel : pixels)
        for (float& v : pixel) v = Uniform(random, least, most);
    return pixels;
}

bool Holds(const void* memory, const ColourPixels& pixels) {
    return pixels.empty() || std::memcmp(memory, pixels.data(), sizeof(ColourPixel) * pixels.size()) == 0;
}

int64_t UnitsApart(float a, float b) {
    if (std::isnan(a) || std::isnan(b)) return std::isnan(a) && std::isnan(b) ? 0 : INT64_MAX;
    const auto place = [](float x) { // -0 has the place below that of 0
        const auto bits = std::bit_cast<int32_t>(x);
        return bits >= 0 ? int64_t{bits} : int64_t{INT32_MIN} - bits - 1;
    };
    return std::llabs(place(a) - place(b));
}

std::string FirstDifference(const ColourPixels& source, const ColourPixels& expected,
                            const ColourPixels& actual, int64_t units) {
    for (size_t i = 0; i < expected.size(); ++i) {
        const bool sameAlpha =
            std::bit_cast<uint32_t>(expected[i][3]) == std::bit_cast<uint32_t>(actual[i][3]);
        const bool sameColour = std::equal(expected[i].begin(), expected[i].begin() + 3, actual[i].begin(),
                                           [=](float a, float b) { return UnitsApart(a, b) <= units; });
        if (sameAlpha && sameColour) continue;
        std::ostringstream text;
        text << "pixel " << i << ':';
        Print(text, source[i]);
        text << "\nbecomes:";
        Print(text, actual[i]);
        text << "\nnot:";
        Print(text, expected[i]);
        return text.str();
    }
    return {};
}

} // namespace PKTest
