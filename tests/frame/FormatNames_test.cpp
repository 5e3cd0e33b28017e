// The numbers and names of the catalogue.

#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>
#include <set>

namespace {

struct NumberAndName {
    uint32_t number;
    const char* name;
};

// clang-format off
constexpr NumberAndName kNames[] = {
    {0x0, "Invalid"},
    {0x805, "VUYA_4444_8u"},
    {0x809, "VUYP_4444_8u"},
    {0x80d, "VUYX_4444_8u"},
    {0xa05, "VUYA_4444_8u_709"},
    {0xa09, "VUYP_4444_8u_709"},
    {0xa0d, "VUYX_4444_8u_709"},
    {0x905, "VUYA_4444_32f"},
    {0x909, "VUYP_4444_32f"},
    {0x90d, "VUYX_4444_32f"},
    {0xb05, "VUYA_4444_32f_709"},
    {0xb09, "VUYP_4444_32f_709"},
    {0xb0d, "VUYX_4444_32f_709"},
    {0x4, "BGRA_4444_8u"},
    {0x8, "BGRP_4444_8u"},
    {0xc, "BGRX_4444_8u"},
    {0x104, "BGRA_4444_32f"},
    {0x108, "BGRP_4444_32f"},
    {0x10c, "BGRX_4444_32f"},
    {0x1004, "ARGB_4444_8u"},
    {0x1008, "PRGB_4444_8u"},
    {0x100c, "XRGB_4444_8u"},
    {0x1104, "ARGB_4444_32f"},
    {0x1108, "PRGB_4444_32f"},
    {0x110c, "XRGB_4444_32f"},
    {0x811, "UYVY_422_8u"},
    {0xa11, "UYVY_422_8u_709"},
    {0x1811, "YUYV_422_8u"},
    {0x1a11, "YUYV_422_8u_709"},
    {0x911, "UYVY_422_32f"},
    {0xb11, "UYVY_422_32f_709"},
    {0x1911, "YUYV_422_32f"},
    {0x1b11, "YUYV_422_32f_709"},
    {0x851, "V210_422_10u"},
    {0xa51, "V210_422_10u_709"},
    {0x84, "BGRA_4444_15u"},
    {0x88, "BGRP_4444_15u"},
    {0x8c, "BGRX_4444_15u"},
    {0x1084, "ARGB_4444_15u"},
    {0x1088, "PRGB_4444_15u"},
    {0x108c, "XRGB_4444_15u"},
    {0x106, "BGRA_4444_32f_Linear"},
    {0x10a, "BGRP_4444_32f_Linear"},
    {0x10e, "BGRX_4444_32f_Linear"},
    {0x1106, "ARGB_4444_32f_Linear"},
    {0x110a, "PRGB_4444_32f_Linear"},
    {0x110e, "XRGB_4444_32f_Linear"},
    {0x1000821, "NTSCDV25"},
    {0x2000821, "PALDV25"},
    {0x3000a21, "NTSC_DV100_720p"},
    {0x4000a21, "PAL_DV100_720p"},
    {0x5000a21, "NTSC_DV100_1080i"},
    {0x6000a21, "PAL_DV100_1080i"},
    {0x7000821, "NTSCDV50"},
    {0x8000821, "PALDV50"},
    {0x9000831, "YUV_420_MPEG2_FIELD"},
    {0xa000831, "YUV_420_MPEG2_FRAME"},
    {0x9000031, "YUV_420_MPEG2_FIELD_FullRange"},
    {0xa000031, "YUV_420_MPEG2_FRAME_FullRange"},
    {0x9000a31, "YUV_420_MPEG2_FIELD_709"},
    {0xa000a31, "YUV_420_MPEG2_FRAME_709"},
    {0x9000231, "YUV_420_MPEG2_FIELD_FullRange_709"},
    {0xa000231, "YUV_420_MPEG2_FRAME_FullRange_709"},
    {0xb000831, "YUV_420_MPEG4_FIELD"},
    {0xc000831, "YUV_420_MPEG4_FRAME"},
    {0xb000031, "YUV_420_MPEG4_FIELD_FullRange"},
    {0xc000031, "YUV_420_MPEG4_FRAME_FullRange"},
    {0xb000a31, "YUV_420_MPEG4_FIELD_709"},
    {0xc000a31, "YUV_420_MPEG4_FRAME_709"},
    {0xb000231, "YUV_420_MPEG4_FIELD_FullRange_709"},
    {0xc000231, "YUV_420_MPEG4_FRAME_FullRange_709"},
};

constexpr struct { uint32_t number; PK_PixelFormat constant; } kConstants[] = {
    {0x0, PK_PixelFormat_Invalid},
    {0x805, PK_PixelFormat_VUYA_4444_8u},
    {0x809, PK_PixelFormat_VUYP_4444_8u},
    {0x80d, PK_PixelFormat_VUYX_4444_8u},
    {0xa05, PK_PixelFormat_VUYA_4444_8u_709},
    {0xa09, PK_PixelFormat_VUYP_4444_8u_709},
    {0xa0d, PK_PixelFormat_VUYX_4444_8u_709},
    {0x905, PK_PixelFormat_VUYA_4444_32f},
    {0x909, PK_PixelFormat_VUYP_4444_32f},
    {0x90d, PK_PixelFormat_VUYX_4444_32f},
    {0xb05, PK_PixelFormat_VUYA_4444_32f_709},
    {0xb09, PK_PixelFormat_VUYP_4444_32f_709},
    {0xb0d, PK_PixelFormat_VUYX_4444_32f_709},
    {0x4, PK_PixelFormat_BGRA_4444_8u},
    {0x8, PK_PixelFormat_BGRP_4444_8u},
    {0xc, PK_PixelFormat_BGRX_4444_8u},
    {0x104, PK_PixelFormat_BGRA_4444_32f},
    {0x108, PK_PixelFormat_BGRP_4444_32f},
    {0x10c, PK_PixelFormat_BGRX_4444_32f},
    {0x1004, PK_PixelFormat_ARGB_4444_8u},
    {0x1008, PK_PixelFormat_PRGB_4444_8u},
    {0x100c, PK_PixelFormat_XRGB_4444_8u},
    {0x1104, PK_PixelFormat_ARGB_4444_32f},
    {0x1108, PK_PixelFormat_PRGB_4444_32f},
    {0x110c, PK_PixelFormat_XRGB_4444_32f},
    {0x811, PK_PixelFormat_UYVY_422_8u},
    {0xa11, PK_PixelFormat_UYVY_422_8u_709},
    {0x1811, PK_PixelFormat_YUYV_422_8u},
    {0x1a11, PK_PixelFormat_YUYV_422_8u_709},
    {0x911, PK_PixelFormat_UYVY_422_32f},
    {0xb11, PK_PixelFormat_UYVY_422_32f_709},
    {0x1911, PK_PixelFormat_YUYV_422_32f},
    {0x1b11, PK_PixelFormat_YUYV_422_32f_709},
    {0x851, PK_PixelFormat_V210_422_10u},
    {0xa51, PK_PixelFormat_V210_422_10u_709},
    {0x84, PK_PixelFormat_BGRA_4444_15u},
    {0x88, PK_PixelFormat_BGRP_4444_15u},
    {0x8c, PK_PixelFormat_BGRX_4444_15u},
    {0x1084, PK_PixelFormat_ARGB_4444_15u},
    {0x1088, PK_PixelFormat_PRGB_4444_15u},
    {0x108c, PK_PixelFormat_XRGB_4444_15u},
    {0x106, PK_PixelFormat_BGRA_4444_32f_Linear},
    {0x10a, PK_PixelFormat_BGRP_4444_32f_Linear},
    {0x10e, PK_PixelFormat_BGRX_4444_32f_Linear},
    {0x1106, PK_PixelFormat_ARGB_4444_32f_Linear},
    {0x110a, PK_PixelFormat_PRGB_4444_32f_Linear},
    {0x110e, PK_PixelFormat_XRGB_4444_32f_Linear},
    {0x40, PK_PixelFormat_RGB_444_10u},
    {0x1000821, PK_PixelFormat_NTSCDV25},
    {0x2000821, PK_PixelFormat_PALDV25},
    {0x3000a21, PK_PixelFormat_NTSC_DV100_720p},
    {0x4000a21, PK_PixelFormat_PAL_DV100_720p},
    {0x5000a21, PK_PixelFormat_NTSC_DV100_1080i},
    {0x6000a21, PK_PixelFormat_PAL_DV100_1080i},
    {0x7000821, PK_PixelFormat_NTSCDV50},
    {0x8000821, PK_PixelFormat_PALDV50},
    {0x9000831, PK_PixelFormat_YUV_420_MPEG2_FIELD},
    {0xa000831, PK_PixelFormat_YUV_420_MPEG2_FRAME},
    {0x9000031, PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange},
    {0xa000031, PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange},
    {0x9000a31, PK_PixelFormat_YUV_420_MPEG2_FIELD_709},
    {0xa000a31, PK_PixelFormat_YUV_420_MPEG2_FRAME_709},
    {0x9000231, PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange_709},
    {0xa000231, PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange_709},
    {0xb000831, PK_PixelFormat_YUV_420_MPEG4_FIELD},
    {0xc000831, PK_PixelFormat_YUV_420_MPEG4_FRAME},
    {0xb000031, PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange},
    {0xc000031, PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange},
    {0xb000a31, PK_PixelFormat_YUV_420_MPEG4_FIELD_709},
    {0xc000a31, PK_PixelFormat_YUV_420_MPEG4_FRAME_709},
    {0xb000231, PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709},
    {0xc000231, PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange_709},
};
// clang-format on

} // namespace

TEST(FormatNames, TellEveryNumber) {
    ASSERT_EQ(std::size(kNames), 71u);
    for (const NumberAndName& row : kNames) EXPECT_STREQ(PK_PixelFormatName(row.number), row.name);
}

TEST(FormatNames, KnowNothingElse) {
    EXPECT_STREQ(PK_PixelFormatName(0x40), "Unknown pixel format"); // RGB_444_10u has no name on purpose
    std::set<uint32_t> named;
    for (const NumberAndName& row : kNames) named.insert(row.number);
    for (uint32_t number = 0; number < 0x4000; ++number) {
        if (named.count(number) != 0) continue;
        EXPECT_STREQ(PK_PixelFormatName(number), "Unknown pixel format");
    }
    EXPECT_STREQ(PK_PixelFormatName(0x01000822), "Unknown pixel format");
    EXPECT_STREQ(PK_PixelFormatName(0xffffffff), "Unknown pixel format");
}

TEST(FormatNames, ConstantsHaveTheirNumbers) {
    ASSERT_EQ(std::size(kConstants), 72u);
    for (const auto& row : kConstants) EXPECT_EQ(row.constant, row.number) << PK_PixelFormatName(row.number);
}
