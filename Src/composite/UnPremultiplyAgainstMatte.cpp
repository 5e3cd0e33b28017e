// PK_UnPremultiplyAgainstMatteColor: an image without the share of the colour that it was flattened against.

#include <PixelKiln/Convert.h>
#include <PixelKiln/Matte.h>

#include "composite/MatteKernels.h"
#include "convert/RasterFormats.h"
#include "convert/WorkingRows.h"
#include "frame/Arguments.h"
#include "primitives/Dispatch.h"

namespace PK {
namespace {

struct Kernels {
    MatteKernels::Complement complement;
    MatteKernels::Remove remove;
};

Kernels KernelsFor(PK_PixelFormat format) {
    const MatteKernels& k = Best<MatteKernels>();
    const bool alphaFirst = IsOrderReversed(format);
    switch (DepthOf(format)) {
    case kDepth8u:
        return alphaFirst ? Kernels{k.complement8uAlphaFirst, k.remove8uAlphaFirst}
                          : Kernels{k.complement8u, k.remove8u};
    case kDepth15u:
        return alphaFirst ? Kernels{k.complement15uAlphaFirst, k.remove15uAlphaFirst}
                          : Kernels{k.complement15u, k.remove15u};
    default:
        return alphaFirst ? Kernels{k.complement32fAlphaFirst, k.remove32fAlphaFirst}
                          : Kernels{k.complement32f, k.remove32f};
    }
}

/// The matte's share is its colour premultiplied by what a pixel leaves uncovered.
class MattePlan {
public:
    /// \param format  straight or premultiplied RGB.
    bool Build(PK_PixelFormat format, const MattePixel& matte, int32_t quality) {
        const PK_PixelFormat straight = WithAlpha(format, kAlphaStraight);
        fPremultiplied = WithAlpha(format, kAlphaPremultiplied);
        fMatte = matte;
        fKernels = KernelsFor(format);
        return fShare.Build(straight, fPremultiplied, quality) && fOut.Build(fPremultiplied, format, quality);
    }

    PK_Result Run(const SourceImage& from, const DestinationImage& to) const {
        RowMemory memory(to.width);
        memory.AddChain(fShare);
        memory.AddRow(fPremultiplied);
        memory.AddRow(fPremultiplied);
        memory.AddSink(fOut);
        return memory.With([&](TemporaryRows& rows) {
            uint8_t* const complement = rows.Take(BytesOfRow(fPremultiplied, to.width));
            uint8_t* const share = rows.Take(BytesOfRow(fPremultiplied, to.width));
            const RowSink sink(to, fOut, rows);
            for (int32_t row = 0; row < to.height; ++row) {
                fKernels.complement(from.Row(row), complement, to.width, fMatte);
                fShare.ConvertRow(complement, share, to.width, rows.Scratch());
                fKernels.remove(from.Row(row), share, sink.Row(row), to.width);
                sink.Finish(row);
            }
            return PK_Success;
        });
    }

private:
    PK_PixelFormat fPremultiplied = 0;
    MattePixel fMatte = {};
    Kernels fKernels = {};
    ConversionChain fShare, fOut;
};

PK_Result UnPremultiply(const SourceImage& from, const DestinationImage& to, const void* matte,
                        PK_PixelFormat matteFormat, int32_t quality) {
    const PK_PixelFormat format = from.format;
    if (StructureOf(format) != kStructure444 || HasNoAlphaMeaning(format) || IsYUV(format) ||
        !IsRasterFormat(format))
        return PK_ErrBadSrcFormat;
    MattePixel pixel = {};
    const PK_Result converted = PK_Convert(matte, 0, matteFormat, pixel.bytes, 0, format, 1, 1, quality);
    if (converted != PK_Success) return converted;
    if (const auto result =
            ResultWithoutWork(to.width, to.height, {from.pixels, to.pixels}, BelowZero::Refused))
        return *result;
    MattePlan plan;
    if (!plan.Build(format, pixel, quality)) return PK_ErrNotSupported;
    return plan.Run(from, to);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_UnPremultiplyAgainstMatteColor(const void* source, int32_t sourceRowBytes, void* dest,
                                            int32_t destRowBytes, PK_PixelFormat format, int32_t width,
                                            int32_t height, const void* matteColor,
                                            PK_PixelFormat matteFormat, int32_t quality) noexcept {
    return UnPremultiply({static_cast<const uint8_t*>(source), sourceRowBytes, format, width, height},
                         {static_cast<uint8_t*>(dest), destRowBytes, format, width, height}, matteColor,
                         matteFormat, quality);
}
