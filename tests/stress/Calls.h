#pragma once

// Calls that each write one block of memory: every thread must get what one thread got beforehand.

#include "support/Random.h"

#include <PixelKiln/PixelFormat.h>

#include <cstdint>
#include <functional>
#include <vector>

namespace PKStress {

struct Call {
    std::vector<uint8_t> before; ///< what the block holds; the source, where the call works in place
    std::function<PK_Result(uint8_t* block)> write;
};

/// Makes all calls once, and gives what makes them again, each in a block of its own, and compares. A call that
/// fails the first time or changes nothing is wrong in every run.
std::function<bool()> Repeat(const std::vector<Call>& calls);

/// A block that an image takes with the row bytes of its format.
std::vector<uint8_t> RandomImage(PK_PixelFormat format, int32_t width, int32_t height,
                                 PKTest::Random& random);

} // namespace PKStress
