// How a chain runs its passes, on kernels of the test's own.

#include "convert/ConversionChain.h"

#include "convert/KernelTable.h"

#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>

#include <array>
#include <cstdlib>
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
    for (const RowKernel pass : passes) chain.passes[chain.passCount++] = pass;
    chain.count = chain.passCount;
    calls.clear();
    return chain;
}

uint8_t Convert(const ConversionChain& chain, int32_t width) {
    const std::vector<uint8_t> source(static_cast<size_t>(width), 0);
    std::vector<uint8_t> destination(static_cast<size_t>(width), 0xee);
    EXPECT_EQ(chain.ConvertRow(source.data(), destination.data(), width), PK_Success);
    EXPECT_EQ(calls.front().source, source.data());
    EXPECT_EQ(calls.back().destination, destination.data());
    for (const uint8_t value : destination) EXPECT_EQ(value, destination[0]);
    return destination[0];
}

TEST(ConversionChain, IsEmptyAtFirst) {
    const ConversionChain chain;
    EXPECT_EQ(chain.count, 0);
    uint8_t destination = 0xee;
    EXPECT_EQ(chain.ConvertRow("s", &destination, 1), PK_ErrFailed);
    EXPECT_EQ(destination, 0xee);
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

TEST(ConversionChain, ScratchRowsHoldSixteenBytesAPixelApart) {
    constexpr int32_t width = 33;
    const auto chain = ChainOf({AppendDigitRow<1>, AppendDigitRow<2>, AppendDigitRow<3>});
    chain.WithScratch(width, [](const ChainScratch& scratch) {
        for (const uint8_t* row : scratch.rows) EXPECT_EQ(reinterpret_cast<uintptr_t>(row) % 16, 0u);
        EXPECT_GE(std::abs(scratch.rows[0] - scratch.rows[1]), 16 * width);
        return PK_Success;
    });
}

/// Far more than the two rows, far less than the way to the heap.
bool IsNearTheStackTop(const void* pointer) {
    const auto* here = static_cast<const uint8_t*>(__builtin_frame_address(0));
    return std::abs(static_cast<const uint8_t*>(pointer) - here) < 1 << 20;
}

TEST(ConversionChain, RowsUpTo16384PixelsStayOnTheStack) {
    const auto chain = ChainOf({AppendDigitRow<1>, AppendDigitRow<2>, AppendDigitRow<3>});
    EXPECT_EQ(Convert(chain, 16384), 123);
    EXPECT_TRUE(IsNearTheStackTop(calls[0].destination));
    EXPECT_TRUE(IsNearTheStackTop(calls[1].destination));

    calls.clear();
    EXPECT_EQ(Convert(chain, 16385), 123);
    EXPECT_FALSE(IsNearTheStackTop(calls[0].destination));
    EXPECT_FALSE(IsNearTheStackTop(calls[1].destination));
}

TEST(ConversionChain, ResultOfTheScratchUserIsHandedOn) {
    const auto chain = ChainOf({AppendDigitRow<1>, AppendDigitRow<2>, AppendDigitRow<3>});
    const auto fail = [](const ChainScratch&) -> PK_Result { return PK_ErrSizeMismatch; };
    EXPECT_EQ(chain.WithScratch(8, fail), PK_ErrSizeMismatch);
}

TEST(ConversionChain, BuildTakesBodiesAndFormatsOfEachStep) {
    ConversionChain chain;
    chain.Build(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, 2);
    ASSERT_EQ(chain.count, 1);
    EXPECT_EQ(chain.kernels[0], Kernel::PremultiplyRow_BGRA_8u);
    EXPECT_EQ(chain.steps[0], ChooseBody(Kernel::PremultiplyRow_BGRA_8u));
    EXPECT_EQ(chain.formats[0], PK_PixelFormat_BGRP_4444_8u);
    EXPECT_EQ(chain.passCount, 1);
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
            chain.Build(source, destination, 2);
            EXPECT_EQ(chain.count, 0) << std::hex << source << " to " << destination;
        }
    }
}

} // namespace

} // namespace PK
