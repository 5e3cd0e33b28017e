// The kernels that lay one row over another, against the rules written out, and by values worked out by hand.

#include "composite/OverKernels.h"

#include "reference/ReferenceOver.h"
#include "support/FloatEnvironment.h"
#include "support/Random.h"
#include "support/RowBuffer.h"
#include "support/Samples.h"
#include "support/Targets.h"
#include "support/Walk.h"

#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <vector>

namespace {

using namespace PKTest;
using reference::OverRule;
using Kernels = PK::OverKernels;

struct Member {
    const char* name;
    Kernels::Over Kernels::*kernel;
    OverRule rule;
};

constexpr Member kCodes[] = {
    {"straight AA", &Kernels::straight8u_AA, {true, false, false, false}},
    {"straight AX", &Kernels::straight8u_AX, {true, false, false, true}},
    {"straight XA", &Kernels::straight8u_XA, {true, false, true, false}},
    {"straight XX", &Kernels::straight8u_XX, {true, false, true, true}},
    {"premultiplied AA", &Kernels::premultiplied8u_AA, {false, false, false, false}},
    {"premultiplied AX", &Kernels::premultiplied8u_AX, {false, false, false, true}},
    {"premultiplied XA", &Kernels::premultiplied8u_XA, {false, false, true, false}},
    {"premultiplied XX", &Kernels::premultiplied8u_XX, {false, false, true, true}},
    {"premultiplied YUV AA", &Kernels::premultipliedYUV8u_AA, {false, true, false, false}},
    {"premultiplied YUV AX", &Kernels::premultipliedYUV8u_AX, {false, true, false, true}},
    {"premultiplied YUV XA", &Kernels::premultipliedYUV8u_XA, {false, true, true, false}},
    {"premultiplied YUV XX", &Kernels::premultipliedYUV8u_XX, {false, true, true, true}},
};
constexpr Member kFloats[] = {
    {"straight AA", &Kernels::straight32f_AA, {true, false, false, false}},
    {"straight AX", &Kernels::straight32f_AX, {true, false, false, true}},
    {"straight XA", &Kernels::straight32f_XA, {true, false, true, false}},
    {"straight XX", &Kernels::straight32f_XX, {true, false, true, true}},
    {"premultiplied AA", &Kernels::premultiplied32f_AA, {false, false, false, false}},
    {"premultiplied AX", &Kernels::premultiplied32f_AX, {false, false, false, true}},
    {"premultiplied XA", &Kernels::premultiplied32f_XA, {false, false, true, false}},
    {"premultiplied XX", &Kernels::premultiplied32f_XX, {false, false, true, true}},
};

/// Opacities at both thresholds and between; the greatest that is not full is 1 with 8e-6 more.
constexpr float kOpacities[] = {8e-6f,     9e-6f,     0.25f,          0.5f,       0.7f, 0.99f,
                                0.999985f, 0.999991f, 0x1.fffef4p-1f, 0.9999925f, 1,    1.5f};

class OverBodies : public TargetTest {
protected:
    static Kernels::Over Body(const Member& member) {
        return PK::KernelsFor<Kernels>(GetParam()).*member.kernel;
    }
    bool ByFours() const { return GetParam() != PK::Target::plain; }

    Random fRandom{1001};
};

/// Alphas in runs of clear, of opaque and of any value, so that fours agree and do not.
void DrawAlphas(std::vector<uint8_t>& row, Random& random) {
    for (size_t at = 0; at < row.size();) {
        const uint32_t kind = random.Below(4);
        for (size_t end = std::min(row.size(), at + 4 * (1 + random.Below(9))); at < end; at += 4)
            row[at + 3] = kind == 0 ? 0
                          : kind == 1
                              ? 255
                              : static_cast<uint8_t>(random.Below(3) ? random.Next() : random.Below(3));
    }
}

} // namespace

INSTANTIATE_TEST_SUITE_P(Targets, OverBodies, EveryTarget(), TargetOf);

