// Every pair of raster formats through PK_Convert, on a photograph and on random rows, against the
// independent router and the slow kernels of tests/reference.

#include <PixelKiln/Convert.h>

#include "convert/RasterFormats.h"
#include "frame/FloatMode.h"
#include "reference/ReferenceKernels.h"
#include "reference/ReferenceRouter.h"
#include "register/KernelRegister.h"
#include "support/Photograph.h"
#include "support/RowBuffer.h"
#include "support/Samples.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string_view>
#include <vector>

namespace {

using namespace PKTest;

constexpr int32_t kQuality = 4;
constexpr int32_t kRows = 8;

/// Rows of one format, each on a 64-byte boundary.
struct Image {
    PK_PixelFormat format;
    int32_t width;
    size_t rowBytes;
    std::vector<uint8_t> room;

    Image(PK_PixelFormat imageFormat, int32_t imageWidth)
        : format(imageFormat), width(imageWidth), rowBytes((static_cast<size_t>(width) * 16 + 127) / 64 * 64),
          room(rowBytes * kRows + 64) {}

    uint8_t* Row(int32_t row) {
        const size_t misalignment = reinterpret_cast<uintptr_t>(room.data()) % 64;
        return room.data() + (64 - misalignment) + static_cast<size_t>(row) * rowBytes;
    }
    size_t PackedBytes() const { return static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width)); }
};

PK_Result Convert(Image& from, Image& to) {
    return PK_Convert(from.Row(0), static_cast<int32_t>(from.rowBytes), from.format, to.Row(0),
                      static_cast<int32_t>(to.rowBytes), to.format, from.width, kRows, kQuality);
}

/// How far apart results may be: a power is right to a unit in the last place, all else to the bit. After a
/// power, a code may round the other way, and a difference of near values keeps the error of its terms.
bool HasPower(const std::vector<reference::Step>& chain) {
    return std::ranges::any_of(chain, [](const reference::Step& step) {
        return step.kernel == "GammaToLinearRow" || step.kernel == "LinearToGammaRow";
    });
}

std::string CompareRows(PK_PixelFormat format, size_t bytes, const uint8_t* expected, const uint8_t* actual,
                        bool afterPower) {
    return afterPower ? FirstDifferenceBeyond(format, bytes, expected, actual)
                      : FirstDifference(format, bytes, expected, actual);
}

/// Whether the body that is chosen for a kernel follows the other of its two rules, if it has two.
bool TakesOtherRule(std::string_view kernel) {
    static const std::vector<PK::KernelRow> kernels = PK::KernelRegister();
    return std::ranges::any_of(kernels, [kernel](const PK::KernelRow& row) {
        return row.name == kernel && row.agreement.kind == PK::Agreement::Declared &&
               row.agreement.from <= PK::BestTarget();
    });
}

/// What the named kernels give, one after the other, for one row.
void RunReference(const std::vector<reference::Step>& chain, PK_PixelFormat format, const uint8_t* source,
                  int32_t width, uint8_t* result) {
    const PK::FloatMode mode;
    Image scratch[2] = {{format, width}, {format, width}};
    for (size_t i = 0; i < chain.size(); ++i) {
        uint8_t* destination = i + 1 == chain.size() ? result : scratch[i % 2].Row(0);
        reference::Run(chain[i].kernel, format, chain[i].next, TakesOtherRule(chain[i].kernel), source,
                       destination, width, chain[i].interpolated ? kQuality : 0);
        source = destination;
        format = chain[i].next;
    }
}

