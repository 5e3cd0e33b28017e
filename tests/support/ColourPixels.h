#pragma once

// Float pixels for the tests of the colour spaces, where two runs of them first differ, and conversions of them at every
// place that memory has.

#include "reference/ReferenceColour.h"
#include "support/Random.h"
#include "support/RowBuffer.h"

#include <gtest/gtest.h>

#include <bit>
#include <cstring>
#include <limits>
#include <string>
#include <vector>

namespace PKTest {

using reference::ColourPixel;
using ColourPixels = std::vector<ColourPixel>;

inline constexpr float kInfinity = std::numeric_limits<float>::infinity();
inline constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
/// Counts of pixels that are no work.
inline constexpr int32_t kNoCounts[] = {0, -1, -7, -8, -9, -64, INT32_MIN + 1, INT32_MIN};

inline uint32_t Pattern(float x) {
    return std::bit_cast<uint32_t>(x);
}

/// What pixels hold.
enum class Content {
    kOrdinary,   ///< From 0 to 1.
    kWide,       ///< From -0.5 to 3, one in four a grey, one channel in eight exactly 0 or 1.
    kHighlights, ///< From 0 to 10.
    kEdges, ///< Zeros, denormals, the largest numbers, infinities, not-a-number of all kinds, of both signs, and
            ///< what is next to 1.
    kAnyBits, ///< Every pattern of 32 bits may occur.
    kMixed,   ///< One in eight of the edges, of any bits and from -10 to 110, the others from -0.25 to 1.25.
};
inline constexpr Content kAllContents[] = {Content::kOrdinary, Content::kWide, Content::kHighlights,
                                           Content::kEdges, Content::kAnyBits};

const char* ContentName(Content content);

float MakeFloat(Content content, Random& random);
float Uniform(Random& random, float least, float most);

/// Alpha is any pattern of 32 bits.
ColourPixels MakePixels(Content content, size_t count, Random& random);
/// All four channels lie between two limits.
ColourPixels UniformPixels(Random& random, size_t count, float least, float most);

inline const float* Floats(const ColourPixels& pixels) {
    return reinterpret_cast<const float*>(pixels.data());
}
inline float* Floats(ColourPixels& pixels) {
    return reinterpret_cast<float*>(pixels.data());
}

/// Whether memory holds just these pixels, to the bit.
bool Holds(const void* memory, const ColourPixels& pixels);
inline bool AreSameBits(const ColourPixels& a, const ColourPixels& b) {
    return a.size() == b.size() && Holds(a.data(), b);
}

/// How far two floats are apart, in units of the last place counted through zero: 0 if their bits are the same or both
/// are not-a-number.
int64_t UnitsApart(float a, float b);

/// The first pixel whose colours are more than \p units apart or whose alphas differ in a bit; empty if there is none.
std::string FirstDifference(const ColourPixels& source, const ColourPixels& expected,
                            const ColourPixels& actual, int64_t units = 0);

/// Runs `convert(source, destination, count)` out of place and in place, before and behind a guard page and off the
/// alignment of vectors: all must give the same bits, and leave the source and what is around both.
template <class Convert>
ColourPixels Converted(const ColourPixels& pixels, Convert convert) {
    constexpr Placement kPlaces[] = {
        {Placement::kBeforeGuard}, {Placement::kAfterGuard}, {Placement::kAtOffset, 4}};
    const auto count = static_cast<int32_t>(pixels.size());
    const size_t bytes = sizeof(ColourPixel) * pixels.size();
    ColourPixels result(pixels.size());
    bool isFirst = true;
    for (const Placement place : kPlaces)
        for (const bool inPlace : {false, true}) {
            const RowBuffer source(bytes, place), other(bytes, place);
            std::copy_n(Floats(pixels), 4 * pixels.size(), reinterpret_cast<float*>(source.Data()));
            const RowBuffer& destination = inPlace ? source : other;
            convert(reinterpret_cast<const float*>(source.Data()),
                    reinterpret_cast<float*>(destination.Data()), count);
            if (isFirst)
                std::copy_n(reinterpret_cast<float*>(destination.Data()), 4 * pixels.size(), Floats(result));
            isFirst = false;
            EXPECT_TRUE(Holds(destination.Data(), result))
                << count << " pixels " << place << (inPlace ? ", in place" : "");
            EXPECT_TRUE(destination.MarginsIntact())
                << count << " pixels " << place << (inPlace ? ", in place" : "");
            EXPECT_TRUE(inPlace || Holds(source.Data(), pixels)) << "the source changed";
        }
    return result;
}

} // namespace PKTest
