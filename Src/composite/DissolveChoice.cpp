#include "composite/DissolveChoice.h"

#include "composite/DissolveKernels.h"
#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"
#include "primitives/CapabilityFlags.h"
#include "primitives/Dispatch.h"

namespace PK {
namespace {

/// One formula at each depth.
struct KernelsOfDepths {
    DissolveKernels::Mix bytes, words, floats;

    DissolveKernels::Mix Of(PK_PixelFormat format) const {
        return DepthOf(format) == kDepth8u ? bytes : DepthOf(format) == kDepth15u ? words : floats;
    }
};

KernelsOfDepths Straight(const DissolveKernels& kernels) {
    return {kernels.straight8u, kernels.straight15u, kernels.straight32f};
}
KernelsOfDepths Premultiplied(const DissolveKernels& kernels) {
    return {kernels.premultiplied8u, kernels.premultiplied15u, kernels.premultiplied32f};
}
KernelsOfDepths Opaque(const DissolveKernels& kernels, uint32_t order) {
    if (order == kOrderBGRA) return {kernels.opaque8u, kernels.opaque15u, kernels.opaque32f};
    return {kernels.opaqueAlphaFirst8u, kernels.opaqueAlphaFirst15u, kernels.opaqueAlphaFirst32f};
}

bool HaveOneFormat(const MixFormats& given) {
    return given.first == given.second && given.second == given.destination;
}

bool HaveOneDepth(const MixFormats& given) {
    return DepthOf(given.first) == DepthOf(given.second) &&
           DepthOf(given.second) == DepthOf(given.destination);
}

constexpr int32_t kDestinationDepthQuality = 2;

/// The image that has a say in how they are mixed; one of the two has alpha.
PK_PixelFormat RulingFormat(const MixFormats& given) {
    const bool followsSecond = HasNoAlphaMeaning(given.first) || AlphaOf(given.second) == kAlphaPremultiplied;
    return followsSecond ? given.second : given.first;
}

} // namespace

DissolveChoice ChooseDissolve(const MixFormats& given, int32_t quality) {
    const DissolveKernels& kernels = Best<DissolveKernels>();
    const bool hasSSE2 = sCPUHasSSE2 != 0;
    if (hasSSE2 && IsV210(given.first) && HaveOneFormat(given)) return {kernels.v210, given.first};

    const uint32_t depth =
        HaveOneDepth(given) || quality == kDestinationDepthQuality ? DepthOf(given.destination) : kDepth32f;
    if (HasNoAlphaMeaning(given.first) && HasNoAlphaMeaning(given.second)) {
        // Deliberate: with SSE2 the fourth sample of an X format is alpha like any other. Hosts compare against it.
        const PK_PixelFormat ordered = hasSSE2 ? WithOrder(given.destination, kOrderBGRA) : given.destination;
        const PK_PixelFormat working = Packed4444(ordered, kAlphaMeaningless, depth);
        const KernelsOfDepths chosen = hasSSE2 ? Straight(kernels) : Opaque(kernels, OrderOf(working));
        return {chosen.Of(working), working};
    }
    const PK_PixelFormat ruling = RulingFormat(given);
    const PK_PixelFormat working = Packed4444(WithOrder(ruling, kOrderBGRA), AlphaOf(ruling), depth);
    const KernelsOfDepths chosen =
        AlphaOf(ruling) == kAlphaPremultiplied ? Premultiplied(kernels) : Straight(kernels);
    return {chosen.Of(working), working};
}

} // namespace PK
