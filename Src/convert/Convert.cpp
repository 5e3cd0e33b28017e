// PK_Convert: copies, decodes, encodes or runs rows, by what the two formats are.

#include <PixelKiln/Convert.h>

#include "convert/CopySameFormat.h"
#include "convert/RasterFormats.h"
#include "convert/Streams.h"
#include "convert/WorkingRows.h"
#include "frame/Arguments.h"
#include "frame/FloatMode.h"
#include "frame/Planes.h"
#include "frame/TransientMemory.h"

namespace PK {

namespace {

/// A transient image as what it is to one operation and to the next.
DestinationImage AsDestination(const TransientPixelBuffer& buffer, PK_PixelFormat format, int32_t width,
                               int32_t height) {
    return {buffer.Pixels(), buffer.RowBytes(), format, width, height};
}

SourceImage AsSource(const DestinationImage& image) {
    return {image.pixels, image.rowBytes, image.format, image.width, image.height};
}

/// Row 0 of the source to row 0 of the destination and so on.
PK_Result ConvertRows(const SourceImage& source, const DestinationImage& destination,
                      const ConversionChain& chain) {
    RowMemory memory(source.width);
    memory.AddChain(chain);
    return memory.With([&](const TemporaryRows& rows) {
        const RowSource from(source, chain, rows.Scratch());
        for (int32_t row = 0; row < source.height; ++row) from.ConvertRow(row, destination.Row(row));
        return PK_Success;
    });
}

PK_Result ConvertToRaster(const SourceImage& source, const DestinationImage& destination, int32_t quality) {
    ConversionChain chain;
    if (!chain.Build(source.format, destination.format, quality)) return PK_ErrFailed;
    if (const auto result =
            ResultWithoutWork(source.width, source.height, {source.pixels, destination.pixels}))
        return *result;

    // Only between a bottom-up and a top-down format do the rows change their order in memory. Otherwise both
    // are walked upward in memory, which the processor fetches ahead best.
    const bool turned = PK_IsOriginTopLeft(source.format) != PK_IsOriginTopLeft(destination.format);
    return ConvertRows(turned ? Reversed(source) : source, destination, chain);
}

PK_Result Convert(const SourceImage& source, const DestinationImage& destination, int32_t quality);

/// A frame of DV has a size of its own, and so no empty picture.
constexpr bool CanBeEmpty(PK_PixelFormat format) {
    return !IsStream(format) || Is420Planar(format);
}

/// The result where a stream cannot be read or written, or there are planes without a sample.
std::optional<PK_Result> ResultOfStream(const SourceImage& source, const DestinationImage& destination) {
    if (source.width < 0 || source.height < 0) return PK_ErrFailed;
    const bool isEmpty = source.width == 0 || source.height == 0;
    if (isEmpty && CanBeEmpty(source.format) && CanBeEmpty(destination.format)) return PK_Success;
    for (const PK_PixelFormat format : {source.format, destination.format})
        if (Is420Planar(format) && !HavePlanesOffsets(source.width, source.height)) return PK_ErrFailed;
    if (HasNull({source.pixels, destination.pixels})) return PK_ErrFailed;
    return std::nullopt;
}

PK_Result ConvertToStream(const SourceImage& source, const DestinationImage& destination, int32_t quality) {
    if (const auto result = ResultOfStream(source, destination)) return *result;

    PK_PixelFormat format = PK_PixelFormat_Invalid;
    const PK_Result chosen = ChooseEncodeSource(source.format, destination.format, quality, format);
    if (chosen != PK_Success) return chosen;
    if (format == source.format) return EncodeStream(source, destination, quality);

    const TransientPixelBuffer buffer(format, source.width, source.height);
    if (buffer.Result() != PK_Success) return buffer.Result();
    const DestinationImage staged = AsDestination(buffer, format, source.width, source.height);
    const PK_Result converted = Convert(source, staged, quality);
    return converted == PK_Success ? EncodeStream(AsSource(staged), destination, quality) : converted;
}

PK_Result ConvertRaster(const SourceImage& source, const DestinationImage& destination, int32_t quality) {
    return IsStream(destination.format) ? ConvertToStream(source, destination, quality)
                                        : ConvertToRaster(source, destination, quality);
}

PK_Result ConvertFromStream(const SourceImage& source, const DestinationImage& destination, int32_t quality) {
    if (const auto result = ResultOfStream(source, destination)) return *result;

    // A stream without a target of its own keeps what is wanted here, and is refused by DecodeStream.
    const DecodeTarget wanted = {destination.format, source.width, source.height};
    DecodeTarget target = wanted;
    ChooseDecodeTarget({source.format, source.width, source.height}, wanted, quality, target);
    if (target.width != source.width || target.height != source.height) return PK_ErrSizeMismatch;

    constexpr int32_t kWholeFrame = 0;
    if (target.format == destination.format) return DecodeStream(source, kWholeFrame, destination, quality);
    ConversionChain onward;
    if (DecodesRows(source.format) && onward.Build(target.format, destination.format, quality))
        return DecodeStreamThrough(onward, source, kWholeFrame, destination, quality);

    const TransientPixelBuffer buffer(target.format, target.width, target.height);
    if (buffer.Result() != PK_Success) return buffer.Result();
    const DestinationImage decoded = AsDestination(buffer, target.format, target.width, target.height);
    const PK_Result result = DecodeStream(source, kWholeFrame, decoded, quality);
    return result == PK_Success ? ConvertRaster(AsSource(decoded), destination, quality) : result;
}

constexpr bool IsKnown(PK_PixelFormat format) {
    return IsStream(format) || IsRasterFormat(format);
}

PK_Result Convert(const SourceImage& source, const DestinationImage& destination, int32_t quality) {
    if (!IsKnown(source.format)) return PK_ErrBadSrcFormat;
    if (!IsKnown(destination.format)) return PK_ErrBadDstFormat;
    if (source.format == destination.format) return CopySameFormat(source, destination);
    return IsStream(source.format) ? ConvertFromStream(source, destination, quality)
                                   : ConvertRaster(source, destination, quality);
}

} // namespace

} // namespace PK

using namespace PK;

PK_Result PK_Convert(const void* source, int32_t sourceRowBytes, PK_PixelFormat sourceFormat,
                     void* destination, int32_t destinationRowBytes, PK_PixelFormat destinationFormat,
                     int32_t width, int32_t height, int32_t quality) noexcept {
    const FloatMode mode;
    return Convert(
        {static_cast<const uint8_t*>(source), sourceRowBytes, sourceFormat, width, height},
        {static_cast<uint8_t*>(destination), destinationRowBytes, destinationFormat, width, height}, quality);
}
