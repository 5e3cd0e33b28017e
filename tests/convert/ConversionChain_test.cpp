// How a chain runs its passes, on kernels of the test's own.

#include "convert/ConversionChain.h"

#include "convert/KernelTable.h"
#include "convert/RasterFormats.h"
#include "convert/WorkingRows.h"

#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>

#include <array>
#include <vector>

namespace PK {

namespace {

/// What the test kernels saw, in order.
struct Call {
    const void* source;
    void* destination;
    int32_t width;
};
std::vector<Call> calls;

/// Multiplies each byte by ten and adds the digit, so that the row tells which kernels ran in which order.
template <uint8_t kDigit>
void AppendDigitRow(const void* source, void* destination, int32_t width) {
    calls.push_back({source, destination, width});
    for (int32_t i = 0; i < width; ++i) {
        const uint8_t value = static_cast<const uint8_t*>(source)[i];
        static_cast<uint8_t*>(destination)[i] = static_cast<uint8_t>(value * 10 + kDigit);
    }
}

ConversionChain ChainOf(std::initializer_list<RowKernel> passes) {
    ConversionChain chain;
    for (const RowKernel pass : passes) chain.passes[chain.passCount++] = {pass, PK_PixelFormat_BGRA_4444_8u};
    chain.count = chain.passCount;
    calls.clear();
    return chain;
}

uint8_t Convert(const ConversionChain& chain, int32_t width) {
    const std::vector<uint8_t> source(static_cast<size_t>(width), 0);
    std::vector<uint8_t> destination(static_cast<size_t>(width), 0xee);
    RowMemory memory(width);
    memory.AddChain(chain);
    const PK_Result result = memory.With([&](const TemporaryRows& rows) {
        chain.ConvertRow(source.data(), destination.data(), width, rows.Scratch());
        return PK_Success;
    });
    EXPECT_EQ(result, PK_Success);
    EXPECT_EQ(calls.front().source, source.data());
    EXPECT_EQ(calls.back().destination, destination.data());
    for (const uint8_t value : destination) EXPECT_EQ(value, destination[0]);
    return destination[0];
}

TEST(ConversionChain, IsEmptyAtFirst) {
    const ConversionChain chain;
    EXPECT_EQ(chain.count, 0);
    EXPECT_EQ(chain.ScratchRows(), 0);
}

TEST(ConversionChain, OnePassGoesStraightFromSourceToDestination) {
    EXPECT_EQ(Convert(ChainOf({AppendDigitRow<7>}), 9), 7);
    EXPECT_EQ(calls.size(), 1u);
}

TEST(ConversionChain, PassesRunInOrderThroughTwoRows) {
    EXPECT_EQ(Convert(ChainOf({AppendDigitRow<1>, AppendDigitRow<2>}), 33), 12);
    EXPECT_EQ(calls[1].source, calls[0].destination);

    EXPECT_EQ(Convert(ChainOf({AppendDigitRow<1>, AppendDigitRow<2>, AppendDigitRow<3>}), 33), 123);

    const auto longest =
        ChainOf({AppendDigitRow<0>, AppendDigitRow<0>, AppendDigitRow<0>, AppendDigitRow<0>,
                 AppendDigitRow<0>, AppendDigitRow<2>, AppendDigitRow<4>, AppendDigitRow<1>});
    EXPECT_EQ(Convert(longest, 33), 241);
    ASSERT_EQ(calls.size(), 8u);
    for (size_t i = 1; i < 8; ++i) EXPECT_EQ(calls[i].source, calls[i - 1].destination);
    for (size_t i = 2; i < 7; ++i) EXPECT_EQ(calls[i].destination, calls[i - 2].destination);
    EXPECT_NE(calls[0].destination, calls[1].destination);
    for (const Call& call : calls) EXPECT_EQ(call.width, 33);
}

TEST(ConversionChain, AsksForAScratchRowBetweenTwoPassesAndForTwoAmongMore) {
    EXPECT_EQ(ChainOf({AppendDigitRow<1>}).ScratchRows(), 0);
    EXPECT_EQ(ChainOf({AppendDigitRow<1>, AppendDigitRow<2>}).ScratchRows(), 1);
    EXPECT_EQ(ChainOf({AppendDigitRow<1>, AppendDigitRow<2>, AppendDigitRow<3>}).ScratchRows(), 2);
    EXPECT_EQ(
        ChainOf({AppendDigitRow<1>, AppendDigitRow<2>, AppendDigitRow<3>, AppendDigitRow<4>}).ScratchRows(),
        2);
}

// What the last pass writes is the destination's affair.
TEST(ConversionChain, ScratchRowsAreAsWideAsTheWidestRowHandedOn) {
    auto chain = ChainOf({AppendDigitRow<1>, AppendDigitRow<2>, AppendDigitRow<3>});
    chain.passes[0].next = PK_PixelFormat_BGRA_4444_8u;
    chain.passes[1].next = PK_PixelFormat_V210_422_10u;
    chain.passes[2].next = PK_PixelFormat_BGRA_4444_32f;
    EXPECT_EQ(chain.ScratchBytes(1), 16u); // a group of V210 is more than a pixel
    EXPECT_EQ(chain.ScratchBytes(6), 24u);
    EXPECT_EQ(chain.ScratchBytes(0), 0u);
    chain.passes[0].next = PK_PixelFormat_UYVY_422_32f;
    EXPECT_EQ(chain.ScratchBytes(7), 64u); // four whole pairs
    EXPECT_EQ(chain.ScratchBytes(INT32_MAX / 16), 0x40000000u);
    chain.passCount = 1;
    EXPECT_EQ(chain.ScratchBytes(7), 0u);
}

TEST(ConversionChain, BuildTakesBodiesAndFormatsOfEachStep) {
    ConversionChain chain;
    EXPECT_TRUE(chain.Build(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, 2));
    ASSERT_EQ(chain.count, 1);
    EXPECT_EQ(chain.source, PK_PixelFormat_BGRA_4444_8u);
    EXPECT_EQ(chain.destination, PK_PixelFormat_BGRP_4444_8u);
    EXPECT_FALSE(chain.IsCopy());
    EXPECT_EQ(chain.kernels[0], Kernel::PremultiplyRow_BGRA_8u);
    EXPECT_EQ(chain.steps[0], ChooseBody(Kernel::PremultiplyRow_BGRA_8u));
    EXPECT_EQ(chain.formats[0], PK_PixelFormat_BGRP_4444_8u);
    EXPECT_EQ(chain.passCount, 1);
    EXPECT_EQ(chain.passes[0].run, chain.steps[0]);
    EXPECT_EQ(chain.passes[0].next, PK_PixelFormat_BGRP_4444_8u);
}

TEST(ConversionChain, FusedPassesTellTheFormatBehindThem) {
    ConversionChain chain; // the order is swapped; matrix, premultiplication and downsampling are one pass
    ASSERT_TRUE(chain.Build(PK_PixelFormat_ARGB_4444_8u, PK_PixelFormat_UYVY_422_8u, 2));
    ASSERT_EQ(chain.count, 4);
    ASSERT_EQ(chain.passCount, 2);
    EXPECT_EQ(chain.passes[0].next, PK_PixelFormat_BGRA_4444_8u);
    EXPECT_EQ(chain.passes[1].next, PK_PixelFormat_UYVY_422_8u);
    EXPECT_EQ(chain.ScratchBytes(5), 20u);
}

TEST(ConversionChain, FromAFormatToItselfIsACopy) {
    for (const PK_PixelFormat format : kRasterFormats) {
        ConversionChain chain;
        ASSERT_TRUE(chain.Build(format, format, 2)) << std::hex << format;
        EXPECT_TRUE(chain.IsCopy());
        EXPECT_EQ(chain.count, 1);
    }
}

TEST(ConversionChain, BuildForgetsWhatWasThere) {
    ConversionChain chain;
    chain.Build(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, 2);
    chain.Build(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_NTSCDV25, 2);
    EXPECT_EQ(chain.count, 0);
    chain.Build(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, 2);
    EXPECT_EQ(chain.count, 1);
    EXPECT_EQ(chain.passCount, 1);
}

TEST(ConversionChain, NothingIsBuiltForStreamsAndUnknownFormats) {
    constexpr PK_PixelFormat known = PK_PixelFormat_BGRA_4444_8u;
    for (const PK_PixelFormat format : {PK_PixelFormat_Invalid, PK_PixelFormat_PALDV25, 0x841u, 0x2004u}) {
        for (const auto& [source, destination] :
             {std::pair{format, known}, {known, format}, {format, format}}) {
            ConversionChain chain;
            EXPECT_FALSE(chain.Build(source, destination, 2));
            EXPECT_EQ(chain.count, 0) << std::hex << source << " to " << destination;
        }
    }
}

} // namespace

} // namespace PK
