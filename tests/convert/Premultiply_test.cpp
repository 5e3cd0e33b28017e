// Premultiplication by alpha and its inverse, by hand.

#include "support/FloatEnvironment.h"
#include "support/KernelRows.h"

#include <bit>

namespace {

using namespace PKTest;
using enum PK::Kernel;

TEST(Premultiply, BytesRoundToTheNearest) {
    // 200 x 128 / 255 is 100.39, 1 x 128 / 255 is 0.502
    ExpectRow(PremultiplyRow_BGRA_8u, 1, Bytes{200, 255, 1, 128}, Bytes{100, 128, 1, 128});
    ExpectRow(PremultiplyRow_ARGB_8u, 1, Bytes{128, 200, 255, 1}, Bytes{128, 100, 128, 1});
    ExpectRow(PremultiplyRow_ARGB_8u, 2, Bytes{0, 9, 8, 7, 255, 9, 8, 7}, Bytes{0, 0, 0, 0, 255, 9, 8, 7});
}

TEST(Premultiply, ChromaAndLumaMoveAboutTheirZero) {
    // 112 x 0.50196 + 128 = 184.2, -112 x 0.50196 + 128 = 71.8, 219 x 0.50196 + 16 = 125.9
    ExpectRow(PremultiplyRow_VUYA_8u, 2, Bytes{240, 16, 235, 128, 7, 8, 9, 0},
              Bytes{184, 72, 126, 128, 128, 128, 16, 0});
}

TEST(Premultiply, WordsRoundHalvesToEven) {
    ExpectRow(PremultiplyRow_BGRA_15u, 2, Words{1, 3, 32768, 16384, 65535, 0, 2, 65535},
              Words{0, 2, 16384, 16384, 32768, 0, 4, 65535});
}

TEST(Premultiply, Floats) {
    ExpectRow(PremultiplyRow_BGRA_32f, 1, Floats{-0.5f, 0.25f, 3, 0.5f}, Floats{-0.25f, 0.125f, 1.5f, 0.5f});
    ExpectRow(PremultiplyRow_ARGB_32f, 1, Floats{0.5f, 1, 2, 3}, Floats{0.5f, 0.5f, 1, 1.5f});
}

TEST(Premultiply, BytesExpandedOnTheWay) {
    ExpectRow(BGRA8uToBGRP32fRow, 1, Bytes{255, 0, 51, 128}, Floats{0.50196078f, 0, 0.10039216f, 0.50196078f},
              Rule::kBoth, 1e-7f);
    ExpectRow(VUYA8uToVUYP32fRow, 1, Bytes{240, 128, 235, 51}, Floats{0.1f, 0, 0.2f, 0.2f}, Rule::kBoth,
              1e-7f);
}

TEST(Unpremultiply, BytesRoundToTheNearestAndAlphaZeroClearsAll) {
    // 255 / 128 x 100 is 199.2; 255 / 170 is 1.5, so that 1 and 3 fall on halves
    ExpectRow(UnpremultiplyRow_BGRA_8u, 3, Bytes{100, 200, 128, 128, 1, 3, 170, 170, 9, 8, 7, 0},
              Bytes{199, 255, 255, 128, 2, 4, 255, 170, 0, 0, 0, 0});
    ExpectRow(UnpremultiplyRow_ARGB_8u, 1, Bytes{170, 1, 3, 4}, Bytes{170, 2, 4, 6});
    // 56 x 1.9921875 + 128 = 239.6, -56 x 1.9921875 + 128 = 16.4, 110 x 1.9921875 + 16 = 235.1
    ExpectRow(UnpremultiplyRow_VUYA_8u, 2, Bytes{184, 72, 126, 128, 200, 3, 90, 0},
              Bytes{240, 16, 235, 128, 0, 0, 0, 0});
}

TEST(Unpremultiply, WordsAreLimitedToFullScale) {
    // 32768 / 3 is 10922.67
    ExpectRow(UnpremultiplyRow_BGRA_15u, 3, Words{1, 2, 4, 3, 3, 20000, 8, 16384, 5, 6, 7, 0},
              Words{10923, 21845, 32768, 3, 6, 32768, 16, 16384, 0, 0, 0, 0});
    ExpectRow(UnpremultiplyRow_ARGB_15u, 1, Words{16384, 3, 4, 5}, Words{16384, 6, 8, 10});
}

TEST(Unpremultiply, FloatsTakeTheReciprocalEstimateUnlessAlphaIsAsGoodAsZero) {
    constexpr float kBound = 1.5f / 4096; // of the estimate's relative error
    ExpectRow(UnpremultiplyRow_BGRA_32f, 1, Floats{0.25f, -0.5f, 1, 0.5f}, Floats{0.5f, -1, 2, 0.5f},
              Rule::kBoth, 2 * kBound);
    ExpectRow(UnpremultiplyRow_BGRA_32f, 2, Floats{1, 2, 3, 7.9e-6f, 1, 2, 3, -1}, Floats(8, 0.0f));
    ExpectRow(UnpremultiplyRow_BGRA_32f, 1, Floats{8e-6f, 0, 0, 8e-6f}, Floats{1, 0, 0, 8e-6f}, Rule::kBoth,
              kBound);
}

// 8e-6 is 0x370637bd. The estimate of a reciprocal is far from 0, whatever its last bits are.
TEST(Unpremultiply, FloatAlphaCountsAsZeroBelowTheThresholdToTheBit) {
    const float least = std::bit_cast<float>(0x370637bdu);
    for (const uint32_t bits : {0x370637bbu, 0x370637bcu, 0x370637bdu, 0x370637beu, 0x370637bfu}) {
        const auto alpha = std::bit_cast<float>(bits);
        const bool counts = alpha >= least;
        for (size_t place = 0; place < 4; ++place) { // whatever its neighbours are
            Floats last(16, 1), first(16, 1);
            last[4 * place + 3] = first[4 * place] = alpha;
            for (const PK::Target target : TargetsWithBody(UnpremultiplyRow_BGRA_32f)) {
                Floats result(16);
                PK::Body(UnpremultiplyRow_BGRA_32f, target)(last.data(), result.data(), 4);
                EXPECT_EQ(result[4 * place + 3], counts ? alpha : 0) << PK::TargetName(target) << alpha;
                EXPECT_EQ(result[4 * place] > 1e5f, counts) << PK::TargetName(target) << alpha;
                PK::Body(UnpremultiplyRow_ARGB_32f, target)(first.data(), result.data(), 4);
                EXPECT_EQ(result[4 * place], counts ? alpha : 0) << PK::TargetName(target) << alpha;
                EXPECT_EQ(result[4 * place + 3] > 1e5f, counts) << PK::TargetName(target) << alpha;
            }
        }
    }
}

/// Every code under every alpha, which comes last.
Bytes EveryCodeUnderEveryAlpha() {
    Bytes row;
    for (unsigned alpha = 0; alpha < 256; ++alpha)
        for (unsigned code = 0; code < 256; ++code)
            row.insert(row.end(), {static_cast<uint8_t>(code), static_cast<uint8_t>(255 - code),
                                   static_cast<uint8_t>(code + 85), static_cast<uint8_t>(alpha)});
    return row;
}

constexpr uint32_t kRoundingModes[] = {0, kRoundDown, kRoundUp, kRoundToZero};

TEST(Premultiply, EveryCodeUnderEveryAlpha) {
    const Bytes row = EveryCodeUnderEveryAlpha(), alphaFirst(row.rbegin(), row.rend());
    for (const PK::Kernel kernel : {PremultiplyRow_BGRA_8u, PremultiplyRow_VUYA_8u})
        ExpectReference(kernel, row);
    ExpectReference(PremultiplyRow_ARGB_8u, alphaFirst);
    for (const uint32_t mode : kRoundingModes) {
        SCOPED_TRACE(testing::Message() << "MXCSR bits " << mode);
        const FloatEnvironment environment(mode);
        for (const PK::Kernel kernel :
             {UnpremultiplyRow_BGRA_8u, UnpremultiplyRow_VUYA_8u, BGRA8uToBGRP32fRow, VUYA8uToVUYP32fRow})
            ExpectReference(kernel, row);
        ExpectReference(UnpremultiplyRow_ARGB_8u, alphaFirst);
    }
}

TEST(Premultiply, BytesRoundToTheNearestInEveryRoundingMode) {
    const Bytes row = EveryCodeUnderEveryAlpha();
    for (const PK::Kernel kernel : {PremultiplyRow_BGRA_8u, PremultiplyRow_ARGB_8u, PremultiplyRow_VUYA_8u})
        ForEachBody(kernel, [&](PK::Target, PK::RowKernel body) {
            Bytes expected(row.size()), actual(row.size());
            body(row.data(), expected.data(), 65536);
            for (const uint32_t mode : kRoundingModes) {
                const FloatEnvironment environment(mode);
                body(row.data(), actual.data(), 65536);
                ASSERT_EQ(actual, expected) << "MXCSR bits " << mode;
            }
        });
}

// 32768 / a is a quotient that is rounded, and so is its product: every alpha, and colours at the ends and about them.
TEST(Unpremultiply, WordsUnderEveryAlphaInEveryRoundingMode) {
    Words row;
    for (unsigned alpha = 0; alpha < 65536; ++alpha)
        row.insert(row.end(), {static_cast<uint16_t>(alpha - 1), static_cast<uint16_t>(alpha / 2),
                               static_cast<uint16_t>(alpha * 40503u >> 3), static_cast<uint16_t>(alpha)});
    const Words alphaFirst(row.rbegin(), row.rend());
    for (const uint32_t mode : kRoundingModes) {
        SCOPED_TRACE(testing::Message() << "MXCSR bits " << mode);
        const FloatEnvironment environment(mode);
        for (const PK::Kernel kernel : {PremultiplyRow_BGRA_15u, UnpremultiplyRow_BGRA_15u})
            ExpectReference(kernel, row);
        for (const PK::Kernel kernel : {PremultiplyRow_ARGB_15u, UnpremultiplyRow_ARGB_15u})
            ExpectReference(kernel, alphaFirst);
    }
}

} // namespace