TEST_P(OverBodies, FollowTheRuleForCodesAtEveryPlaceOfARow) {
    for (const Member& member : kCodes)
        for (int round = 0; round < 160; ++round) {
            const auto width = static_cast<int32_t>(fRandom.Below(70));
            const auto bytes = static_cast<size_t>(width) * 4;
            std::vector<uint8_t> top = fRandom.Bytes(bytes), back = fRandom.Bytes(bytes);
            DrawAlphas(top, fRandom);
            DrawAlphas(back, fRandom);
            const auto offset = static_cast<int>(fRandom.Below(3) ? 4 * fRandom.Below(4) : fRandom.Below(16));
            const RowBuffer expected(bytes, {Placement::kAtOffset, offset}),
                actual(bytes, {Placement::kAtOffset, offset});
            const float opacity = kOpacities[fRandom.Below(std::size(kOpacities))];
            reference::Over8u(member.rule, ByFours(), top.data(), back.data(), expected.Data(), width,
                              opacity);
            Body(member)(top.data(), back.data(), actual.Data(), width, opacity);
            ASSERT_EQ(std::vector<uint8_t>(expected.Data(), expected.Data() + bytes),
                      std::vector<uint8_t>(actual.Data(), actual.Data() + bytes))
                << member.name << ", opacity " << opacity << ", width " << width << ", offset " << offset
                << ", seed " << fRandom.Seed();
            ASSERT_TRUE(actual.MarginsIntact());
        }
}

// A row for each pair of codes, under every alpha of the top.
TEST_P(OverBodies, FollowTheRuleForEveryAlphaOverEveryAlpha) {
    std::vector<uint8_t> top(65536 * 4), back(top.size()), expected(top.size()), actual(top.size());
    fRandom.Fill(top.data(), top.size());
    fRandom.Fill(back.data(), back.size());
    for (size_t i = 0; i < 65536; ++i) {
        top[4 * i + 3] = static_cast<uint8_t>(i);
        back[4 * i + 3] = static_cast<uint8_t>(i >> 8);
    }
    for (const Member& member : kCodes)
        for (const float opacity : {0.4f, 1.0f}) {
            reference::Over8u(member.rule, ByFours(), top.data(), back.data(), expected.data(), 65536,
                              opacity);
            Body(member)(top.data(), back.data(), actual.data(), 65536, opacity);
            ASSERT_EQ(reinterpret_cast<uintptr_t>(expected.data()) % 16, 0u);
            ASSERT_EQ(reinterpret_cast<uintptr_t>(actual.data()) % 16, 0u);
            ASSERT_EQ(expected, actual) << member.name << ", opacity " << opacity;
        }
}

// At full opacity the kernel computes in integers what the rule has in floats.
TEST_P(OverBodies, FollowTheRuleForEveryCodeOverEveryCodeAtFullOpacity) {
    std::vector<uint8_t> top(65536 * 4), back(top.size(), 255), expected(top.size()), actual(top.size());
    const Member& member = kCodes[4];
    Walk walk;
    for (size_t code = 0; code < 256; ++code) {
        if (walk.LeavesOut()) continue;
        for (size_t i = 0; i < 65536; ++i) {
            std::fill_n(&top[4 * i], 3, static_cast<uint8_t>(code));
            top[4 * i + 3] = static_cast<uint8_t>(i);
            std::fill_n(&back[4 * i], 3, static_cast<uint8_t>(i >> 8));
        }
        reference::Over8u(member.rule, ByFours(), top.data(), back.data(), expected.data(), 65536, 1);
        Body(member)(top.data(), back.data(), actual.data(), 65536, 1);
        ASSERT_EQ(expected, actual) << "top " << code;
    }
}

TEST_P(OverBodies, RoundCodesByTheModeOfTheCaller) {
    std::vector<uint8_t> top = fRandom.Bytes(4 * 4096), back = fRandom.Bytes(4 * 4096), expected(top.size()),
                         actual(top.size());
    for (const uint32_t mode : {kRoundDown, kRoundUp, kRoundToZero})
        for (const Member& member : kCodes) {
            const FloatEnvironment environment(mode);
            reference::Over8u(member.rule, ByFours(), top.data(), back.data(), expected.data(), 4096, 0.3f);
            Body(member)(top.data(), back.data(), actual.data(), 4096, 0.3f);
            ASSERT_EQ(expected, actual) << member.name;
        }
}

