// Every body of the colour spaces' kernels that this processor runs, against the plain one and against a restatement of
// the steps, pixel by pixel.

#include "colour/ColourKernels.h"
#include "colour/DecodeTables.h"
#include "colour/FloatBodies.h"
#include "support/ColourPixels.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <ostream>
#include <random>

namespace PKTest {
namespace {

using namespace PK;
using reference::Rounding;

using reference::kFrom2020;
constexpr const float* kLuma = reference::kLuma709;
using reference::kTo2020;

/// Sums that leave the floats, cancel to nothing, and leave a channel at zero.
constexpr float kExtreme[9] = {3e38f, -3e38f, 3e38f, 1, -1, 0, 0, 0, -0.0f};
/// Leaves a channel of exactly 1 as it is, for the clip.
constexpr float kIdentity[9] = {1, 0, 0, 0, 1, 0, 0, 0, 1};

/// A kernel with its arguments, and the same restated.
struct KernelCase {
    const char* name;
    std::function<void(Target, const float*, float*, int32_t)> run;
    std::function<ColourPixel(const ColourPixel&, Rounding)> reference;
    int64_t units = 0; ///< that the restatement may be off by
};

std::ostream& operator<<(std::ostream& stream, const KernelCase& kernel) {
    return stream << kernel.name;
}

KernelCase GammaCase(const char* name, float in, float out, const float* matrix = nullptr,
                     bool clip = false) {
    const bool needMatrix = matrix != nullptr;
    const GammaConversion conversion = {needMatrix ? matrix : kTo2020,  in,         out,
                                        {kLuma[0], kLuma[1], kLuma[2]}, needMatrix, clip};
    const reference::PowerLaws laws = {in, out, matrix, clip, kLuma};
    return {name,
            [=](Target target, const float* source, float* destination, int32_t count) {
                KernelsFor<GammaKernels>(target).convert(source, destination, count, conversion);
            },
            [=](const ColourPixel& pixel, Rounding rounding) {
                return reference::BulkPowerLaws(pixel, laws, rounding);
            }};
}

KernelCase PQToHubCase(const char* name, const float* matrix) {
    return {name,
            [=](Target target, const float* source, float* destination, int32_t count) {
                KernelsFor<PQKernels>(target).toRec709(source, destination, count, {matrix, PQDecodeTable()});
            },
            [=](const ColourPixel& pixel, Rounding rounding) {
                return reference::BulkPQToHub(pixel, matrix, PQDecodeTable(), rounding);
            }};
}

KernelCase HubToPQCase(const char* name, const float* matrix, float outScale, int64_t units) {
    return {name,
            [=](Target target, const float* source, float* destination, int32_t count) {
                KernelsFor<PQKernels>(target).fromRec709(source, destination, count, {matrix, outScale});
            },
            [=](const ColourPixel& pixel, Rounding rounding) {
                return reference::BulkHubToPQ(pixel, matrix, outScale, rounding);
            },
            units};
}

KernelCase HLGToHubCase(const char* name, const float* matrix) {
    return {
        name,
        [=](Target target, const float* source, float* destination, int32_t count) {
            KernelsFor<HLGKernels>(target).toRec709(source, destination, count, {matrix, HLGDecodeTable()});
        },
        [=](const ColourPixel& pixel, Rounding rounding) {
            return reference::BulkHLGToHub(pixel, matrix, HLGDecodeTable(), rounding);
        }};
}

KernelCase HubToHLGCase(const char* name, const float* matrix) {
    return {name,
            [=](Target target, const float* source, float* destination, int32_t count) {
                KernelsFor<HLGKernels>(target).fromRec709(source, destination, count, {matrix});
            },
            [=](const ColourPixel& pixel, Rounding rounding) {
                return reference::BulkHubToHLG(pixel, matrix, rounding);
            }};
}

/// The power at the end of PQ is right to 0.501 units, so that it may be the neighbour of the right one; a factor behind
/// it makes that up to two units.
const KernelCase kKernelCases[] = {
    GammaCase("Gamma22", 2.4f, 1 / 2.2f),
    GammaCase("GammaSquare", 2, 0.5f),
    GammaCase("GammaSteep", 30, -7),
    GammaCase("GammaTo2020", 2.4f, 0.41666666f, kTo2020),
    GammaCase("GammaFrom2020", 2.4f, 0.41666666f, kFrom2020),
    GammaCase("GammaFrom2020Clipped", 2.4f, 0.41666666f, kFrom2020, true),
    GammaCase("GammaTo2020Clipped", 2.4f, 0.38461539f, kTo2020, true),
    GammaCase("GammaClipped", 2.4f, 0.41666666f, kIdentity, true),
    GammaCase("GammaExtreme", 2.6f, 0.41666666f, kExtreme),
    GammaCase("GammaExtremeClipped", 2.6f, 0.41666666f, kExtreme, true),
    PQToHubCase("PQToHub", kFrom2020),
    PQToHubCase("PQToHubExtreme", kExtreme),
    HubToPQCase("HubToPQ", kTo2020, 1, 1),
    HubToPQCase("HubToPQNormalised", kTo2020, 1.9682022f, 2),
    HubToPQCase("HubToPQExtreme", kExtreme, 1, 1),
    HLGToHubCase("HLGToHub", kFrom2020),
    HLGToHubCase("HLGToHubExtreme", kExtreme),
    HubToHLGCase("HubToHLG", kTo2020),
    HubToHLGCase("HubToHLGExtreme", kExtreme),
};

ColourPixels RunBody(const KernelCase& kernel, Target target, const ColourPixels& source) {
    ColourPixels result(source.size());
    kernel.run(target, Floats(source), Floats(result), static_cast<int32_t>(source.size()));
    return result;
}

class FloatKernelSweep : public testing::TestWithParam<KernelCase> {};

TEST_P(FloatKernelSweep, BodiesWithoutFusedArithmeticAgreeToTheBit) {
    const KernelCase& kernel = GetParam();
    Random random(1);
    for (const Content content : kAllContents) {
        const ColourPixels source = MakePixels(content, 20000, random);
        const ColourPixels plain = RunBody(kernel, Target::plain, source);
        for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
            if (RoundingOf(target) == Rounding::kFused) continue;
            const ColourPixels result = RunBody(kernel, target, source);
            if (Holds(result.data(), plain)) continue;
            FAIL() << TargetName(target) << ", " << ContentName(content) << ", seed " << random.Seed() << '\n'
                   << FirstDifference(source, plain, result);
        }
    }
}

TEST_P(FloatKernelSweep, BodiesDoTheStatedSteps) {
    const KernelCase& kernel = GetParam();
    Random random(2);
    for (const Content content : kAllContents) {
        const ColourPixels source = MakePixels(content, 8000, random);
        for (const Rounding rounding : {Rounding::kEach, Rounding::kFused}) {
            ColourPixels expected;
            for (const ColourPixel& pixel : source) expected.push_back(kernel.reference(pixel, rounding));
            for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
                if (RoundingOf(target) != rounding) continue;
                const ColourPixels actual = RunBody(kernel, target, source);
                ASSERT_EQ(FirstDifference(source, expected, actual, kernel.units), "")
                    << TargetName(target) << ", " << ContentName(content) << ", seed " << random.Seed();
            }
        }
    }
}

TEST_P(FloatKernelSweep, NoPixelDependsOnItsPlace) {
    const KernelCase& kernel = GetParam();
    Random random(3);
    ColourPixels source;
    for (const Content content : kAllContents)
        for (const ColourPixel& pixel : MakePixels(content, 64, random)) source.push_back(pixel);
    std::shuffle(source.begin(), source.end(), std::mt19937_64(random.Seed()));
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
        const ColourPixels result = RunBody(kernel, target, source);
        for (ptrdiff_t shift = 1; shift < 8; ++shift) {
            ColourPixels rotated = source, expected = result;
            std::rotate(rotated.begin(), rotated.begin() + shift, rotated.end());
            std::rotate(expected.begin(), expected.begin() + shift, expected.end());
            const ColourPixels actual = RunBody(kernel, target, rotated);
            ASSERT_TRUE(Holds(actual.data(), expected))
                << TargetName(target) << ", moved by " << shift << ", seed " << random.Seed() << '\n'
                << FirstDifference(rotated, expected, actual);
        }
    }
}

INSTANTIATE_TEST_SUITE_P(, FloatKernelSweep, testing::ValuesIn(kKernelCases),
                         [](const auto& test) { return test.param.name; });

} // namespace
} // namespace PKTest
