#pragma once

// The row kernels of the codec bridges, one structure a kernel source. Kernel sources include this header, so
// it holds nothing that the compiler could emit once per instruction set.

#include "primitives/KernelShapes.h"

namespace PK {

struct RGB8Kernels {
    RowKernel toBGRA;

    static constexpr const char* kFamily = "RGB8";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const RGB8Kernels& For();
};

struct DNxHDKernels {
    RowKernel toRGB10;
    RowKernel fromRGB10;

    static constexpr const char* kFamily = "DNxHD";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DNxHDKernels& For();
};

struct UYVY10Kernels {
    RowKernel toV210; // whole groups only
    RowKernel fromV210;

    static constexpr const char* kFamily = "UYVY10";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const UYVY10Kernels& For();
};

struct J2KKernels {
    RowKernel bgr16ToRGB10;
    RowKernel rgb10ToBGR16;
    RowKernel offsetUYVY32f;
    RowKernel zyxToBGR32f;

    static constexpr const char* kFamily = "J2K";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const J2KKernels& For();
};

struct Words15uKernels {
    RowKernel rgb10WordsToXRGB; // truncates below SSE4.1, rounds from there up
    RowKernel halve;
    RowKernel swapAndHalve;

    static constexpr const char* kFamily = "Words15u";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const Words15uKernels& For();
};

/// V210 in whole groups, the last of them filled up with repetitions of the last sample of each plane.
struct W210Kernels {
    PlanesRow toV210;
    PlanesRow averageToV210; // takes six rows
    PlanesRow quarterToV210;
    PlanesRow quarterToVUYX;

    static constexpr const char* kFamily = "W210";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const W210Kernels& For();
};

} // namespace PK
