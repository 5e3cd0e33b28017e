// Every identifier of the host has its pixel format, and nothing else has one.

#include <PixelKiln/PixelFormat.h>

#include "zebmediatypes/PixelFormat.h"

#include <gtest/gtest.h>

using namespace zebmediatypes;

namespace {

// clang-format off
constexpr struct { PixelFormat identifier; PK_PixelFormat format; } kMapping[] = {
    {kPixelFormat_BGRA_4444_8u, 0x4},
    {kPixelFormat_VUYA_4444_8u, 0x805},
    {kPixelFormat_VUYA_4444_8u_709, 0xa05},
    {kPixelFormat_ARGB_4444_8u, 0x1004},
    {kPixelFormat_BGRX_4444_8u, 0xc},
    {kPixelFormat_VUYX_4444_8u, 0x80d},
    {kPixelFormat_VUYX_4444_8u_709, 0xa0d},
    {kPixelFormat_XRGB_4444_8u, 0x100c},
    {kPixelFormat_BGRP_4444_8u, 0x8},
    {kPixelFormat_VUYP_4444_8u, 0x809},
    {kPixelFormat_VUYP_4444_8u_709, 0xa09},
    {kPixelFormat_PRGB_4444_8u, 0x1008},
    {kPixelFormat_BGRA_4444_15u, 0x84},
    {kPixelFormat_BGRX_4444_15u, 0x8c},
    {kPixelFormat_BGRP_4444_15u, 0x88},
    {kPixelFormat_ARGB_4444_15u, 0x1084},
    {kPixelFormat_XRGB_4444_15u, 0x108c},
    {kPixelFormat_PRGB_4444_15u, 0x1088},
    {kPixelFormat_RGB_444_10u, 0x40},
    {kPixelFormat_BGRA_4444_32f, 0x104},
    {kPixelFormat_VUYA_4444_32f, 0x905},
    {kPixelFormat_VUYA_4444_32f_709, 0xb05},
    {kPixelFormat_ARGB_4444_32f, 0x1104},
    {kPixelFormat_XRGB_4444_32f, 0x110c},
    {kPixelFormat_BGRX_4444_32f, 0x10c},
    {kPixelFormat_VUYX_4444_32f, 0x90d},
    {kPixelFormat_VUYX_4444_32f_709, 0xb0d},
    {kPixelFormat_PRGB_4444_32f, 0x1108},
    {kPixelFormat_BGRP_4444_32f, 0x108},
    {kPixelFormat_VUYP_4444_32f, 0x909},
    {kPixelFormat_VUYP_4444_32f_709, 0xb09},
    {kPixelFormat_BGRA_4444_32f_Linear, 0x106},
    {kPixelFormat_ARGB_4444_32f_Linear, 0x1106},
    {kPixelFormat_BGRP_4444_32f_Linear, 0x10a},
    {kPixelFormat_PRGB_4444_32f_Linear, 0x110a},
    {kPixelFormat_UYVY_422_32f, 0x911},
    {kPixelFormat_UYVY_422_32f_709, 0xb11},
    {kPixelFormat_NTSCDV25, 0x1000821},
    {kPixelFormat_PALDV25, 0x2000821},
    {kPixelFormat_NTSCDV50, 0x7000821},
    {kPixelFormat_PALDV50, 0x8000821},
    {kPixelFormat_NTSC_DV100_720p, 0x3000a21},
    {kPixelFormat_PAL_DV100_720p, 0x4000a21},
    {kPixelFormat_NTSC_DV100_1080i, 0x5000a21},
    {kPixelFormat_PAL_DV100_1080i, 0x6000a21},
    {kPixelFormat_YUYV_422_8u, 0x1811},
    {kPixelFormat_YUYV_422_8u_709, 0x1a11},
    {kPixelFormat_V210_422_10u, 0x851},
    {kPixelFormat_V210_422_10u_709, 0xa51},
    {kPixelFormat_UYVY_422_8u, 0x811},
    {kPixelFormat_UYVY_422_8u_709, 0xa11},
    {kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_601, 0x9000831},
    {kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_601, 0xa000831},
    {kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_601_FullRange, 0x9000031},
    {kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_601_FullRange, 0xa000031},
    {kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_709_FullRange, 0x9000231},
    {kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_709_FullRange, 0xa000231},
    {kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_709, 0x9000a31},
    {kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_709, 0xa000a31},
    {kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_601, 0xb000831},
    {kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_601, 0xc000831},
    {kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_601_FullRange, 0xb000031},
    {kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_601_FullRange, 0xc000031},
    {kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_709_FullRange, 0xb000231},
    {kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_709_FullRange, 0xc000231},
    {kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_709, 0xb000a31},
    {kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_709, 0xc000a31},
};
// clang-format on

bool IsMapped(const PixelFormat& identifier) {
    for (const auto& row : kMapping) {
        if (row.identifier == identifier) return true;
    }
    return false;
}

} // namespace

TEST(HostFormats, MapEveryIdentifier) {
    ASSERT_EQ(std::size(kMapping), 67u);
    for (const auto& row : kMapping)
        EXPECT_EQ(PK_ZEBPixelFormatToPKPixelFormat(row.identifier), row.format)
            << PK_PixelFormatName(row.format);
}

TEST(HostFormats, IdentifiersDiffer) {
    for (const auto& a : kMapping) {
        for (const auto& b : kMapping) EXPECT_EQ(a.identifier == b.identifier, &a == &b);
    }
}

TEST(HostFormats, NeedBothWords) {
    EXPECT_EQ(PK_ZEBPixelFormatToPKPixelFormat({{0, 0}}), PK_PixelFormat_Invalid);
    EXPECT_EQ(PK_ZEBPixelFormatToPKPixelFormat({{~0u, ~0u}}), PK_PixelFormat_Invalid);
    for (const auto& row : kMapping) {
        for (const int word : {0, 1}) {
            PixelFormat other = row.identifier;
            other.words[word] ^= 0x40000000;
            ASSERT_FALSE(IsMapped(other));
            EXPECT_EQ(PK_ZEBPixelFormatToPKPixelFormat(other), PK_PixelFormat_Invalid);
        }
    }
}

// Internal steps of conversion that the host has no name for.
TEST(HostFormats, NeverGiveInternalFormats) {
    for (const auto& row : kMapping) {
        const PK_PixelFormat format = PK_ZEBPixelFormatToPKPixelFormat(row.identifier);
        EXPECT_NE(format, PK_PixelFormat_BGRX_4444_32f_Linear);
        EXPECT_NE(format, PK_PixelFormat_XRGB_4444_32f_Linear);
        EXPECT_NE(format, PK_PixelFormat_YUYV_422_32f);
        EXPECT_NE(format, PK_PixelFormat_YUYV_422_32f_709);
    }
}
