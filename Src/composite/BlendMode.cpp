// PK_CompositeWithBlendMode: one image over another by a blend mode.

#include <PixelKiln/Composite.h>

#include "composite/BlendChoice.h"
#include "composite/CompositeRows.h"
#include "frame/FloatMode.h"
#include "frame/SharedRandom.h"

namespace PK {
namespace {

/// Of what is drawn.
constexpr unsigned kSeed = 1;

struct Blend {
    PK_BlendMode mode;
    float opacity;
    int32_t quality;
};

/// Callers that blend row by row see one long sequence of numbers, and seed themselves.
bool SeedsItself(const Blend& blend, const MixImages& images) {
    return blend.mode == PK_BlendMode_Dissolve && images.destination.height > 1;
}

PK_Result Run(const MixPlan& plan, const Blend& blend, const MixImages& images) {
    if (!SeedsItself(blend, images) || IsTask(images)) return RunInFourBands(plan, images);
    // Memory is laid out by numbers of the same sequence: only behind that it begins.
    return plan.Run(images, 0, images.destination.height, [] { SeedSharedRandom(kSeed); });
}

PK_Result Composite(const MixImages& images, const Blend& blend) {
    if (const auto result = ResultOfStreams(images.Formats())) return *result;
    const MixKernel kernel = SelectBlendKernel(blend.mode);
    if (kernel == nullptr) return PK_ErrNotSupported;
    if (const auto result = ResultWithoutWork(images)) return *result;
    MixPlan plan;
    if (!plan.Build(images.Formats(), {kBlendFormat, kBlendFormat, kBlendFormat}, kernel, blend.opacity,
                    blend.quality))
        return PK_ErrFailed;
    return Run(plan, blend, images);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_CompositeWithBlendMode(const void* top, int32_t topRowBytes, PK_PixelFormat topFormat,
                                    const void* back, int32_t backRowBytes, PK_PixelFormat backFormat,
                                    void* dest, int32_t destRowBytes, PK_PixelFormat destFormat,
                                    int32_t width, int32_t height, float opacity, PK_BlendMode blendMode,
                                    int32_t quality, bool compositeInLinear) noexcept {
    if (blendMode == PK_BlendMode_Normal)
        return PK_Composite(top, topRowBytes, topFormat, back, backRowBytes, backFormat, dest, destRowBytes,
                            destFormat, width, height, opacity, quality, compositeInLinear);
    const MixImages images = {{static_cast<const uint8_t*>(top), topRowBytes, topFormat, width, height},
                              {static_cast<const uint8_t*>(back), backRowBytes, backFormat, width, height},
                              {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}};
    const Blend blend = {blendMode, opacity, quality};
    if (SeedsItself(blend, images)) SeedSharedRandom(kSeed);
    const FloatMode mode;
    return Composite(images, blend);
}
