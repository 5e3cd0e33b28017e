#pragma once

// The vector kernels of the colour spaces. Pixels are four floats in memory order B, G, R, A (V, U, Y, A); counts of
// pixels are multiples of eight; matrices are nine floats row by row, as in CSMatrix. Source and destination may be one.

#include "colour/FloatTargets.h"

namespace PK {

/// The pixels of a row that a kernel takes; the rest goes one by one.
inline int32_t BulkPixels(int32_t count) {
    return count > 0 ? count & ~7 : 0;
}

struct GammaConversion {
    float inExponent;
    float outExponent;
    float luma[3]; ///< The weights of R, G and B.
    bool needMatrix;
    bool gamutClip;
};

struct GammaKernels {
    void (*convert)(const float* source, float* destination, int32_t count, const float* matrix,
                    const GammaConversion& conversion);

    template <FloatTarget>
    static const GammaKernels& For();
};

struct PQKernels {
    /// \param table  PQDecodeTable
    void (*toRec709)(const float* source, float* destination, int32_t count, const float* matrix,
                     const float* table);

    /// \param outScale  factor on the signal.
    void (*fromRec709)(const float* source, float* destination, int32_t count, const float* matrix,
                       float outScale);

    template <FloatTarget>
    static const PQKernels& For();
};

struct HLGKernels {
    /// \param table  HLGDecodeTable
    void (*toRec709)(const float* source, float* destination, int32_t count, const float* matrix,
                     const float* table);
    void (*fromRec709)(const float* source, float* destination, int32_t count, const float* matrix);

    template <FloatTarget>
    static const HLGKernels& For();
};

struct YUVKernels {
    void (*toRGB)(const float* source, float* destination, int32_t count);
    void (*fromRGB)(const float* source, float* destination, int32_t count);

    template <FloatTarget>
    static const YUVKernels& For();
};

struct ClampKernels {
    /// \param count  floats, a multiple of 32.
    void (*clamp)(const float* source, float* destination, int32_t count, float minValue, float maxValue);

    template <FloatTarget>
    static const ClampKernels& For();
};

} // namespace PK
