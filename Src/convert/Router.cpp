// One function a rule, tried in the order of kRules; the first that applies decides. Their order decides
// which chain is found, and so the numbers that come out.

#include "convert/Router.h"

#include "convert/KernelMembers.h"
#include "convert/KernelTable.h"
#include "convert/RasterFormats.h"
#include "convert/RouterTable.h"
#include "frame/PixelFormat.h"

#include <optional>

namespace PK {

namespace {

using enum Kernel;

/// What is asked: from S to D at a render quality.
struct Question {
    PK_PixelFormat S;
    PK_PixelFormat D;
    int32_t quality;
};

/// What a rule that applies says. Without a kernel it is a failure, for the reason given.
struct Answer {
    Kernel kernel;
    PK_PixelFormat next;
    PK_Result failure = PK_ErrFailed;
};

using MaybeAnswer = std::optional<Answer>;

constexpr MaybeAnswer kDoesNotApply = std::nullopt;

constexpr bool SameButAlpha(const Question& q) {
    return WithAlpha(q.S, 0) == WithAlpha(q.D, 0);
}

/// The same colour model in the same matrix.
constexpr bool Alike(const Question& q) {
    constexpr uint32_t mask = kModelMask | kMatrixMask;
    return (q.S & mask) == (q.D & mask);
}

// Rules that need no table: what differs is one field.

/// Only where the direct kernel has a body, which is from SSE2 up.
MaybeAnswer DirectToBGR8u(const Question& q) {
    if (q.D != PK_PixelFormat_BGRA_4444_8u && q.D != PK_PixelFormat_BGRX_4444_8u) return kDoesNotApply;
    const Kernel direct = q.S == PK_PixelFormat_VUYX_4444_8u       ? VUYX8uToBGR8uRow_601
                          : q.S == PK_PixelFormat_VUYX_4444_8u_709 ? VUYX8uToBGR8uRow_709
                                                                   : None;
    Target target;
    if (!ChooseTarget(direct, target)) return kDoesNotApply;
    return Answer{direct, q.D};
}

MaybeAnswer Copy(const Question& q) {
    if (q.S != q.D) return kDoesNotApply;
    return Answer{CopyMember(q.S), q.D};
}

/// A premultiplied source keeps its colour and loses its alpha: it is not unpremultiplied on this way.
MaybeAnswer ForceOpaque(const Question& q) {
    if (!SameButAlpha(q)) return kDoesNotApply;
    const bool dropsAlpha = AlphaOf(q.S) == kAlphaPremultiplied && HasNoAlphaMeaning(q.D);
    if (!dropsAlpha && !HasNoAlphaMeaning(q.S)) return kDoesNotApply;
    return Answer{ForceOpaqueMember(q.S), q.D};
}

MaybeAnswer Unpremultiply(const Question& q) {
    if (AlphaOf(q.S) != kAlphaPremultiplied || AlphaOf(q.D) != kAlphaStraight) return kDoesNotApply;
    if (!IsPacked4444(q.S) || !SameButAlpha(q)) return kDoesNotApply;
    return Answer{UnpremultiplyMember(q.S), q.D};
}

/// Losing straight alpha goes over black: by way of the premultiplied form.
MaybeAnswer Premultiply(const Question& q) {
    if (AlphaOf(q.S) != kAlphaStraight || AlphaOf(q.D) == kAlphaStraight) return kDoesNotApply;
    if (!IsPacked4444(q.S) || !SameButAlpha(q)) return kDoesNotApply;
    return Answer{PremultiplyMember(q.S), WithAlpha(q.D, kAlphaPremultiplied)};
}

MaybeAnswer ExpandTo32f(const Question& q) {
    if (q.D != WithDepth(q.S, kDepth32f)) return kDoesNotApply;
    if (DepthOf(q.S) != kDepth8u && DepthOf(q.S) != kDepth15u) return kDoesNotApply;
    return Answer{ExpandTo32fMember(q.S), q.D};
}

MaybeAnswer PackFrom32f(const Question& q) {
    if (q.S != WithDepth(q.D, kDepth32f)) return kDoesNotApply;
    if (DepthOf(q.D) != kDepth8u && DepthOf(q.D) != kDepth15u) return kDoesNotApply;
    return Answer{PackFrom32fMember(q.D), q.D};
}

MaybeAnswer Expand8uTo15u(const Question& q) {
    if (DepthOf(q.S) != kDepth8u || q.D != WithDepth(q.S, kDepth15u)) return kDoesNotApply;
    return Answer{Expand8uTo15uRow, q.D};
}

MaybeAnswer Pack15uTo8u(const Question& q) {
    if (DepthOf(q.D) != kDepth8u || q.S != WithDepth(q.D, kDepth15u)) return kDoesNotApply;
    return Answer{Pack15uTo8uRow, q.D};
}

/// Alpha, where it differs too, is left to the next step.
MaybeAnswer SwapOrder(const Question& q) {
    constexpr uint32_t mask = kAlphaMask | kOrderMask;
    if (With(q.S, mask, 0) != With(q.D, mask, 0)) return kDoesNotApply;
    return Answer{SwapOrderMember(q.S), WithOrder(q.S, OrderOf(q.D))};
}

/// A source without alpha meets a destination with it: opaque from here on, and of the destination's kind.
MaybeAnswer GainAlpha(const Question& q) {
    if (DepthOf(q.S) != kDepth8u && DepthOf(q.S) != kDepth32f) return kDoesNotApply;
    if (!IsPacked4444(q.S) || !HasNoAlphaMeaning(q.S)) return kDoesNotApply;
    if (!IsPacked4444(q.D) || HasNoAlphaMeaning(q.D)) return kDoesNotApply;
    return Answer{ForceOpaqueMember(q.S), WithAlpha(q.S, AlphaOf(q.D))};
}

MaybeAnswer LookUp(const Question& q) {
    const RouterRow* row = FindRouterRow(q.S, q.D);
    if (row == nullptr) return kDoesNotApply;
    return Answer{AtQuality(row->kernel, q.quality), row->next.For(q.D)};
}

// Fallback rules: towards the float formats with four channels, and from there.

MaybeAnswer FallBackToFirstOrder(const Question& q) {
    if (OrderOf(q.S) == kOrderBGRA) return kDoesNotApply;
    return Answer{SwapOrderMember(q.S), WithOrder(q.S, kOrderBGRA)};
}

MaybeAnswer FallBackTo8uMatrix(const Question& q) {
    if (DepthOf(q.S) != kDepth8u || DepthOf(q.D) != kDepth8u) return kDoesNotApply;
    if (ModelOf(q.S) == ModelOf(q.D) || Is422(q.S)) return kDoesNotApply;
    if (IsYUV(q.S)) return Answer{YUVToRGBMember(q.S), AlphaOf(q.S)};
    return Answer{RGBToYUVMember(q.D), AlphaOf(q.S) | (IsMatrix601(q.D) ? kCodingYUV601 : kCodingYUV709)};
}

MaybeAnswer FallBackFromV210(const Question& q) {
    if (!IsV210(q.S)) return kDoesNotApply;
    return Answer{V210ToUYVY32fRow, WithDepth(q.S, kDepth32f)};
}

MaybeAnswer FallBackToFourChannels(const Question& q) {
    if (IsPacked4444(q.S) || (Alike(q) && !IsPacked4444(q.D))) return kDoesNotApply;

    const Kernel kernel = Upsample422To444Member(q.S, q.quality);
    if (kernel == None) return Answer{None, PK_PixelFormat_Invalid, PK_ErrBadSrcFormat};
    return Answer{kernel, With(q.S, kStructureMask | kAlphaMask, kStructure444 | FourChannelAlpha(q.D))};
}

MaybeAnswer FallBackTo32f(const Question& q) {
    if (DepthOf(q.S) == kDepth32f) return kDoesNotApply;
    const bool needsFloat = DepthOf(q.D) == kDepth32f || !Alike(q) || StructureOf(q.S) != StructureOf(q.D) ||
                            AlphaOf(q.S) != AlphaOf(q.D) || OrderOf(q.S) != OrderOf(q.D);
    if (!needsFloat) return kDoesNotApply;
    return Answer{ExpandTo32fMember(q.S), WithDepth(q.S, kDepth32f)};
}

/// The transfer function is for straight or opaque colour only.
Answer ChangeLight(PK_PixelFormat S) {
    if (AlphaOf(S) == kAlphaPremultiplied) return {UnpremultiplyMember(S), WithAlpha(S, kAlphaStraight)};
    if (IsLinear(S)) return {LinearToGammaRow, With(S, kLightMask, kLightGamma)};
    return {GammaToLinearRow, With(S, kLightMask, kLightLinear)};
}

MaybeAnswer FallBackToGamma(const Question& q) {
    if (!IsLinear(q.S) || IsLinear(q.D)) return kDoesNotApply;
    return ChangeLight(q.S);
}

MaybeAnswer FallBackToLinear(const Question& q) {
    if (!Alike(q) || IsLinear(q.S) || !IsLinear(q.D)) return kDoesNotApply;
    return ChangeLight(q.S);
}

/// Whether an alpha kind can stand where the destination's is wanted.
constexpr bool AlphaAgrees(uint32_t source, uint32_t destination) {
    switch (source) {
    case kAlphaStraight:
        return destination == kAlphaStraight;
    case kAlphaPremultiplied:
        return destination == kAlphaNone || destination == kAlphaPremultiplied;
    case kAlphaMeaningless:
        return destination == kAlphaNone || destination == kAlphaMeaningless;
    default:
        return true;
    }
}

MaybeAnswer FallBackToAlphaKind(const Question& q) {
    if (!Alike(q) || AlphaAgrees(AlphaOf(q.S), AlphaOf(q.D))) return kDoesNotApply;
    if (AlphaOf(q.S) == kAlphaStraight) {
        return Answer{PremultiplyMember(q.S), WithAlpha(q.S, kAlphaPremultiplied)};
    }
    if (AlphaOf(q.S) == kAlphaPremultiplied) {
        if (HasNoAlphaMeaning(q.D)) return Answer{ForceOpaqueMember(q.S), WithAlpha(q.S, kAlphaMeaningless)};
        return Answer{UnpremultiplyMember(q.S), WithAlpha(q.S, kAlphaStraight)};
    }
    return Answer{ForceOpaqueMember(q.S), WithAlpha(q.S, AlphaOf(q.D))};
}

MaybeAnswer FallBackTo422(const Question& q) {
    if (!Alike(q) || !IsPacked4444(q.S) || !Is422(q.D)) return kDoesNotApply;
    return Answer{Downsample444To422Float32Row,
                  IsMatrix601(q.S) ? PK_PixelFormat_UYVY_422_32f : PK_PixelFormat_UYVY_422_32f_709};
}

MaybeAnswer FallBackToV210(const Question& q) {
    if (!Alike(q) || !IsV210(q.D)) return kDoesNotApply;
    return Answer{UYVY32fToV210Row, q.D};
}

/// Only the depth is left to change, and perhaps the order in a last step of its own.
MaybeAnswer FallBackFrom32f(const Question& q) {
    if (!Alike(q)) return kDoesNotApply;
    if (DepthOf(q.S) != kDepth32f || DepthOf(q.D) == kDepth32f) {
        return Answer{None, PK_PixelFormat_Invalid, PK_ErrBadDstFormat};
    }
    const PK_PixelFormat next = WithOrder(q.D, kOrderBGRA);
    if (next == PK_PixelFormat_RGB_444_10u) return Answer{BGR32fToRGB10uRow, next};
    return Answer{PackFrom32fMember(next), next};
}

/// What is left is a float format in another model or matrix.
MaybeAnswer FallBackToMatrix(const Question& q) {
    if (!IsYUV(q.S)) {
        const uint32_t coding = IsMatrix601(q.D) ? kCodingYUV601 : kCodingYUV709;
        return Answer{RGBToYUVFloat32Member(q.D), q.S | coding};
    }
    if (!IsYUV(q.D)) return Answer{YUVToRGBFloat32Member(q.S), With(q.S, kCodingMask, kCodingRGB)};
    return Answer{ChangeMatrixFloat32Member(q.S),
                  With(q.S, kMatrixMask, IsMatrix601(q.S) ? kMatrix709 : kMatrix601)};
}

constexpr MaybeAnswer (*kRules[])(const Question&) = {
    DirectToBGR8u,
    Copy,
    ForceOpaque,
    Unpremultiply,
    Premultiply,
    ExpandTo32f,
    PackFrom32f,
    Expand8uTo15u,
    Pack15uTo8u,
    SwapOrder,
    GainAlpha,
    LookUp,
    FallBackToFirstOrder,
    FallBackTo8uMatrix,
    FallBackFromV210,
    FallBackToFourChannels,
    FallBackTo32f,
    FallBackToGamma,
    FallBackToLinear,
    FallBackToAlphaKind,
    FallBackTo422,
    FallBackToV210,
    FallBackFrom32f,
    FallBackToMatrix,
};

Answer Ask(const Question& q) {
    if (!IsRasterFormat(q.S)) return {None, PK_PixelFormat_Invalid, PK_ErrBadSrcFormat};
    if (!IsRasterFormat(q.D)) return {None, PK_PixelFormat_Invalid, PK_ErrBadDstFormat};
    for (const auto rule : kRules) {
        if (const MaybeAnswer answer = rule(q)) return *answer;
    }
    return {None, PK_PixelFormat_Invalid};
}

} // namespace

PK_Result ChooseConversionStep(PK_PixelFormat current, PK_PixelFormat destination, int32_t quality,
                               ConversionStep& step) {
    const Answer answer = Ask({current, destination, quality});
    step = {answer.kernel, answer.next};
    return answer.kernel != None ? PK_Success : answer.failure;
}

} // namespace PK
