#pragma once

// The shapes of kernels that run along rows of elements: pixels, or the samples of an array. Kernel sources include this
// header, so it holds nothing that the compiler could emit once per instruction set.
//
// A kernel touches exactly the bytes of its rows, up to the end of the last unit that cannot be parted: a pair of pixels
// in 4:2:2, a group of six in V210. The destination may be a source where their elements have one size.

#include "primitives/simd/Targets.h"

#include <cstddef>

namespace PK {

/// One row in, one row out.
using RowKernel = void (*)(const void* source, void* destination, int32_t width);

/// The same by constants that the caller gives.
template <class Constants>
using RowKernelWith = void (*)(const void* source, void* destination, ptrdiff_t count,
                               const Constants& constants);

/// Two rows in, one row out.
using TwoRowKernel = void (*)(const void* first, const void* second, void* destination, int32_t width);

/// The same by a factor or what else the caller gives.
template <class Constants>
using TwoRowKernelWith = void (*)(const void* first, const void* second, void* destination, int32_t width,
                                  const Constants& constants);

/// The rows of the planes of an image in the order Y, U, V; for an average, the three of the row below behind them.
using PlaneRows = const uint8_t* const*;

/// Planes in, a row of `width` pixels out.
using PlanesRow = void (*)(PlaneRows planes, uint8_t* destination, int32_t width);

} // namespace PK
