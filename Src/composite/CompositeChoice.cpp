// A straight destination is composited straight; one that is premultiplied, opaque or without alpha, premultiplied.

#include "composite/CompositeChoice.h"

#include "composite/OverKernels.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/PixelFormat.h>

namespace PK {
namespace {

using Member = OverKernels::Over OverKernels::*;

/// The members for top and back with alpha, an opaque back, an opaque top and both.
struct Members {
    Member byOpacity[4];

    Member Of(bool topIsOpaque, bool backIsOpaque) const {
        return byOpacity[(topIsOpaque ? 2 : 0) + (backIsOpaque ? 1 : 0)];
    }
};

using K = OverKernels;
constexpr Members kStraight8u = {
    {&K::straight8u_AA, &K::straight8u_AX, &K::straight8u_XA, &K::straight8u_XX}};
constexpr Members kPremultiplied8u = {
    {&K::premultiplied8u_AA, &K::premultiplied8u_AX, &K::premultiplied8u_XA, &K::premultiplied8u_XX}};
constexpr Members kPremultipliedYUV8u = {{&K::premultipliedYUV8u_AA, &K::premultipliedYUV8u_AX,
                                          &K::premultipliedYUV8u_XA, &K::premultipliedYUV8u_XX}};
constexpr Members kStraight32f = {
    {&K::straight32f_AA, &K::straight32f_AX, &K::straight32f_XA, &K::straight32f_XX}};
constexpr Members kPremultiplied32f = {
    {&K::premultiplied32f_AA, &K::premultiplied32f_AX, &K::premultiplied32f_XA, &K::premultiplied32f_XX}};

/// Straight YUV of 8 bits is mixed by its codes as they are, without regard to their zeros: callers know it so.
const Members& MembersFor(bool is8u, bool isStraight, bool isYUV) {
    if (!is8u) return isStraight ? kStraight32f : kPremultiplied32f;
    if (isStraight) return kStraight8u;
    return isYUV ? kPremultipliedYUV8u : kPremultiplied8u;
}

/// In the order of BGRA, 4:4:4, at 8u or 32f, with an alpha that counts.
PK_PixelFormat WorkingFormat(PK_PixelFormat destination, bool is8u) {
    PK_PixelFormat format = With(destination, kStructureMask | kOrderMask, 0);
    if (!is8u) format = WithDepth(format, kDepth32f);
    return HasNoAlphaMeaning(format) ? WithAlpha(format, kAlphaPremultiplied) : format;
}

bool BeginLikeTemporaryRows(const DestinationImage& image) {
    constexpr uintptr_t kBoundary = 16; // that kernels count from
    return (reinterpret_cast<uintptr_t>(image.pixels) | static_cast<uintptr_t>(image.rowBytes)) % kBoundary ==
           0;
}

} // namespace

CompositeChoice ChooseComposite(const MixImages& images, bool inLinear) {
    const MixFormats given = images.Formats();
    const bool is8u = DepthOf(given.destination) == kDepth8u;
    const bool topIsOpaque = HasNoAlphaMeaning(given.first), backIsOpaque = HasNoAlphaMeaning(given.second);
    const OverKernels& kernels = Best<OverKernels>();

    PK_PixelFormat working;
    Member kernel;
    if (Is422(given.destination)) { // a plain fade of two images, whatever their alpha
        working = is8u ? PK_PixelFormat_VUYP_4444_8u : PK_PixelFormat_VUYP_4444_32f;
        kernel = MembersFor(is8u, false, true).Of(true, true);
    } else {
        const bool isStraight = AlphaOf(given.destination) == kAlphaStraight;
        working = WorkingFormat(given.destination, is8u);
        kernel = MembersFor(is8u, isStraight, IsYUV(given.destination)).Of(topIsOpaque, backIsOpaque);
    }
    if (!inLinear) working = With(working, kLightMask, kLightGamma);
    // What is opaque to the kernel needs no alpha written before, and over an opaque back codes of 8 bits need none behind.
    // Kernels round by where a row begins: without its own row the result must begin like one.
    const PK_PixelFormat opaque = WithAlpha(working, kAlphaMeaningless);
    const auto asRead = [=](PK_PixelFormat format, bool isOpaque) {
        return isOpaque && (inLinear || format == opaque) ? opaque : working;
    };
    const bool staysOpaque =
        is8u && backIsOpaque && given.destination == opaque && BeginLikeTemporaryRows(images.destination);
    return {{asRead(given.first, topIsOpaque), asRead(given.second, backIsOpaque),
             staysOpaque ? opaque : working},
            kernels.*kernel};
}

} // namespace PK
