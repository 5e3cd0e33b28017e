// The matrices between gamuts against those that follow from the chromaticities of the standards, in double precision.

#include "colour/Rec2020Matrices.h"

#include "colour/Conversions.h"
#include "colour/ExactColour.h"
#include "colour/WorstError.h"

#include <cmath>

namespace PKTest {
namespace {

using namespace PK;

void ExpectNear(const std::string& what, const CSMatrix& matrix, const exact::Matrix& expected,
                double bound) {
    WorstError worst(what);
    for (size_t i = 0; i < 9; ++i)
        worst.Take(std::abs(double{matrix.m[i]} - expected[i / 3][i % 3]), static_cast<double>(i));
    worst.ExpectBelow(bound);
}

TEST(Gamuts, PublishedMatricesInDoublePrecision) {
    // ITU-R BT.2087, which gives four digits: the yardstick itself.
    constexpr double kBT2087[9] = {0.6274, 0.3293, 0.0433, 0.0691, 0.9195, 0.0114, 0.0164, 0.0880, 0.8956};
    const exact::Matrix to2020 = exact::Between(exact::kRec709, exact::kRec2020);
    for (size_t i = 0; i < 9; ++i) EXPECT_NEAR(to2020[i / 3][i % 3], kBT2087[i], 5e-5);
    const exact::Matrix round = Times(to2020, exact::Between(exact::kRec2020, exact::kRec709));
    for (size_t i = 0; i < 9; ++i) EXPECT_NEAR(round[i / 3][i % 3], i % 4 == 0 ? 1 : 0, 1e-14);
}

TEST(Gamuts, StoredMatricesOfRec2020) {
    ExpectNear("stored matrix Rec. 709 to Rec. 2020, absolute", Rec709ToRec2020(),
               exact::Between(exact::kRec709, exact::kRec2020), 2.5e-5);
    ExpectNear("stored matrix Rec. 2020 to Rec. 709, absolute", Rec2020ToRec709(),
               exact::Between(exact::kRec2020, exact::kRec709), 2.5e-5);
}

/// A gamut with the white of the table, whose fifth digit the standards do not have.
exact::Gamut WithWhiteOfTheTable(exact::Gamut gamut) {
    const float* white = ColorSpace::Illuminant(kIlluminantD65);
    gamut.white[0] = double{white[0]};
    gamut.white[1] = double{white[1]};
    return gamut;
}

TEST(Gamuts, CalculatedMatrices) {
    const ColorSpace& hub = ColorSpace::WorkingSpace(kWorkingSpaceRec709);
    struct {
        const char* name;
        PK_WorkingSpace space;
        exact::Gamut gamut;
    } const cases[] = {{"Rec. 2020", kWorkingSpaceRec2020, exact::kRec2020},
                       {"P3 D65", kWorkingSpaceDCIP3D65, exact::kP3D65},
                       {"PQ Rec. 2020", kWorkingSpacePQRec2020, exact::kRec2020},
                       {"PQ P3", kWorkingSpacePQP3, exact::kP3D65}};
    for (const auto& [name, which, gamut] : cases) {
        const ColorSpace& space = ColorSpace::WorkingSpace(which);
        const CSMatrix from = ColorSpace::CalculateConversionMatrix(hub, space);
        const CSMatrix to = ColorSpace::CalculateConversionMatrix(space, hub);
        const exact::Gamut hubs = WithWhiteOfTheTable(exact::kRec709), its = WithWhiteOfTheTable(gamut);
        // Single precision alone, and with the white that the standards round.
        const std::string title = name;
        ExpectNear("matrix Rec. 709 to " + title + ", absolute", from, exact::Between(hubs, its), 1e-6);
        ExpectNear("matrix " + title + " to Rec. 709, absolute", to, exact::Between(its, hubs), 2e-6);
        ExpectNear("matrix Rec. 709 to " + title + ", absolute, D65 of the standards", from,
                   exact::Between(exact::kRec709, gamut), 2.5e-5);
        ExpectNear("matrix " + title + " to Rec. 709, absolute, D65 of the standards", to,
                   exact::Between(gamut, exact::kRec709), 2.5e-5);
    }
}

TEST(Gamuts, GreysStayGrey) {
    // The rows add up to 1 within the digits of the matrices; PQ shows the most of the rest.
    for (const PK_WorkingSpace which : {kWorkingSpaceRec2020, kWorkingSpaceDCIP3D65, kWorkingSpacePQP3})
        for (const Way way : {Way::kFromHub, Way::kToHub})
            for (const float value : {0.01f, 0.18f, 0.5f, 1.0f}) {
                const ColourPixel grey = ConvertAlone(ColorSpace::WorkingSpace(which), way, Grey(value));
                EXPECT_NEAR(grey[0], grey[2], 2e-5f * grey[2]) << which;
                EXPECT_NEAR(grey[1], grey[2], 2e-5f * grey[2]) << which;
            }
}

} // namespace
} // namespace PKTest
