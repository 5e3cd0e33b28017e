// libyuv on large frames: pixels, pairs decoded to pixels as they are, and planes, whose chroma serves the half size as it
// is. Its "ARGB" is BGRA in memory; a negative height turns a picture over.

#include "Reducer.h"

#include <libyuv.h>

namespace Scaling {
namespace {

using Samples = std::shared_ptr<std::vector<uint8_t>>;

Samples MakeSamples(int32_t width, int32_t height) {
    return std::make_shared<std::vector<uint8_t>>(static_cast<size_t>(width) * static_cast<size_t>(height));
}

template <libyuv::FilterMode kFilter>
void Halve(const uint8_t* pixels, int32_t rowBytes, tool::Frame& result) {
    libyuv::ARGBScale(pixels, rowBytes, kLargeWidth, kLargeHeight, result.Pixels(), result.RowBytes(),
                      kHalfWidth, kHalfHeight, kFilter);
}

template <libyuv::FilterMode kFilter>
Reduction ReducePixels(const tool::Frame& source) {
    return ReductionTo(
        [&source](tool::Frame& result) { Halve<kFilter>(source.Pixels(), source.RowBytes(), result); });
}

Reduction ReducePairs(const tool::Frame& source) {
    constexpr int32_t kRowBytes = 4 * kLargeWidth;
    return ReductionTo([&source, pixels = MakeSamples(kRowBytes, kLargeHeight)](tool::Frame& result) {
        libyuv::UYVYToARGB(source.Pixels(), source.RowBytes(), pixels->data(), kRowBytes, kLargeWidth,
                           -kLargeHeight);
        Halve<libyuv::kFilterBox>(pixels->data(), kRowBytes, result);
    });
}

Reduction ReducePlanes(const tool::Frame& source) {
    return ReductionTo([planes = source.Planes(),
                        luma = MakeSamples(kHalfWidth, kHalfHeight)](tool::Frame& result) {
        libyuv::ScalePlane(planes[0].first, planes[0].rowBytes, kLargeWidth, kLargeHeight, luma->data(),
                           kHalfWidth, kHalfWidth, kHalfHeight, libyuv::kFilterBox);
        libyuv::I444ToARGB(luma->data(), kHalfWidth, planes[1].first, planes[1].rowBytes, planes[2].first,
                           planes[2].rowBytes, result.Pixels(), result.RowBytes(), kHalfWidth, -kHalfHeight);
    });
}

const AddReducers add = {
    {kPixels, "libyuv bilinear", ReducePixels<libyuv::kFilterBilinear>},
    {kPixels, "libyuv box", ReducePixels<libyuv::kFilterBox>},
    {kPairs, "libyuv, pixels, box", ReducePairs},
    {kPlanes, "libyuv, box of luma", ReducePlanes},
};

} // namespace
} // namespace Scaling
