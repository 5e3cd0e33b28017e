#pragma once

// Float pixels for the tests of the colour spaces, and where two runs of them first differ.

#include "reference/ReferenceColour.h"
#include "support/Random.h"

#include <string>
#include <vector>

namespace PKTest {

using reference::ColourPixel;
using ColourPixels = std::vector<ColourPixel>;

/// What pixels hold.
enum class Content {
    kOrdinary,   ///< From 0 to 1.
    kWide,       ///< From -0.5 to 3, one in four a grey, one channel in eight exactly 0 or 1.
    kHighlights, ///< From 0 to 10.
    kEdges, ///< Zeros, denormals, the largest numbers, infinities, not-a-number of all kinds, of both signs, and
            ///< what is next to 1.
    kAnyBits, ///< Every pattern of 32 bits may occur.
};
inline constexpr Content kAllContents[] = {Content::kOrdinary, Content::kWide, Content::kHighlights,
                                           Content::kEdges, Content::kAnyBits};

const char* ContentName(Content content);

/// Alpha is any pattern of 32 bits.
ColourPixels MakePixels(Content content, size_t count, Random& random);

inline const float* Floats(const ColourPixels& pixels) {
    return reinterpret_cast<const float*>(pixels.data());
}
inline float* Floats(ColourPixels& pixels) {
    return reinterpret_cast<float*>(pixels.data());
}

/// Whether memory holds just these pixels, to the bit.
bool Holds(const void* memory, const ColourPixels& pixels);

/// How far two floats are apart, in units of the last place counted through zero: 0 if their bits are the same or both
/// are not-a-number.
int64_t UnitsApart(float a, float b);

/// The first pixel whose colours are more than \p units apart or whose alphas differ in a bit; empty if there is none.
std::string FirstDifference(const ColourPixels& source, const ColourPixels& expected,
                            const ColourPixels& actual, int64_t units = 0);

} // namespace PKTest
