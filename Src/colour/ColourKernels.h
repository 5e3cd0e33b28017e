#pragma once

// The vector kernels of the colour spaces. Pixels are four floats in memory order B, G, R, A (V, U, Y, A); counts of
// pixels are multiples of eight; matrices are nine floats row by row, as in CSMatrix. Source and destination may be one.

#include "primitives/KernelShapes.h"

namespace PK {

struct GammaConversion {
    const float* matrix;
    float inExponent;
    float outExponent;
    float luma[3]; ///< The weights of R, G and B.
    bool needMatrix;
    bool gamutClip;
};

struct GammaKernels {
    RowKernelWith<GammaConversion> convert;

    static constexpr const char* kFamily = "Gamma";
    static constexpr Offer kOffer = Offer::processor;
    template <Target>
    static const GammaKernels& For();
};

/// From a signal, by a table of linear values, to the hub.
struct SignalDecoding {
    const float* matrix;
    const float* table; ///< PQDecodeTable or HLGDecodeTable.
};

struct PQEncoding {
    const float* matrix;
    float outScale; ///< Factor on the signal.
};

struct PQKernels {
    RowKernelWith<SignalDecoding> toRec709;
    RowKernelWith<PQEncoding> fromRec709;

    static constexpr const char* kFamily = "PQ";
    static constexpr Offer kOffer = Offer::processor;
    template <Target>
    static const PQKernels& For();
};

struct HLGEncoding {
    const float* matrix;
};

struct HLGKernels {
    RowKernelWith<SignalDecoding> toRec709;
    RowKernelWith<HLGEncoding> fromRec709;

    static constexpr const char* kFamily = "HLG";
    static constexpr Offer kOffer = Offer::processor;
    template <Target>
    static const HLGKernels& For();
};

struct YUVKernels {
    RowKernel toRGB;
    RowKernel fromRGB;

    static constexpr const char* kFamily = "YUV";
    static constexpr Offer kOffer = Offer::processor;
    template <Target>
    static const YUVKernels& For();
};

struct FloatRange {
    float least, most;
};

struct ClampKernels {
    RowKernelWith<FloatRange> clamp; ///< Counts floats, a multiple of 32.

    static constexpr const char* kFamily = "Clamp";
    static constexpr Offer kOffer = Offer::processor;
    template <Target>
    static const ClampKernels& For();
};

} // namespace PK
