// PK_CrossDissolve: two images mixed by a ratio.

#include <PixelKiln/CrossDissolve.h>

#include "composite/DissolveChoice.h"
#include "convert/RasterFormats.h"
#include "frame/Arguments.h"
#include "primitives/Thresholds.h"

#include <PixelKiln/Convert.h>

namespace PK {
namespace {

/// The images row by row as the picture has them. All are walked upward in memory where they have one origin: the
/// processor fetches ahead best so.
MixImages WithRowsPaired(const MixImages& images) {
    const auto [first, second, destination] = images.Formats();
    const bool isBottomLeft = PK_IsOriginBottomLeft(destination);
    if (PK_IsOriginBottomLeft(first) == isBottomLeft && PK_IsOriginBottomLeft(second) == isBottomLeft)
        return images;
    return {FromTop(images.first), FromTop(images.second), FromTop(images.destination)};
}

PK_Result Dissolve(const MixImages& images, float ratio, int32_t quality) {
    const MixFormats given = images.Formats();
    if (!IsRasterFormat(given.first) || !IsRasterFormat(given.second)) return PK_ErrBadSrcFormat;
    if (!IsRasterFormat(given.destination)) return PK_ErrBadDstFormat;
    const DestinationImage& destination = images.destination;
    if (const auto result = ResultWithoutWork(destination.width, destination.height,
                                              {images.first.pixels, images.second.pixels, destination.pixels},
                                              BelowZero::Refused))
        return *result;

    const auto [kernel, working] = ChooseDissolve(given, quality);
    MixPlan plan;
    if (!plan.Build(given, {working, working, working}, kernel, 1 - ratio, quality)) return PK_ErrFailed;
    return plan.Run(WithRowsPaired(images), 0, destination.height);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_CrossDissolve(const void* first, int32_t firstRowBytes, PK_PixelFormat firstFormat,
                           const void* second, int32_t secondRowBytes, PK_PixelFormat secondFormat,
                           void* dest, int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                           int32_t height, float ratio, int32_t quality) noexcept {
    if (kNegligible > ratio)
        return PK_Convert(first, firstRowBytes, firstFormat, dest, destRowBytes, destFormat, width, height,
                          quality);
    if (kNegligible + ratio > 1)
        return PK_Convert(second, secondRowBytes, secondFormat, dest, destRowBytes, destFormat, width, height,
                          quality);
    return Dissolve({{static_cast<const uint8_t*>(first), firstRowBytes, firstFormat, width, height},
                     {static_cast<const uint8_t*>(second), secondRowBytes, secondFormat, width, height},
                     {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}},
                    ratio, quality);
}
