#include "convert/Streams.h"

#include "convert/ConversionChain.h"
#include "convert/Planar420.h"
#include "dv/CompressDV.h"

#include <algorithm>
#include <iterator>

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

/// A DV format whose decoder gives 4:2:2 at full size and four channels at half size.
struct DVPicture {
    PK_PixelFormat stream;
    int32_t width;
    int32_t height;
    PK_PixelFormat native;
    PK_PixelFormat reduced;
};

constexpr DVPicture kDVPictures[] = {
    {PK_PixelFormat_NTSC_DV100_720p, 960, 720, PK_PixelFormat_YUYV_422_8u_709,
     PK_PixelFormat_VUYA_4444_8u_709},
    {PK_PixelFormat_PAL_DV100_720p, 960, 720, PK_PixelFormat_YUYV_422_8u_709,
     PK_PixelFormat_VUYA_4444_8u_709},
    {PK_PixelFormat_NTSC_DV100_1080i, 1280, 1080, PK_PixelFormat_YUYV_422_8u_709,
     PK_PixelFormat_VUYA_4444_8u_709},
    {PK_PixelFormat_PAL_DV100_1080i, 1440, 1080, PK_PixelFormat_YUYV_422_8u_709,
     PK_PixelFormat_VUYA_4444_8u_709},
    {PK_PixelFormat_NTSCDV50, 720, 480, PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_VUYA_4444_8u},
    {PK_PixelFormat_PALDV50, 720, 576, PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_VUYA_4444_8u},
};

DecodeTarget ChooseDVTarget(const DVPicture& picture, const DecodeTarget& wanted, int32_t quality) {
    const int32_t halfWidth = picture.width / 2;
    const int32_t halfHeight = picture.height / 2;
    const DecodeTarget reduced = {picture.reduced, halfWidth, halfHeight};

    if (wanted.width == picture.width && wanted.height == halfHeight) {
        return {picture.native, picture.width, halfHeight}; // one field
    }
    if (wanted.width <= halfWidth && wanted.height <= halfHeight) return reduced;
    const bool isSmaller = wanted.width < picture.width && wanted.height < picture.height;
    if (quality < kExactSizeQuality && isSmaller) return reduced;
    return {picture.native, picture.width, picture.height};
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
    const auto picture = std::ranges::find(kDVPictures, stream.format, &DVPicture::stream);
    if (picture != std::end(kDVPictures)) {
        target = ChooseDVTarget(*picture, wanted, quality);
        return PK_Success;
    }
    if (Is420Planar(stream.format)) {
        target = ChoosePlanarTarget(stream, wanted, quality);
        return PK_Success;
    }
    return CodecOf(stream.format) == Codec::DV25 ? PK_ErrNotSupported : PK_ErrBadSrcFormat;
}

PK_Result ChooseEncodeSource(PK_PixelFormat source, PK_PixelFormat stream, int32_t,
                             PK_PixelFormat& format) noexcept {
    const auto picture = std::ranges::find(kDVPictures, stream, &DVPicture::stream);
    if (picture != std::end(kDVPictures)) {
        format = picture->native;
        return PK_Success;
    }
    if (stream == PK_PixelFormat_NTSCDV25 || stream == PK_PixelFormat_PALDV25) {
        format = ChooseDV25Source(source);
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

// No codec of DV is built yet. A decoder or encoder is taken in here, chosen by CodecOf.
PK_Result DecodeStreamThrough(const ConversionChain& onward, const SourceImage& source, int32_t field,
                              const DestinationImage& destination, int32_t quality) noexcept {
    if (!Is420Planar(source.format)) return PK_ErrNotSupported;
    if (onward.count == 0) return PK_ErrBadDstFormat;
    if (destination.width == 0 || destination.height == 0) return PK_Success;
    const auto planes = PlanesOfStream(source);
    if (!planes) return PK_ErrFailed;
    return DecodePlanar420Through(onward, *planes, source.format, FromTop(destination), field, quality);
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
