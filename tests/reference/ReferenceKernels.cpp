// Finds the family that a kernel belongs to.
#include "ReferenceKernels.h"

#include <sstream>
#include <stdexcept>

#include "ReferenceFamilies.h"
#include "ReferenceSamples.h"

namespace reference {

void Run(std::string_view kernel, uint32_t sourceFormat, uint32_t destinationFormat, bool vectorMember,
         const void* src, void* dst, int32_t width, int quality) {
    if (width < 0) throw std::invalid_argument("negative width");
    const Job job = {kernel, sourceFormat, destinationFormat, vectorMember, src, dst, width, quality};
    for (const auto family :
         {RunCopyAndAlpha, RunPremultiplication, RunDepthChange, RunRGBToYUV, RunYUVToRGB, RunBetweenMatrices,
          RunChromaResampling, RunTransferFunction, RunV210, RunRGB10}) {
        if (family(job)) return;
    }
    std::ostringstream message;
    message << "no member of " << kernel << " from 0x" << std::hex << sourceFormat << " to 0x"
            << destinationFormat;
    throw std::invalid_argument(message.str());
}

int64_t RowLength(uint32_t format, int32_t width) {
    if (IsStream(format)) return 0;
    if (IsV210(format)) return Groups(width) * 16;
    if (format == kRGB_444_10u) return int64_t{width} * 4;
    if (Is4444(format, k8u)) return int64_t{width} * 4;
    if (Is4444(format, k15u)) return int64_t{width} * 8;
    if (Is4444(format, k32f)) return int64_t{width} * 16;
    if (Is422OfDepth(format, k8u)) return Pairs(width) * 4;
    if (Is422OfDepth(format, k32f)) return Pairs(width) * 16;
    return 0;
}

} // namespace reference
