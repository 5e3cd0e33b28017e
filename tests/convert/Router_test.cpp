// The router from step to step: every pair of raster formats, the shape of all chains, single decisions.

#include "convert/Router.h"

#include "convert/KernelTable.h"
#include "convert/RasterFormats.h"
#include "convert/RouterTable.h"
#include "frame/Capabilities.h"
#include "frame/PixelFormat.h"
#include "reference/ReferenceRouter.h"
#include "support/FlagScope.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <set>
#include <string>
#include <vector>

namespace PK {

namespace {

using enum Kernel;

constexpr int kMaximumSteps = 8;
constexpr int32_t kRepeating = 1;
constexpr int32_t kInterpolating = 2;

struct Step {
    PK_PixelFormat from;
    Kernel kernel;
    PK_PixelFormat to;
};

/// The steps from source to destination; empty where the router fails or needs more than eight.
std::vector<Step> Walk(PK_PixelFormat source, PK_PixelFormat destination, int32_t quality = kInterpolating) {
    std::vector<Step> steps;
    PK_PixelFormat current = source;
    while (steps.size() < kMaximumSteps) {
        ConversionStep step;
        if (ChooseConversionStep(current, destination, quality, step) != PK_Success) break;
        steps.push_back({current, step.kernel, step.next});
        current = step.next;
        if (current == destination) return steps;
    }
    return {};
}

std::vector<Kernel> KernelsOf(PK_PixelFormat source, PK_PixelFormat destination,
                              int32_t quality = kInterpolating) {
    std::vector<Kernel> kernels;
    for (const Step& step : Walk(source, destination, quality)) kernels.push_back(step.kernel);
    return kernels;
}

template <class Visit>
void ForEachPair(Visit&& visit) {
    for (const PK_PixelFormat source : kRasterFormats) {
        for (const PK_PixelFormat destination : kRasterFormats) visit(source, destination);
    }
}

std::array<int, kMaximumSteps + 1> CountPairsBySteps() {
    std::array<int, kMaximumSteps + 1> pairs{};
    ForEachPair([&](PK_PixelFormat source, PK_PixelFormat destination) {
        ++pairs[Walk(source, destination).size()];
    });
    return pairs;
}

using Kernels = std::vector<Kernel>;

TEST(Router, FormatsMakeEveryPair) {
    EXPECT_EQ(std::size(kRasterFormats), 47u);
    EXPECT_EQ(std::set<PK_PixelFormat>(std::begin(kRasterFormats), std::end(kRasterFormats)).size(), 47u);
}

TEST(Router, EveryPairHasAChainOfKnownLength) {
    const PKTest::FlagScope flags;
    sCPUHasSSE2 = 1;
    EXPECT_EQ(CountPairsBySteps(), (std::array{0, 329, 484, 572, 458, 240, 97, 27, 2}));
}

TEST(Router, WithoutSSE2TwoPairsTakeAStepMore) {
    const PKTest::FlagScope flags;
    sCPUHasSSE2 = 0;
    EXPECT_EQ(CountPairsBySteps(), (std::array{0, 327, 486, 572, 458, 240, 97, 27, 2}));
}

TEST(Router, NoChainVisitsAFormatTwiceOrLeavesTheCatalogue) {
    const PKTest::FlagScope flags;
    for (const bool sse2 : {false, true}) {
        sCPUHasSSE2 = sse2;
        ForEachPair([](PK_PixelFormat source, PK_PixelFormat destination) {
            if (source == destination) return;
            std::set<PK_PixelFormat> seen{source};
            for (const Step& step : Walk(source, destination)) {
                EXPECT_TRUE(IsRasterFormat(step.to)) << std::hex << source << " to " << destination;
                EXPECT_TRUE(seen.insert(step.to).second) << std::hex << source << " to " << destination;
            }
        });
    }
}

TEST(Router, QualityOnlyChangesHowFloatChromaIsUpsampled) {
    ForEachPair([](PK_PixelFormat source, PK_PixelFormat destination) {
        Kernels low = KernelsOf(source, destination, kRepeating);
        const Kernels high = KernelsOf(source, destination, kInterpolating);
        EXPECT_EQ(std::ranges::count(low, Upsample422To444Float32Row_Interpolate), 0);
        EXPECT_EQ(std::ranges::count(high, Upsample422To444Float32Row_Repeat), 0);
        std::ranges::replace(low, Upsample422To444Float32Row_Repeat, Upsample422To444Float32Row_Interpolate);
        EXPECT_EQ(low, high) << std::hex << source << " to " << destination;
    });
    EXPECT_EQ(KernelsOf(PK_PixelFormat_UYVY_422_32f, PK_PixelFormat_VUYA_4444_32f, 0),
              Kernels{Upsample422To444Float32Row_Repeat});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_UYVY_422_32f, PK_PixelFormat_VUYA_4444_32f, 5),
              Kernels{Upsample422To444Float32Row_Interpolate});
}

