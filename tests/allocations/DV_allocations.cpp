// Encoders of DV, from the pixels that they take and from others.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

namespace {

using namespace PKAllocations;

struct Encoding {
    PK_PixelFormat from, to;
    int32_t width, height;
    Memory memory;
};

constexpr PK_PixelFormat kYUYV = PK_PixelFormat_YUYV_422_8u, kYUYV709 = PK_PixelFormat_YUYV_422_8u_709;
constexpr Memory kNone = TakesNone("goes from segment to segment");

constexpr Encoding kEncodings[] = {
    {kYUYV, PK_PixelFormat_NTSCDV25, 720, 480, kNone},
    {kYUYV, PK_PixelFormat_PALDV50, 720, 576, kNone},
    {kYUYV709, PK_PixelFormat_NTSC_DV100_1080i, 1280, 1080, kNone},
    {kYUYV, PK_PixelFormat_NTSCDV25, 360, 240, TakesOrRefuses("the doubled picture")},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_PALDV25, 720, 576, TakesOrRefuses("the picture in pairs")},
    {PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_PALDV25, 720, 576,
     TakesOrRefuses("the picture in RGB, and in pairs")},
};

std::vector<uint8_t> PictureOf(PK_PixelFormat format, int32_t width, int32_t height) {
    return Content(static_cast<size_t>(PK_PixelFormatRowBytes(format, width)) * static_cast<size_t>(height));
}

std::vector<uint8_t> FrameOf(PK_PixelFormat stream) {
    return Content(static_cast<size_t>(PK_PixelFormatSize(stream, 0, 0)));
}

void AddEncodings(Calls& calls) {
    for (const Encoding& job : kEncodings)
        calls.push_back({{"PK_Convert"},
                         job.memory,
                         FrameOf(job.to),
                         [=, picture = PictureOf(job.from, job.width, job.height)](uint8_t* frame) {
                             return PK_Convert(picture.data(), PK_PixelFormatRowBytes(job.from, job.width),
                                               job.from, frame,
                                               static_cast<int32_t>(PK_PixelFormatSize(job.to, 0, 0)), job.to,
                                               job.width, job.height, 4);
                         }});
}

void AddCompressions(Calls& calls) {
    for (const PK_PixelFormat from : {kYUYV709, PK_PixelFormat_BGRA_4444_8u})
        calls.push_back({{"PK_CompressDV100720pWithChannelOffset"},
                         from == kYUYV709 ? kNone : TakesOrRefuses("the picture in pairs"),
                         FrameOf(PK_PixelFormat_NTSC_DV100_720p),
                         [=, picture = PictureOf(from, 960, 720)](uint8_t* frame) {
                             return PK_CompressDV100720pWithChannelOffset(
                                 picture.data(), PK_PixelFormatRowBytes(from, 960), from, 960, 720, frame,
                                 240000, 2, PK_PixelFormat_NTSC_DV100_720p, 4);
                         }});
    for (const PK_PixelFormat from : {kYUYV, PK_PixelFormat_BGRA_4444_32f})
        calls.push_back({{"PK_CompressDVCPROPAL25"},
                         from == kYUYV ? kNone : TakesOrRefuses("the picture in RGB, and in pairs"),
                         FrameOf(PK_PixelFormat_PALDV25),
                         [=, picture = PictureOf(from, 720, 576)](uint8_t* frame) {
                             return PK_CompressDVCPROPAL25(picture.data(), PK_PixelFormatRowBytes(from, 720),
                                                           from, 720, 576, frame, 144000,
                                                           PK_PixelFormat_PALDV25, 4);
                         }});
}

void AddBlackFrames(Calls& calls) {
    for (const PK_PixelFormat stream : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV25})
        calls.push_back({{"PK_FillWithOpaqueBlack"},
                         TakesNone("keeps its frames in the library"),
                         FrameOf(stream),
                         [=](uint8_t* frame) { return PK_FillWithOpaqueBlack(frame, 0, 720, 480, stream); }});
}

const Family sEncodings(AddEncodings);
const Family sCompressions(AddCompressions);
const Family sBlackFrames(AddBlackFrames);

} // namespace
