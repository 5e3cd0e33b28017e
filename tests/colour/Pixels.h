#pragma once

// Float pixels for the tests of the colour spaces, and conversions of them at every place that memory has.

#include "support/Random.h"
#include "support/RowBuffer.h"
#include "support/Targets.h"

#include "primitives/CpuFeatures.h"

#include <gtest/gtest.h>

#include <array>
#include <bit>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <limits>
#include <vector>

namespace PKTest {

inline constexpr float kInfinity = std::numeric_limits<float>::infinity();
inline constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
inline constexpr int32_t kNoCounts[] = {0, -1, -8, INT32_MIN};

/// B, G, R, A or V, U, Y, A.
using Pixel = std::array<float, 4>;
using Pixels = std::vector<Pixel>;

inline uint32_t Pattern(float x) {
    return std::bit_cast<uint32_t>(x);
}

/// Equal in value, or both not a number.
inline bool IsSame(float a, float b) {
    return a == b || (std::isnan(a) && std::isnan(b));
}

inline size_t BytesOf(const Pixels& pixels) {
    return pixels.size() * sizeof(Pixel);
}

inline bool AreSameBits(const Pixels& a, const Pixels& b) {
    return a.size() == b.size() && std::memcmp(a.data(), b.data(), BytesOf(a)) == 0;
}

inline float Uniform(Random& random, float least, float most) {
    return least + (most - least) * static_cast<float>(random.Next()) * 0x1p-32f;
}

/// Zeros, denormals, huge values, infinities, NaN and noise, each of either sign, among values around the range of video.
inline float AnyFloat(Random& random) {
    constexpr float kEdges[] = {
        0.0f, 0x1p-149f, 0x1p-126f, 1e-6f, 0.0031308f, 0.04045f,  0.5f, 1.0f,
        2.0f, 100.0f,    1e4f,      1e30f, 3.4e38f,    kInfinity, kNaN, std::bit_cast<float>(0x7f800001u),
    };
    switch (random.Below(8)) {
    case 0:
        return std::copysign(kEdges[random.Below(std::size(kEdges))], random.Below(2) != 0 ? -1.0f : 1.0f);
    case 1:
        return std::bit_cast<float>(random.Next());
    case 2:
        return Uniform(random, -10, 110);
    default:
        return Uniform(random, -0.25f, 1.25f);
    }
}

inline Pixels AnyPixels(Random& random, size_t count) {
    Pixels pixels(count);
    for (Pixel& pixel : pixels)
        for (float& c : pixel) c = AnyFloat(random);
    return pixels;
}

inline Pixels UniformPixels(Random& random, size_t count, float least, float most) {
    Pixels pixels(count);
    for (Pixel& pixel : pixels)
        for (float& c : pixel) c = Uniform(random, least, most);
    return pixels;
}

/// Runs `convert(source, destination, count)` out of place and in place, before and behind a guard page and off the
/// alignment of vectors: all must give the same bits, and leave the source and what is around both.
template <class Convert>
Pixels Converted(const Pixels& pixels, Convert convert) {
    constexpr Placement kPlaces[] = {
        {Placement::kBeforeGuard}, {Placement::kAfterGuard}, {Placement::kAtOffset, 4}};
    const auto count = static_cast<int32_t>(pixels.size());
    Pixels first;
    for (const Placement place : kPlaces)
        for (const bool inPlace : {false, true}) {
            const RowBuffer source(BytesOf(pixels), place), other(BytesOf(pixels), place);
            std::memcpy(source.Data(), pixels.data(), BytesOf(pixels));
            const RowBuffer& destination = inPlace ? source : other;
            convert(reinterpret_cast<const float*>(source.Data()),
                    reinterpret_cast<float*>(destination.Data()), count);
            Pixels result(pixels.size());
            std::memcpy(result.data(), destination.Data(), BytesOf(pixels));
            if (first.empty()) first = result;
            EXPECT_TRUE(AreSameBits(result, first)) << place << (inPlace ? ", in place" : "");
            EXPECT_TRUE(destination.MarginsIntact()) << place;
            EXPECT_TRUE(inPlace || std::memcmp(source.Data(), pixels.data(), BytesOf(pixels)) == 0)
                << "the source changed";
        }
    return first;
}

/// The targets whose bodies this processor runs.
} // namespace PKTest
