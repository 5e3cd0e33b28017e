// The exported encoders of DV: a source in any format goes through the one that the encoder takes.

#include <PixelKiln/Convert.h>
#include <PixelKiln/DV.h>

#include "convert/Image.h"
#include "convert/Streams.h"
#include "dv/CompressDV.h"
#include "frame/Arguments.h"
#include "frame/RowScratch.h"

namespace PK {
namespace {

/// Calls compress(source) with the picture in the format that is encoded.
template <class Compress>
PK_Result CompressFrom(const SourceImage& source, const void* dst, PK_PixelFormat dstFormat, int32_t quality,
                       const Compress& compress) {
    if (source.width < 0 || source.height < 0 || HasNull({source.pixels, dst})) return PK_ErrFailed;
    PK_PixelFormat format = PK_PixelFormat_Invalid;
    const PK_Result chosen = ChooseEncodeSource(source.format, dstFormat, quality, format);
    if (chosen != PK_Success) return chosen;
    if (format == source.format) return compress(source);

    const auto bytes = static_cast<uint64_t>(PK_PixelFormatSize(format, source.width, source.height));
    const auto rowBytes = static_cast<int32_t>(PK_PixelFormatSize(format, source.width, 1));
    return WithRowScratch(bytes, [&](uint8_t* pixels) {
        const PK_Result converted =
            PK_Convert(source.pixels, static_cast<int32_t>(source.rowBytes), source.format, pixels, rowBytes,
                       format, source.width, source.height, quality);
        return converted == PK_Success
                   ? compress(SourceImage{pixels, rowBytes, format, source.width, source.height})
                   : converted;
    });
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_CompressDV100720pWithChannelOffset(const void* src, int32_t srcRowBytes,
                                                PK_PixelFormat srcFormat, int32_t width, int32_t height,
                                                void* dst, int32_t dstBytes, int32_t channelOffset,
                                                PK_PixelFormat dstFormat, int32_t quality) noexcept {
    return CompressFrom({static_cast<const uint8_t*>(src), srcRowBytes, srcFormat, width, height}, dst,
                        dstFormat, quality, [&](const SourceImage& source) {
                            return CompressDV100(source.pixels, static_cast<int32_t>(source.rowBytes), width,
                                                 height, dst, dstBytes, channelOffset, dstFormat, quality);
                        });
}

PK_Result PK_CompressDVCPROPAL25(const void* src, int32_t srcRowBytes, PK_PixelFormat srcFormat,
                                 int32_t width, int32_t height, void* dst, int32_t dstBytes,
                                 PK_PixelFormat dstFormat, int32_t quality) noexcept {
    constexpr bool kIsDVCPRO = true;
    return CompressFrom({static_cast<const uint8_t*>(src), srcRowBytes, srcFormat, width, height}, dst,
                        dstFormat, quality, [&](const SourceImage& source) {
                            return CompressDV25(source.pixels, static_cast<int32_t>(source.rowBytes),
                                                source.format, width, height, dst, dstBytes, dstFormat,
                                                kIsDVCPRO, quality);
                        });
}
