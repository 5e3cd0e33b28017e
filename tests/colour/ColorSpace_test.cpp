// What a colour space is in figures: illuminants, primaries, matrices, weights, adaptation and conversion.

#include <PixelKiln/ColorSpace.h>

#include "colour/ReferenceColorimetry.h"
#include "support/ColourPixels.h"
#include "support/GuardedRows.h"

#include <algorithm>
#include <memory>

namespace {

using namespace PKTest;
using namespace PK;

constexpr PK_Illuminant kAllIlluminants[] = {kIlluminantD50, kIlluminantD55, kIlluminantD60,
                                             kIlluminantDCI, kIlluminantD65, kIlluminantD75};

/// A space with the primaries and the white of a host.
class HostSpace : public SRGBColorSpace {
public:
    HostSpace(const std::array<float, 6>& primaries, const float* white)
        : fPrimaries(primaries), fWhite(white) {}

    const float* Primaries() const override { return fPrimaries.data(); }
    const float* WhitePoint() const override { return fWhite; }

    using ColorSpace::CalculateLumaCoeffs;
    using ColorSpace::matricesValid;
    using ColorSpace::rgbToXYZ;
    using ColorSpace::xyzToRGB;

private:
    std::array<float, 6> fPrimaries;
    const float* fWhite;
};

constexpr std::array<float, 6> kSRGBPrimaries = {0.64f, 0.33f, 0.30f, 0.60f, 0.15f, 0.06f};
constexpr std::array<float, 6> kWidePrimaries = {0.713f, 0.293f, 0.165f, 0.83f, 0.128f, 0.044f};

void ExpectSameBits(const CSMatrix& actual, const Matrix3<float>& expected) {
    for (size_t i = 0; i < 9; ++i)
        EXPECT_EQ(Pattern(actual.m[i]), Pattern(expected[i / 3][i % 3]))
            << "entry " << i << ": " << actual.m[i] << " and " << expected[i / 3][i % 3];
}

void ExpectNear(const CSMatrix& actual, const Matrix3<double>& expected, double tolerance) {
    for (size_t i = 0; i < 9; ++i)
        EXPECT_NEAR(static_cast<double>(actual.m[i]), expected[i / 3][i % 3], tolerance) << "entry " << i;
}

bool IsExactIdentity(const CSMatrix& matrix) {
    return std::ranges::equal(matrix.m, CSMatrix().m);
}

TEST(ColorSpace, IlluminantsAreRowsOfOneTable) {
    constexpr float expected[6][2] = {{0.34567f, 0.3585f}, {0.33242f, 0.34743f}, {0.32168f, 0.33767f},
                                      {0.314f, 0.351f},    {0.31271f, 0.32902f}, {0.29902f, 0.31485f}};
    const float* table = ColorSpace::Illuminant(kIlluminantD50);
    for (uint32_t i = 0; i < 6; ++i) {
        const float* row = ColorSpace::Illuminant(static_cast<PK_Illuminant>(i));
        EXPECT_EQ(row, table + 2 * i);
        EXPECT_EQ(row[0], expected[i][0]);
        EXPECT_EQ(row[1], expected[i][1]);
    }
    EXPECT_EQ(ColorSpace::Illuminant(kIlluminantD75)[2], 1e-6f) << "the third float of the last row";
}

TEST(ColorSpace, EveryWhiteIsARowOfTheTable) {
    const float* d65 = ColorSpace::Illuminant(kIlluminantD65);
    EXPECT_EQ(SRGBColorSpace().WhitePoint(), d65);
    EXPECT_EQ(GammaColorSpace().WhitePoint(), d65);
    EXPECT_EQ(Rec709ColorSpace().WhitePoint(), d65);
    EXPECT_EQ(Rec2020ColorSpace().WhitePoint(), d65);
    EXPECT_EQ(HLGColorSpace().WhitePoint(), d65);
    EXPECT_EQ(PQColorSpace(false, false).WhitePoint(), d65);
    EXPECT_EQ(PQColorSpace(true, true).WhitePoint(), d65);
    EXPECT_EQ(PQColorSpace(kWidePrimaries.data(), true).WhitePoint(), d65);
    EXPECT_EQ(DCIP3ColorSpace().WhitePoint(), d65);
    for (const PK_Illuminant illuminant : kAllIlluminants)
        EXPECT_EQ(DCIP3ColorSpace(illuminant).WhitePoint(), ColorSpace::Illuminant(illuminant));
}

TEST(ColorSpace, PrimariesAreThoseOfTheStandards) {
    const auto expect = [](const ColorSpace& space, const std::array<float, 6>& expected) {
        EXPECT_TRUE(std::equal(expected.begin(), expected.end(), space.Primaries()));
    };
    constexpr std::array<float, 6> kRec2020 = {0.708f, 0.292f, 0.170f, 0.797f, 0.131f, 0.046f};
    constexpr std::array<float, 6> kP3 = {0.68f, 0.32f, 0.265f, 0.69f, 0.15f, 0.06f};
    expect(SRGBColorSpace(), kSRGBPrimaries);
    expect(GammaColorSpace(), kSRGBPrimaries);
    expect(Rec709ColorSpace(), kSRGBPrimaries);
    expect(Rec2020ColorSpace(), kRec2020);
    expect(HLGColorSpace(), kRec2020);
    expect(DCIP3ColorSpace(kIlluminantDCI), kP3);
    expect(PQColorSpace(false, false), kRec2020);
    expect(PQColorSpace(true, false), kP3);
    expect(PQColorSpace(kWidePrimaries.data(), false), kWidePrimaries);
}

TEST(ColorSpace, FixedWeightsOfLuminance) {
    const auto expect = [](const ColorSpace& space, const std::array<float, 3>& expected) {
        EXPECT_TRUE(std::equal(expected.begin(), expected.end(), space.LuminanceCoeffs()));
    };
    constexpr std::array<float, 3> kRec709 = {0.2126f, 0.7152f, 0.0722f},
                                   kRec2020 = {0.2627f, 0.678f, 0.0593f};
    expect(SRGBColorSpace(), kRec709);
    expect(GammaColorSpace(), kRec709);
    expect(Rec709ColorSpace(), kRec709);
    expect(Rec2020ColorSpace(), kRec2020);
    expect(HLGColorSpace(), kRec2020);
}

TEST(ColorSpace, MatricesAreThoseOfThePublishedTables) {
    // sRGB as in IEC 61966-2-1, to its four digits.
    ExpectNear(SRGBColorSpace().RGBtoXYZ(),
               {{{0.4124, 0.3576, 0.1805}, {0.2126, 0.7152, 0.0722}, {0.0193, 0.1192, 0.9505}}}, 2e-4);
    ExpectNear(SRGBColorSpace().XYZtoRGB(),
               {{{3.2406, -1.5372, -0.4986}, {-0.9689, 1.8758, 0.0415}, {0.0557, -0.2040, 1.0570}}}, 6e-4);
    ExpectNear(Rec2020ColorSpace().RGBtoXYZ(),
               {{{0.6370, 0.1446, 0.1689}, {0.2627, 0.6780, 0.0593}, {0.0000, 0.0281, 1.0610}}}, 2e-4);
}

TEST(ColorSpace, MatricesFollowFromPrimariesAndWhite) {
    for (const PK_Illuminant illuminant : kAllIlluminants)
        for (const std::array<float, 6>& primaries : {kSRGBPrimaries, kWidePrimaries}) {
            const float* white = ColorSpace::Illuminant(illuminant);
            const HostSpace space(primaries, white);
            const Matrix3<float> toXYZ = RGBToXYZOf<float>(primaries.data(), white);
            ExpectSameBits(space.RGBtoXYZ(), toXYZ);
            ExpectSameBits(space.XYZtoRGB(), Inverse(toXYZ));
            const Matrix3<double> exact = RGBToXYZOf<double>(primaries.data(), white);
            ExpectNear(space.RGBtoXYZ(), exact, 2e-6);
            ExpectNear(space.XYZtoRGB(), Inverse(exact), 2e-5);
        }
}

TEST(ColorSpace, MatricesFollowTheVirtualFunctionsAtEveryRequest) {
    class Changing : public SRGBColorSpace {
    public:
        const float* Primaries() const override { return primaries.data(); }
        std::array<float, 6> primaries = kSRGBPrimaries;
    } space;
    const CSMatrix before = space.RGBtoXYZ();
    space.primaries = kWidePrimaries;
    ExpectSameBits(space.RGBtoXYZ(), RGBToXYZOf<float>(kWidePrimaries.data(), space.WhitePoint()));
    EXPECT_NE(before.m[0], space.RGBtoXYZ().m[0]);
}

TEST(ColorSpace, TheReferencesAreTheMembersAndEitherRequestRefreshesBoth) {
    const HostSpace space(kSRGBPrimaries, ColorSpace::Illuminant(kIlluminantD65));
    EXPECT_EQ(&space.RGBtoXYZ(), &space.rgbToXYZ);
    EXPECT_EQ(&space.XYZtoRGB(), &space.xyzToRGB);
    EXPECT_FALSE(space.matricesValid) << "nothing in the library sets the flag";

    const HostSpace forward(kSRGBPrimaries, ColorSpace::Illuminant(kIlluminantD65));
    EXPECT_TRUE(IsExactIdentity(forward.rgbToXYZ) && IsExactIdentity(forward.xyzToRGB)) << "as constructed";
    forward.RGBtoXYZ();
    EXPECT_FALSE(IsExactIdentity(forward.xyzToRGB));
    const HostSpace backward(kSRGBPrimaries, ColorSpace::Illuminant(kIlluminantD65));
    backward.XYZtoRGB();
    EXPECT_FALSE(IsExactIdentity(backward.rgbToXYZ));
}

TEST(ColorSpace, AHostThatSetsTheFlagKeepsItsOwnMatrices) {
    HostSpace space(kSRGBPrimaries, ColorSpace::Illuminant(kIlluminantD65));
    space.rgbToXYZ.m[3] = 5;
    space.matricesValid = true;
    EXPECT_EQ(space.RGBtoXYZ().m[3], 5.0f);
    EXPECT_EQ(space.XYZtoRGB().m[0], 1.0f);
    float luma[3];
    space.CalculateLumaCoeffs(luma);
    EXPECT_EQ(luma[0], 5.0f);
}

TEST(ColorSpace, WhiteOfAHostsSpaceIsItsWhite) {
    const float white[2] = {0.33f, 0.34f};
    const HostSpace space(kWidePrimaries, white);
    const CSMatrix& m = space.RGBtoXYZ();
    for (int row = 0; row < 3; ++row) {
        const float sum = m.m[3 * row] + m.m[3 * row + 1] + m.m[3 * row + 2];
        EXPECT_NEAR(sum, WhiteOf<float>(white)[static_cast<size_t>(row)], 1e-6f);
    }
}

TEST(ColorSpace, PrimariesWithoutLuminanceGiveWhatIEEESays) {
    const HostSpace space({0.64f, 0.0f, 0.30f, 0.60f, 0.15f, 0.06f}, ColorSpace::Illuminant(kIlluminantD65));
    EXPECT_TRUE(std::isnan(space.RGBtoXYZ().m[0]));
    EXPECT_TRUE(std::isnan(space.XYZtoRGB().m[0]));
}

TEST(ColorSpace, LuminanceWeightsOfAHostAreTheMiddleRow) {
    const HostSpace space(kWidePrimaries, ColorSpace::Illuminant(kIlluminantD50));
    float luma[4] = {9, 9, 9, 9};
    space.CalculateLumaCoeffs(luma);
    const Matrix3<float> expected = RGBToXYZOf<float>(kWidePrimaries.data(), space.WhitePoint());
    for (size_t i = 0; i < 3; ++i) EXPECT_EQ(luma[i], expected[1][i]);
    EXPECT_EQ(luma[3], 9.0f);
}

TEST(ColorSpace, WeightsOfP3FollowItsWhite) {
    for (const PK_Illuminant illuminant : kAllIlluminants) {
        const DCIP3ColorSpace space(illuminant);
        const float* luma = space.LuminanceCoeffs();
        const Matrix3<float> expected = RGBToXYZOf<float>(space.Primaries(), space.WhitePoint());
        for (size_t i = 0; i < 3; ++i) EXPECT_EQ(luma[i], expected[1][i]);
        EXPECT_EQ(luma, space.LuminanceCoeffs());
    }
    const DCIP3ColorSpace d65, dci(kIlluminantDCI);
    EXPECT_NE(d65.LuminanceCoeffs()[0], dci.LuminanceCoeffs()[0]);
    // SMPTE EG 432-1 has 0.2095, 0.7216, 0.0689 for the white of projection.
    EXPECT_NEAR(dci.LuminanceCoeffs()[0], 0.2095f, 1e-4f);
    EXPECT_NEAR(dci.LuminanceCoeffs()[1], 0.7216f, 1e-4f);
    EXPECT_NEAR(dci.LuminanceCoeffs()[2], 0.0689f, 1e-4f);
}

TEST(ColorSpace, AdaptationIsBradfords) {
    for (const PK_Illuminant i : kAllIlluminants)
        for (const PK_Illuminant j : kAllIlluminants) {
            const float *from = ColorSpace::Illuminant(i), *to = ColorSpace::Illuminant(j);
            const CSMatrix matrix = ColorSpace::CalculateAdaptationMatrix(from, to);
            if (i == j) {
                EXPECT_TRUE(IsExactIdentity(matrix));
                continue;
            }
            ExpectSameBits(matrix, AdaptationOf<float>(from, to));
            ExpectNear(matrix, AdaptationOf<double>(from, to), 1e-6);
            // It takes the one white to the other.
            const Vector3<double> white = WhiteOf<double>(from), expected = WhiteOf<double>(to);
            for (size_t row = 0; row < 3; ++row) {
                double sum = 0;
                for (size_t k = 0; k < 3; ++k) sum += static_cast<double>(matrix.m[3 * row + k]) * white[k];
                EXPECT_NEAR(sum, expected[row], 2e-6);
            }
        }
    // D65 to D50 as it is published, with four digits.
    ExpectNear(ColorSpace::CalculateAdaptationMatrix(ColorSpace::Illuminant(kIlluminantD65),
                                                     ColorSpace::Illuminant(kIlluminantD50)),
               {{{1.0478, 0.0229, -0.0501}, {0.0296, 0.9904, -0.0171}, {-0.0092, 0.0151, 0.7517}}}, 5e-4);
}

TEST(ColorSpace, WhitesAreTheSameByThreeFloats) {
    const float white[3] = {0.3f, 0.32f, 7.0f}, same[3] = {0.3f, 0.32f, 7.0f}, other[3] = {0.3f, 0.32f, 8.0f};
    EXPECT_TRUE(IsExactIdentity(ColorSpace::CalculateAdaptationMatrix(white, same)));
    const CSMatrix adapted = ColorSpace::CalculateAdaptationMatrix(white, other);
    EXPECT_FALSE(IsExactIdentity(adapted)) << "the third float tells them apart";
    ExpectSameBits(adapted, AdaptationOf<float>(white, other));

    const float copyOfD75[3] = {0.29902f, 0.31485f, 1e-6f};
    EXPECT_TRUE(IsExactIdentity(
        ColorSpace::CalculateAdaptationMatrix(copyOfD75, ColorSpace::Illuminant(kIlluminantD75))));
}

TEST(ColorSpace, WhitesMayDifferByExactlyTheLimit) {
    const float zero[3] = {0, 0.5f, 1e-6f}, limit[3] = {1e-6f, 0.5f, 0};
    EXPECT_TRUE(IsExactIdentity(ColorSpace::CalculateAdaptationMatrix(zero, limit)));
    EXPECT_TRUE(IsExactIdentity(ColorSpace::CalculateAdaptationMatrix(limit, zero)));
    const float beyond[3] = {std::nextafter(1e-6f, 1.0f), 0.5f, 0};
    EXPECT_FALSE(IsExactIdentity(ColorSpace::CalculateAdaptationMatrix(zero, beyond)));
    const float noNumber[3] = {kNaN, 0.5f, 0};
    EXPECT_FALSE(IsExactIdentity(ColorSpace::CalculateAdaptationMatrix(noNumber, noNumber)));
}

TEST(ColorSpace, AdaptationReadsNoThirdFloatOfWhitesThatDiffer) {
    const GuardedRows first(2 * sizeof(float), Guard::kAfter), second(2 * sizeof(float), Guard::kAfter);
    auto* from = reinterpret_cast<float*>(first.Bytes());
    auto* to = reinterpret_cast<float*>(second.Bytes());
    constexpr float pairs[][4] = {{0.3f, 0.32f, 0.31f, 0.32f},
                                  {0.3f, 0.32f, 0.3f, 0.33f},
                                  {kNaN, 0.3f, kNaN, 0.3f},
                                  {0.3f, kNaN, 0.3f, kNaN}};
    for (const auto& [fromX, fromY, toX, toY] : pairs) {
        from[0] = fromX;
        from[1] = fromY;
        to[0] = toX;
        to[1] = toY;
        EXPECT_FALSE(IsExactIdentity(ColorSpace::CalculateAdaptationMatrix(from, to)));
    }
}

TEST(ColorSpace, ConversionsComparePairsOnly) {
    const GuardedRows memory(2 * sizeof(float), Guard::kAfter);
    auto* white = reinterpret_cast<float*>(memory.Bytes());
    std::copy_n(ColorSpace::Illuminant(kIlluminantD65), 2, white);
    const HostSpace from(kWidePrimaries, white);
    const SRGBColorSpace to;
    ExpectSameBits(
        ColorSpace::CalculateConversionMatrix(from, to),
        Times(Inverse(RGBToXYZOf<float>(to.Primaries(), white)), RGBToXYZOf<float>(from.Primaries(), white)));
    white[1] = 0.33f;
    const CSMatrix adapted = ColorSpace::CalculateConversionMatrix(from, to);
    ExpectSameBits(adapted, Times(Times(Inverse(RGBToXYZOf<float>(to.Primaries(), to.WhitePoint())),
                                        AdaptationOf<float>(white, to.WhitePoint())),
                                  RGBToXYZOf<float>(from.Primaries(), white)));
}

TEST(ColorSpace, ConversionsOfDifferentWhitesGoThroughBradford) {
    const ColorSpace& hub = ColorSpace::WorkingSpace(kWorkingSpaceRec709);
    const auto direct = [&hub](const ColorSpace& to) {
        return Times(Inverse(RGBToXYZOf<float>(to.Primaries(), to.WhitePoint())),
                     RGBToXYZOf<float>(hub.Primaries(), hub.WhitePoint()));
    };
    const ColorSpace& d65 = ColorSpace::WorkingSpace(kWorkingSpaceDCIP3D65);
    ExpectSameBits(ColorSpace::CalculateConversionMatrix(hub, d65), direct(d65));

    const ColorSpace& d60 = ColorSpace::WorkingSpace(kWorkingSpaceDCIP3D60);
    const CSMatrix adapted = ColorSpace::CalculateConversionMatrix(hub, d60);
    ExpectSameBits(adapted, Times(Times(Inverse(RGBToXYZOf<float>(d60.Primaries(), d60.WhitePoint())),
                                        AdaptationOf<float>(hub.WhitePoint(), d60.WhitePoint())),
                                  RGBToXYZOf<float>(hub.Primaries(), hub.WhitePoint())));
    EXPECT_GT(std::abs(adapted.m[0] - direct(d60)[0][0]), 1e-3f);
    // White stays white.
    for (int row = 0; row < 3; ++row)
        EXPECT_NEAR(adapted.m[3 * row] + adapted.m[3 * row + 1] + adapted.m[3 * row + 2], 1.0f, 2e-6f);
}

TEST(ColorSpace, AConversionToItselfIsNotTheExactIdentity) {
    const Rec709ColorSpace space;
    const CSMatrix matrix = ColorSpace::CalculateConversionMatrix(space, space);
    EXPECT_FALSE(IsExactIdentity(matrix));
    ExpectNear(matrix, {{{1, 0, 0}, {0, 1, 0}, {0, 0, 1}}}, 1e-6);
    const Matrix3<float> toXYZ = RGBToXYZOf<float>(space.Primaries(), space.WhitePoint());
    ExpectSameBits(matrix, Times(Inverse(toXYZ), toXYZ));
}

TEST(ColorSpace, EveryPairConvertsAsDoublePrecisionSays) {
    for (uint32_t i = 0; i <= 6; ++i)
        for (uint32_t j = 0; j <= 6; ++j) {
            const ColorSpace& from = ColorSpace::WorkingSpace(static_cast<PK_WorkingSpace>(i));
            const ColorSpace& to = ColorSpace::WorkingSpace(static_cast<PK_WorkingSpace>(j));
            Matrix3<double> adaptation = {{{1, 0, 0}, {0, 1, 0}, {0, 0, 1}}};
            if (from.WhitePoint() != to.WhitePoint())
                adaptation = AdaptationOf<double>(from.WhitePoint(), to.WhitePoint());
            const Matrix3<double> exact =
                Times(Times(Inverse(RGBToXYZOf<double>(to.Primaries(), to.WhitePoint())), adaptation),
                      RGBToXYZOf<double>(from.Primaries(), from.WhitePoint()));
            ExpectNear(ColorSpace::CalculateConversionMatrix(from, to), exact, 4e-6);
        }
}

TEST(ColorSpace, AHostsSpaceConvertsItsPixelsByItsBase) {
    class OwnLuma : public Rec2020ColorSpace {
    public:
        const float* LuminanceCoeffs() const override { return fLuma; }

    private:
        float fLuma[3] = {0.8f, 0.1f, 0.1f};
    };
    const OwnLuma own;
    const Rec2020ColorSpace base;
    const ColourPixels red = {{0.1f, 0.2f, 2.0f, 1.0f}};
    const auto through = [&red](const ColorSpace& space, bool gamutClip) {
        return Converted(red, [&](const float* source, float* destination, int32_t count) {
            space.ConvertPixelsFromRec709(source, destination, count, gamutClip);
        });
    };
    EXPECT_TRUE(AreSameBits(through(own, false), through(base, false)));
    EXPECT_FALSE(AreSameBits(through(own, true), through(base, true)))
        << "the clip asks the object for its weights";
}

} // namespace
