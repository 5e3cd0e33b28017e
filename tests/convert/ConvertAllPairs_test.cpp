// Every pair of raster formats through PK_Convert, against the chain's steps run one by one.

#include <PixelKiln/Convert.h>

#include "convert/ConversionChain.h"
#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "frame/FloatMode.h"
#include "support/FlagScope.h"
#include "support/GuardedRows.h"
#include "support/Samples.h"

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

namespace {

using namespace PKTest;

constexpr int32_t kQuality = 2;

/// Room for a row of any format, aligned as the scratch rows of a chain are.
struct alignas(64) ScratchRow {
    uint8_t bytes[16 * 64];
};

/// Runs the steps that the chain lists; what it runs itself may be fewer.
void RunSteps(const PK::ConversionChain& chain, const uint8_t* source, uint8_t* destination, int32_t width) {
    const PK::FloatMode mode;
    ScratchRow rows[2] = {};
    const uint8_t* from = source;
    for (int32_t i = 0; i + 1 < chain.count; ++i) {
        uint8_t* to = rows[i % 2].bytes;
        chain.steps[i](from, to, width);
        from = to;
    }
    chain.steps[chain.count - 1](from, destination, width);
}

/// One row of exactly its bytes, before a guard page and after one.
void ExpectRow(PK_PixelFormat source, PK_PixelFormat destination, int32_t width, Guard guard) {
    SCOPED_TRACE(testing::Message() << std::hex << source << " to " << destination << std::dec << " width "
                                    << width << (guard == Guard::kAfter ? " before" : " after")
                                    << " a guard page");
    PK::ConversionChain chain;
    chain.Build(source, destination, kQuality);
    ASSERT_GT(chain.count, 0);

    const auto sourceBytes = static_cast<size_t>(PK_PixelFormatPackedRowBytes(source, width));
    const auto destinationBytes = static_cast<size_t>(PK_PixelFormatPackedRowBytes(destination, width));
    const GuardedRows row(sourceBytes, guard);
    const GuardedRows expected(destinationBytes, guard);
    const GuardedRows actual(destinationBytes, guard);
    Random random(source * 31 + destination);
    FillOrdinarySamples(source, row.Bytes(), sourceBytes, random);
    RunSteps(chain, row.Bytes(), expected.Bytes(), width);

    ASSERT_EQ(PK_Convert(row.Bytes(), 0, source, actual.Bytes(), 0, destination, width, 1, kQuality),
              PK_Success);
    EXPECT_EQ(FirstDifference(destination, destinationBytes, expected.Bytes(), actual.Bytes()), "")
        << "seed " << random.Seed();
}

void ExpectAllPairs() {
    for (const PK_PixelFormat source : PK::kRasterFormats) {
        for (const PK_PixelFormat destination : PK::kRasterFormats) {
            for (const int32_t width : {1, 2, 7, 18}) {
                ExpectRow(source, destination, width, Guard::kBefore);
                ExpectRow(source, destination, width, Guard::kAfter);
                if (testing::Test::HasFatalFailure()) return;
            }
        }
    }
}

TEST(ConvertAllPairs, PlainBodiesGiveTheStepsOneByOne) {
    const FlagScope flags;
    FlagScope::ClearAll();
    ExpectAllPairs();
}

TEST(ConvertAllPairs, BestBodiesGiveTheStepsOneByOne) {
    const FlagScope flags;
    PK::DetectProcessor();
    ExpectAllPairs();
}

} // namespace
