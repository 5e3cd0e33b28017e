// 8-bit 4:2:2 to 8-bit BGR in one pass: chroma resampling followed by the matrix.

#include "convert/ColourMatrices.h"
#include "convert/ConversionKernels.h"
#include "primitives/lanes/ChromaPairs.h"

namespace PK::PK_TARGET {
namespace {

template <const YUVToRGBMatrix& kMatrix>
struct PixelBGRX {
    static I32 Pack(I32 chroma, I32 luma) { return YUV8ToRGB8<kMatrix>(OpaqueChannels(chroma, luma)); }
};

template <const YUVToRGBMatrix& kMatrix>
using UYVYToBGR = UpsamplePairs<false, PixelBGRX<kMatrix>>;
template <const YUVToRGBMatrix& kMatrix>
using YUYVToBGR = UpsamplePairs<true, PixelBGRX<kMatrix>>;

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::YUV422ToBGRKernels& PK::YUV422ToBGRKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr YUV422ToBGRKernels kernels = {
        .UYVY601ToBGR8uRow = Row<UYVYToBGR<kYUV8ToRGB8_601>>,
        .UYVY709ToBGR8uRow = Row<UYVYToBGR<kYUV8ToRGB8_709>>,
        .YUYV601ToBGR8uRow = Row<YUYVToBGR<kYUV8ToRGB8_601>>,
        .YUYV709ToBGR8uRow = Row<YUYVToBGR<kYUV8ToRGB8_709>>,
    };
    return kernels;
}
