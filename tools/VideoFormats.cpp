#include "VideoFormats.h"

#include "Failure.h"
#include "Formats.h"

namespace tool {
namespace {

// By kind of picture, range and matrix.
using Formats = PK_PixelFormat[2][2][2];
constexpr Formats kLeft = {
    {{PK_PixelFormat_YUV_420_MPEG2_FRAME, PK_PixelFormat_YUV_420_MPEG2_FRAME_709},
     {PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange, PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange_709}},
    {{PK_PixelFormat_YUV_420_MPEG2_FIELD, PK_PixelFormat_YUV_420_MPEG2_FIELD_709},
     {PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange, PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange_709}}};
constexpr Formats kCentred = {
    {{PK_PixelFormat_YUV_420_MPEG4_FRAME, PK_PixelFormat_YUV_420_MPEG4_FRAME_709},
     {PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange, PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange_709}},
    {{PK_PixelFormat_YUV_420_MPEG4_FIELD, PK_PixelFormat_YUV_420_MPEG4_FIELD_709},
     {PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange, PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709}}};

struct FFmpegName {
    const char* name;
    RowPacking packing;
    bool isFullRange;
};
constexpr FFmpegName kFFmpegNames[] = {{"yuv420p", RowPacking::Planes, false},
                                       {"yuvj420p", RowPacking::Planes, true},
                                       {"nv12", RowPacking::Pairs, false}};

} // namespace

PK_PixelFormat Video420::Format() const {
    return (isCentred ? kCentred : kLeft)[areFields][isFullRange][is709];
}

std::optional<Video420> Video420Of(PK_PixelFormat format) {
    for (int bits = 0; bits < 16; ++bits) {
        const Video420 video = {(bits & 1) != 0, (bits & 2) != 0, (bits & 4) != 0, (bits & 8) != 0};
        if (video.Format() == format) return video;
    }
    return std::nullopt;
}

bool Is709(const std::string& matrix, Size size) {
    if (matrix.empty()) return size.width >= 1280 || size.height > 576;
    if (matrix != "601" && matrix != "709")
        throw Failure(kExitUsage, "'" + matrix + "' is no matrix of video: --matrix takes 601 or 709");
    return matrix == "709";
}

FileFormat::Told FileFormat::ParseWords(const std::string& text, bool isFullRange) {
    Told told{isFullRange, {}, {}};
    const std::string name = text.substr(0, text.find(':'));
    for (size_t at = name.size(); at < text.size();) {
        const size_t end = std::min(text.find(':', at + 1), text.size());
        const std::string word = text.substr(at + 1, end - at - 1);
        if (word == "left" || word == "center")
            told.isCentred = word == "center";
        else if (word == "frames" || word == "fields")
            told.areFields = word == "fields";
        else
            throw Failure(kExitUsage,
                          "behind " + name +
                              " may stand :left or :center, and :frames or :fields, and not ':" + word + "'");
        at = end;
    }
    return told;
}

FileFormat FileFormat::Parse(const std::string& text, RowPacking packing) {
    for (const FFmpegName& known : kFFmpegNames) {
        if (text.substr(0, text.find(':')) != known.name) continue;
        FileFormat format(PK_PixelFormat_Invalid, known.packing);
        format.fTold = ParseWords(text, known.isFullRange);
        return format;
    }
    return {ParseFormat(text), packing};
}

PK_PixelFormat FileFormat::At(Size size, const std::string& matrix, PK_PixelFormat like) const {
    if (!fTold) return fFormat;
    const std::optional<Video420> other = Video420Of(like);
    Video420 video = other.value_or(Video420{});
    video.isFullRange = fTold->isFullRange;
    video.isCentred = fTold->isCentred.value_or(video.isCentred);
    video.areFields = fTold->areFields.value_or(video.areFields);
    if (!other || !matrix.empty()) video.is709 = Is709(matrix, size);
    return video.Format();
}

} // namespace tool
