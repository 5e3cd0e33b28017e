// The router's rules, one after the other: the first that applies decides.
#include "ReferenceRouter.h"

#include "ReferenceFormats.h"

namespace reference {
namespace {

using MaybeStep = std::optional<Step>;

// Alpha kind of a hub on the way to a destination: a destination without alpha goes through the X formats.
uint32_t HubAlpha(uint32_t destination) {
    return Alpha(destination) == 0 ? kMeaningless : Alpha(destination);
}

bool IsBGR8u(uint32_t format) {
    return format == kBGRA_4444_8u || format == kBGRP_4444_8u || format == kBGRX_4444_8u;
}

bool IsVUY8u(uint32_t format) {
    return format == kVUYA_4444_8u || format == kVUYP_4444_8u || format == kVUYX_4444_8u;
}

bool IsVUY8u709(uint32_t format) {
    return format == kVUYA_4444_8u_709 || format == kVUYP_4444_8u_709 || format == kVUYX_4444_8u_709;
}

Step UpsampleFloat(uint32_t next, int quality) {
    return {"Upsample422To444Float32Row", next, quality > 1};
}

MaybeStep FromVUYA8u(uint32_t D) {
    if (D == kVUYA_4444_8u_709) return Step{"YUV601To709Row", D};
    if (D == kVUYP_4444_32f) return Step{"VUYA8uToVUYP32fRow", D};
    if (Is422(D)) return Step{"PremultiplyRow", kVUYP_4444_8u};
    if (IsYUV(D) && !Is601(D) && Depth(D) == k8u) return Step{"YUV601To709Row", kVUYA_4444_8u_709};
    if (IsYUV(D)) return {};
    if (Depth(D) != k8u) return Step{"YUV601ToRGB32fRow", kBGRA_4444_32f};
    return Step{"YUV601ToRGBRow", kBGRA_4444_8u};
}

MaybeStep FromVUYA8u709(uint32_t D) {
    if (D == kVUYA_4444_8u) return Step{"YUV709To601Row", D};
    if (D == kVUYP_4444_32f_709) return Step{"VUYA8uToVUYP32fRow", D};
    if (Is422(D)) return Step{"PremultiplyRow", kVUYP_4444_8u_709};
    if (IsYUV(D) && Is601(D) && Depth(D) == k8u) return Step{"YUV709To601Row", kVUYA_4444_8u};
    if (IsYUV(D)) return {};
    if (Depth(D) != k8u) return Step{"YUV709ToRGB32fRow", kBGRA_4444_32f};
    return Step{"YUV709ToRGBRow", kBGRA_4444_8u};
}

MaybeStep FromVUYP8u(uint32_t D) {
    if (D == kVUYP_4444_8u_709) return Step{"YUV601To709Row", D};
    if (Is422(D)) return Step{"Downsample444To422Row", kUYVY_422_8u};
    if (IsYUV(D)) return {};
    if (Depth(D) != k8u) return Step{"YUV601ToRGB32fRow", kBGRP_4444_32f};
    return Step{"YUV601ToRGBRow", kBGRP_4444_8u};
}

MaybeStep FromVUYP8u709(uint32_t D) {
    if (D == kVUYP_4444_8u) return Step{"YUV709To601Row", D};
    if (Is422(D)) return Step{"Downsample444To422Row", kUYVY_422_8u_709};
    if (IsYUV(D)) return {};
    if (Depth(D) != k8u) return Step{"YUV709ToRGB32fRow", kBGRP_4444_32f};
    return Step{"YUV709ToRGBRow", kBGRP_4444_8u};
}

MaybeStep FromVUYX8u(uint32_t D) {
    const uint32_t a = HubAlpha(D);
    if (Is422(D) && Is601(D)) return Step{"Downsample444To422Row", kUYVY_422_8u};
    if (IsYUV(D) && !Is601(D)) return Step{"YUV601To709Row", Is422(D) ? kVUYP_4444_8u_709 : (a | 0xA01)};
    if (IsYUV(D)) return {};
    if (Depth(D) != k8u) return Step{"VUYX8uToRGB32fRow", a | 0x100};
    return Step{"VUYX8uToRGB8uRow", a};
}

MaybeStep FromVUYX8u709(uint32_t D) {
    const uint32_t a = HubAlpha(D);
    if (Is422(D) && !Is601(D)) return Step{"Downsample444To422Row", kUYVY_422_8u_709};
    if (IsYUV(D) && Is601(D)) return Step{"YUV709To601Row", Is422(D) ? kVUYP_4444_8u : (a | 0x801)};
    if (IsYUV(D)) return {};
    if (Depth(D) != k8u) return Step{"VUYX8uToRGB32fRow", a | 0x100};
    return Step{"VUYX8uToRGB8uRow", a};
}

MaybeStep FromVUYFloat(uint32_t S, uint32_t D) {
    if (S == kVUYA_4444_32f) {
        if (D == kVUYA_4444_32f_709) return Step{"YUV601To709Float32Row", D};
        if (D == kBGRA_4444_32f) return Step{"YUV601ToRGBFloat32Row", D};
        if (Is422(D)) return Step{"PremultiplyRow", kVUYP_4444_32f};
    }
    if (S == kVUYP_4444_32f) {
        if (D == kVUYP_4444_32f_709) return Step{"YUV601To709Float32Row", D};
        if (D == kBGRP_4444_32f) return Step{"YUV601ToRGBFloat32Row", D};
        if (D == kUYVY_422_32f) return Step{"Downsample444To422Float32Row", D};
        if (Depth(D) == k8u && Is422(D) && Is601(D)) return Step{"PackFrom32fRow", kVUYP_4444_8u};
    }
    if (S == kVUYA_4444_32f_709) {
        if (D == kVUYA_4444_32f) return Step{"YUV709To601Float32Row", D};
        if (D == kBGRA_4444_32f) return Step{"YUV709ToRGBFloat32Row", D};
    }
    if (S == kVUYP_4444_32f_709) {
        if (D == kVUYP_4444_32f) return Step{"YUV709To601Float32Row", D};
        if (D == kBGRP_4444_32f) return Step{"YUV709ToRGBFloat32Row", D};
        if (D == kUYVY_422_32f_709) return Step{"Downsample444To422Float32Row", D};
    }
    return {};
}

MaybeStep FromBGRA8u(uint32_t D) {
    if (D == kVUYA_4444_8u) return Step{"RGBToYUV601Row", D};
    if (D == kVUYA_4444_8u_709) return Step{"RGBToYUV709Row", D};
    if (D == kBGRA_4444_32f_Linear) return Step{"Gamma8uToLinearFloat32Row", D};
    if (D == kARGB_4444_15u) return Step{"Expand8uTo15uRow", kBGRA_4444_15u};
    if (D == kBGRA_4444_15u) return Step{"Expand8uTo15uRow", D};
    if (D == kBGRP_4444_32f) return Step{"BGRA8uToBGRP32fRow", D};
    if (IsRGB(D) && Depth(D) != k8u) return {};
    if (IsRGB(D)) {
        return Step{"PremultiplyRow", Alpha(D) == kPremultiplied ? kBGRP_4444_8u : kBGRX_4444_8u};
    }
    if (Depth(D) != k8u) return Step{"ExpandTo32fRow", kBGRA_4444_32f};
    if (Is601(D)) return Step{"RGBToYUV601Row", kVUYA_4444_8u};
    return Step{"RGBToYUV709Row", kVUYA_4444_8u_709};
}

MaybeStep FromBGRP8u(uint32_t D) {
    if (D == kVUYP_4444_8u) return Step{"RGBToYUV601Row", D};
    if (D == kVUYP_4444_8u_709) return Step{"RGBToYUV709Row", D};
    if (D == kRGB_444_10u) return Step{"BGR8uToRGB10uRow", D};
    if (Alpha(D) == kStraight) return Step{"UnpremultiplyRow", kBGRA_4444_8u};
    if (HasNoAlphaMeaning(D)) return Step{"ForceOpaqueRow", kBGRX_4444_8u};
    return {};
}

MaybeStep FromBGRFloat(uint32_t S, uint32_t D) {
    if (S == kBGRA_4444_32f) {
        if (D == kVUYA_4444_32f) return Step{"RGBToYUV601Float32Row", D};
        if (D == kVUYA_4444_32f_709) return Step{"RGBToYUV709Float32Row", D};
        if (D == kBGRA_4444_32f_Linear) return Step{"GammaToLinearRow", D};
        if (D == kBGRA_4444_15u) return Step{"PackFrom32fRow", D};
        if (D == kVUYA_4444_8u) return Step{"RGB32fToYUV601_8uRow", D};
        if (D == kVUYA_4444_8u_709) return Step{"RGB32fToYUV709_8uRow", D};
    }
    if (S == kBGRP_4444_32f) {
        if (D == kRGB_444_10u) return Step{"BGR32fToRGB10uRow", D};
        if (D == kVUYP_4444_32f) return Step{"RGBToYUV601Float32Row", D};
        if (D == kVUYP_4444_32f_709) return Step{"RGBToYUV709Float32Row", D};
    }
    if (S == kBGRA_4444_32f_Linear) {
        if (D == kBGRA_4444_32f) return Step{"LinearToGammaRow", D};
        if (D == kBGRA_4444_8u) return Step{"LinearFloat32ToGamma8uRow", D};
    }
    return {};
}

MaybeStep FromUYVY8u(uint32_t D) {
    if (IsBGR8u(D)) return Step{"UYVY601ToBGR8uRow", D};
    if (IsVUY8u(D)) return Step{"Upsample422To444Row", D};
    if (D == kV210_422_10u) return Step{"UYVY8uToV210Row", D};
    if (IsYUV(D) && !Is601(D)) return Step{"UYVY601To709Row", kUYVY_422_8u_709};
    if (Is422(D)) return Step{"SwapOrderRow", kYUYV_422_8u};
    if (Alpha(D) == kStraight) return Step{"Upsample422To444Row", kVUYA_4444_8u};
    if (Alpha(D) == kPremultiplied) return Step{"Upsample422To444Row", kVUYP_4444_8u};
    return Step{"Upsample422To444Row", kVUYX_4444_8u};
}

MaybeStep FromUYVY8u709(uint32_t D) {
    if (IsBGR8u(D)) return Step{"UYVY709ToBGR8uRow", D};
    if (IsVUY8u709(D)) return Step{"Upsample422To444Row", D};
    if (D == kV210_422_10u_709) return Step{"UYVY8uToV210Row", D};
    if (D == kUYVY_422_8u) return Step{"UYVY709To601Row", D};
    if (IsYUV(D) && Is601(D)) return Step{"UYVY709To601Row", kUYVY_422_8u};
    if (HasOrderBit(D) && Is422(D)) return Step{"SwapOrderRow", kYUYV_422_8u_709};
    return {};
}

MaybeStep FromYUYV8u(uint32_t S, uint32_t D) {
    if (S == kYUYV_422_8u) {
        if (IsBGR8u(D)) return Step{"YUYV601ToBGR8uRow", D};
        if (D == kYUYV_422_8u_709) return Step{"YUYV601To709Row", D};
        if (IsVUY8u(D)) return Step{"Upsample422To444Row", D};
    } else {
        if (IsBGR8u(D)) return Step{"YUYV709ToBGR8uRow", D};
        if (D == kYUYV_422_8u) return Step{"YUYV709To601Row", D};
        if (IsVUY8u709(D)) return Step{"Upsample422To444Row", D};
    }
    return {};
}

MaybeStep FromUYVYFloat(uint32_t S, uint32_t D, int quality) {
    if (S == kUYVY_422_32f && (D == kVUYA_4444_32f || D == kVUYP_4444_32f)) return UpsampleFloat(D, quality);
    if (S == kUYVY_422_32f_709 && (D == kVUYA_4444_32f_709 || D == kVUYP_4444_32f_709)) {
        return UpsampleFloat(D, quality);
    }
    return {};
}

MaybeStep FromV210(uint32_t S, uint32_t D) {
    if (IsBGR8u(D)) return Step{"V210ToBGR8uRow", D};
    if (S == kV210_422_10u) {
        if (IsVUY8u(D)) return Step{"V210ToVUY8uRow", D};
        if (D == kUYVY_422_8u) return Step{"V210ToUYVY8uRow", D};
    } else {
        if (IsVUY8u709(D)) return Step{"V210ToVUY8uRow", D};
        if (IsVUY8u(D)) return Step{"V210709ToVUY601_8uRow", D};
        if (D == kUYVY_422_8u || D == kUYVY_422_8u_709) return Step{"V210ToUYVY8uRow", kUYVY_422_8u_709};
    }
    return {};
}

MaybeStep FromBGR15u(uint32_t S, uint32_t D) {
    if (Depth(D) == k8u) return Step{"Pack15uTo8uRow", Alpha(S)};
    // The straight source runs the kernel of the other direction. Kept so: results depend on it.
    if (D == kRGB_444_10u && S == kBGRA_4444_15u) return Step{"UnpremultiplyRow", kBGRP_4444_15u};
    if (D == kRGB_444_10u) return Step{"BGR15uToRGB10uRow", D};
    return Step{"ExpandTo32fRow", Alpha(S) | k32f};
}

MaybeStep FromRGB10u(uint32_t D) {
    const uint32_t a = HubAlpha(D);
    if (Depth(D) == k8u) return Step{"RGB10uToBGR8uRow", a};
    if (Depth(D) == k15u) return Step{"RGB10uToBGR15uRow", a | k15u};
    return Step{"RGB10uToBGR32fRow", a | k32f};
}

MaybeStep FromTable(uint32_t S, uint32_t D, int quality) {
    switch (S) {
    case kVUYA_4444_8u:
        return FromVUYA8u(D);
    case kVUYA_4444_8u_709:
        return FromVUYA8u709(D);
    case kVUYP_4444_8u:
        return FromVUYP8u(D);
    case kVUYP_4444_8u_709:
        return FromVUYP8u709(D);
    case kVUYX_4444_8u:
        return FromVUYX8u(D);
    case kVUYX_4444_8u_709:
        return FromVUYX8u709(D);
    case kVUYA_4444_32f:
    case kVUYP_4444_32f:
    case kVUYA_4444_32f_709:
    case kVUYP_4444_32f_709:
        return FromVUYFloat(S, D);
    case kBGRA_4444_8u:
        return FromBGRA8u(D);
    case kBGRP_4444_8u:
        return FromBGRP8u(D);
    case kBGRA_4444_32f:
    case kBGRP_4444_32f:
    case kBGRA_4444_32f_Linear:
        return FromBGRFloat(S, D);
    case kUYVY_422_8u:
        return FromUYVY8u(D);
    case kUYVY_422_8u_709:
        return FromUYVY8u709(D);
    case kYUYV_422_8u:
    case kYUYV_422_8u_709:
        return FromYUYV8u(S, D);
    case kUYVY_422_32f:
    case kUYVY_422_32f_709:
        return FromUYVYFloat(S, D, quality);
    case kV210_422_10u:
    case kV210_422_10u_709:
        return FromV210(S, D);
    case kBGRA_4444_15u:
    case kBGRP_4444_15u:
    case kBGRX_4444_15u:
        return FromBGR15u(S, D);
    case kARGB_4444_15u:
        return Step{"SwapOrderRow", kBGRA_4444_15u};
    case kRGB_444_10u:
        return FromRGB10u(D);
    default:
        return {};
    }
}

Step GammaStep(uint32_t S) {
    if (Alpha(S) == kPremultiplied) return {"UnpremultiplyRow", WithAlpha(S, kStraight)};
    if (IsLinear(S)) return {"LinearToGammaRow", S & ~kLinear};
    return {"GammaToLinearRow", S | kLinear};
}

Step AlphaStep(uint32_t S, uint32_t D) {
    if (Alpha(S) == kStraight) return {"PremultiplyRow", WithAlpha(S, kPremultiplied)};
    if (Alpha(S) == kPremultiplied) {
        if (!HasNoAlphaMeaning(D)) return {"UnpremultiplyRow", WithAlpha(S, kStraight)};
        return {"ForceOpaqueRow", WithAlpha(S, kMeaningless)};
    }
    return {"ForceOpaqueRow", WithAlpha(S, Alpha(D))};
}

bool AlphaAgrees(uint32_t S, uint32_t D) {
    if (Alpha(S) == 0) return true;
    if (Alpha(S) == kStraight) return Alpha(D) == kStraight;
    if (Alpha(S) == kPremultiplied) return Alpha(D) == 0 || Alpha(D) == kPremultiplied;
    return Alpha(D) == 0 || Alpha(D) == kMeaningless;
}

// Same colour model and same matrix.
bool Alike(uint32_t S, uint32_t D) {
    const uint32_t mask = kYUV | kMatrixMask;
    return (S & mask) == (D & mask);
}

MaybeStep UpsampleToHub(uint32_t S, uint32_t D, int quality) {
    const uint32_t a = HubAlpha(D);
    if (S == kUYVY_422_8u) return Step{"Upsample422To444Row", a | 0x801};
    if (S == kUYVY_422_8u_709) return Step{"Upsample422To444Row", a | 0xA01};
    if (S == kUYVY_422_32f) return UpsampleFloat(a | 0x901, quality);
    if (S == kUYVY_422_32f_709) return UpsampleFloat(a | 0xB01, quality);
    return {};
}

MaybeStep AmongAlike(uint32_t S, uint32_t D) {
    if (IsLinear(D) && !IsLinear(S)) return GammaStep(S);
    if (!AlphaAgrees(S, D)) return AlphaStep(S, D);
    if (IsPacked4444(S) && Is422(D)) {
        return Step{"Downsample444To422Float32Row", Is601(D) ? kUYVY_422_32f : kUYVY_422_32f_709};
    }
    if (IsV210(D)) return Step{"UYVY32fToV210Row", D};
    if (Depth(S) != k32f || Depth(D) == k32f) return {};
    const uint32_t next = D & ~kOrder;
    return Step{next == kRGB_444_10u ? "BGR32fToRGB10uRow" : "PackFrom32fRow", next};
}

Step BetweenModels(uint32_t S, uint32_t D) {
    if (IsYUV(S) && Is601(S)) {
        if (IsYUV(D)) return {"YUV601To709Float32Row", S | k709};
        return {"YUV601ToRGBFloat32Row", S & ~(kYUV | kVideoRange)};
    }
    if (IsYUV(S)) {
        if (IsYUV(D)) return {"YUV709To601Float32Row", S & ~kMatrixMask};
        return {"YUV709ToRGBFloat32Row", S & ~(kYUV | kMatrixMask | kVideoRange)};
    }
    if (Is601(D)) return {"RGBToYUV601Float32Row", S | 0x801};
    return {"RGBToYUV709Float32Row", S | 0xA01};
}

MaybeStep Fallback(uint32_t S, uint32_t D, int quality) {
    if (HasOrderBit(S)) return Step{"SwapOrderRow", S & ~kOrder};

    if (Depth(S) == k8u && Depth(D) == k8u && IsYUV(S) != IsYUV(D) && !Is422(S)) {
        if (IsYUV(S)) return Step{Is601(S) ? "YUV601ToRGBRow" : "YUV709ToRGBRow", Alpha(S)};
        if (Is601(D)) return Step{"RGBToYUV601Row", Alpha(S) | 0x801};
        return Step{"RGBToYUV709Row", Alpha(S) | 0xA01};
    }

    if (S == kV210_422_10u) return Step{"V210ToUYVY32fRow", kUYVY_422_32f};
    if (S == kV210_422_10u_709) return Step{"V210ToUYVY32fRow", kUYVY_422_32f_709};

    const bool alike = Alike(S, D);
    const bool staysUnpacked = alike && !IsPacked4444(D);
    if (!IsPacked4444(S) && !staysUnpacked) return UpsampleToHub(S, D, quality);

    const bool differsInMoreThanOrder = (S & ~kOrder) != (D & ~kOrder);
    const bool expands = Depth(D) == k32f || !alike || Structure(S) != Structure(D) || Alpha(S) != Alpha(D) ||
                         HasOrderBit(S) != HasOrderBit(D);
    if (differsInMoreThanOrder && Depth(S) != k32f && expands) {
        return Step{"ExpandTo32fRow", WithDepth(S, k32f)};
    }

    if (IsLinear(S) && !IsLinear(D)) return GammaStep(S);
    if (alike) return AmongAlike(S, D);
    return BetweenModels(S, D);
}

bool IsVUYX8u(uint32_t format) {
    return format == kVUYX_4444_8u || format == kVUYX_4444_8u_709;
}

// The formats of which CopyRow knows the row length.
bool IsCopyable(uint32_t format) {
    if (IsV210(format) || format == kRGB_444_10u) return true;
    if (IsPacked4444(format)) return Depth(format) != k10u;
    return Is422(format) && (Depth(format) == k8u || Depth(format) == k32f);
}

} // namespace

std::optional<Step> ChooseStep(uint32_t S, uint32_t D, int quality, bool sse2) {
    if (IsStream(S) || IsStream(D)) return {};

    if (sse2 && IsVUYX8u(S) && (D == kBGRA_4444_8u || D == kBGRX_4444_8u)) return Step{"VUYX8uToBGR8uRow", D};

    if (S == D) {
        if (!IsCopyable(S)) return {};
        return Step{"CopyRow", D};
    }

    if (SameButForAlpha(S, D)) {
        if (Alpha(S) == kPremultiplied && HasNoAlphaMeaning(D)) return Step{"ForceOpaqueRow", D};
        if (HasNoAlphaMeaning(S)) return Step{"ForceOpaqueRow", D};
        if (Alpha(S) == kPremultiplied && IsPacked4444(S) && Alpha(D) == kStraight) {
            return Step{"UnpremultiplyRow", D};
        }
        if (Alpha(S) == kStraight && IsPacked4444(S)) {
            return Step{"PremultiplyRow", WithAlpha(D, kPremultiplied)};
        }
    }

    if (D == WithDepth(S, k32f) && (Depth(S) == k8u || Depth(S) == k15u)) return Step{"ExpandTo32fRow", D};
    if (S == WithDepth(D, k32f) && (Depth(D) == k8u || Depth(D) == k15u)) return Step{"PackFrom32fRow", D};
    if (Depth(S) == k8u && D == WithDepth(S, k15u)) return Step{"Expand8uTo15uRow", D};
    if (Depth(D) == k8u && S == WithDepth(D, k15u)) return Step{"Pack15uTo8uRow", D};

    const uint32_t alphaAndOrder = kAlphaMask | kOrder;
    if ((S & ~alphaAndOrder) == (D & ~alphaAndOrder)) {
        return Step{"SwapOrderRow", (S & ~kOrder) | (D & kOrder)};
    }

    if ((Depth(S) == k8u || Depth(S) == k32f) && IsPacked4444(S) && HasNoAlphaMeaning(S) && IsPacked4444(D) &&
        !HasNoAlphaMeaning(D)) {
        return Step{"ForceOpaqueRow", WithAlpha(S, Alpha(D))};
    }

    if (auto step = FromTable(S, D, quality)) return step;
    return Fallback(S, D, quality);
}

std::vector<Step> Chain(uint32_t source, uint32_t destination, int quality, bool sse2) {
    std::vector<Step> steps;
    uint32_t current = source;
    for (int taken = 0; taken < 8; ++taken) {
        const auto step = ChooseStep(current, destination, quality, sse2);
        if (!step) return {};
        steps.push_back(*step);
        if (step->next == destination) return steps;
        current = step->next;
    }
    return {};
}

} // namespace reference
