// Conversions, and the mixes of two images that convert rows on their way.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

namespace {

using namespace PKAllocations;

struct Conversion {
    PK_PixelFormat from, to;
    Memory memory;
};

constexpr Conversion kConversions[] = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_V210_422_10u, TakesOrRefuses("rows between two passes")},
    {PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_YUYV_422_8u_709, TakesOrRefuses("rows between two passes")},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_8u, TakesNone("one pass needs no row")},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u, TakesNone("a copy")},
    {PK_PixelFormat_YUV_420_MPEG2_FRAME, PK_PixelFormat_YUV_420_MPEG2_FRAME, TakesNone("a copy")},
    {PK_PixelFormat_YUV_420_MPEG2_FRAME, PK_PixelFormat_BGRA_4444_8u,
     TakesOrRefuses("a decoded row above 256 KiB")},
    {PK_PixelFormat_YUV_420_MPEG4_FIELD_709, PK_PixelFormat_BGRP_4444_32f_Linear,
     TakesOrRefuses("rows between passes")},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_YUV_420_MPEG2_FIELD,
     TakesOrRefuses("sums of chroma above 256 KiB")},
    {PK_PixelFormat_RGB_444_10u, PK_PixelFormat_YUV_420_MPEG2_FRAME, TakesOrRefuses("rows between passes")},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange,
     TakesOrRefuses("the picture in RGB")},
};

PK_Result Convert(const Image& source, uint8_t* block, PK_PixelFormat to) {
    return PK_Convert(source.bytes.data(), source.rowBytes, source.format, block,
                      PK_PixelFormatRowBytes(to, kWidth), to, kWidth, kHeight, 4);
}

void AddConversions(Calls& calls) {
    for (const Conversion& conversion : kConversions)
        calls.push_back({{"PK_Convert"},
                         conversion.memory,
                         std::vector<uint8_t>(Image(conversion.to).bytes.size()),
                         [source = Image(conversion.from), to = conversion.to](uint8_t* block) {
                             return Convert(source, block, to);
                         }});
}

/// Pictures between stream and raster, one of them of a size that is refused.
void AddStreams(Calls& calls) {
    constexpr int32_t kDVWidth = 720, kDVHeight = 480;
    const std::vector<uint8_t> picture = Content(4 * kDVWidth * kDVHeight);
    calls.push_back({{"PK_Convert"},
                     TakesOrRefuses("the picture that is decoded"),
                     picture,
                     [stream = Content(240000)](uint8_t* block) {
                         return PK_Convert(stream.data(), 0, PK_PixelFormat_NTSCDV50, block, 4 * kDVWidth,
                                           PK_PixelFormat_BGRA_4444_8u, kDVWidth, kDVHeight, 4);
                     }});
    calls.push_back({{"PK_Convert"},
                     TakesOrRefuses("the planes of the picture"),
                     picture,
                     [stream = std::vector<uint8_t>(120000)](uint8_t* block) {
                         return PK_Convert(stream.data(), 0, PK_PixelFormat_NTSCDV25, block, 4 * kDVWidth,
                                           PK_PixelFormat_BGRA_4444_8u, kDVWidth, kDVHeight, 4);
                     }});
    calls.push_back({{"PK_Convert"},
                     TakesOrRefuses("the picture that is encoded, and the rows to it"),
                     Content(240000),
                     [source = Image(PK_PixelFormat_ARGB_4444_15u)](uint8_t* block) {
                         return Convert(source, block, PK_PixelFormat_NTSCDV50);
                     },
                     PK_ErrBadDVSourceSize});
}

Call MaskComposite(PK_PixelFormat first, PK_PixelFormat second, PK_PixelFormat to, Memory memory) {
    return {{"PK_OneBitMaskComposite"},
            memory,
            std::vector<uint8_t>(Image(to).bytes.size()),
            [a = Image(first), b = Image(second), to,
             mask = Content((kWidth / 8 + 2) * kHeight)](uint8_t* block) {
                return PK_OneBitMaskComposite(a.bytes.data(), a.rowBytes, a.format, b.bytes.data(),
                                              b.rowBytes, b.format, mask.data(), kWidth / 8 + 2, 3, block,
                                              PK_PixelFormatRowBytes(to, kWidth), to, kWidth, kHeight, 4);
            }};
}

void AddMaskComposites(Calls& calls) {
    constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kFloats = PK_PixelFormat_VUYA_4444_32f;
    calls.push_back(MaskComposite(kBGRA, kBGRA, kBGRA, TakesNone("its images are of one format")));
    calls.push_back(MaskComposite(kFloats, kBGRA, kBGRA, TakesOrRefuses("rows that are converted")));
    calls.push_back(MaskComposite(PK_PixelFormat_V210_422_10u, PK_PixelFormat_UYVY_422_8u, kFloats,
                                  TakesOrRefuses("rows that are converted")));
}

Call CrossDissolve(PK_PixelFormat first, PK_PixelFormat second, PK_PixelFormat to, Memory memory,
                   float ratio = 0.3f) {
    return {{"PK_CrossDissolve"},
            memory,
            std::vector<uint8_t>(Image(to).bytes.size()),
            [a = Image(first), b = Image(second), to, ratio](uint8_t* block) {
                return PK_CrossDissolve(a.bytes.data(), a.rowBytes, a.format, b.bytes.data(), b.rowBytes,
                                        b.format, block, PK_PixelFormatRowBytes(to, kWidth), to, kWidth,
                                        kHeight, ratio, 4);
            }};
}

void AddCrossDissolves(Calls& calls) {
    constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kUYVY = PK_PixelFormat_UYVY_422_8u;
    calls.push_back(CrossDissolve(kBGRA, kBGRA, kBGRA, TakesNone("its images are of one format")));
    calls.push_back(CrossDissolve(kBGRA, kUYVY, kBGRA, TakesNone("a copy of the first image"), 0));
    calls.push_back(CrossDissolve(kUYVY, kUYVY, kUYVY, TakesOrRefuses("rows that are converted")));
    calls.push_back(CrossDissolve(PK_PixelFormat_V210_422_10u, PK_PixelFormat_ARGB_4444_15u, kBGRA,
                                  TakesOrRefuses("rows that are converted")));
}

const Family sCrossDissolves(AddCrossDissolves);
const Family sConversions(AddConversions), sStreams(AddStreams), sMaskComposites(AddMaskComposites);

} // namespace
