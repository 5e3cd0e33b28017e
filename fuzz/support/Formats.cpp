#include "support/Formats.h"

#include "convert/RasterFormats.h"

#include <cstdio>
#include <iterator>

namespace PKFuzz {

namespace {

constexpr PK_PixelFormat kStreamFormats[] = {
    PK_PixelFormat_NTSCDV25,
    PK_PixelFormat_PALDV25,
    PK_PixelFormat_NTSC_DV100_720p,
    PK_PixelFormat_PAL_DV100_720p,
    PK_PixelFormat_NTSC_DV100_1080i,
    PK_PixelFormat_PAL_DV100_1080i,
    PK_PixelFormat_NTSCDV50,
    PK_PixelFormat_PALDV50,
    PK_PixelFormat_YUV_420_MPEG2_FIELD,
    PK_PixelFormat_YUV_420_MPEG2_FRAME,
    PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange,
    PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange,
    PK_PixelFormat_YUV_420_MPEG2_FIELD_709,
    PK_PixelFormat_YUV_420_MPEG2_FRAME_709,
    PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange_709,
    PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange_709,
    PK_PixelFormat_YUV_420_MPEG4_FIELD,
    PK_PixelFormat_YUV_420_MPEG4_FRAME,
    PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange,
    PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange,
    PK_PixelFormat_YUV_420_MPEG4_FIELD_709,
    PK_PixelFormat_YUV_420_MPEG4_FRAME_709,
    PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709,
    PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange_709,
};

} // namespace

PK_PixelFormat DrawRasterFormat(ByteStream& stream) {
    return PK::kRasterFormats[stream.Below(std::size(PK::kRasterFormats))];
}

PK_PixelFormat DrawStreamFormat(ByteStream& stream) {
    return kStreamFormats[stream.Below(std::size(kStreamFormats))];
}

PK_PixelFormat DrawFormat(ByteStream& stream) {
    switch (stream.Below(16)) {
    case 15:
        return stream.U32();
    case 14: {
        const PK_PixelFormat named = stream.Bool() ? DrawRasterFormat(stream) : DrawStreamFormat(stream);
        return named ^ 1u << stream.Below(32);
    }
    case 13:
        return DrawStreamFormat(stream);
    default:
        return DrawRasterFormat(stream);
    }
}

std::string Words(PK_PixelFormat format) {
    char number[16];
    std::snprintf(number, sizeof number, "0x%x ", static_cast<unsigned>(format));
    return number + std::string(PK_PixelFormatName(format));
}

} // namespace PKFuzz
