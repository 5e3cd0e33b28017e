// Frames of DV are read alike in every floating-point mode, and leave the caller's as it is.

#include <PixelKiln/PixelKiln.h>

#include "support/DVFrames.h"

#include <gtest/gtest.h>

#include <vector>
#include <xmmintrin.h>

namespace {

struct Stream {
    const char* frame;
    PK_PixelFormat stream, pixels;
    int32_t width, height;
};

TEST(DVMode, SamplesAreThoseOfRoundingToNearest) {
    constexpr Stream kStreams[] = {
        {"dv25_525_411_astronaut", PK_PixelFormat_NTSCDV25, PK_PixelFormat_UYVY_422_8u, 720, 480},
        {"dv50_625_astronaut", PK_PixelFormat_PALDV50, PK_PixelFormat_YUYV_422_8u, 720, 576},
        {"dv100_720p60_chelsea", PK_PixelFormat_NTSC_DV100_720p, PK_PixelFormat_YUYV_422_8u_709, 960, 720},
    };
    constexpr unsigned kModes[] = {0x3f80, 0x5f80, 0x7f80, 0x9fc0}; // down, up, to zero; flushing, too
    for (const auto& [name, stream, pixels, width, height] : kStreams) {
        const std::vector<uint8_t> frame = PKTest::ReadDVFrame(name);
        const size_t bytes = size_t{2} * static_cast<size_t>(width) * static_cast<size_t>(height);
        std::vector<uint8_t> expected(bytes), decoded(bytes);
        ASSERT_EQ(PK_Success,
                  PK_Convert(frame.data(), 0, stream, expected.data(), 2 * width, pixels, width, height, 2));
        for (const unsigned mode : kModes) {
            const unsigned saved = _mm_getcsr();
            _mm_setcsr(mode);
            const PK_Result result =
                PK_Convert(frame.data(), 0, stream, decoded.data(), 2 * width, pixels, width, height, 2);
            const unsigned after = _mm_getcsr();
            _mm_setcsr(saved);
            ASSERT_EQ(PK_Success, result);
            EXPECT_EQ(mode, after);
            EXPECT_EQ(expected, decoded) << name << std::hex << ", mode " << mode;
        }
    }
}

} // namespace