TEST(Router, AgreesWithTheRestatedRouter) {
    const PKTest::FlagScope flags;
    std::set<std::string> names;
    for (const int32_t quality : {kRepeating, kInterpolating})
        for (const bool sse2 : {false, true}) {
            sCPUHasSSE2 = sse2;
            ForEachPair([&](PK_PixelFormat source, PK_PixelFormat destination) {
                const std::vector<Step> steps = Walk(source, destination, quality);
                const auto expected = reference::Chain(source, destination, quality, sse2);
                ASSERT_EQ(steps.size(), expected.size()) << std::hex << source << " to " << destination;
                for (size_t i = 0; i < steps.size(); ++i) {
                    EXPECT_EQ(Info(steps[i].kernel).name, expected[i].kernel);
                    EXPECT_EQ(steps[i].to, expected[i].next);
                    EXPECT_EQ(steps[i].kernel == Upsample422To444Float32Row_Interpolate,
                              expected[i].interpolated);
                    names.insert(expected[i].kernel);
                }
            });
        }
    EXPECT_EQ(names.size(), 59u) << "some kernel is named by no chain, or one is new";
}

/// What a kernel relies on of a format: how its pixels lie in memory.
uint32_t LayoutOf(PK_PixelFormat format) {
    const uint32_t fourChannels = IsPacked4444(format) ? kAlphaMeaningless : kAlphaNone;
    return (format & (kStructureMask | kDepthMask)) | fourChannels;
}

TEST(Router, KernelsOnlyMeetRowsOfTheirLayout) {
    ForEachPair([](PK_PixelFormat source, PK_PixelFormat destination) {
        for (const Step& step : Walk(source, destination)) {
            if (source == PK_PixelFormat_RGB_444_10u && destination == source)
                continue; // copied by pixel size
            const KernelRow& info = Info(step.kernel);
            EXPECT_EQ(LayoutOf(info.operands.source.format), LayoutOf(step.from))
                << info.name << std::hex << " " << step.from;
            EXPECT_EQ(LayoutOf(info.operands.destination.format), LayoutOf(step.to))
                << info.name << std::hex << " " << step.to;
        }
    });
}

/// A row of the table by its source and position.
struct RowName {
    PK_PixelFormat source;
    size_t position;
    bool operator==(const RowName&) const = default;
};

TEST(Router, EveryTableRowDecidesOnSomeWay) {
    std::set<const RouterRow*> used;
    ForEachPair([&](PK_PixelFormat source, PK_PixelFormat destination) {
        for (const Step& step : Walk(source, destination, kRepeating)) {
            const RouterRow* row = FindRouterRow(step.from, destination);
            if (row == nullptr) continue;
            if (row->kernel == step.kernel && row->next.For(destination) == step.to) used.insert(row);
        }
    });

    std::vector<RowName> unused;
    for (const RouterSource& entry : RouterTable()) {
        for (size_t i = 0; i < entry.rows.size(); ++i) {
            if (!used.contains(&entry.rows[i])) unused.push_back({entry.source, i});
        }
    }
    // From BGRA_4444_8u to 8-bit RGB that is not premultiplied: the rules of alpha and order come first for
    // each such format of the catalogue.
    EXPECT_EQ(unused, (std::vector<RowName>{{PK_PixelFormat_BGRA_4444_8u, 7}}));
}

