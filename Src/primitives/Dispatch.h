#pragma once

// Which instruction sets may be used at this moment, and the choice among the bodies of a kernel source.
//
// A kernel source that is no family of row kernels hands over its functions as a structure of pointers:
//
//   struct TransposeKernels {
//       void (*block)(...);
//       template <Target> static const TransposeKernels& For(); // defined in Transpose.kernels.cpp, one a target
//   };
//
//   Best<TransposeKernels>().block(...);

#include "primitives/simd/Targets.h"

namespace PK {

const char* TargetName(Target target) noexcept;

/// Whether the capability flags allow the bodies of a target at this moment. A target stands on all lower
/// ones, so that switching SSE2 off leaves the plain bodies.
bool IsEnabled(Target target) noexcept;

/// The highest target that is enabled at this moment.
Target BestTarget() noexcept;

/// The functions of one target; the tests compare them all.
template <class Kernels>
const Kernels& KernelsFor(Target target) noexcept {
    switch (target) {
    case Target::avx512:
        return Kernels::template For<Target::avx512>();
    case Target::avx2:
        return Kernels::template For<Target::avx2>();
    case Target::sse41:
        return Kernels::template For<Target::sse41>();
    case Target::ssse3:
        return Kernels::template For<Target::ssse3>();
    case Target::sse2:
        return Kernels::template For<Target::sse2>();
    case Target::plain:
        break;
    }
    return Kernels::template For<Target::plain>();
}

/// The functions of the highest target that is enabled at this moment.
template <class Kernels>
const Kernels& Best() noexcept {
    return KernelsFor<Kernels>(BestTarget());
}

} // namespace PK
