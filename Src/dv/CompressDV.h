#pragma once

// Pictures in the formats that the encoders of DV take, to frames. All work is done on the calling thread.

#include <PixelKiln/Types.h>

namespace PK {

/// Encodes by the host's encoder, one call at a time in the process.
/// \param format     YUYV_422_8u, UYVY_422_8u, VUYA_4444_8u or BGRA_4444_8u.
/// \param width      720 x 480 or 360 x 240 for NTSCDV25, 720 x 576 or 360 x 288 for PALDV25.
/// \param dstBytes   those of the frame.
/// \param isDVCPRO   SMPTE 314M: 4:1:1 for 625 lines too.
/// \param quality    below 3 a quick result.
/// \return PK_Success; PK_ErrBadSrcFormat where dstFormat is no DV25; PK_ErrSizeMismatch; PK_ErrBadDstFormat for another
///         format of pixels; PK_ErrBadDVDestination where the encoder does not write as many bytes; what it reports besides.
PK_Result CompressDV25(const void* src, int32_t rowBytes, PK_PixelFormat format, int32_t width,
                       int32_t height, void* dst, int32_t dstBytes, PK_PixelFormat dstFormat, bool isDVCPRO,
                       int32_t quality) noexcept;

/// \param src      YUYV_422_8u.
/// \param width    720 x 480 for NTSCDV50, 720 x 576 for PALDV50.
/// \param quality  below 5 a quick result.
/// \return PK_Success; PK_ErrBadDstFormat where dstFormat is no DV50; PK_ErrBadDVSourceSize.
PK_Result CompressDV50(const void* src, int32_t rowBytes, int32_t width, int32_t height, void* dst,
                       PK_PixelFormat dstFormat, int32_t quality) noexcept;

/// \param src            YUYV_422_8u_709.
/// \param width          960 x 720, 1280 x 1080 for NTSC_DV100_1080i or 1440 x 1080 for PAL_DV100_1080i.
/// \param dstBytes       those of the frame.
/// \param channelOffset  of 720 lines, 2 for the second frame of a pair; anything else counts as 0.
/// \return PK_Success; PK_ErrBadDstFormat where dstFormat is no DV100; PK_ErrBadDVDestination for another number of bytes;
///         PK_ErrBadDVSourceSize.
PK_Result CompressDV100(const void* src, int32_t rowBytes, int32_t width, int32_t height, void* dst,
                        int32_t dstBytes, int32_t channelOffset, PK_PixelFormat dstFormat,
                        int32_t quality) noexcept;

} // namespace PK
