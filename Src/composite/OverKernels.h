#pragma once

// Rows of one image over another.

#include "primitives/KernelShapes.h"

namespace PK {

/// The letters tell top and back: A is read with its alpha, X is opaque whatever stands in its alpha. Straight colour,
/// premultiplied colour, and colour that is premultiplied about the zeros of chroma and luma. At 32f these are 0.
///
/// The constant is the opacity: 1 from one threshold below it on.
///
/// At 8u the bodies from SSE2 on decide for runs of four pixels together whether one image shows alone, from the first
/// 16-byte boundary of the destination on; single pixels before it and behind the last run follow the plain rule.
struct OverKernels {
    using Over = TwoRowKernelWith<float>;
    Over straight8u_AA, straight8u_AX, straight8u_XA, straight8u_XX;
    Over premultiplied8u_AA, premultiplied8u_AX, premultiplied8u_XA, premultiplied8u_XX;
    Over premultipliedYUV8u_AA, premultipliedYUV8u_AX, premultipliedYUV8u_XA, premultipliedYUV8u_XX;
    Over straight32f_AA, straight32f_AX, straight32f_XA, straight32f_XX;
    Over premultiplied32f_AA, premultiplied32f_AX, premultiplied32f_XA, premultiplied32f_XX;

    static constexpr const char* kFamily = "Over";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const OverKernels& For();
};

} // namespace PK
