// Rows in a working format: as they lie where the formats agree, else through temporary rows and chains.

#include "convert/WorkingRows.h"

#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "support/FlagScope.h"
#include "support/GuardedImage.h"
#include "support/Random.h"
#include "support/Samples.h"

#include <PixelKiln/Convert.h>

#include <gtest/gtest.h>

#include <cstring>
#include <thread>
#include <vector>

using namespace PKTest;

namespace PK {
namespace {

constexpr int32_t kQuality = 4;

class WorkingRows : public testing::Test {
protected:
    WorkingRows() { SetCapabilities(ReadProcessor()); }

    static ConversionChain ChainOf(PK_PixelFormat from, PK_PixelFormat to) {
        ConversionChain chain;
        EXPECT_TRUE(chain.Build(from, to, kQuality)) << std::hex << from << " to " << to;
        return chain;
    }

    FlagScope fFlags;
    Random fRandom{4400};
};

/// An image of ordinary samples that ends at a guard page, walked upward or downward in memory.
struct Picture {
    GuardedImage memory;
    PK_PixelFormat format;
    int32_t width, height;

    Picture(PK_PixelFormat pixelFormat, int32_t columns, int32_t rows, bool upwards, Random& random)
        : memory({BytesOfRow(pixelFormat, columns), rows, upwards ? size_t{32} : 0, upwards}, random),
          format(pixelFormat), width(columns), height(rows) {
        for (int32_t row = 0; row < rows; ++row)
            FillOrdinarySamples(format, memory.Row(row), BytesOfRow(format, columns), random);
    }
    SourceImage Source() const { return {memory.Pixels(), memory.RowBytes(), format, width, height}; }
    DestinationImage Destination() const {
        return {memory.Pixels(), memory.RowBytes(), format, width, height};
    }
};

/// One row in another format; at a 16-byte boundary, since expansion to 15 bits rounds by where a pixel lies to one.
std::vector<uint8_t> Converted(const uint8_t* row, PK_PixelFormat from, PK_PixelFormat to, int32_t width) {
    const size_t bytes = BytesOfRow(to, width);
    std::vector<uint8_t> memory(bytes + 15);
    uint8_t* const aligned = memory.data() + (-reinterpret_cast<uintptr_t>(memory.data()) & 15);
    EXPECT_EQ(PK_Convert(row, 0, from, aligned, 0, to, width, 1, kQuality), PK_Success);
    return {aligned, aligned + bytes};
}

bool IsOnStack(const void* pointer) {
    const auto* here = static_cast<const uint8_t*>(__builtin_frame_address(0));
    const auto* at = static_cast<const uint8_t*>(pointer);
    return at > here - 0x100000 && at < here + 0x100000;
}

TEST_F(WorkingRows, OfTheWorkingFormatAreReadAndWrittenWhereTheyLie) {
    const PK_PixelFormat format = PK_PixelFormat_BGRA_4444_8u;
    const Picture from(format, 5, 3, true, fRandom), to(format, 5, 3, false, fRandom);
    const SourceImage image = from.Source();
    const DestinationImage target = to.Destination();
    const ConversionChain chain = ChainOf(format, format);
    RowMemory memory(5);
    memory.AddSource(chain);
    memory.AddSink(chain);
    const PK_Result result = memory.With([&](TemporaryRows& rows) {
        EXPECT_EQ(rows.Take(0), nullptr); // nothing was asked for
        const RowSource source(image, chain, rows);
        const RowSink sink(target, chain, rows);
        for (int32_t row = 0; row < 3; ++row) {
            EXPECT_EQ(source.Row(row), image.Row(row));
            EXPECT_EQ(sink.Row(row), target.Row(row));
            sink.Finish(row);
        }
        return PK_Success;
    });
    EXPECT_EQ(result, PK_Success);
}

TEST_F(WorkingRows, OfOtherFormatsAreConvertedOnTheWayInAndOut) {
    constexpr int32_t kWidth = 11, kHeight = 3;
    for (const PK_PixelFormat working : {PK_PixelFormat_BGRP_4444_32f, PK_PixelFormat_BGRA_4444_15u,
                                         PK_PixelFormat_VUYP_4444_8u_709, PK_PixelFormat_UYVY_422_32f}) {
        for (const PK_PixelFormat outside : kRasterFormats) {
            SCOPED_TRACE(testing::Message() << std::hex << "0x" << outside << " and 0x" << working);
            const bool upwards = fRandom.Below(2) != 0;
            const Picture from(outside, kWidth, kHeight, upwards, fRandom),
                to(outside, kWidth, kHeight, !upwards, fRandom);
            const SourceImage image = from.Source();
            const DestinationImage target = to.Destination();
            const ConversionChain in = ChainOf(outside, working), out = ChainOf(working, outside);
            RowMemory memory(kWidth);
            memory.AddSource(in);
            memory.AddSink(out);
            std::vector<std::vector<uint8_t>> expected;
            const PK_Result result = memory.With([&](TemporaryRows& rows) {
                const RowSource source(image, in, rows);
                const RowSink sink(target, out, rows);
                for (int32_t row = 0; row < kHeight; ++row) {
                    const std::vector<uint8_t> wanted = Converted(image.Row(row), outside, working, kWidth);
                    const uint8_t* const got = source.Row(row);
                    EXPECT_EQ(std::vector<uint8_t>(got, got + wanted.size()), wanted) << "row " << row;
                    std::memcpy(sink.Row(row), got, wanted.size());
                    sink.Finish(row);
                    expected.push_back(Converted(wanted.data(), working, outside, kWidth));
                }
                return PK_Success;
            });
            ASSERT_EQ(result, PK_Success);
            to.memory.ExpectRows(expected);
            if (HasFailure()) return;
        }
    }
}

// Deinterlacing reads a row as the lower neighbour first and as the upper one afterwards.
TEST_F(WorkingRows, TwoSourcesOfOneImageKeepARowEach) {
    const Picture from(PK_PixelFormat_UYVY_422_8u, 9, 2, false, fRandom);
    const SourceImage image = from.Source();
    const ConversionChain chain = ChainOf(image.format, PK_PixelFormat_BGRP_4444_32f);
    RowMemory memory(9);
    memory.AddSource(chain);
    memory.AddSource(chain);
    memory.With([&](TemporaryRows& rows) {
        const RowSource above(image, chain, rows), below(image, chain, rows);
        const uint8_t* const first = above.Row(0);
        const std::vector<uint8_t> before(first, first + 9 * 16);
        EXPECT_GE(std::abs(below.Row(1) - first), 9 * 16);
        EXPECT_EQ(std::vector<uint8_t>(first, first + 9 * 16), before);
        return PK_Success;
    });
}

// A blurred line begins with a margin.
TEST_F(WorkingRows, CanBeConvertedIntoMemoryOfTheOperation) {
    const Picture from(PK_PixelFormat_YUYV_422_8u, 6, 2, false, fRandom);
    const SourceImage image = from.Source();
    const ConversionChain chain = ChainOf(image.format, PK_PixelFormat_VUYP_4444_32f);
    ASSERT_GT(chain.passCount, 1);
    alignas(16) uint8_t line[16 * 8] = {};
    RowMemory memory(6);
    memory.AddChain(chain);
    memory.With([&](const TemporaryRows& rows) {
        const RowSource source(image, chain, rows.Scratch());
        source.ConvertRow(1, line + 16);
        return PK_Success;
    });
    const std::vector<uint8_t> wanted = Converted(image.Row(1), image.format, chain.destination, 6);
    EXPECT_EQ(std::vector<uint8_t>(line + 16, line + 16 * 7), wanted);
    EXPECT_EQ(std::vector<uint8_t>(line + 16 * 7, line + 16 * 8), std::vector<uint8_t>(16));
}

TEST_F(WorkingRows, TemporaryRowsLieApartAtBoundariesThatKernelsRoundBy) {
    const ConversionChain chain = ChainOf(PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_15u);
    ASSERT_EQ(chain.ScratchRows(), 2);
    for (const int32_t width : {1, 7, 4000, 20000}) {
        const uint64_t rowBytes = BytesOfRow(PK_PixelFormat_BGRA_4444_15u, width);
        RowMemory memory(width);
        memory.AddSource(chain);
        memory.AddRow(PK_PixelFormat_BGRA_4444_15u);
        memory.With([&](TemporaryRows& rows) {
            const uint64_t scratchBytes = chain.ScratchBytes(width);
            const std::pair<uint8_t*, uint64_t> all[] = {{rows.Scratch().rows[0], scratchBytes},
                                                         {rows.Scratch().rows[1], scratchBytes},
                                                         {rows.Take(rowBytes), rowBytes},
                                                         {rows.Take(rowBytes), rowBytes}};
            for (const auto& [row, bytes] : all) {
                EXPECT_EQ(reinterpret_cast<uintptr_t>(row) % 16, 0u);
                std::memset(row, 0x5a, bytes);
                for (const auto& [other, otherBytes] : all)
                    EXPECT_TRUE(row == other || row + bytes <= other || other + otherBytes <= row);
            }
            return PK_Success;
        });
    }
}

TEST_F(WorkingRows, UpTo256KiBInAllStayOnTheStack) {
    for (const int32_t width : {16384, 16385}) {
        RowMemory memory(width);
        memory.AddRow(PK_PixelFormat_BGRA_4444_8u);
        memory.AddRow(PK_PixelFormat_BGRA_4444_8u);
        memory.AddRow(PK_PixelFormat_BGRA_4444_15u);
        memory.With([&](TemporaryRows& rows) {
            EXPECT_EQ(IsOnStack(rows.Take(1)), width == 16384);
            return PK_Success;
        });
    }
}

TEST_F(WorkingRows, ResultOfARunIsHandedOnAndMemoryThatCannotBeHadIsOne) {
    EXPECT_EQ(RowMemory(8).With([](TemporaryRows&) { return PK_ErrSizeMismatch; }), PK_ErrSizeMismatch);
    RowMemory tooMuch(kMaximumWidth);
    for (int i = 0; i < 200; ++i) tooMuch.AddRow(PK_PixelFormat_BGRA_4444_32f); // 400 GiB
    EXPECT_EQ(tooMuch.With([](TemporaryRows&) -> PK_Result {
        ADD_FAILURE();
        return PK_Success;
    }),
              PK_ErrOutOfMemory);
}

} // namespace
} // namespace PK