class ConvertReference : public TargetTest {
protected:
    static void ExpectAllFrom(Image& source) {
        for (const PK_PixelFormat format : PK::kRasterFormats) {
            if (format == source.format) continue;
            SCOPED_TRACE(testing::Message() << std::hex << source.format << " to " << format);
            Image actual(format, source.width), expected(format, source.width);
            ASSERT_EQ(PK_Success, Convert(source, actual));

            const auto chain = reference::Chain(source.format, format, kQuality, PK::sCPUHasSSE2 != 0);
            ASSERT_FALSE(chain.empty());
            const bool flipped = PK_IsOriginTopLeft(source.format) != PK_IsOriginTopLeft(format);
            for (int32_t row = 0; row < kRows; ++row) {
                const int32_t resultRow = flipped ? kRows - 1 - row : row;
                RunReference(chain, source.format, source.Row(row), source.width, expected.Row(resultRow));
                ASSERT_EQ("", CompareRows(format, actual.PackedBytes(), expected.Row(resultRow),
                                          actual.Row(resultRow), HasPower(chain)))
                    << "row " << row;
            }
        }
    }
};

TEST_P(ConvertReference, EveryPairOnAPhotograph) {
    const Photograph photograph = ReadPhotograph("chelsea.png");
    Image picture(PK_PixelFormat_BGRA_4444_8u, photograph.width);
    for (int32_t row = 0; row < kRows; ++row) {
        const uint8_t* pixels = photograph.Row(row * photograph.height / kRows);
        std::copy_n(pixels, picture.PackedBytes(), picture.Row(row));
        // A slope of alpha, so that premultiplication has work to do.
        for (int32_t x = 0; x < picture.width; ++x) picture.Row(row)[4 * x + 3] = static_cast<uint8_t>(x);
    }
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        Image source(format, picture.width);
        ASSERT_EQ(PK_Success, Convert(picture, source));
        ASSERT_NO_FATAL_FAILURE(ExpectAllFrom(source));
    }
}

TEST_P(ConvertReference, EveryPairOnRandomRows) {
    for (const PK_PixelFormat format : PK::kRasterFormats)
        for (const int32_t width : {1, 2, 3, 29, 64}) {
            Random random(format * 131 + static_cast<uint32_t>(width));
            SCOPED_TRACE(testing::Message() << "width " << width << ", seed " << random.Seed());
            Image source(format, width);
            for (int32_t row = 0; row < kRows; ++row)
                FillOrdinarySamples(format, source.Row(row), source.PackedBytes(), random);
            ASSERT_NO_FATAL_FAILURE(ExpectAllFrom(source));
        }
}

/// One row of exactly its bytes, before a guard page and after one.
TEST_P(ConvertReference, EveryPairUpToTheGuardPages) {
    for (const PK_PixelFormat from : PK::kRasterFormats)
        for (const PK_PixelFormat to : PK::kRasterFormats)
            for (const int32_t width : {1, 2, 7, 18})
                for (const auto place : {Placement::kBeforeGuard, Placement::kAfterGuard}) {
                    Random random(from * 31 + to);
                    SCOPED_TRACE(testing::Message() << std::hex << from << " to " << to << std::dec
                                                    << ", width " << width << ", seed " << random.Seed());
                    const auto bytes = static_cast<size_t>(PK_PixelFormatPackedRowBytes(to, width));
                    const RowBuffer source(static_cast<size_t>(PK_PixelFormatPackedRowBytes(from, width)),
                                           {place});
                    const RowBuffer actual(bytes, {place});
                    FillOrdinarySamples(from, source.Data(), source.Size(), random);
                    ASSERT_EQ(PK_Success,
                              PK_Convert(source.Data(), 0, from, actual.Data(), 0, to, width, 1, kQuality));
                    ASSERT_TRUE(actual.MarginsIntact());

                    // At the same distance from a boundary, which one kernel counts from.
                    const auto offset = static_cast<int>(reinterpret_cast<uintptr_t>(actual.Data()) % 16);
                    const RowBuffer expected(bytes, {Placement::kAtOffset, offset});
                    const auto chain = reference::Chain(from, to, kQuality, PK::sCPUHasSSE2 != 0);
                    RunReference(chain, from, source.Data(), width, expected.Data());
                    ASSERT_EQ("", CompareRows(to, bytes, expected.Data(), actual.Data(), HasPower(chain)));
                }
}

INSTANTIATE_TEST_SUITE_P(Targets, ConvertReference, EveryTarget(), TargetOf);

} // namespace
