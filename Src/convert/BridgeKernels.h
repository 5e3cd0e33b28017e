#pragma once

// The row kernels of the codec bridges, one structure a kernel source. Kernel sources include this header, so
// it holds nothing that the compiler could emit once per instruction set.

#include "primitives/simd/Targets.h"

namespace PK {

/// Converts one row, or any run of `width` pixels. The rows may be the same where both layouts are.
using BridgeRow = void (*)(const void* source, void* destination, int32_t width);

struct RGB8Kernels {
    BridgeRow toBGRA;

    template <Target>
    static const RGB8Kernels& For();
};

struct DNxHDKernels {
    BridgeRow toRGB10;
    BridgeRow fromRGB10;

    template <Target>
    static const DNxHDKernels& For();
};

struct UYVY10Kernels {
    BridgeRow toV210; // whole groups only
    BridgeRow fromV210;

    template <Target>
    static const UYVY10Kernels& For();
};

struct J2KKernels {
    BridgeRow bgr16ToRGB10;
    BridgeRow rgb10ToBGR16;
    BridgeRow offsetUYVY32f;
    BridgeRow zyxToBGR32f;

    template <Target>
    static const J2KKernels& For();
};

struct Words15uKernels {
    BridgeRow rgb10WordsToXRGB; // truncates below SSE4.1, rounds from there up
    BridgeRow halve;
    BridgeRow swapAndHalve;

    template <Target>
    static const Words15uKernels& For();
};

/// Rows of the Y, U and V planes, and for an average the three of the row below.
using PlaneRows = const uint8_t* const*;

/// Converts planes to a row of `width` pixels of the destination; V210 in whole groups, the last of them
/// filled up with repetitions of the last sample of each plane.
using PlanesRow = void (*)(PlaneRows planes, uint8_t* destination, int32_t width);

struct W210Kernels {
    PlanesRow toV210;
    PlanesRow averageToV210; // takes six rows
    PlanesRow quarterToV210;
    PlanesRow quarterToVUYX;

    template <Target>
    static const W210Kernels& For();
};

} // namespace PK
