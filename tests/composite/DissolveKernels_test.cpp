// The kernels of PK_CrossDissolve against a restatement pixel by pixel, and rules of theirs that no image shows.

#include "composite/DissolveKernels.h"
#include "reference/ReferenceDissolve.h"
#include "support/FloatEnvironment.h"
#include "support/Samples.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <cstring>
#include <limits>
#include <vector>

using namespace PKTest;

namespace {

using PK::DissolveKernels;

struct Case {
    DissolveKernels::Mix DissolveKernels::*kernel;
    DissolveRule rule;
    SampleDepth depth;
    bool alphaFirst = false;
};

constexpr Case kCases[] = {
    {&DissolveKernels::opaque8u, DissolveRule::kOpaque, SampleDepth::k8u},
    {&DissolveKernels::opaque15u, DissolveRule::kOpaque, SampleDepth::k15u},
    {&DissolveKernels::opaque32f, DissolveRule::kOpaque, SampleDepth::k32f},
    {&DissolveKernels::opaqueAlphaFirst8u, DissolveRule::kOpaque, SampleDepth::k8u, true},
    {&DissolveKernels::opaqueAlphaFirst15u, DissolveRule::kOpaque, SampleDepth::k15u, true},
    {&DissolveKernels::opaqueAlphaFirst32f, DissolveRule::kOpaque, SampleDepth::k32f, true},
    {&DissolveKernels::straight8u, DissolveRule::kStraight, SampleDepth::k8u},
    {&DissolveKernels::straight15u, DissolveRule::kStraight, SampleDepth::k15u},
    {&DissolveKernels::straight32f, DissolveRule::kStraight, SampleDepth::k32f},
    {&DissolveKernels::premultiplied8u, DissolveRule::kPremultiplied, SampleDepth::k8u},
    {&DissolveKernels::premultiplied15u, DissolveRule::kPremultiplied, SampleDepth::k15u},
    {&DissolveKernels::premultiplied32f, DissolveRule::kPremultiplied, SampleDepth::k32f},
};

constexpr float kWeights[] = {0, 7e-6f, 8e-6f, 0.1f, 0.31f, 0.5f, 0.7071f, 0.99999f, 1};

PK::Samples SamplesOf(SampleDepth depth) {
    return depth == SampleDepth::k8u    ? PK::Samples::Bytes
           : depth == SampleDepth::k15u ? PK::Samples::Words
                                        : PK::Samples::Floats;
}

class DissolveBodies : public TargetTest {
protected:
    const DissolveKernels& fKernels = PK::KernelsFor<DissolveKernels>(GetParam());
    Random fRandom{4401};

