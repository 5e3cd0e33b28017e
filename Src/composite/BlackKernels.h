#pragma once

// Rows laid over opaque black, and what their alpha tells.

#include "primitives/KernelShapes.h"

namespace PK {

/// The constant is the opacity of the row.
struct BlackKernels {
    using OverBlack = RowKernelWith<float>;
    OverBlack rgb8u, rgb8uAlphaFirst;
    /// From SSE2 on by floats and by runs of four pixels from the first 16-byte boundary of the destination on; plain by
    /// integers.
    OverBlack yuv8u;
    OverBlack floats, floatsAlphaFirst;

    static constexpr const char* kFamily = "Black";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const BlackKernels& For();
};

/// What the alphas of pixels are; the numbers are those that callers get.
enum class AlphaTest : uint32_t { opaque = 0, transparent = 1, mixed = 2 };

struct AlphaTestKernels {
    /// No pixels are opaque ones.
    using Test = AlphaTest (*)(const void* row, int32_t width);
    Test codes, codesAlphaFirst, floats, floatsAlphaFirst;

    static constexpr const char* kFamily = "AlphaTest";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const AlphaTestKernels& For();
};

} // namespace PK
