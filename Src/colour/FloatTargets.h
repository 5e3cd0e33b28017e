#pragma once

// The instruction sets that the kernels of the colour spaces are compiled for, from the lowest up, and the choice among
// their bodies. It goes by what the processor reports alone.
//
// A kernel source hands over its functions as a structure of pointers, one structure a target:
//
//   struct GammaKernels {
//       void (*convert)(...);
//       template <FloatTarget> static const GammaKernels& For(); // defined in GammaPixels.kernels.cpp
//   };

#include <cstdint>

namespace PK {

struct CpuFlags;

/// avx2fma fuses multiplications with additions, so that its results differ from the others' in the last bits.
enum class FloatTarget : uint8_t { plain, sse2, sse41, avx, avx2fma };
inline constexpr int kFloatTargetCount = 5;

const char* FloatTargetName(FloatTarget target);

/// Whether a processor runs the bodies of a target.
bool Runs(const CpuFlags& processor, FloatTarget target);

/// The highest target that this processor runs.
FloatTarget BestFloatTarget();

template <class Kernels>
const Kernels& KernelsFor(FloatTarget target) {
    switch (target) {
    case FloatTarget::avx2fma:
        return Kernels::template For<FloatTarget::avx2fma>();
    case FloatTarget::avx:
        return Kernels::template For<FloatTarget::avx>();
    case FloatTarget::sse41:
        return Kernels::template For<FloatTarget::sse41>();
    case FloatTarget::sse2:
        return Kernels::template For<FloatTarget::sse2>();
    case FloatTarget::plain:
        break;
    }
    return Kernels::template For<FloatTarget::plain>();
}

} // namespace PK
