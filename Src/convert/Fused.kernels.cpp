// Kernels that always go together, as one pass over the row with the numbers of the single ones.

#include "convert/ByteScale.h"
#include "convert/ColourMatrices.h"
#include "convert/DownsampleRow.h"
#include "convert/Kernel.h"

namespace PK::PK_TARGET {
namespace {

template <const RGBToYUVMatrix& kMatrix>
struct OpaqueRGB {
    static I32 Pixels(const uint8_t* source) { return RGB8ToYUV8<kMatrix>(LoadByteChannels(source)); }
};

template <const RGBToYUVMatrix& kMatrix>
struct StraightRGB {
    static I32 Pixels(const uint8_t* source) { return PremultiplyVUYA(OpaqueRGB<kMatrix>::Pixels(source)); }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
PK::KernelBodies PK::FusedBodies<PK::PK_TARGET::kTarget>() {
    using namespace PK_TARGET;
    static constexpr KernelBody bodies[] = {
        {Kernel::RGBToUYVY601, DownsampleRow<OpaqueRGB<kRGB8ToYUV601>>},
        {Kernel::RGBToUYVY709, DownsampleRow<OpaqueRGB<kRGB8ToYUV709>>},
        {Kernel::StraightRGBToUYVY601, DownsampleRow<StraightRGB<kRGB8ToYUV601>>},
        {Kernel::StraightRGBToUYVY709, DownsampleRow<StraightRGB<kRGB8ToYUV709>>},
    };
    return bodies;
}
