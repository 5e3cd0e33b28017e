// PK_IsOpacityNOP, and the numbers of the blend modes.

#include <PixelKiln/Accumulate.h>

#include <gtest/gtest.h>

#include <limits>

namespace {

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

} // namespace

TEST(OpacityNOP, IsOneInTheModesThatShowTheTopAlone) {
    for (int32_t mode = -2; mode < 30; ++mode)
        EXPECT_EQ(PK_IsOpacityNOP(mode, 1.0f), mode == PK_BlendMode_Dissolve || mode == PK_BlendMode_Normal)
            << mode;
    EXPECT_FALSE(PK_IsOpacityNOP(PK_BlendMode_Multiply, 1.0f));
    EXPECT_TRUE(PK_IsOpacityNOP(6, 1.0f));
    EXPECT_TRUE(PK_IsOpacityNOP(18, 1.0f));
    EXPECT_FALSE(PK_IsOpacityNOP(INT32_MIN, 1.0f));
}

TEST(OpacityNOP, IsAsNearToOneAsDoesNotCount) {
    for (const float opacity : {1.0f, 0.9999999f, 0.999993f, 1.000007f})
        EXPECT_TRUE(PK_IsOpacityNOP(PK_BlendMode_Normal, opacity)) << opacity;
    for (const float opacity : {0.99999f, 1.00001f, 0.0f, -1.0f, 2.0f, kNaN, kInfinity})
        EXPECT_FALSE(PK_IsOpacityNOP(PK_BlendMode_Normal, opacity)) << opacity;
}

TEST(BlendModeNumbers, AreNumberedByName) {
    EXPECT_EQ(PK_BlendMode_Color, 0);
    EXPECT_EQ(PK_BlendMode_ColorBurn, 1);
    EXPECT_EQ(PK_BlendMode_ColorDodge, 2);
    EXPECT_EQ(PK_BlendMode_Darken, 3);
    EXPECT_EQ(PK_BlendMode_DarkerColor, 4);
    EXPECT_EQ(PK_BlendMode_Difference, 5);
    EXPECT_EQ(PK_BlendMode_Dissolve, 6);
    EXPECT_EQ(PK_BlendMode_Exclusion, 7);
    EXPECT_EQ(PK_BlendMode_HardLight, 8);
    EXPECT_EQ(PK_BlendMode_HardMix, 9);
    EXPECT_EQ(PK_BlendMode_Hue, 10);
    EXPECT_EQ(PK_BlendMode_Lighten, 11);
    EXPECT_EQ(PK_BlendMode_LighterColor, 12);
    EXPECT_EQ(PK_BlendMode_LinearBurn, 13);
    EXPECT_EQ(PK_BlendMode_LinearDodge, 14);
    EXPECT_EQ(PK_BlendMode_LinearLight, 15);
    EXPECT_EQ(PK_BlendMode_Luminosity, 16);
    EXPECT_EQ(PK_BlendMode_Multiply, 17);
    EXPECT_EQ(PK_BlendMode_Normal, 18);
    EXPECT_EQ(PK_BlendMode_Overlay, 19);
    EXPECT_EQ(PK_BlendMode_PinLight, 20);
    EXPECT_EQ(PK_BlendMode_Saturation, 21);
    EXPECT_EQ(PK_BlendMode_Screen, 22);
    EXPECT_EQ(PK_BlendMode_SoftLight, 23);
    EXPECT_EQ(PK_BlendMode_VividLight, 24);
    EXPECT_EQ(PK_BlendMode_Subtract, 25);
    EXPECT_EQ(PK_BlendMode_Divide, 26);
}
