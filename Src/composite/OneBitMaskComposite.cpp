// PK_OneBitMaskComposite: each pixel from one of two images, by one bit of a mask.

#include <PixelKiln/Overlay.h>

#include "composite/MaskKernels.h"
#include "convert/ConversionChain.h"
#include "convert/Image.h"
#include "convert/RasterFormats.h"
#include "frame/RowScratch.h"
#include "primitives/Dispatch.h"

namespace PK {
namespace {

/// One of the two images, and the way to the destination's format where its own is another.
struct MaskInput {
    SourceImage image;
    bool isConverted = false;
    ConversionChain chain = {};

    PK_Result Prepare(PK_PixelFormat destination, int32_t quality) {
        isConverted = image.format != destination;
        if (isConverted) chain.Build(image.format, destination, quality);
        return isConverted && chain.count == 0 ? PK_ErrFailed : PK_Success;
    }

    /// The row in the destination's format: where it lies, or converted into `converted`.
    const uint8_t* Row(int32_t row, uint8_t* converted, const ChainScratch& scratch) const {
        if (!isConverted) return image.Row(row);
        chain.ConvertRow(image.Row(row), converted, image.width, scratch);
        return converted;
    }
};

struct Mask {
    const uint8_t* bits;
    ptrdiff_t rowBytes;
    int32_t firstBit;
};

MaskKernels::Select KernelFor(PK_PixelFormat format) {
    const MaskKernels& kernels = Best<MaskKernels>();
    switch (BytesPerPixel(format)) {
    case 4:
        return kernels.pixels4;
    case 8:
        return kernels.pixels8;
    default:
        return kernels.pixels16;
    }
}

PK_Result CheckArguments(const SourceImage& first, const SourceImage& second, const Mask& mask,
                         const DestinationImage& destination) {
    if (Is422(destination.format) || !IsRasterFormat(destination.format)) return PK_ErrBadDstFormat;
    if (!IsRasterFormat(first.format) || !IsRasterFormat(second.format)) return PK_ErrBadSrcFormat;
    if (destination.width < 0 || destination.width > kMaximumWidth) return PK_ErrFailed;
    if (destination.height < 0) return PK_ErrFailed;
    if (destination.width == 0 || destination.height == 0) return PK_Success;
    const bool hasNull = !first.pixels || !second.pixels || !mask.bits || !destination.pixels;
    return hasNull ? PK_ErrFailed : PK_Success;
}

void SelectRows(const MaskInput& first, uint8_t* firstRow, const MaskInput& second, uint8_t* secondRow,
                const ChainScratch& scratch, const Mask& mask, const DestinationImage& destination) {
    const MaskKernels::Select select = KernelFor(destination.format);
    for (int32_t row = 0; row < destination.height; ++row) {
        select(first.Row(row, firstRow, scratch), second.Row(row, secondRow, scratch), destination.Row(row),
               destination.width, {mask.bits + row * mask.rowBytes, mask.firstBit});
    }
}

PK_Result Composite(const SourceImage& firstImage, const SourceImage& secondImage, const Mask& mask,
                    const DestinationImage& destination, int32_t quality) {
    const PK_Result checked = CheckArguments(firstImage, secondImage, mask, destination);
    if (checked != PK_Success || destination.width == 0 || destination.height == 0) return checked;

    MaskInput first{firstImage}, second{secondImage};
    if (const PK_Result result = first.Prepare(destination.format, quality); result != PK_Success)
        return result;
    if (const PK_Result result = second.Prepare(destination.format, quality); result != PK_Success)
        return result;

    // The rows are converted one after the other, so that the longer chain's scratch serves both.
    const bool firstIsLonger = first.chain.passCount > second.chain.passCount;
    const ConversionChain& longer = firstIsLonger ? first.chain : second.chain;
    const int32_t width = destination.width;
    const uint64_t rowBytes = static_cast<uint64_t>(BytesPerPixel(destination.format)) * uint64_t(width);
    return longer.WithScratch(width, [&](const ChainScratch& scratch) {
        return WithRowScratch(first.isConverted ? rowBytes : 0, [&](uint8_t* firstRow) {
            return WithRowScratch(second.isConverted ? rowBytes : 0, [&](uint8_t* secondRow) {
                SelectRows(first, firstRow, second, secondRow, scratch, mask, destination);
                return PK_Success;
            });
        });
    });
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_OneBitMaskComposite(const void* first, int32_t firstRowBytes, PK_PixelFormat firstFormat,
                                 const void* second, int32_t secondRowBytes, PK_PixelFormat secondFormat,
                                 const uint8_t* mask, int32_t maskRowBytes, uint8_t maskBitOffset, void* dest,
                                 int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                                 int32_t height, int32_t quality) noexcept {
    return Composite({static_cast<const uint8_t*>(first), firstRowBytes, firstFormat, width, height},
                     {static_cast<const uint8_t*>(second), secondRowBytes, secondFormat, width, height},
                     {mask, maskRowBytes, maskBitOffset & 7},
                     {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}, quality);
}
