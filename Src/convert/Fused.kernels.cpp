// Kernels that always go together, as one pass over the row with the numbers of the single ones.

#include "convert/ConversionKernels.h"
#include "convert/DownsampleRow.h"
#include "convert/RGBStages.h"

template <>
const PK::FusedKernels& PK::FusedKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr FusedKernels kernels = {
        .RGBToUYVY601 = DownsampleRow<OpaqueRGB<kRGB8ToYUV601>>,
        .RGBToUYVY709 = DownsampleRow<OpaqueRGB<kRGB8ToYUV709>>,
        .StraightRGBToUYVY601 = DownsampleRow<StraightRGB<kRGB8ToYUV601>>,
        .StraightRGBToUYVY709 = DownsampleRow<StraightRGB<kRGB8ToYUV709>>,
    };
    return kernels;
}
