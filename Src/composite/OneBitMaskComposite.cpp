// PK_OneBitMaskComposite: each pixel from one of two images, by one bit of a mask.

#include <PixelKiln/Overlay.h>

#include "composite/MaskKernels.h"
#include "convert/RasterFormats.h"
#include "convert/WorkingRows.h"
#include "frame/Arguments.h"
#include "primitives/Dispatch.h"

namespace PK {
namespace {

struct Mask {
    const uint8_t* bits;
    ptrdiff_t rowBytes;
    int32_t firstBit;

    MaskRow Row(int32_t row) const { return {bits + row * rowBytes, firstBit}; }
};

struct MaskImages {
    SourceImage first, second;
    Mask mask;
    DestinationImage destination;
};

/// The ways to the destination's format, in which pixels are picked, and the kernel that picks them.
class MaskPlan {
public:
    bool Build(PK_PixelFormat first, PK_PixelFormat second, PK_PixelFormat destination, int32_t quality) {
        fSelect = KernelFor(BytesPerPixel(destination));
        return fFirst.Build(first, destination, quality) && fSecond.Build(second, destination, quality);
    }

    /// Rows from `firstRow` up to `endRow` of images in the formats of the plan.
    PK_Result Run(const MaskImages& images, int32_t firstRow, int32_t endRow) const {
        const int32_t width = images.destination.width;
        RowMemory memory(width);
        memory.AddSource(fFirst);
        memory.AddSource(fSecond);
        return memory.With([&](TemporaryRows& rows) {
            const RowSource first(images.first, fFirst, rows), second(images.second, fSecond, rows);
            for (int32_t row = firstRow; row < endRow; ++row)
                fSelect(first.Row(row), second.Row(row), images.destination.Row(row), width,
                        images.mask.Row(row));
            return PK_Success;
        });
    }

private:
    static MaskKernels::Select KernelFor(int32_t pixelBytes) {
        const MaskKernels& kernels = Best<MaskKernels>();
        return pixelBytes == 4 ? kernels.pixels4 : pixelBytes == 8 ? kernels.pixels8 : kernels.pixels16;
    }

    ConversionChain fFirst, fSecond;
    MaskKernels::Select fSelect = nullptr;
};

PK_Result Composite(const MaskImages& images, int32_t quality) {
    const auto& [first, second, mask, destination] = images;
    if (Is422(destination.format) || !IsRasterFormat(destination.format)) return PK_ErrBadDstFormat;
    if (!IsRasterFormat(first.format) || !IsRasterFormat(second.format)) return PK_ErrBadSrcFormat;
    if (destination.width > kMaximumWidth) return PK_ErrFailed; // of an image without rows, too
    if (const auto result = ResultWithoutWork(destination.width, destination.height,
                                              {first.pixels, second.pixels, mask.bits, destination.pixels},
                                              BelowZero::Refused))
        return *result;

    MaskPlan plan;
    if (!plan.Build(first.format, second.format, destination.format, quality)) return PK_ErrFailed;
    return plan.Run(images, 0, destination.height);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_OneBitMaskComposite(const void* first, int32_t firstRowBytes, PK_PixelFormat firstFormat,
                                 const void* second, int32_t secondRowBytes, PK_PixelFormat secondFormat,
                                 const uint8_t* mask, int32_t maskRowBytes, uint8_t maskBitOffset, void* dest,
                                 int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                                 int32_t height, int32_t quality) noexcept {
    return Composite({{static_cast<const uint8_t*>(first), firstRowBytes, firstFormat, width, height},
                      {static_cast<const uint8_t*>(second), secondRowBytes, secondFormat, width, height},
                      {mask, maskRowBytes, maskBitOffset & 7},
                      {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}},
                     quality);
}
