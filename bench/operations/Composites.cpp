// One image over another, in place of the back image as other libraries work, and the blend modes.

#include "operations/Composites.h"
#include "operations/Operation.h"

#include <PixelKiln/Composite.h>

namespace OperationBench {
namespace {

constexpr size_t kBytes8 = 4 * static_cast<size_t>(kPixels), kBytes32 = 4 * kBytes8;
constexpr PK_PixelFormat kFloats = PK_PixelFormat_BGRA_4444_32f;

template <PK_PixelFormat kTop, PK_PixelFormat kBack, bool kFully = false>
Run Over(const uint8_t* source, uint8_t* back) {
    return [=] {
        PK_Composite(source, kBGRARowBytes, kTop, back, kBGRARowBytes, kBack, back, kBGRARowBytes, kBack,
                     kWidth, kHeight, kFully ? 1 : kOpacity, 4, false);
    };
}

/// The top lies in front of the back.
template <PK_BlendMode kMode>
Run Blend(const uint8_t* source, uint8_t* destination) {
    return [=] {
        constexpr int32_t kRowBytes = 16 * kWidth;
        PK_CompositeWithBlendMode(source, kRowBytes, kFloats, source + kBytes32, kRowBytes, kFloats,
                                  destination, kRowBytes, kFloats, kWidth, kHeight, kOpacity, kMode, 4,
                                  false);
    };
}

constexpr PK_PixelFormat kStraight = PK_PixelFormat_BGRA_4444_8u,
                         kPremultiplied = PK_PixelFormat_BGRP_4444_8u, kOpaque = PK_PixelFormat_BGRX_4444_8u;

template <PK_BlendMode kMode>
Operation ModeRow(const char* name) {
    return {name, 2 * kBytes32, kBytes32, Samples::Floats, Against::Memcpy, 0.35, Blend<kMode>};
}

// clang-format off: one row an operation
const AddOperations add = {
    {"Premultiplied BGRA 8u over opaque", 2 * kBytes8, kBytes8, Samples::Bytes, Against::Peer, 1,
     Over<kPremultiplied, kOpaque>},
    {"Premultiplied BGRA 8u over premultiplied", 2 * kBytes8, kBytes8, Samples::Bytes, Against::Peer, 1,
     Over<kPremultiplied, kPremultiplied>},
    {"Premultiplied BGRA 8u over opaque at full opacity", 2 * kBytes8, kBytes8, Samples::Bytes, Against::Peer,
     1, Over<kPremultiplied, kOpaque, true>},
    {"Premultiplied BGRA 8u over premultiplied at full opacity", 2 * kBytes8, kBytes8, Samples::Bytes,
     Against::Peer, 1, Over<kPremultiplied, kPremultiplied, true>},
    {"Straight BGRA 8u over straight", 2 * kBytes8, kBytes8, Samples::Bytes, Against::Peer, 0.7,
     Over<kStraight, kStraight>},
    ModeRow<PK_BlendMode_ColorBurn>("Blend of BGRA 32f, ColorBurn"),
    ModeRow<PK_BlendMode_ColorDodge>("Blend of BGRA 32f, ColorDodge"),
    ModeRow<PK_BlendMode_Darken>("Blend of BGRA 32f, Darken"),
    ModeRow<PK_BlendMode_Difference>("Blend of BGRA 32f, Difference"),
    ModeRow<PK_BlendMode_Exclusion>("Blend of BGRA 32f, Exclusion"),
    ModeRow<PK_BlendMode_HardLight>("Blend of BGRA 32f, HardLight"),
    ModeRow<PK_BlendMode_HardMix>("Blend of BGRA 32f, HardMix"),
    ModeRow<PK_BlendMode_Lighten>("Blend of BGRA 32f, Lighten"),
    ModeRow<PK_BlendMode_LinearBurn>("Blend of BGRA 32f, LinearBurn"),
    ModeRow<PK_BlendMode_LinearDodge>("Blend of BGRA 32f, LinearDodge"),
    ModeRow<PK_BlendMode_LinearLight>("Blend of BGRA 32f, LinearLight"),
    ModeRow<PK_BlendMode_Multiply>("Blend of BGRA 32f, Multiply"),
    ModeRow<PK_BlendMode_Overlay>("Blend of BGRA 32f, Overlay"),
    ModeRow<PK_BlendMode_PinLight>("Blend of BGRA 32f, PinLight"),
    ModeRow<PK_BlendMode_Screen>("Blend of BGRA 32f, Screen"),
    ModeRow<PK_BlendMode_SoftLight>("Blend of BGRA 32f, SoftLight"),
    ModeRow<PK_BlendMode_VividLight>("Blend of BGRA 32f, VividLight"),
    ModeRow<PK_BlendMode_Subtract>("Blend of BGRA 32f, Subtract"),
    ModeRow<PK_BlendMode_Divide>("Blend of BGRA 32f, Divide"),
    {"Blend of BGRA 32f, Luminosity", 2 * kBytes32, kBytes32, Samples::Floats, Against::Peer, 1,
     Blend<PK_BlendMode_Luminosity>},
    {"Blend of BGRA 32f, Hue", 2 * kBytes32, kBytes32, Samples::Floats, Against::Peer, 1,
     Blend<PK_BlendMode_Hue>},
};
// clang-format on

// What straight alpha is measured by.
const AddPeers addOwn = {
    {"Straight BGRA 8u over straight", "premultiplied", false, Over<kPremultiplied, kPremultiplied>},
};

} // namespace
} // namespace OperationBench
