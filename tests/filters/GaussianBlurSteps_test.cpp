// PK_GaussianBlur held to its steps, line by line: every row and column converted, filtered by the restatement and
// converted back, each by calls of its own.

#include "convert/RasterFormats.h"
#include "filters/GaussianBlur.h"
#include "reference/ReferenceGaussianBlur.h"
#include "support/AlignedPicture.h"
#include "support/FloatEnvironment.h"
#include "support/Targets.h"
#include "support/Walk.h"

#include <PixelKiln/GaussianBlur.h>
#include <PixelKiln/Lifecycle.h>

#include <gtest/gtest.h>

#include <optional>

using namespace PKTest;

namespace {

struct Job {
    PK_PixelFormat from, to;
    int32_t width, height, moreColumns, moreRows;
    double sigmaX, sigmaY;
    bool repeatEdge = false, linear = false;
    int32_t direction = 3, quality = 4;
};

bool IsTaken(PK_PixelFormat format) {
    return (format & 0x30) == 0 && (format & 0xc) != 0;
}

bool Is8u(PK_PixelFormat format) {
    return (format & 0x1c0) == 0;
}

PK_PixelFormat Working(const Job& job) {
    if (job.linear) return 266;
    if ((job.from & 1) == 0) return 264;
    return (job.from & 0x601) == 1 ? 0x909 : 0xb09;
}

AlignedPicture Transposed(const AlignedPicture& picture) {
    AlignedPicture turned(picture.format, picture.height, picture.width);
    const size_t pixel = picture.rowLength / static_cast<size_t>(picture.width);
    for (int32_t y = 0; y < picture.height; ++y)
        for (int32_t x = 0; x < picture.width; ++x)
            std::memcpy(turned.Row(x) + static_cast<size_t>(y) * pixel,
                        picture.Row(y) + static_cast<size_t>(x) * pixel, pixel);
    return turned;
}

AlignedPicture RowsBlurred(const AlignedPicture& source, const Job& job, PK_PixelFormat format, int32_t more,
                           double sigma) {
    const AlignedPicture floats = RowsIn(Working(job), source, job.quality);
    AlignedPicture filtered(Working(job), source.width + more, source.height);
    const ReferenceGaussian gaussian = ReferenceGaussianOf(sigma);
    const FloatEnvironment environment(kFlushToZero);
    for (int32_t row = 0; row < source.height; ++row) {
        std::vector<FloatPixel> line(static_cast<size_t>(source.width));
        std::memcpy(line.data(), floats.Row(row), floats.rowLength);
        line = ReferenceGaussianLine(line, filtered.width, gaussian, job.repeatEdge);
        std::memcpy(filtered.Row(row), line.data(), filtered.rowLength);
    }
    return RowsIn(format, filtered, job.quality);
}

AlignedPicture Blurred(const AlignedPicture& source, const Job& job) {
    const bool rows = job.sigmaX > 0 && (job.direction == 1 || job.direction == 3);
    const bool columns = job.sigmaY > 0 && (job.direction == 2 || job.direction == 3);
    const PK_PixelFormat between = (job.from & ~0x100cu) | 8;
    std::optional<AlignedPicture> wide;
    if (rows) wide.emplace(RowsBlurred(source, job, columns ? between : job.to, job.moreColumns, job.sigmaX));
    if (!columns) return *wide;
    return Transposed(RowsBlurred(Transposed(wide ? *wide : source), job, job.to, job.moreRows, job.sigmaY));
}

class GaussianBlurSteps : public testing::Test {
protected:
    GaussianBlurSteps() { PK_Initialize(); }
    ~GaussianBlurSteps() override { PK_Terminate(); }

