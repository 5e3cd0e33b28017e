// The conversions of whole spaces, through the functions of the classes: whole groups of eight pixels are held to the
// restated steps of the vector bodies and the rest to those of single pixels, at every count.

#include "colour/Conversions.h"
#include "colour/DecodeTables.h"
#include "colour/FloatBodies.h"
#include "support/RowBuffer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <deque>
#include <functional>
#include <memory>
#include <ostream>

namespace PKTest {
namespace {

using namespace PK;
using namespace reference;

using Restatement = std::function<ColourPixel(const ColourPixel&)>;

/// A conversion with its two restatements: of pixels in groups of eight and of single ones.
struct HubConversion {
    const char* name;
    std::shared_ptr<const ColorSpace> space;
    Way way;
    bool gamutClip;
    Restatement bulk, single;
    int64_t units = 0; ///< that the restatement in bulk may be off by
};

std::ostream& operator<<(std::ostream& stream, const HubConversion& conversion) {
    return stream << conversion.name;
}

Rounding BulkRounding() {
    return RoundingOf(BestTarget(Offer::processor));
}

const float kTo2020[9] = {0.6274020f, 0.3292920f, 0.0433061f, 0.0690955f, 0.9195440f,
                          0.0113602f, 0.0163937f, 0.0880281f, 0.8955780f};
const float kFrom2020[9] = {1.6605000f,  -0.5876570f, -0.0728399f, -0.1245470f, 1.1329000f,
                            -0.0083480f, -0.0181537f, -0.1005970f, 1.1187500f};
const float kLuma709[3] = {0.2126f, 0.7152f, 0.0722f};

/// The matrix between a space and the hub, kept for the run.
const float* HubMatrix(const ColorSpace& space, Way way) {
    const ColorSpace& hub = ColorSpace::WorkingSpace(kWorkingSpaceRec709);
    static std::deque<CSMatrix> kept;
    kept.push_back(way == Way::kFromHub ? ColorSpace::CalculateConversionMatrix(hub, space)
                                        : ColorSpace::CalculateConversionMatrix(space, hub));
    return kept.back().m;
}

HubConversion PowerLawConversion(const char* name, std::shared_ptr<const ColorSpace> space, Way way,
                                 const PowerLaws& laws) {
    return {name,
            std::move(space),
            way,
            laws.gamutClip,
            [=](const ColourPixel& pixel) { return BulkPowerLaws(pixel, laws, BulkRounding()); },
            [=](const ColourPixel& pixel) { return SinglePowerLaws(pixel, laws); }};
}

void AddGamma(std::vector<HubConversion>& list) {
    const auto space = std::make_shared<GammaColorSpace>(0.45f);
    list.push_back(PowerLawConversion("HubToGamma", space, Way::kFromHub, {2.4f, 0.45f}));
    list.push_back(PowerLawConversion("GammaToHub", space, Way::kToHub, {1 / 0.45f, 0.41666666f}));
    // The matrix is the identity, so that nothing is clipped.
    list.push_back(PowerLawConversion("HubToGammaClipped", space, Way::kFromHub,
                                      {2.4f, 0.45f, nullptr, true, kLuma709}));
}

void AddRec2020(std::vector<HubConversion>& list) {
    const auto space = std::make_shared<Rec2020ColorSpace>();
    const float* luma = space->LuminanceCoeffs();
    list.push_back(PowerLawConversion("HubToRec2020", space, Way::kFromHub, {2.4f, 0.41666666f, kTo2020}));
    list.push_back(PowerLawConversion("HubToRec2020Clipped", space, Way::kFromHub,
                                      {2.4f, 0.41666666f, kTo2020, true, luma}));
    list.push_back(PowerLawConversion("Rec2020ToHub", space, Way::kToHub, {2.4f, 0.41666666f, kFrom2020}));
    list.push_back(PowerLawConversion("Rec2020ToHubClipped", space, Way::kToHub,
                                      {2.4f, 0.41666666f, kFrom2020, true, kLuma709}));
}

void AddP3(std::vector<HubConversion>& list) {
    for (const PK_Illuminant white : {kIlluminantD65, kIlluminantDCI}) {
        const auto space = std::make_shared<DCIP3ColorSpace>(white);
        const float *from = HubMatrix(*space, Way::kFromHub), *to = HubMatrix(*space, Way::kToHub);
        const float* luma = space->LuminanceCoeffs();
        const bool isD65 = white == kIlluminantD65;
        list.push_back(PowerLawConversion(isD65 ? "HubToP3D65" : "HubToP3DCI", space, Way::kFromHub,
                                          {2.4f, 0.38461539f, from}));
        list.push_back(PowerLawConversion(isD65 ? "HubToP3D65Clipped" : "HubToP3DCIClipped", space,
                                          Way::kFromHub, {2.4f, 0.38461539f, from, true, luma}));
        list.push_back(PowerLawConversion(isD65 ? "P3D65ToHub" : "P3DCIToHub", space, Way::kToHub,
                                          {2.6f, 0.41666666f, to}));
        list.push_back(PowerLawConversion(isD65 ? "P3D65ToHubClipped" : "P3DCIToHubClipped", space,
                                          Way::kToHub, {2.6f, 0.41666666f, to, true, kLuma709}));
    }
}

/// Without normalisation and clip signals are looked up, else every pixel is calculated by itself.
HubConversion PQToHub(const char* name, std::shared_ptr<const PQColorSpace> space, bool normalized,
                      bool clip) {
    const float* matrix = HubMatrix(*space, Way::kToHub);
    const bool isLookedUp = !normalized && !clip;
    const float inScale = normalized ? 0.50807786f : 1.0f;
    const auto calculated = [=](const ColourPixel& pixel) {
        return SinglePQToHub(pixel, matrix, inScale, clip, kLuma709);
    };
    const auto bulk = [=](const ColourPixel& pixel) {
        return isLookedUp ? BulkPQToHub(pixel, matrix, PQDecodeTable(), BulkRounding()) : calculated(pixel);
    };
    const auto single = [=](const ColourPixel& pixel) {
        return isLookedUp ? SinglePQToHubByTable(pixel, matrix, PQDecodeTable()) : calculated(pixel);
    };
    return {name, std::move(space), Way::kToHub, clip, bulk, single};
}

/// A clip has no effect on the way in.
HubConversion HubToPQ(const char* name, std::shared_ptr<const PQColorSpace> space, bool normalized,
                      bool clip) {
    const float* matrix = HubMatrix(*space, Way::kFromHub);
    const float outScale = normalized ? 1.9682022f : 1.0f;
    const auto bulk = [=](const ColourPixel& pixel) {
        return BulkHubToPQ(pixel, matrix, outScale, BulkRounding());
    };
    const auto single = [=](const ColourPixel& pixel) { return SingleHubToPQ(pixel, matrix, outScale); };
    return {name, std::move(space), Way::kFromHub, clip, bulk, single, normalized ? 2 : 1};
}

void AddPQ(std::vector<HubConversion>& list) {
    const auto plain = std::make_shared<PQColorSpace>(false, false);
    const auto normalised = std::make_shared<PQColorSpace>(true, true);
    list.push_back(PQToHub("PQToHub", plain, false, false));
    list.push_back(PQToHub("PQToHubClipped", plain, false, true));
    list.push_back(PQToHub("PQP3NormalisedToHub", normalised, true, false));
    list.push_back(PQToHub("PQP3NormalisedToHubClipped", normalised, true, true));
    list.push_back(HubToPQ("HubToPQ", plain, false, false));
    list.push_back(HubToPQ("HubToPQClipped", plain, false, true));
    list.push_back(HubToPQ("HubToPQP3Normalised", normalised, true, false));
}

void AddHLG(std::vector<HubConversion>& list) {
    const auto space = std::make_shared<HLGColorSpace>();
    const auto bulkTo = [](const ColourPixel& pixel) {
        return BulkHLGToHub(pixel, kFrom2020, HLGDecodeTable(), BulkRounding());
    };
    const auto singleTo = [](const ColourPixel& pixel) {
        return SingleHLGToHub(pixel, kFrom2020, HLGDecodeTable());
    };
    const auto bulkFrom = [](const ColourPixel& pixel) {
        return BulkHubToHLG(pixel, kTo2020, BulkRounding());
    };
    const auto singleFrom = [](const ColourPixel& pixel) { return SingleHubToHLG(pixel, kTo2020); };
    for (const bool clip : {false, true}) { // which has no effect
        list.push_back({clip ? "HLGToHubClipped" : "HLGToHub", space, Way::kToHub, clip, bulkTo, singleTo});
        list.push_back(
            {clip ? "HubToHLGClipped" : "HubToHLG", space, Way::kFromHub, clip, bulkFrom, singleFrom});
    }
}

std::vector<HubConversion> AllHubConversions() {
    std::vector<HubConversion> list;
    AddGamma(list);
    AddRec2020(list);
    AddP3(list);
    AddPQ(list);
    AddHLG(list);
    return list;
}

ColourPixels Expected(const HubConversion& conversion, const ColourPixels& source) {
    ColourPixels expected;
    const size_t bulk = source.size() / 8 * 8;
    for (size_t i = 0; i < source.size(); ++i)
        expected.push_back((i < bulk ? conversion.bulk : conversion.single)(source[i]));
    return expected;
}

class HubConversions : public testing::TestWithParam<HubConversion> {};

TEST_P(HubConversions, GroupsOfEightAndTheRestAtEveryCount) {
    const HubConversion& conversion = GetParam();
    Random random(1);
    for (const Content content : kAllContents)
        for (size_t count = 0; count <= 70; ++count) {
            const ColourPixels source = MakePixels(content, count, random);
            const ColourPixels result =
                Convert(*conversion.space, conversion.way, source, conversion.gamutClip);
            ASSERT_EQ(FirstDifference(source, Expected(conversion, source), result, conversion.units), "")
                << ContentName(content) << ", " << count << " pixels, seed " << random.Seed();
        }
}

TEST_P(HubConversions, SinglePixelsOfEveryContent) {
    const HubConversion& conversion = GetParam();
    Random random(2);
    for (const Content content : kAllContents)
        for (const ColourPixel& pixel : MakePixels(content, 3000, random)) {
            const ColourPixel result =
                ConvertAlone(*conversion.space, conversion.way, pixel, conversion.gamutClip);
            ASSERT_EQ(FirstDifference({pixel}, {conversion.single(pixel)}, {result}), "")
                << ContentName(content) << ", seed " << random.Seed();
        }
}

TEST_P(HubConversions, StaysInItsRowsAndGivesTheSameInPlace) {
    const HubConversion& conversion = GetParam();
    const auto run = [&](const uint8_t* from, uint8_t* to, int32_t count) {
        Convert(*conversion.space, conversion.way, reinterpret_cast<const float*>(from),
                reinterpret_cast<float*>(to), count, conversion.gamutClip);
    };
    Random random(3);
    for (int32_t count = 0; count <= 70; ++count)
        for (const Placement place : {Placement{Placement::kBeforeGuard}, Placement{Placement::kAfterGuard},
                                      Placement{Placement::kAtOffset, 4}}) {
            const ColourPixels pixels = MakePixels(Content::kWide, static_cast<size_t>(count), random);
            const ColourPixels expected =
                Convert(*conversion.space, conversion.way, pixels, conversion.gamutClip);
            const size_t bytes = 16 * pixels.size();
            RowBuffer source(bytes, place), destination(bytes, place);
            std::copy_n(Floats(pixels), 4 * count, reinterpret_cast<float*>(source.Data()));
            run(source.Data(), destination.Data(), count);
            ASSERT_TRUE(destination.MarginsIntact()) << count << " pixels " << place;
            ASSERT_TRUE(Holds(destination.Data(), expected)) << count << " pixels " << place;
            ASSERT_TRUE(Holds(source.Data(), pixels)) << "the source was written";
            run(source.Data(), source.Data(), count);
            ASSERT_TRUE(source.MarginsIntact()) << count << " pixels in place " << place;
            ASSERT_TRUE(Holds(source.Data(), expected)) << count << " pixels in place " << place;
        }
}

TEST_P(HubConversions, CountsBelowOneTouchNothing) {
    const HubConversion& conversion = GetParam();
    for (const int32_t count : {0, -1, -7, -8, -9, -64, INT_MIN + 1, INT_MIN}) {
        const ColourPixels source(16, Grey(0.5f));
        ColourPixels destination(16, Grey(7));
        // In the middle, for a count that is taken as a step back.
        Convert(*conversion.space, conversion.way, Floats(source) + 32, Floats(destination) + 32, count,
                conversion.gamutClip);
        EXPECT_EQ(destination, ColourPixels(16, Grey(7))) << count;
        Convert(*conversion.space, conversion.way, nullptr, nullptr, count, conversion.gamutClip);
    }
}

INSTANTIATE_TEST_SUITE_P(, HubConversions, testing::ValuesIn(AllHubConversions()),
                         [](const auto& test) { return test.param.name; });

} // namespace
} // namespace PKTest
