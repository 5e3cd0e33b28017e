// The bridges from 10- and 16-bit words to 15-bit samples.

#include "convert/Bridges.h"
#include "primitives/CapabilityFlags.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/CodecBridges.h>

#include <algorithm>

namespace PK {
namespace {

/// The member shows in the result, so that each flag counts by itself and those below it do not.
Target TargetOfXRGB() {
    if (sCPUHasAVX2) return std::max(BestTarget(), Target::avx2);
    return sCPUHasSSE4 ? Target::sse41 : Target::plain;
}

} // namespace
} // namespace PK

void PK_ConvertRGB_444_16u_To_XRGB_4444_15u(const void* source, void* destination, int32_t width,
                                            int32_t height) noexcept {
    using namespace PK;
    if (ResultWithoutWork(width, height, {source, destination})) return;
    const SourceRows topDown(source, ptrdiff_t{6} * width);
    ConvertRows(KernelsFor<Words15uKernels>(TargetOfXRGB()).rgb10WordsToXRGB,
                {topDown[height - 1], -topDown.rowBytes}, {destination, ptrdiff_t{8} * width}, width, height);
}

PK_Result PK_Scale16uBufferTo15uSIMD(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                     bool byteSwap) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {buffer})) return *result;
    const Words15uKernels& kernels = Best<Words15uKernels>();
    ConvertRows(byteSwap ? kernels.swapAndHalve : kernels.halve, {buffer, rowBytes}, {buffer, rowBytes},
                width, height);
    return PK_Success;
}