TEST(Router, TableNamesOnlyFormatsOfTheCatalogueAndEachOnce) {
    std::set<PK_PixelFormat> sources;
    for (const RouterSource& entry : RouterTable()) {
        EXPECT_TRUE(IsRasterFormat(entry.source));
        EXPECT_TRUE(sources.insert(entry.source).second);
    }
}

TEST(Router, SameFormatIsCopied) {
    for (const PK_PixelFormat format : kRasterFormats) {
        const std::vector<Step> steps = Walk(format, format);
        ASSERT_EQ(steps.size(), 1u) << std::hex << format;
        EXPECT_EQ(steps[0].to, format);
    }
    EXPECT_EQ(KernelsOf(PK_PixelFormat_RGB_444_10u, PK_PixelFormat_RGB_444_10u), Kernels{CopyRow_4444_8u});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_PRGB_4444_15u, PK_PixelFormat_PRGB_4444_15u),
              Kernels{CopyRow_4444_15u});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_V210_422_10u_709, PK_PixelFormat_V210_422_10u_709),
              Kernels{CopyRow_V210});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_YUYV_422_32f, PK_PixelFormat_YUYV_422_32f), Kernels{CopyRow_422_32f});
}

TEST(Router, OrderIsSwappedBeforeTheMatrix) {
    EXPECT_EQ(KernelsOf(PK_PixelFormat_ARGB_4444_8u, PK_PixelFormat_VUYA_4444_8u),
              (Kernels{SwapOrderRow_4444_8u, RGBToYUV601Row}));
}

TEST(Router, StraightRGBReachesTenBitsThroughPremultipliedFloat) {
    const std::vector<Step> steps = Walk(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_RGB_444_10u);
    ASSERT_EQ(steps.size(), 3u);
    EXPECT_EQ(steps[0].to, PK_PixelFormat_BGRA_4444_32f);
    EXPECT_EQ(steps[1].to, PK_PixelFormat_BGRP_4444_32f);
    EXPECT_EQ(steps[2].kernel, BGR32fToRGB10uRow);
}

TEST(Router, ColourIsPremultipliedOnTheWayTo422) {
    const std::vector<Step> steps = Walk(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u);
    ASSERT_EQ(steps.size(), 3u);
    EXPECT_EQ(steps[0].to, PK_PixelFormat_VUYA_4444_8u);
    EXPECT_EQ(steps[1].to, PK_PixelFormat_VUYP_4444_8u);
    EXPECT_EQ(steps[2].kernel, Downsample444To422Row);
}

TEST(Router, FloatYUYVTurnsItsOrderFirst) {
    for (const PK_PixelFormat destination : kRasterFormats) {
        if (destination == PK_PixelFormat_YUYV_422_32f || destination == PK_PixelFormat_YUYV_422_8u) continue;
        const std::vector<Step> steps = Walk(PK_PixelFormat_YUYV_422_32f, destination);
        ASSERT_FALSE(steps.empty());
        EXPECT_EQ(steps[0].kernel, SwapOrderRow_422_32f) << std::hex << destination;
        EXPECT_EQ(steps[0].to, PK_PixelFormat_UYVY_422_32f) << std::hex << destination;
    }
    EXPECT_EQ(KernelsOf(PK_PixelFormat_YUYV_422_32f, PK_PixelFormat_YUYV_422_8u),
              Kernels{PackFrom32fRow_YUYV_8u});
}

