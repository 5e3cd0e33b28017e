#pragma once

// Kernels for the tests of pixel lanes: each does with a row of pixels or lanes what one function does with a vector.

#include "primitives/KernelShapes.h"

namespace PKTest {

/// A layout to pixels of four floats in the order of BGRA, and back.
struct LayoutProbe {
    PK::RowKernel load, store;
};

struct LaneProbes {
    LayoutProbe bytesAlphaLast, bytesAlphaFirst;
    LayoutProbe wordsAlphaLast, wordsAlphaFirst;
    LayoutProbe floatsAlphaLast, floatsAlphaFirst;
    PK::RowKernel vote;        ///< Masks of a lane each to masks of groups.
    PK::TwoRowKernel products; ///< Bytes in lanes to nearest(a x b / 255).
    PK::TwoRowKernel lesserBytes, greaterBytes;

    static constexpr PK::Offer kOffer = PK::Offer::flags;
    template <PK::Target>
    static const LaneProbes& For(); // LaneProbes.kernels.cpp
};

} // namespace PKTest
