// HLG against ITU-R BT.2100, shown at a peak of 1000 cd/m2, and what its conversions do at the borders of the signal.

#include "colour/Conversions.h"
#include "colour/ExactColour.h"
#include "colour/WorstError.h"

#include <cmath>
#include <limits>

namespace PKTest {
namespace {

using namespace PK;

constexpr size_t kRed = 2;

float HubGrey(double candelas) {
    return static_cast<float>(std::pow(candelas / 100, 1 / 2.4));
}

TEST(HLG, ScalarFunctionsChangeNothing) {
    const HLGColorSpace space;
    for (const float v : {-2.0f, 0.0f, 0.3f, 1.0f, 7.5f, kInfinity}) {
        EXPECT_EQ(space.LinearToEOTF(v), v);
        EXPECT_EQ(space.EOTFToLinear(v), v);
    }
}

TEST(HLG, GreysFollowTheStandard) {
    const HLGColorSpace space;
    WorstError alone("HLG signal of a grey by itself, absolute"),
        bulk("HLG signal of a grey in bulk, absolute");
    for (int code = 1; code < 1024; ++code) {
        const double signal = code / 1023.0;
        const double scene = exact::HLGSceneLight(signal);
        const double candelas = exact::HLGDisplayLight({scene, scene, scene})[0];
        for (size_t i = 0; i < 3; ++i) {
            const ColourPixel hub = Grey(HubGrey(candelas));
            alone.Take(std::abs(double{ConvertAlone(space, Way::kFromHub, hub)[i]} - signal), signal);
            bulk.Take(std::abs(double{ConvertInBulk(space, Way::kFromHub, hub)[i]} - signal), signal);
        }
    }
    alone.ExpectBelow(2e-6);
    bulk.ExpectBelow(0x1p-10);
}

TEST(HLG, SignalsOfTheTableFollowTheStandard) {
    const HLGColorSpace space;
    WorstError alone("hub value of an HLG grey by itself, relative"),
        bulk("hub value of an HLG grey in bulk, relative");
    for (int code = 1; code < 2048; ++code) {
        // A little above the step, so that the entry is the step's.
        const auto signal = static_cast<float>((code + 0.01) / 2047);
        const double scene = exact::HLGSceneLight(code / 2047.0);
        const double hub = std::pow(exact::HLGDisplayLight({scene, scene, scene})[0] / 100, 1 / 2.4);
        const ColourPixel single = ConvertAlone(space, Way::kToHub, Grey(signal));
        const ColourPixel many = ConvertInBulk(space, Way::kToHub, Grey(signal));
        for (size_t i = 0; i < 3; ++i) {
            alone.Take(std::abs(double{single[i]} / hub - 1), code);
            bulk.Take(std::abs(double{many[i]} / hub - 1), code);
        }
    }
    alone.ExpectBelow(3e-6);
    bulk.ExpectBelow(0x1p-10);
}

TEST(HLG, ColoursFollowTheStandard) {
    const HLGColorSpace space;
    const exact::Matrix to2020 = exact::Between(exact::kRec709, exact::kRec2020);
    WorstError alone("HLG signal of a colour by itself, absolute"),
        bulk("HLG signal of a colour in bulk, absolute");
    Random random(1);
    for (const ColourPixel& hub : MakePixels(Content::kOrdinary, 4000, random)) {
        const auto candelas = [&](size_t i) { return 100 * std::pow(double{hub[i]}, 2.4); };
        const exact::Triple scene =
            exact::HLGSceneLight(exact::Apply(to2020, {candelas(2), candelas(1), candelas(0)}));
        const ColourPixel single = ConvertAlone(space, Way::kFromHub, hub);
        const ColourPixel many = ConvertInBulk(space, Way::kFromHub, hub);
        for (size_t i = 0; i < 3; ++i) {
            const double signal = exact::HLGSignal(scene[2 - i]);
            alone.Take(std::abs(double{single[i]} - signal), signal);
            bulk.Take(std::abs(double{many[i]} - signal), signal);
        }
    }
    alone.ExpectBelow(2e-5); // the stored matrix is off by up to 1e-5, see Gamuts
    bulk.ExpectBelow(0x1p-10);
}

TEST(HLG, BlackIsBlackBothWays) {
    const HLGColorSpace space;
    for (const Way way : {Way::kFromHub, Way::kToHub}) {
        EXPECT_EQ(ConvertAlone(space, way, Grey(0)), Grey(0));
        EXPECT_EQ(ConvertInBulk(space, way, Grey(0)), Grey(0));
    }
}

TEST(HLG, FullSignalIsAThousandCandelas) {
    const HLGColorSpace space;
    EXPECT_NEAR(ConvertAlone(space, Way::kToHub, Grey(1))[kRed], 2.6102, 1e-4); // 10^(1 / 2.4)
    EXPECT_NEAR(ConvertInBulk(space, Way::kToHub, Grey(1))[kRed], 2.6102, 2.6e-3);
    EXPECT_NEAR(ConvertAlone(space, Way::kFromHub, Grey(HubGrey(1000)))[kRed], 1, 2e-6);
    EXPECT_GT(ConvertAlone(space, Way::kFromHub, Grey(HubGrey(2000)))[kRed], 1.05f)
        << "highlights are not cut";
}

TEST(HLG, SignalsAreLimitedToZeroAndOne) {
    const HLGColorSpace space;
    for (const float below :
         {-1e-9f, -0.5f, -3e38f, -kInfinity, kNaN, -kNaN, std::bit_cast<float>(0x7f800001u)}) {
        EXPECT_EQ(ConvertAlone(space, Way::kToHub, Grey(below)), Grey(0)) << below;
        EXPECT_EQ(ConvertInBulk(space, Way::kToHub, Grey(below)), Grey(0)) << below;
    }
    for (const float above : {1.001f, 3e38f, kInfinity}) {
        EXPECT_EQ(ConvertAlone(space, Way::kToHub, Grey(above)), ConvertAlone(space, Way::kToHub, Grey(1)));
        EXPECT_EQ(ConvertInBulk(space, Way::kToHub, Grey(above)), ConvertInBulk(space, Way::kToHub, Grey(1)));
    }
}

TEST(HLG, NegativeLightKeepsItsSign) {
    const HLGColorSpace space;
    Random random(2);
    for (ColourPixel pixel : MakePixels(Content::kOrdinary, 500, random)) {
        const ColourPixel light = ConvertAlone(space, Way::kFromHub, pixel);
        const ColourPixel lights = ConvertInBulk(space, Way::kFromHub, pixel);
        for (size_t i = 0; i < 3; ++i) pixel[i] = -pixel[i];
        const ColourPixel dark = ConvertAlone(space, Way::kFromHub, pixel);
        const ColourPixel darks = ConvertInBulk(space, Way::kFromHub, pixel);
        for (size_t i = 0; i < 3; ++i) {
            ASSERT_EQ(dark[i], -light[i]) << "seed " << random.Seed();
            ASSERT_EQ(darks[i], -lights[i]) << "seed " << random.Seed();
        }
    }
}

TEST(HLG, PrimariesWhiteAndLuminanceAreThoseOfRec2020) {
    const HLGColorSpace space;
    const ColorSpace& rec2020 = ColorSpace::WorkingSpace(kWorkingSpaceRec2020);
    for (int i = 0; i < 6; ++i) EXPECT_EQ(space.Primaries()[i], rec2020.Primaries()[i]);
    for (int i = 0; i < 3; ++i) EXPECT_EQ(space.LuminanceCoeffs()[i], rec2020.LuminanceCoeffs()[i]);
    EXPECT_EQ(space.WhitePoint(), rec2020.WhitePoint());
}

} // namespace
} // namespace PKTest
