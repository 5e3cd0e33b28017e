#pragma once

// The instruction sets that a row kernel is compiled for, from the lowest up. Each has a vector file of its
// name in this folder and a word in cmake/PixelKilnKernels.cmake.

#include <cstdint>

namespace PK {

enum class Target : uint8_t { plain, sse2, ssse3, sse41, avx2, avx512 };
inline constexpr int kTargetCount = 6;

} // namespace PK
