// Planar 4:2:0 to raster images: which rows of the planes a row of the destination takes, which kernel makes pixels of
// them, and the chain from these to the destination.

#include "convert/BridgeKernels.h"
#include "convert/Planar420.h"
#include "convert/RowsOfPlanes.h"

namespace PK {

namespace {

/// What the row kernels make of planes.
struct DecodedRow {
    PlanesRow kernel;
    PK_PixelFormat format;
};

constexpr PK_PixelFormat OfMatrix(PK_PixelFormat format, PK_PixelFormat matrix) {
    return With(format, kMatrixMask, IsMatrix601(matrix) ? kMatrix601 : kMatrix709);
}

/// Every row of luma is kept as it is.
DecodedRow FullRow(PK_PixelFormat source, PK_PixelFormat destination) {
    const auto& kernels = Best<PlanarDecodeKernels>();
    const PK_PixelFormat full = OfMatrix(PK_PixelFormat_VUYX_4444_8u, source);
    if (destination == full)
        return {HasChromaBetween(source) ? kernels.toVUYXFromBetween : kernels.toVUYXFromEven, full};
    return {kernels.toUYVY, OfMatrix(PK_PixelFormat_UYVY_422_8u, source)};
}

/// Of so many luma samples one.
DecodedRow DecimatedRow(PK_PixelFormat source, int32_t step) {
    const auto& kernels = Best<PlanarDecodeKernels>();
    return {step == 1   ? kernels.every1
            : step == 2 ? kernels.every2
            : step == 4 ? kernels.every4
                        : kernels.every8,
            OfMatrix(PK_PixelFormat_VUYA_4444_8u, source)};
}

/// Of BT.709 all 4:2:2 goes by one format.
DecodedRow WidenedRow(PK_PixelFormat source, PK_PixelFormat destination, UseOfPlanes& use) {
    const auto& kernels = Best<PlanarWidenKernels>();
    const bool is601 = IsMatrix601(source), to601 = IsMatrix601(destination);
    if (!IsYUV(destination))
        return {is601 ? kernels.toBGRX601 : kernels.toBGRX709, PK_PixelFormat_BGRX_4444_8u};
    if (IsPacked4444(destination)) return {kernels.toVUYX, OfMatrix(PK_PixelFormat_VUYX_4444_8u, source)};
    use.changesMatrix = is601 && !to601;
    use.packsWords = is601 && IsV210(destination);
    if (use.packsWords) return {Best<W210Kernels>().toV210, destination};
    return {kernels.toUYVY, is601 && to601 ? PK_PixelFormat_UYVY_422_8u : PK_PixelFormat_UYVY_422_8u_709};
}

constexpr bool DiffersInAlphaAlone(PK_PixelFormat a, PK_PixelFormat b) {
    return WithAlpha(a, kAlphaNone) == WithAlpha(b, kAlphaNone);
}

/// How the planes of a format and size are taken to an image of a format and size.
class DecodePlan {
public:
    PK_Result Build(const DecodeTarget& source, const DecodeTarget& target, int32_t field, int32_t quality);

    PK_Result Run(const SourcePlanes& planes, const DestinationImage& destination,
                  const ConversionChain& onward) const;

private:
    PK_Result BuildDecimation(const DecodeTarget& source, const DecodeTarget& target, int32_t quality);
    PK_Result Finish(PK_PixelFormat destination, int32_t quality);

    int32_t LumaRow(int32_t row) const { return fFirstRow + fRowStep * row; }

