#pragma once

// Rows of samples: awkward content for any format, and the first place where two rows differ.

#include "primitives/KernelRow.h"
#include "support/Random.h"

#include <PixelKiln/Types.h>

#include <cstddef>
#include <string>

namespace PKTest {

/// Fills a row with random samples of the format's depth, one in eight of them an edge value: codes at the
/// borders, words above full scale, zeros of both signs, denormals, huge values, infinities, not-a-number.
void FillSamples(PK_PixelFormat format, uint8_t* row, size_t bytes, Random& random);
void FillSamples(PK::Samples samples, uint8_t* row, size_t bytes, Random& random);

/// As FillSamples, with values in the format's nominal range only.
void FillOrdinarySamples(PK_PixelFormat format, uint8_t* row, size_t bytes, Random& random);
void FillOrdinarySamples(PK::Samples samples, uint8_t* row, size_t bytes, Random& random);

/// Where two rows of a format first differ, in words; empty if they agree. Float samples agree when both are
/// not-a-number, or when they lie at most `ulps` units in the last place apart.
std::string FirstDifference(PK_PixelFormat format, size_t bytes, const uint8_t* expected,
                            const uint8_t* actual, int64_t ulps = 0);
std::string FirstDifference(PK::Samples samples, size_t bytes, const uint8_t* expected, const uint8_t* actual,
                            int64_t ulps = 0);

/// As FirstDifference, for results behind a computation that is not exact to the bit: codes may differ by 1
/// and floats by 4e-6 of the larger of 1 and their value.
std::string FirstDifferenceBeyond(PK_PixelFormat format, size_t bytes, const uint8_t* expected,
                                  const uint8_t* actual);

} // namespace PKTest