TEST(Router, DirectKernelNeedsSSE2) {
    const PKTest::FlagScope flags;
    sCPUHasSSE2 = 1;
    EXPECT_EQ(KernelsOf(PK_PixelFormat_VUYX_4444_8u, PK_PixelFormat_BGRA_4444_8u),
              Kernels{VUYX8uToBGR8uRow_601});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_VUYX_4444_8u_709, PK_PixelFormat_BGRX_4444_8u),
              Kernels{VUYX8uToBGR8uRow_709});
    sCPUHasSSE2 = 0;
    EXPECT_EQ(KernelsOf(PK_PixelFormat_VUYX_4444_8u, PK_PixelFormat_BGRX_4444_8u),
              Kernels{VUYX8uToRGB8uRow_601});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_VUYX_4444_8u_709, PK_PixelFormat_BGRX_4444_8u),
              Kernels{VUYX8uToRGB8uRow_709});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_VUYX_4444_8u, PK_PixelFormat_BGRA_4444_8u),
              (Kernels{ForceOpaqueRow_BGRA_8u, YUV601ToRGBRow}));
}

TEST(Router, DroppingStraightAlphaGoesOverBlackAndDroppingPremultipliedAlphaKeepsColour) {
    EXPECT_EQ(KernelsOf(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRX_4444_8u),
              (Kernels{PremultiplyRow_BGRA_8u, ForceOpaqueRow_BGRA_8u}));
    EXPECT_EQ(KernelsOf(PK_PixelFormat_PRGB_4444_15u, PK_PixelFormat_XRGB_4444_15u),
              Kernels{ForceOpaqueRow_ARGB_15u});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_VUYP_4444_8u, PK_PixelFormat_VUYA_4444_8u),
              Kernels{UnpremultiplyRow_VUYA_8u});
}

TEST(Router, OtherKnownWays) {
    EXPECT_EQ(KernelsOf(PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u),
              Kernels{ForceOpaqueRow_BGRA_8u});
    EXPECT_EQ(KernelsOf(PK_PixelFormat_V210_422_10u_709, PK_PixelFormat_UYVY_422_8u),
              (Kernels{V210ToUYVY8uRow, UYVY709To601Row}));
    EXPECT_EQ(KernelsOf(PK_PixelFormat_YUYV_422_32f, PK_PixelFormat_VUYA_4444_32f),
              (Kernels{SwapOrderRow_422_32f, Upsample422To444Float32Row_Interpolate}));
}

TEST(Router, Straight15BitsToTenBitsRunsTheUnpremultiplier) {
    EXPECT_EQ(KernelsOf(PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_RGB_444_10u),
              (Kernels{UnpremultiplyRow_BGRA_15u, BGR15uToRGB10uRow}));
}

TEST(Router, StreamsAreRefusedSourceFirst) {
    ConversionStep step;
    EXPECT_EQ(ChooseConversionStep(PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV25, 2, step),
              PK_ErrBadSrcFormat);
    EXPECT_EQ(step.kernel, None);
    EXPECT_EQ(ChooseConversionStep(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_PALDV25, 2, step),
              PK_ErrBadDstFormat);
    EXPECT_EQ(step.kernel, None);
    EXPECT_EQ(ChooseConversionStep(PK_PixelFormat_YUV_420_MPEG2_FRAME, PK_PixelFormat_BGRA_4444_8u, 2, step),
              PK_ErrBadSrcFormat);
}

TEST(Router, FormatsOutsideTheCatalogueFindNoKernel) {
    // Nothing, 10-bit YUV in 4:4:4, a reserved bit, linear 8-bit, full-range YUV, a matrix that no format
    // has.
    for (const PK_PixelFormat format : {0x0u, 0x841u, 0x2004u, 0x6u, 0x5u, 0xc05u}) {
        ConversionStep step;
        EXPECT_EQ(ChooseConversionStep(format, PK_PixelFormat_BGRA_4444_8u, 2, step), PK_ErrBadSrcFormat);
        EXPECT_EQ(step.kernel, None);
        EXPECT_EQ(ChooseConversionStep(PK_PixelFormat_BGRA_4444_8u, format, 2, step), PK_ErrBadDstFormat);
        EXPECT_EQ(step.kernel, None);
    }
}

} // namespace

} // namespace PK
