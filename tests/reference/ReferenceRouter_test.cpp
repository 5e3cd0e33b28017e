// Every pair of raster formats has a way, and the lengths of the ways are the known ones.
#include "ReferenceRouter.h"

#include <array>
#include <set>

#include <gtest/gtest.h>

#include "ReferenceFormats.h"

namespace {

using namespace reference;

// How many ordered pairs take 1, 2, ... 8 kernels; entry 0 counts the pairs without a way.
std::array<int, 9> CountByLength(bool sse2) {
    std::array<int, 9> counts{};
    for (const uint32_t source : kRasterFormats) {
        for (const uint32_t destination : kRasterFormats) {
            ++counts[Chain(source, destination, 3, sse2).size()];
        }
    }
    return counts;
}

std::vector<std::string> KernelNames(uint32_t source, uint32_t destination) {
    std::vector<std::string> names;
    for (const Step& step : Chain(source, destination, 3, true)) names.push_back(step.kernel);
    return names;
}

using Names = std::vector<std::string>;

TEST(ReferenceRouter, AllPairsHaveAWay) {
    EXPECT_EQ(CountByLength(true), (std::array<int, 9>{0, 329, 484, 572, 458, 240, 97, 27, 2}));
    EXPECT_EQ(CountByLength(false), (std::array<int, 9>{0, 327, 486, 572, 458, 240, 97, 27, 2}));
}

TEST(ReferenceRouter, NoWayVisitsAFormatTwice) {
    for (const bool sse2 : {false, true}) {
        for (const uint32_t source : kRasterFormats) {
            for (const uint32_t destination : kRasterFormats) {
                if (source == destination) continue;
                std::set<uint32_t> visited = {source};
                for (const Step& step : Chain(source, destination, 3, sse2)) {
                    EXPECT_TRUE(visited.insert(step.next).second)
                        << std::hex << source << " to " << destination;
                }
            }
        }
    }
}

TEST(ReferenceRouter, EveryStepEndsInARasterFormat) {
    const std::set<uint32_t> known(kRasterFormats.begin(), kRasterFormats.end());
    EXPECT_EQ(known.size(), 47u);
    for (const uint32_t source : kRasterFormats) {
        for (const uint32_t destination : kRasterFormats) {
            for (const Step& step : Chain(source, destination, 3, true)) EXPECT_TRUE(known.count(step.next));
        }
    }
}

TEST(ReferenceRouter, EqualFormatsAreCopied) {
    for (const uint32_t format : kRasterFormats) EXPECT_EQ(KernelNames(format, format), Names{"CopyRow"});
}

TEST(ReferenceRouter, KnownWays) {
    EXPECT_EQ(KernelNames(kARGB_4444_8u, kVUYA_4444_8u), (Names{"SwapOrderRow", "RGBToYUV601Row"}));
    EXPECT_EQ(KernelNames(kBGRA_4444_8u, kUYVY_422_8u),
              (Names{"RGBToYUV601Row", "PremultiplyRow", "Downsample444To422Row"}));
    EXPECT_EQ(KernelNames(kBGRA_4444_15u, kRGB_444_10u), (Names{"UnpremultiplyRow", "BGR15uToRGB10uRow"}));
    EXPECT_EQ(KernelNames(kYUYV_422_32f, kVUYA_4444_32f),
              (Names{"SwapOrderRow", "Upsample422To444Float32Row"}));
    EXPECT_EQ(KernelNames(kBGRA_4444_8u, kBGRX_4444_8u), (Names{"PremultiplyRow", "ForceOpaqueRow"}));
    EXPECT_EQ(KernelNames(kBGRP_4444_8u, kBGRX_4444_8u), Names{"ForceOpaqueRow"});
    EXPECT_EQ(KernelNames(kV210_422_10u_709, kUYVY_422_8u), (Names{"V210ToUYVY8uRow", "UYVY709To601Row"}));
}

TEST(ReferenceRouter, TenBitRGBIsReachedThroughFloat) {
    const auto chain = Chain(kBGRA_4444_8u, kRGB_444_10u, 3, true);
    ASSERT_EQ(chain.size(), 3u);
    EXPECT_EQ(chain[0].next, kBGRA_4444_32f);
    EXPECT_EQ(chain[1].next, kBGRP_4444_32f);
    EXPECT_EQ(chain[2].kernel, "BGR32fToRGB10uRow");
}

TEST(ReferenceRouter, DirectKernelNeedsSSE2) {
    EXPECT_EQ(Chain(kVUYX_4444_8u, kBGRA_4444_8u, 3, true)[0].kernel, "VUYX8uToBGR8uRow");
    EXPECT_EQ(Chain(kVUYX_4444_8u, kBGRA_4444_8u, 3, false)[0].kernel, "ForceOpaqueRow");
    EXPECT_EQ(Chain(kVUYX_4444_8u, kBGRX_4444_8u, 3, false)[0].kernel, "VUYX8uToRGB8uRow");
}

TEST(ReferenceRouter, QualityAboveOneInterpolates) {
    EXPECT_FALSE(Chain(kUYVY_422_32f, kVUYA_4444_32f, 1, true)[0].interpolated);
    EXPECT_TRUE(Chain(kUYVY_422_32f, kVUYA_4444_32f, 2, true)[0].interpolated);
}

TEST(ReferenceRouter, StreamsHaveNoWay) {
    EXPECT_TRUE(Chain(0x01000821, kBGRA_4444_8u, 3, true).empty());
    EXPECT_TRUE(Chain(kBGRA_4444_8u, 0x01000821, 3, true).empty());
}

} // namespace