    void Check(const Job& job) {
        AlignedPicture source(job.from, job.width, job.height);
        AlignedPicture out(job.to, job.width + job.moreColumns, job.height + job.moreRows);
        source.FillOrdinary(fRandom);
        out.FillOrdinary(fRandom);
        AlignedPicture forMotion = out, expected = out;
        const AlignedPicture blurred = Blurred(source, job);
        for (int32_t row = 0; row < blurred.height; ++row)
            std::memcpy(expected.Row(row), blurred.Row(row), blurred.rowLength);

        const auto words = [&] {
            return testing::Message()
                   << std::hex << "0x" << job.from << " to 0x" << job.to << std::dec << ", " << job.width
                   << " x " << job.height << ", more " << job.moreColumns << " x " << job.moreRows
                   << ", sigma " << job.sigmaX << " and " << job.sigmaY << ", repeated " << job.repeatEdge
                   << ", linear " << job.linear << ", direction " << job.direction << ", seed "
                   << fRandom.Seed();
        };
        ASSERT_EQ(PK_GaussianBlur(source.Pixels(), source.RowBytes(), job.width, job.height, job.from,
                                  out.Pixels(), out.RowBytes(), out.width, out.height, job.to, job.sigmaX,
                                  job.sigmaY, job.repeatEdge, job.linear, job.direction, job.quality),
                  PK_Success);
        ASSERT_EQ("", out.DifferenceFrom(expected)) << words();
        for (const bool reuseDestination : {false, true}) {
            AlignedPicture motion = forMotion;
            ASSERT_EQ(PK::BlurForMotion(source.Pixels(), source.RowBytes(), job.width, job.height, job.from,
                                        motion.Pixels(), motion.RowBytes(), motion.width, motion.height,
                                        job.to, job.sigmaX, job.sigmaY, job.repeatEdge, job.linear,
                                        reuseDestination, job.direction, job.quality),
                      PK_Success);
            ASSERT_EQ("", motion.DifferenceFrom(expected)) << words() << ", for motion " << reuseDestination;
        }
    }

    FlagScope fFlags;
    Random fRandom{6101};
};

} // namespace

TEST_F(GaussianBlurSteps, FollowsTheStepsForAllPairsOfFormats) {
    Walk walk;
    for (const PK_PixelFormat from : PK::kRasterFormats)
        for (const PK_PixelFormat to : PK::kRasterFormats) {
            if (!IsTaken(from) || !IsTaken(to) || Is8u(from) != Is8u(to) || walk.LeavesOut()) continue;
            for (const bool linear : {false, true})
                for (const int32_t direction : {1, 2, 3})
                    ASSERT_NO_FATAL_FAILURE(
                        Check({from, to, 9, 7, 3, 2, 1.3, 2.4, direction != 2, linear, direction}));
        }
}

TEST_F(GaussianBlurSteps, FollowsTheStepsAtEverySizeAndTarget) {
    const auto draw = [&](uint32_t count) { return static_cast<int32_t>(fRandom.Below(count)); };
    AtEveryTarget([&] {
        for (const PK_PixelFormat format : PK::kRasterFormats) {
            if (!IsTaken(format)) continue;
            for (int round = 0; round < 3; ++round)
                ASSERT_NO_FATAL_FAILURE(Check({format, format, 1 + draw(80), 1 + draw(80), draw(20), draw(20),
                                               0.3 + draw(200) / 10.0, 0.3 + draw(200) / 10.0, draw(2) != 0,
                                               draw(2) != 0, 1 + draw(3), 5}));
        }
    });
}

// 33 x 33 is run as bands of 32 rows and strips of 128 bytes; 33 x 32 and 32 x 33 one after the other.
TEST_F(GaussianBlurSteps, FollowsTheStepsInBandsAndWithout) {
    for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_XRGB_4444_15u,
                                        PK_PixelFormat_BGRP_4444_32f, PK_PixelFormat_VUYA_4444_32f_709})
        for (const int32_t width : {32, 33, 65, 130})
            for (const int32_t height : {32, 33, 64, 97})
                for (const bool repeatEdge : {false, true})
                    ASSERT_NO_FATAL_FAILURE(
                        Check({format, format, width, height, 5, 4, 3.1, 1.7, repeatEdge}));
}

TEST_F(GaussianBlurSteps, FiltersLinesTooLongForTheStack) {
    for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_32f}) {
        ASSERT_NO_FATAL_FAILURE(Check({format, format, 3001, 3, 7, 1, 40, 1}));
        ASSERT_NO_FATAL_FAILURE(Check({format, format, 3, 3001, 1, 7, 1, 40, true}));
        ASSERT_NO_FATAL_FAILURE(Check({format, format, 1700, 40, 1, 8, 10, 3}));
        ASSERT_NO_FATAL_FAILURE(Check({format, format, 40, 1700, 8, 1, 3, 10}));
    }
}
