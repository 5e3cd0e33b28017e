#pragma once

// The instruction sets that kernels are compiled for, from the lowest up, and which of them a family of kernels has.
// Each target has a vector file in this folder and a line in cmake/PixelKilnKernels.cmake.
//
// A family is a structure of pointers, one for each of its kernels, and every target has one of them:
//
//   struct TransposeKernels {
//       void (*pixels4)(const TransposeArea& area);
//       static constexpr const char* kFamily = "Transpose";
//       static constexpr Offer kOffer = Offer::flags;
//       template <Target> static const TransposeKernels& For(); // defined in Transpose.kernels.cpp, one a target
//   };
//
// Dispatch.h chooses among them. Kernel sources include this header, so it holds nothing that the compiler could emit
// once per instruction set.

#include <cstdint>

namespace PK {

/// avx2fma fuses multiplications with additions, so that its results may differ from the others' in the last bits.
enum class Target : uint8_t { plain, sse2, ssse3, sse41, avx, avx2, avx2fma, avx512 };
inline constexpr int kTargetCount = 8;

/// The targets that a family has, and what chooses among them.
enum class Offer : uint8_t {
    flags, ///< plain, SSE2, SSSE3, SSE4.1, AVX2, AVX-512: by the capability flags, which settings and switches reach.
    processor, ///< plain, SSE2, SSE4.1, AVX, AVX2 with FMA: by what the processor reports alone, without a start.
};

} // namespace PK
