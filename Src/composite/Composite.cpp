// PK_Composite: one image over another.

#include <PixelKiln/Composite.h>
#include <PixelKiln/Convert.h>

#include "composite/CompositeChoice.h"
#include "composite/CompositeRows.h"
#include "frame/FloatMode.h"
#include "primitives/Thresholds.h"

namespace PK {
namespace {

/// One of the images, as if the other were not there.
PK_Result ShowAlone(const SourceImage& image, const DestinationImage& destination, int32_t quality) {
    return PK_Convert(image.pixels, static_cast<int32_t>(image.rowBytes), image.format, destination.pixels,
                      static_cast<int32_t>(destination.rowBytes), destination.format, destination.width,
                      destination.height, quality);
}

PK_Result Composite(const MixImages& images, float opacity, int32_t quality, bool inLinear) {
    const auto& [top, back, destination] = images;
    if (const auto result = ResultOfStreams(images.Formats())) return *result;
    if (opacity < kNegligible) return ShowAlone(back, destination, quality);
    if (opacity + kNegligible > 1 && HasNoAlphaMeaning(top.format))
        return ShowAlone(top, destination, quality);

    if (const auto result = ResultWithoutWork(images)) return *result;
    const CompositeChoice choice = ChooseComposite(images, inLinear);
    MixPlan plan;
    if (!plan.Build(images.Formats(), choice.working, choice.kernel, opacity, quality)) return PK_ErrFailed;
    return RunInFourBands(plan, images);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_Composite(const void* top, int32_t topRowBytes, PK_PixelFormat topFormat, const void* back,
                       int32_t backRowBytes, PK_PixelFormat backFormat, void* dest, int32_t destRowBytes,
                       PK_PixelFormat destFormat, int32_t width, int32_t height, float opacity,
                       int32_t quality, bool compositeInLinear) noexcept {
    const FloatMode mode;
    return Composite({{static_cast<const uint8_t*>(top), topRowBytes, topFormat, width, height},
                      {static_cast<const uint8_t*>(back), backRowBytes, backFormat, width, height},
                      {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}},
                     opacity, quality, compositeInLinear);
}
