#include "dv/CompressDV.h"

#include "dv/EncodeDV.h"
#include "frame/DVEncoder.h"

#include "mc_enc_dv/mc_enc_dv.h"

namespace PK {
namespace {

/// From this quality on, DV50 and DV100 take the time for the best picture, and DV25 for a good one.
constexpr int32_t kBestQuality = 5, kGoodQualityOfDV25 = 3;

/// Whether there is an encoder for a size: the frame's, or half of it both ways.
bool HasDV25Size(const DVFormat& format, int32_t width, int32_t height) {
    for (const int32_t part : {1, 2})
        if (width == format.width / part && height == format.height / part) return true;
    return false;
}

/// 0 for pixels that the encoder does not know.
uint32_t PixelKindOf(PK_PixelFormat format) {
    switch (format) {
    case PK_PixelFormat_YUYV_422_8u:
        return mc_enc_dv::kYUYV;
    case PK_PixelFormat_UYVY_422_8u:
        return mc_enc_dv::kUYVY;
    case PK_PixelFormat_VUYA_4444_8u:
        return mc_enc_dv::kVUYA;
    case PK_PixelFormat_BGRA_4444_8u:
        return mc_enc_dv::kBGRA;
    default:
        return 0;
    }
}

const DVPolicy& PolicyOf(int32_t quality) {
    return quality >= kBestQuality ? kBestDVPolicy : kPlainDVPolicy;
}

DVPicture AsPicture(const void* yuyv, int32_t rowBytes) {
    return {static_cast<const uint8_t*>(yuyv), rowBytes, true};
}

bool HasSize(const DVFormat& format, int32_t width, int32_t height) {
    return width == format.width && height == format.height;
}

} // namespace

PK_Result CompressDV25(const void* src, int32_t rowBytes, PK_PixelFormat format, int32_t width,
                       int32_t height, void* dst, int32_t dstBytes, PK_PixelFormat dstFormat, bool isDVCPRO,
                       int32_t quality) noexcept {
    const DVFormat* const stream = FindDVFormat(dstFormat);
    if (stream == nullptr || stream->channels != 1) return PK_ErrBadSrcFormat;
    if (!HasDV25Size(*stream, width, height)) return PK_ErrSizeMismatch;
    const uint32_t kind = PixelKindOf(format);
    if (kind == 0) return PK_ErrBadDstFormat;

    int32_t flags = mc_enc_dv::kAlways;
    if (isDVCPRO) flags |= mc_enc_dv::kDVCPRO;
    if (quality < kGoodQualityOfDV25) flags |= mc_enc_dv::kFast;
    if ((format & kAlphaMask) == kAlphaStraight) flags |= mc_enc_dv::kHasAlpha;
    const auto* top = static_cast<const uint8_t*>(src);
    if (PK_IsOriginBottomLeft(format)) {
        top += int64_t{height - 1} * rowBytes;
        rowBytes = -rowBytes;
    }

    const int32_t written = RunDVEncoder({top, rowBytes, dst, dstBytes, width, height, flags, kind});
    if (written < 0) return written;
    return written == dstBytes && written != 0 ? PK_Success : PK_ErrBadDVDestination;
}

PK_Result CompressDV50(const void* src, int32_t rowBytes, int32_t width, int32_t height, void* dst,
                       PK_PixelFormat dstFormat, int32_t quality) noexcept {
    const DVFormat* const stream = FindDVFormat(dstFormat);
    if (stream == nullptr || stream->sampling != DVSampling::k422) return PK_ErrBadDstFormat;
    if (!HasSize(*stream, width, height)) return PK_ErrBadDVSourceSize;
    EncodeDV(*stream, AsPicture(src, rowBytes), 0, PolicyOf(quality), static_cast<uint8_t*>(dst));
    return PK_Success;
}

PK_Result CompressDV100(const void* src, int32_t rowBytes, int32_t width, int32_t height, void* dst,
                        int32_t dstBytes, int32_t channelOffset, PK_PixelFormat dstFormat,
                        int32_t quality) noexcept {
    const DVFormat* const stream = FindDVFormat(dstFormat);
    if (stream == nullptr || !stream->IsHD()) return PK_ErrBadDstFormat;
    if (dstBytes != stream->FrameBytes()) return PK_ErrBadDVDestination;
    if (!HasSize(*stream, width, height)) return PK_ErrBadDVSourceSize;
    constexpr int32_t kSecondOfPair = 2;
    const int32_t firstChannel = stream->isProgressive && channelOffset == kSecondOfPair ? kSecondOfPair : 0;
    EncodeDV(*stream, AsPicture(src, rowBytes), firstChannel, PolicyOf(quality), static_cast<uint8_t*>(dst));
    return PK_Success;
}

} // namespace PK
