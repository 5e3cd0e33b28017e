// The slots of the colour kernels: bound to the processor at the first call, called straight from then on.

#include "colour/FloatKernelTable.h"

#include "colour/DecodeTables.h"
#include "support/ColourPixels.h"

#include <PixelKiln/ColorSpace.h>

#include <atomic>
#include <barrier>
#include <thread>

namespace {

using namespace PK;
using namespace PKTest;

std::atomic<int> sChoices = 0, sCalls = 0;

/// Kernels that tell who was called with what. Each slot keeps its body for good, so that each test has its own.
template <int kTest>
struct ProbeKernels {
    struct Call {
        Target target;
        const float* source;
        float* destination;
        int32_t count;
        float number;
    };

    void (*probe)(const float* source, float* destination, int32_t count, float number, Call& call);

    static constexpr Offer kOffer = Offer::processor;

    template <Target kTarget>
    static void Probe(const float* source, float* destination, int32_t count, float number, Call& call) {
        ++sCalls;
        call = {kTarget, source, destination, count, number};
    }

    template <Target kTarget>
    static const ProbeKernels& For() {
        static constexpr ProbeKernels kernels = {Probe<kTarget>};
        ++sChoices;
        return kernels;
    }
};

TEST(FloatKernelTable, TheFirstCallChoosesAndGoesOn) {
    using Slot = KernelSlot<&ProbeKernels<0>::probe>;
    sChoices = sCalls = 0;
    float from = 1, to = 2;
    for (int i = 1; i <= 3; ++i) {
        ProbeKernels<0>::Call call{};
        Slot::Call(&from, &to, 40 + i, 0.5f, call);
        EXPECT_EQ(call.target, BestTarget(Offer::processor));
        EXPECT_EQ(call.source, &from);
        EXPECT_EQ(call.destination, &to);
        EXPECT_EQ(call.count, 40 + i);
        EXPECT_EQ(call.number, 0.5f);
        EXPECT_EQ(sChoices, 1) << "later calls go straight to the body";
        EXPECT_EQ(sCalls, i);
    }
}

TEST(FloatKernelTable, ThreadsMayMeetInTheFirstCall) {
    using Slot = KernelSlot<&ProbeKernels<1>::probe>;
    constexpr int kThreads = 8;
    sChoices = sCalls = 0;
    std::barrier start(kThreads);
    std::vector<std::thread> threads;
    std::array<ProbeKernels<1>::Call, kThreads> calls{};
    for (size_t i = 0; i < kThreads; ++i)
        threads.emplace_back([&start, &calls, i] {
            start.arrive_and_wait();
            Slot::Call(nullptr, nullptr, static_cast<int32_t>(i), 1, calls[i]);
        });
    for (std::thread& thread : threads) thread.join();
    for (size_t i = 0; i < kThreads; ++i) {
        EXPECT_EQ(calls[i].target, BestTarget(Offer::processor));
        EXPECT_EQ(calls[i].count, static_cast<int32_t>(i));
    }
    EXPECT_EQ(sCalls, kThreads);
    EXPECT_GE(sChoices, 1);
    EXPECT_LE(sChoices, kThreads);
}

/// The slot gives what the body of the best target gives.
template <class Slot, auto kKernel, class Kernels, class... Arguments>
void ExpectBound(const Arguments&... arguments) {
    Random random(5);
    const ColourPixels source = UniformPixels(random, 40, -0.3f, 1.3f);
    ColourPixels expected(source.size()), actual(source.size());
    (KernelsFor<Kernels>(BestTarget(Offer::processor)).*kKernel)(source.data()->data(),
                                                                 expected.data()->data(), arguments...);
    for (int i = 0; i < 2; ++i) {
        actual.assign(source.size(), ColourPixel{});
        Slot::Call(source.data()->data(), actual.data()->data(), arguments...);
        EXPECT_TRUE(AreSameBits(actual, expected)) << "call " << i;
    }
    EXPECT_FALSE(AreSameBits(actual, ColourPixels(source.size())));
}

TEST(FloatKernelTable, AllSlotsHoldTheBestBody) {
    using Table = FloatKernelTable;
    const float matrix[9] = {0.6f, 0.3f, 0.1f, 0.1f, 0.8f, 0.1f, -0.1f, 0.2f, 0.9f};
    const GammaConversion conversion = {matrix, 2.4f, 0.45f, {0.2126f, 0.7152f, 0.0722f}, true, true};
    ExpectBound<Table::PQToRec709Kernel, &PQKernels::toRec709, PQKernels>(
        40, SignalDecoding{matrix, PQDecodeTable()});
    ExpectBound<Table::Rec709ToPQKernel, &PQKernels::fromRec709, PQKernels>(40, PQEncoding{matrix, 1.5f});
    ExpectBound<Table::HLGToRec709Kernel, &HLGKernels::toRec709, HLGKernels>(
        40, SignalDecoding{matrix, HLGDecodeTable()});
    ExpectBound<Table::Rec709ToHLGKernel, &HLGKernels::fromRec709, HLGKernels>(40, HLGEncoding{matrix});
    ExpectBound<Table::ClampFloats, &ClampKernels::clamp, ClampKernels>(160, FloatRange{0.1f, 0.9f});
    ExpectBound<Table::YUVToRGBKernel, &YUVKernels::toRGB, YUVKernels>(40);
    ExpectBound<Table::RGBToYUVKernel, &YUVKernels::fromRGB, YUVKernels>(40);
    ExpectBound<Table::ConvertGammaKernel, &GammaKernels::convert, GammaKernels>(40, conversion);
}

} // namespace
