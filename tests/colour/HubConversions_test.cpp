// The conversions of whole spaces, through the functions of the classes: whole groups of eight pixels are held to the
// restated steps of the vector bodies and the rest to those of single pixels, at every count.

#include "colour/Conversions.h"
#include "colour/DecodeTables.h"
#include "colour/FloatBodies.h"

#include <gtest/gtest.h>

#include <deque>
#include <functional>
#include <memory>
#include <ostream>
#include <string>
#include <utility>

namespace PKTest {
namespace {

using namespace PK;
using namespace reference;

using Restatement = std::function<ColourPixel(const ColourPixel&)>;

/// A conversion with its two restatements: of pixels in groups of eight and of single ones.
struct HubConversion {
    std::string name;
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

/// The matrix between a space and the hub, kept for the run.
const float* HubMatrix(const ColorSpace& space, Way way) {
    const ColorSpace& hub = ColorSpace::WorkingSpace(kWorkingSpaceRec709);
    static std::deque<CSMatrix> kept;
    kept.push_back(way == Way::kFromHub ? ColorSpace::CalculateConversionMatrix(hub, space)
                                        : ColorSpace::CalculateConversionMatrix(space, hub));
    return kept.back().m;
}

HubConversion PowerLawConversion(std::string name, std::shared_ptr<const ColorSpace> space, Way way,
                                 const PowerLaws& laws) {
    return {std::move(name),
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
    const auto strong = std::make_shared<GammaColorSpace>(3.0f);
    list.push_back(PowerLawConversion("HubToGamma3", strong, Way::kFromHub, {2.4f, 3.0f}));
    list.push_back(PowerLawConversion("Gamma3ToHub", strong, Way::kToHub, {1 / 3.0f, 0.41666666f}));
    // The matrix is the identity, so that nothing is clipped.
    list.push_back(PowerLawConversion("HubToGammaClipped", space, Way::kFromHub,
                                      {2.4f, 0.45f, nullptr, true, kLuma709}));
    list.push_back(PowerLawConversion("GammaToHubClipped", space, Way::kToHub,
                                      {1 / 0.45f, 0.41666666f, nullptr, true, kLuma709}));
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
    constexpr std::pair<const char*, PK_Illuminant> kWhites[] = {
        {"D50", kIlluminantD50}, {"D55", kIlluminantD55}, {"D60", kIlluminantD60},
        {"DCI", kIlluminantDCI}, {"D65", kIlluminantD65}, {"D75", kIlluminantD75}};
    for (const auto& [white, illuminant] : kWhites) {
        const auto space = std::make_shared<DCIP3ColorSpace>(illuminant);
        const float *from = HubMatrix(*space, Way::kFromHub), *to = HubMatrix(*space, Way::kToHub);
        const float* luma = space->LuminanceCoeffs();
        const std::string name = std::string("P3") + white;
        list.push_back(PowerLawConversion("HubTo" + name, space, Way::kFromHub, {2.4f, 0.38461539f, from}));
        list.push_back(PowerLawConversion("HubTo" + name + "Clipped", space, Way::kFromHub,
                                          {2.4f, 0.38461539f, from, true, luma}));
        list.push_back(PowerLawConversion(name + "ToHub", space, Way::kToHub, {2.6f, 0.41666666f, to}));
        list.push_back(PowerLawConversion(name + "ToHubClipped", space, Way::kToHub,
                                          {2.6f, 0.41666666f, to, true, kLuma709}));
    }
}

/// Every pixel by itself, however many there are.
void AddSRGB(std::vector<HubConversion>& list) {
    const auto space = std::make_shared<SRGBColorSpace>();
    for (const bool clip : {false, true}) {
        const auto from = [clip](const ColourPixel& pixel) { return SingleHubToSRGB(pixel, clip); };
        const auto to = [clip](const ColourPixel& pixel) { return SingleSRGBToHub(pixel, clip); };
        list.push_back({clip ? "HubToSRGBClipped" : "HubToSRGB", space, Way::kFromHub, clip, from, from});
        list.push_back({clip ? "SRGBToHubClipped" : "SRGBToHub", space, Way::kToHub, clip, to, to});
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
    AddSRGB(list);
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
    const auto run = [&](const float* from, float* to, int32_t count) {
        Convert(*conversion.space, conversion.way, from, to, count, conversion.gamutClip);
    };
    Random random(3);
    for (size_t count = 0; count <= 70; ++count) {
        Converted(MakePixels(Content::kWide, count, random), run);
        ASSERT_FALSE(HasFailure());
    }
}

TEST_P(HubConversions, CountsBelowOneTouchNothing) {
    const HubConversion& conversion = GetParam();
    for (const int32_t count : kNoCounts) {
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
