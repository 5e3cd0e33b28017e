// PK_DeinterlaceCopy held to its steps, row by row, for all pairs of formats.

#include "convert/RasterFormats.h"
#include "reference/ReferenceDeinterlace.h"
#include "support/AlignedPicture.h"
#include "support/Targets.h"
#include "support/Walk.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/CrossDissolve.h>
#include <PixelKiln/Deinterlace.h>

#include <gtest/gtest.h>

using namespace PKTest;

namespace {

PK_Result Copy(AlignedPicture& source, AlignedPicture& out, int32_t width, int32_t height, int32_t field,
               int32_t quality) {
    return PK_DeinterlaceCopy(source.Pixels(), source.RowBytes(), source.format, out.Pixels(), out.RowBytes(),
                              out.format, width, height, field, quality);
}

bool IsTaken(PK_PixelFormat format) {
    return (format & 0x30) == 0x10 || (format & 0xc) != 0;
}

/// The steps as they are told, row by row, each row by calls of its own.
class Steps {
public:
    Steps(AlignedPicture& source, AlignedPicture& destination, int32_t width, int32_t height)
        : fSource(source), fDestination(destination), fWidth(width), fHeight(height) {}

    void Average(int32_t field) {
        const int32_t first = field != 0 ? 1 : 0;
        if (field != 0) CopyRow(1, 0);
        int32_t kept = first;
        for (int32_t round = 0; round < fHeight / 2 - 1; ++round, kept += 2)
            ASSERT_EQ(PK_CrossDissolve(fSource.RowFromTop(kept), 0, fSource.format,
                                       fSource.RowFromTop(kept + 2), 0, fSource.format,
                                       fDestination.RowFromTop(kept + 1), 0, fDestination.format, fWidth, 1,
                                       0.5f, 4),
                      PK_Success);
        if (field == 0) CopyRow(kept, kept + 1);
    }

    void AlongEdges(int32_t field) {
        if (field == 1) CopyRow(1, 0);
        int32_t rebuilt = field == 1 ? 2 : 1;
        for (int32_t i = 1; i < fHeight - 2; i += 2, rebuilt += 2) Interpolate(rebuilt);
        if (field != 1) CopyRow(rebuilt - 1, rebuilt);
    }

private:
    void Convert(const uint8_t* from, PK_PixelFormat fromFormat, uint8_t* to, PK_PixelFormat toFormat) {
        ASSERT_EQ(PK_Convert(from, 0, fromFormat, to, 0, toFormat, fWidth, 1, 4), PK_Success);
    }
    void CopyRow(int32_t from, int32_t to) {
        Convert(fSource.RowFromTop(from), fSource.format, fDestination.RowFromTop(to), fDestination.format);
    }

    PK_PixelFormat Working() const {
        uint32_t depth = fDestination.format & 0x1c0;
        if (depth == 0x40) depth = 0x80;
        if ((fSource.format & 0x1c0) != (fDestination.format & 0x1c0)) depth = 0x100;
        PK_PixelFormat working = (fDestination.format & ~0x1fcu) | 8 | depth;
        if ((working & 1) != 0) working &= ~0x1000u; // VUY has one order
        return PK::IsRasterFormat(working) ? working : (working & ~0x1c0u) | 0x100;
    }

    void Interpolate(int32_t row) {
        AlignedPicture above(Working(), fWidth, 1), below(Working(), fWidth, 1),
            between(Working(), fWidth, 1);
        Convert(fSource.RowFromTop(row - 1), fSource.format, above.Pixels(), above.format);
        Convert(fSource.RowFromTop(row + 1), fSource.format, below.Pixels(), below.format);
        const auto depth = static_cast<SampleDepth>(above.rowLength / static_cast<size_t>(fWidth) / 4);
        ReferenceInterpolateRow(depth, (Working() & 0x1000) != 0, above.Pixels(), below.Pixels(),
                                between.Pixels(), fWidth);
        Convert(between.Pixels(), between.format, fDestination.RowFromTop(row), fDestination.format);
    }

    AlignedPicture &fSource, &fDestination;
    int32_t fWidth, fHeight;
};

class DeinterlaceSteps : public testing::Test {
protected:
    DeinterlaceSteps() { PK::SetCapabilities(PK::ReadProcessor()); }

    void CheckPair(PK_PixelFormat from, PK_PixelFormat to, int32_t width, int32_t height, int32_t field,
                   int32_t quality) {
        AlignedPicture source(from, width, height), out(to, width, height);
        source.FillOrdinary(fRandom);
        out.FillOrdinary(fRandom);
        AlignedPicture expected = out;
        ASSERT_EQ(Copy(source, out, width, height, field, quality), PK_Success);
        Steps steps(source, expected, width, height);
        quality < 4 ? steps.Average(field) : steps.AlongEdges(field);
        for (int32_t row = 0; row < height; ++row)
            ASSERT_EQ("", FirstDifference(to, out.rowLength, expected.RowFromTop(row), out.RowFromTop(row)))
                << std::hex << "0x" << from << " to 0x" << to << std::dec << ", row " << row << " of "
                << height << ", width " << width << ", field " << field << ", quality " << quality
                << ", seed " << fRandom.Seed();
    }

    FlagScope fFlags;
    Random fRandom{6302};
};

} // namespace

TEST_F(DeinterlaceSteps, FollowsTheStepsForAllPairsOfFormats) {
    Walk walk;
    for (const PK_PixelFormat from : PK::kRasterFormats)
        for (const PK_PixelFormat to : PK::kRasterFormats) {
            if (!IsTaken(from) || !IsTaken(to) || walk.LeavesOut()) continue;
            for (const int32_t quality : {3, 4})
                for (const int32_t field : {0, 1, 2})
                    ASSERT_NO_FATAL_FAILURE(CheckPair(from, to, 7, 6, field, quality));
        }
}

TEST_F(DeinterlaceSteps, FollowsTheStepsAtEverySizeAndTarget) {
    AtEveryTarget([&] {
        for (const PK_PixelFormat format : PK::kRasterFormats) {
            if (!IsTaken(format)) continue;
            for (const int32_t quality : {2, 5})
                for (int round = 0; round < 3; ++round)
                    ASSERT_NO_FATAL_FAILURE(CheckPair(format, format,
                                                      1 + static_cast<int32_t>(fRandom.Below(70)),
                                                      2 + static_cast<int32_t>(fRandom.Below(8)),
                                                      static_cast<int32_t>(fRandom.Below(2)), quality));
        }
    });
}

TEST_F(DeinterlaceSteps, ConvertsRowsTooLongForTheStack) {
    ASSERT_NO_FATAL_FAILURE(
        CheckPair(PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_32f, 17001, 4, 0, 4));
    ASSERT_NO_FATAL_FAILURE(
        CheckPair(PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_32f, 17001, 4, 1, 3));
}
