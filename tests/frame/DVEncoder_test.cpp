// The host's encoder of DV25 as the library holds it: with and without a start, and over forks.

#include "frame/DVEncoder.h"

#include <PixelKiln/PixelKiln.h>

#include "support/Child.h"

#include "mc_enc_dv/mc_enc_dv.h"

#include <atomic>
#include <gtest/gtest.h>
#include <thread>
#include <vector>

namespace {

constexpr int32_t kFrameBytes = 120000;

using Bytes = std::vector<uint8_t>;

Bytes Encoded() {
    const Bytes pixels(size_t{1440} * 480, 100);
    Bytes frame(kFrameBytes);
    EXPECT_EQ(PK::RunDVEncoder({pixels.data(), 1440, frame.data(), kFrameBytes, 720, 480, mc_enc_dv::kAlways,
                                mc_enc_dv::kYUYV}),
              kFrameBytes);
    return frame;
}

TEST(DVEncoderOfTheLibrary, EncodesBeforeAStartAndBehindAStop) {
    const Bytes before = Encoded();
    PK_Initialize();
    EXPECT_EQ(Encoded(), before);
    PK_Terminate();
    EXPECT_EQ(Encoded(), before);
    PK::CloseDVEncoder();
    PK::CloseDVEncoder();
    EXPECT_EQ(Encoded(), before);
}

TEST(DVEncoderOfTheLibrary, IsFreeInAChildWhateverThreadsWereEncoding) {
    std::atomic<bool> stop = false;
    std::vector<std::thread> threads;
    for (int i = 0; i < 3; ++i)
        threads.emplace_back([&] {
            while (!stop) Encoded();
        });
    for (int i = 0; i < 10; ++i)
        EXPECT_EQ(PKTest::EndOfChild([] { return Encoded().size() == kFrameBytes ? 0 : 1; }), 0);
    stop = true;
    for (std::thread& thread : threads) thread.join();
}

} // namespace
