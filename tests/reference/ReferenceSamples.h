// Samples in memory, and the rounding that the reference kernels share.
#pragma once

#include <cmath>
#include <cstdint>
#include <cstring>

#include "ReferenceFormats.h"

namespace reference {

constexpr float kOneBy255 = 1.0f / 255.0f; // 0x3b808081
constexpr float kOneBy224 = 1.0f / 224.0f; // 0x3b924925
constexpr float kOneBy219 = 1.0f / 219.0f; // 0x3b95a025

// The index-th sample of a row, which need not be aligned.
template <typename T>
T Get(const void* row, int64_t index) {
    T value;
    std::memcpy(&value, static_cast<const char*>(row) + index * static_cast<int64_t>(sizeof(T)), sizeof(T));
    return value;
}

template <typename T>
void Put(void* row, int64_t index, T value) {
    std::memcpy(static_cast<char*>(row) + index * static_cast<int64_t>(sizeof(T)), &value, sizeof(T));
}

// Rounds in the current mode, then limits to 0..limit. NaN gives 0.
inline uint32_t NearestClamped(float value, uint32_t limit) {
    if (std::isnan(value)) return 0;
    const float rounded = std::nearbyint(value);
    if (rounded <= 0.0f) return 0;
    if (rounded >= static_cast<float>(limit)) return limit;
    return static_cast<uint32_t>(rounded);
}

inline uint8_t Nearest8u(float value) {
    return static_cast<uint8_t>(NearestClamped(value, 255));
}
inline uint16_t Nearest15u(float value) {
    return static_cast<uint16_t>(NearestClamped(value, 32768));
}

// NaN gives 0.
inline float LimitToUnit(float value) {
    if (!(value > 0.0f)) return 0.0f;
    return value < 1.0f ? value : 1.0f;
}

// Position of alpha among the four samples of a 4444 pixel.
constexpr int AlphaIndex(uint32_t format) {
    return HasOrderBit(format) ? 0 : 3;
}

constexpr bool Is4444(uint32_t format, uint32_t depth) {
    return IsPacked4444(format) && Depth(format) == depth;
}
constexpr bool IsRGB4444(uint32_t format, uint32_t depth) {
    return IsRGB(format) && Is4444(format, depth);
}
constexpr bool IsYUV4444(uint32_t format, uint32_t depth) {
    return IsYUV(format) && Is4444(format, depth);
}
constexpr bool Is422OfDepth(uint32_t format, uint32_t depth) {
    return Is422(format) && Depth(format) == depth;
}
constexpr bool SameButForDepth(uint32_t one, uint32_t other) {
    return WithDepth(one, 0) == WithDepth(other, 0);
}

// The value that stands for 0 in an 8-bit YUV sample: V, U, Y, A in this order.
constexpr float VUYAOffset(int sample) {
    constexpr float kOffsets[4] = {128.0f, 128.0f, 16.0f, 0.0f};
    return kOffsets[sample];
}

constexpr int64_t Pairs(int32_t width) {
    return (static_cast<int64_t>(width) + 1) / 2;
}
constexpr int64_t Groups(int32_t width) {
    return (static_cast<int64_t>(width) + 5) / 6;
}

} // namespace reference