TEST_P(OverBodies, FollowTheRuleForFloatsToTheBit) {
    constexpr int32_t kWidth = 4099;
    constexpr size_t kBytes = kWidth * 16;
    const PK_PixelFormat format = PK_PixelFormat_BGRA_4444_32f;
    std::vector<float> top(kWidth * 4), back(top.size()), expected(top.size()), actual(top.size());
    for (const Member& member : kFloats)
        for (const float opacity : kOpacities)
            for (const bool isOrdinary : {false, true}) {
                auto* const topBytes = reinterpret_cast<uint8_t*>(top.data());
                auto* const backBytes = reinterpret_cast<uint8_t*>(back.data());
                if (isOrdinary) {
                    FillOrdinarySamples(format, topBytes, kBytes, fRandom);
                    FillOrdinarySamples(format, backBytes, kBytes, fRandom);
                } else {
                    FillSamples(format, topBytes, kBytes, fRandom);
                    FillSamples(format, backBytes, kBytes, fRandom);
                }
                constexpr float kAlphas[] = {0, -0.0f, 1, 7.9e-6f, 8.1e-6f, 0.999993f, 0.99999f, 0.5f};
                for (size_t i = 3; i < top.size(); i += 4) {
                    if (fRandom.Below(2)) top[i] = kAlphas[fRandom.Below(8)];
                    if (fRandom.Below(2)) back[i] = kAlphas[fRandom.Below(8)];
                }
                reference::Over32f(member.rule, top.data(), back.data(), expected.data(), kWidth, opacity);
                Body(member)(top.data(), back.data(), actual.data(), kWidth, opacity);
                ASSERT_EQ("", FirstDifference(format, kBytes, reinterpret_cast<uint8_t*>(expected.data()),
                                              reinterpret_cast<uint8_t*>(actual.data())))
                    << member.name << ", opacity " << opacity << ", seed " << fRandom.Seed();
            }
}

// What no number comes of stays within its pixel.
TEST_P(OverBodies, KeepNotANumbersWithinTheirPixel) {
    const float nan = std::numeric_limits<float>::quiet_NaN(),
                infinity = std::numeric_limits<float>::infinity();
    for (const Member& member : kFloats)
        for (const float odd : {nan, infinity, -infinity})
            for (size_t place = 0; place < 32; ++place) {
                std::vector<float> top(37 * 4, 0.5f), back(37 * 4, 0.25f), result(37 * 4);
                top[place] = back[64 + place] = odd;
                Body(member)(top.data(), back.data(), result.data(), 37, 0.5f);
                for (size_t i = 0; i < result.size(); ++i)
                    if (i / 4 != place / 4 && i / 4 != (64 + place) / 4) {
                        ASSERT_TRUE(std::isfinite(result[i])) << member.name << ", sample " << i;
                    }
            }
}

// Hosts may have all floating-point exceptions but those of rounding unmasked.
TEST_P(OverBodies, DivideByNothing) {
    const std::vector<uint8_t> top = {9, 9, 9, 0, 8, 8, 8, 0, 7, 7, 7, 255, 6, 6, 6, 1},
                               back = {5, 5, 5, 0, 4, 4, 4, 0, 3, 3, 3, 0, 2, 2, 2, 0};
    std::vector<float> floats(16), results(16);
    std::vector<uint8_t> result(16);
    for (size_t i = 0; i < 16; ++i) floats[i] = static_cast<float>(top[i]) / 255;
    const uint32_t saved = _mm_getcsr();
    _mm_setcsr(0x1f80 & ~0x0680u); // invalid, division by zero, overflow
    for (const Member& member : kCodes) Body(member)(top.data(), back.data(), result.data(), 4, 0.5f);
    for (const Member& member : kFloats) Body(member)(floats.data(), floats.data(), results.data(), 4, 0.5f);
    const uint32_t flags = _mm_getcsr() & 0x0d;
    _mm_setcsr(saved);
    EXPECT_EQ(flags, 0u);
}

TEST_P(OverBodies, WorkInPlaceOfEitherRow) {
    for (const Member& member : kCodes) {
        const std::vector<uint8_t> top = fRandom.Bytes(4 * 61), back = fRandom.Bytes(4 * 61);
        std::vector<uint8_t> expected(top.size()), inTop = top, inBack = back;
        Body(member)(top.data(), back.data(), expected.data(), 61, 0.6f);
        Body(member)(inTop.data(), back.data(), inTop.data(), 61, 0.6f);
        Body(member)(top.data(), inBack.data(), inBack.data(), 61, 0.6f);
        EXPECT_EQ(inTop, expected) << member.name;
        EXPECT_EQ(inBack, expected) << member.name;
    }
}
