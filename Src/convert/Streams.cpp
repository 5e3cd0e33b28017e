#include "convert/Streams.h"

#include "convert/ConversionChain.h"
#include "convert/DVTarget.h"
#include "convert/DecodeDV.h"
#include "convert/Planar420.h"
#include "dv/CompressDV.h"
#include "dv/DVFormat.h"

namespace PK {

namespace {

enum class Codec : uint8_t { None, DV25, DV50, DV100, Planar420 };

/// By the kind alone, in the order of the kinds.
Codec CodecOf(PK_PixelFormat format) {
    constexpr Codec codecs[kStreamLast420 + 1] = {
        Codec::None,      Codec::DV25,      Codec::DV25,      Codec::DV100, Codec::DV100,
        Codec::DV100,     Codec::DV100,     Codec::DV50,      Codec::DV50,  Codec::Planar420,
        Codec::Planar420, Codec::Planar420, Codec::Planar420,
    };
    const uint32_t kind = StreamKind(format);
    return kind <= kStreamLast420 ? codecs[kind] : Codec::None;
}

PK_PixelFormat ChooseDV25Source(PK_PixelFormat source) {
    if (!IsYUV(source)) return PK_PixelFormat_BGRA_4444_8u;
    if (IsPacked4444(source)) return PK_PixelFormat_VUYA_4444_8u;
    return IsOrderReversed(source) ? PK_PixelFormat_YUYV_422_8u : PK_PixelFormat_UYVY_422_8u;
}

PK_PixelFormat ChoosePlanarSource(PK_PixelFormat source, PK_PixelFormat stream) {
    if ((stream & kRangeMask) == kRangeFull) return PK_PixelFormat_BGRX_4444_8u;
    return IsStream(source) ? PK_PixelFormat_VUYX_4444_8u : source;
}

PK_Result EncodeToPlanes(const SourceImage& source, const DestinationImage& destination, int32_t quality) {
    if (!Is420Planar(destination.format)) return PK_ErrNotSupported;
    if (source.width == 0 || source.height == 0) return PK_Success;
    const auto planes = PlanesOfStream(destination);
    if (!planes) return PK_ErrFailed;
    return EncodePlanar420(FromTop(source), destination.format, *planes, quality);
}

} // namespace

PK_Result ChooseDecodeTarget(const DecodeTarget& stream, const DecodeTarget& wanted, int32_t quality,
                             DecodeTarget& target) noexcept {
    if (FindDVFormat(stream.format) != nullptr) {
        const bool isDV25 = CodecOf(stream.format) == Codec::DV25;
        target = isDV25 ? ChooseDV25Target(stream.format, wanted, quality)
                        : ChooseDVTarget(stream.format, wanted, quality);
        return PK_Success;
    }
    if (Is420Planar(stream.format)) {
        target = ChoosePlanarTarget(stream, wanted, quality);
        return PK_Success;
    }
    return PK_ErrBadSrcFormat;
}

PK_Result ChooseEncodeSource(PK_PixelFormat source, PK_PixelFormat stream, int32_t,
                             PK_PixelFormat& format) noexcept {
    if (FindDVFormat(stream) != nullptr) {
        const bool isDV25 = CodecOf(stream) == Codec::DV25;
        format = isDV25 ? ChooseDV25Source(source) : DVPairsFormat(stream);
        return PK_Success;
    }
    if (Is420Planar(stream)) {
        format = ChoosePlanarSource(source, stream);
        return PK_Success;
    }
    return PK_ErrNotSupported;
}

PK_Result DecodeStream(const SourceImage& source, int32_t field, const DestinationImage& destination,
                       int32_t quality) noexcept {
    ConversionChain stays;
    stays.Build(destination.format, destination.format, quality);
    return DecodeStreamThrough(stays, source, field, destination, quality);
}

bool DecodesRows(PK_PixelFormat stream) noexcept {
    const Codec codec = CodecOf(stream);
    return codec == Codec::Planar420 || codec == Codec::DV25;
}

PK_Result DecodeStreamThrough(const ConversionChain& onward, const SourceImage& source, int32_t field,
                              const DestinationImage& destination, int32_t quality) noexcept {
    const Codec codec = CodecOf(source.format);
    if (codec == Codec::None || (codec == Codec::Planar420 && !Is420Planar(source.format)))
        return PK_ErrNotSupported;
    if (onward.count == 0) return PK_ErrBadDstFormat;
    if (destination.width == 0 || destination.height == 0) return PK_Success;
    const DestinationImage image = FromTop(destination);
    switch (codec) {
    case Codec::DV25:
        return DecodeDV25(onward, source.pixels, source.format, image, field, quality);
    case Codec::DV50:
        return DecodeDV50(onward, source.pixels, source.format, image, field);
    case Codec::DV100:
        return DecodeDV100(onward, source.pixels, source.format, image, field);
    default:
        break;
    }
    const auto planes = PlanesOfStream(source);
    return planes ? DecodePlanar420Through(onward, *planes, source.format, image, field, quality)
                  : PK_ErrFailed;
}

PK_Result EncodeStream(const SourceImage& source, const DestinationImage& destination,
                       int32_t quality) noexcept {
    const auto sourceRowBytes = static_cast<int32_t>(source.rowBytes);
    const auto frameBytes = static_cast<int32_t>(destination.rowBytes);
    switch (CodecOf(destination.format)) {
    case Codec::DV25:
        return CompressDV25(source.pixels, sourceRowBytes, source.format, source.width, source.height,
                            destination.pixels, frameBytes, destination.format, false, quality);
    case Codec::DV50:
        return CompressDV50(source.pixels, sourceRowBytes, source.width, source.height, destination.pixels,
                            destination.format, quality);
    case Codec::DV100:
        return CompressDV100(source.pixels, sourceRowBytes, source.width, source.height, destination.pixels,
                             frameBytes, 0, destination.format, quality);
    case Codec::Planar420:
        return EncodeToPlanes(source, destination, quality);
    case Codec::None:
        break;
    }
    return PK_ErrNotSupported;
}

} // namespace PK