    UseOfPlanes fUse{};
    int32_t fFirstRow = 0, fRowStep = 1;
    DecodedRow fRow{};
    ConversionChain fChain; ///< from the decoded row to the destination
};

PK_Result DecodePlan::Build(const DecodeTarget& source, const DecodeTarget& target, int32_t field,
                            int32_t quality) {
    fUse.isFieldPicture = HasFieldPictures(source.format);
    const bool isFull = target.height == source.height, isHalf = target.height == source.height / 2;
    const bool isOneField = isHalf && !isFull;
    if (isOneField) {
        fRowStep = 2;
        fFirstRow = field == 2 ? 1 : 0;
    }
    if (isFull || isHalf) {
        fUse.widening = WideningOf(source.width, target.width);
        if (fUse.widening != Widening::None) {
            fRow = WidenedRow(source.format, target.format, fUse);
            return Finish(DiffersInAlphaAlone(fRow.format, target.format) ? fRow.format : target.format,
                          quality);
        }
        if (target.width == source.width) {
            fUse.interpolates = isFull || fUse.isFieldPicture;
            fRow = FullRow(source.format, target.format);
            return Finish(target.format, quality);
        }
    }
    return BuildDecimation(source, target, quality);
}

PK_Result DecodePlan::BuildDecimation(const DecodeTarget& source, const DecodeTarget& target,
                                      int32_t quality) {
    const bool isQuarter = target.width == source.width / 2 && target.height == source.height / 2;
    const int32_t step = isQuarter ? 2 : StepOfColumns(source.width, target.width);
    if (!isQuarter) {
        if (quality >= kExactSizeQuality) return PK_ErrSizeMismatch;
        if (!IsEvenRatio(source.height, target.height)) return PK_ErrBadHeight;
        if (step == 0) return PK_ErrBadWidth;
    }
    fFirstRow = 0;
    fRowStep = isQuarter ? 2 : source.height / target.height;
    fRow = DecimatedRow(source.format, step);
    return Finish(target.format, quality);
}

PK_Result DecodePlan::Finish(PK_PixelFormat destination, int32_t quality) {
    return fChain.Build(fRow.format, destination, quality) ? PK_Success : PK_ErrFailed;
}

PK_Result DecodePlan::Run(const SourcePlanes& planes, const DestinationImage& destination,
                          const ConversionChain& onward) const {
    const int32_t width = destination.width;
    RowMemory memory(width);
    memory.AddSink(fChain);
    memory.AddSink(onward);
    RowsOfPlanes::AddTo(memory, fUse, planes, width);
    return memory.With([&](TemporaryRows& rows) {
        const RowSink sink(destination, onward, rows);
        uint8_t* const decoded = fChain.IsCopy() ? nullptr : rows.Take(BytesOfRow(fRow.format, width));
        RowsOfPlanes source(fUse, planes, width, rows);
        const int32_t rowsInTurns =
            fUse.isFieldPicture && fRowStep == 1 ? 2 : 1; // of one field and the other
        for (int32_t row = 0; row < destination.height; ++row) {
            const PlaneRows rowsOfPlanes =
                source.Fetch(LumaRow(row), row + rowsInTurns >= destination.height);
            uint8_t* const target = sink.Row(row);
            fRow.kernel(rowsOfPlanes, decoded != nullptr ? decoded : target, width);
            if (decoded != nullptr) fChain.ConvertRow(decoded, target, width, rows.Scratch());
            sink.Finish(row);
        }
        return PK_Success;
    });
}

} // namespace

PK_Result DecodePlanar420(const SourcePlanes& source, PK_PixelFormat format,
                          const DestinationImage& destination, int32_t field, int32_t quality) {
    ConversionChain stays;
    if (!stays.Build(destination.format, destination.format, quality)) return PK_ErrFailed;
    return DecodePlanar420Through(stays, source, format, destination, field, quality);
}

PK_Result DecodePlanar420Through(const ConversionChain& onward, const SourcePlanes& source,
                                 PK_PixelFormat format, const DestinationImage& destination, int32_t field,
                                 int32_t quality) {
    if (destination.width == 0 || destination.height == 0) return PK_Success;
    DecodePlan plan;
    const PK_Result result =
        plan.Build({format, source[0].width, source[0].height},
                   {onward.source, destination.width, destination.height}, field, quality);
    return result == PK_Success ? plan.Run(source, destination, onward) : result;
}

} // namespace PK
