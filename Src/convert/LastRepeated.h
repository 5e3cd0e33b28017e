#pragma once

// Rows of which two elements make a unit of the destination, and a lone last one both.

#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {

/// A source whose last element is repeated behind it.
template <class Operand>
struct LastRepeated : Operand {
    static void Complete(uint8_t* window, RowEnd end) {
        constexpr int32_t kBytes = Operand::kBytes;
        if (end.elementsLeft >= end.groupElements) return;
        uint8_t* const behind = window + end.elementsLeft * kBytes;
        std::memcpy(behind, behind - kBytes, kBytes);
    }
};

} // namespace PK::PK_TARGET