    /// Rows of any samples, in which alphas that are 0 or equal are as frequent as others.
    void FillPixels(const Case& c, std::vector<uint8_t>& first, std::vector<uint8_t>& second) {
        FillSamples(SamplesOf(c.depth), first.data(), first.size(), fRandom);
        FillSamples(SamplesOf(c.depth), second.data(), second.size(), fRandom);
        const size_t sample = static_cast<size_t>(c.depth), pixel = 4 * sample;
        const size_t alpha = c.alphaFirst ? 0 : 3 * sample;
        // Groups without a transparent pixel, and some where all are alike, take paths of their own.
        const uint32_t kinds = 1 + fRandom.Below(4);
        for (size_t at = alpha; at < first.size(); at += pixel) {
            const uint32_t kind = fRandom.Below(kinds);
            if (kind == 0) std::memcpy(&second[at], &first[at], sample);
            if (kind == 1) std::memset(&second[at], 0, sample);
            if (kind == 2) std::memset(&first[at], 0, sample);
        }
    }
};

TEST_P(DissolveBodies, GiveWhatTheFormulaGives) {
    constexpr size_t kPixels = 211;
    for (const Case& c : kCases)
        for (const uint32_t mode : {0u, kRoundDown, kRoundUp, kFlushToZero})
            for (const float weight : kWeights) {
                const size_t bytes = kPixels * 4 * static_cast<size_t>(c.depth);
                std::vector<uint8_t> first(bytes), second(bytes), out(bytes), expected(bytes);
                FillPixels(c, first, second);
                const FloatEnvironment environment(mode | kExceptionFlags);
                ReferenceDissolveRow(c.rule, c.depth, c.alphaFirst, first.data(), second.data(),
                                     expected.data(), kPixels, weight);
                (fKernels.*c.kernel)(first.data(), second.data(), out.data(), kPixels, weight);
                ASSERT_TRUE(environment.IsAsGiven());
                ASSERT_EQ("", FirstDifference(SamplesOf(c.depth), bytes, expected.data(), out.data()))
                    << "kernel " << &c - kCases << ", weight " << weight << ", mode " << std::hex << mode
                    << ", seed " << fRandom.Seed();
            }
}

TEST_P(DissolveBodies, MixV210SampleBySample) {
    for (const uint32_t mode : {0u, kRoundDown, kRoundUp})
        for (const float weight : kWeights) {
            std::vector<uint32_t> first(4 * 13), second(first.size()), out(first.size()), expected;
            fRandom.Fill(reinterpret_cast<uint8_t*>(first.data()), 4 * first.size());
            fRandom.Fill(reinterpret_cast<uint8_t*>(second.data()), 4 * second.size());
            first[0] = second[0] = 0x3fffffff;
            const FloatEnvironment environment(mode | kExceptionFlags);
            for (size_t i = 0; i < first.size(); ++i)
                expected.push_back(ReferenceDissolveV210(first[i], second[i], weight));
            fKernels.v210(first.data(), second.data(), out.data(), 6 * 13, weight);
            ASSERT_EQ(out, expected) << weight << ", mode " << std::hex << mode;
        }
}

TEST_P(DissolveBodies, WorkInPlaceOfEitherRow) {
    for (const Case& c : kCases) {
        constexpr size_t kPixels = 61;
        const size_t bytes = kPixels * 4 * static_cast<size_t>(c.depth);
        std::vector<uint8_t> first(bytes), second(bytes), expected(bytes);
        FillPixels(c, first, second);
        const DissolveKernels::Mix mix = fKernels.*c.kernel;
        mix(first.data(), second.data(), expected.data(), kPixels, 0.3f);
        std::vector<uint8_t> inFirst = first, inSecond = second;
        mix(inFirst.data(), second.data(), inFirst.data(), kPixels, 0.3f);
        mix(first.data(), inSecond.data(), inSecond.data(), kPixels, 0.3f);
        EXPECT_EQ(inFirst, expected) << &c - kCases;
        EXPECT_EQ(inSecond, expected) << &c - kCases;
    }
}

// A host that stops at a division by zero must not be stopped by transparent pixels.
TEST_P(DissolveBodies, DivideNothingByZero) {
    for (const Case& c : kCases) {
        constexpr size_t kPixels = 33;
        const size_t bytes = kPixels * 4 * static_cast<size_t>(c.depth);
        const std::vector<uint8_t> clear(bytes);
        std::vector<uint8_t> out(bytes), opaque(bytes);
        const float one = 1;
        for (size_t at = 3 * sizeof one; at + 4 <= bytes; at += 8 * sizeof one)
            std::memcpy(&opaque[at], &one, sizeof one);
        const FloatEnvironment environment(0);
        (fKernels.*c.kernel)(clear.data(), clear.data(), out.data(), kPixels, 0.3f);
        (fKernels.*c.kernel)(opaque.data(), clear.data(), out.data(), kPixels, 0.3f);
        (fKernels.*c.kernel)(clear.data(), opaque.data(), out.data(), kPixels, 0.3f);
        EXPECT_EQ(_mm_getcsr() & _MM_EXCEPT_DIV_ZERO, 0u) << &c - kCases;
    }
}

TEST_P(DissolveBodies, KeepNotANumberToItsPixel) {
    constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    for (const auto kernel : {fKernels.opaque32f, fKernels.straight32f, fKernels.premultiplied32f})
        for (const float odd : {kNaN, kInfinity, -kInfinity})
            for (size_t place = 0; place < 4 * 19; ++place) {
                std::vector<float> first(4 * 19, 0.5f), second(first.size(), 0.25f), plain(first.size()),
                    out(first.size());
                kernel(first.data(), second.data(), plain.data(), 19, 0.5f);
                first[place] = odd;
                kernel(first.data(), second.data(), out.data(), 19, 0.5f);
                for (size_t i = 0; i < out.size(); ++i)
                    if (i / 4 != place / 4) {
                        ASSERT_EQ(out[i], plain[i]) << i << ", odd at " << place;
                    }
            }
}

INSTANTIATE_TEST_SUITE_P(Targets, DissolveBodies, EveryTarget(), TargetOf);

} // namespace
