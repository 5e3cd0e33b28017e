// What it costs to hand a task to the pool: empty parts, so that nothing is measured but the way there and back. And what
// bands bring: composites of 1080 lines, to be held beside the same on one processor (taskset -c 1).

#include "frame/Task.h"

#include <PixelKiln/Composite.h>
#include <PixelKiln/Lifecycle.h>

#include <benchmark/benchmark.h>

#include <chrono>
#include <thread>
#include <vector>

namespace {

using namespace PK::Threading;
using Clock = std::chrono::steady_clock;

class EmptyTask : public Task {
public:
    explicit EmptyTask(int64_t parts) : fParts(static_cast<int32_t>(parts)) {}

    int32_t GetPartCount() const override { return fParts; }
    void RunPart(int32_t) const override {}

private:
    int32_t fParts;
};

// One task after the other: the threads of the pool are awake or on their way.
void BackToBack(benchmark::State& state) {
    const EmptyTask task(state.range(0));
    for (auto _ : state) RunTaskOnAllProcessors(task);
}

// After a pause, as between frames: the threads of the pool sleep and have to be woken.
void AfterAPause(benchmark::State& state) {
    const EmptyTask task(state.range(0));
    for (auto _ : state) {
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
        const Clock::time_point start = Clock::now();
        RunTaskOnAllProcessors(task);
        state.SetIterationTime(std::chrono::duration<double>(Clock::now() - start).count());
    }
}

constexpr int32_t kWidth = 1920, kHeight = 1080;

template <PK_PixelFormat kFormat, PK_BlendMode kMode>
void CompositeBands(benchmark::State& state) {
    const int32_t rowBytes = PK_PixelFormatPackedRowBytes(kFormat, kWidth);
    const std::vector<uint8_t> top(static_cast<size_t>(rowBytes) * kHeight, 60);
    std::vector<uint8_t> back = top;
    for (auto _ : state)
        PK_CompositeWithBlendMode(top.data(), rowBytes, kFormat, back.data(), rowBytes, kFormat, back.data(),
                                  rowBytes, kFormat, kWidth, kHeight, 0.6f, kMode, 4, false);
}

BENCHMARK(CompositeBands<PK_PixelFormat_BGRP_4444_8u, PK_BlendMode_Normal>)
    ->UseRealTime()
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(CompositeBands<PK_PixelFormat_BGRA_4444_8u, PK_BlendMode_Normal>)
    ->UseRealTime()
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(CompositeBands<PK_PixelFormat_BGRA_4444_32f, PK_BlendMode_Multiply>)
    ->UseRealTime()
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(BackToBack)->Arg(1)->Arg(64)->UseRealTime()->Unit(benchmark::kMicrosecond);
BENCHMARK(AfterAPause)->Arg(1)->Arg(64)->UseManualTime()->Iterations(2000)->Unit(benchmark::kMicrosecond);

} // namespace

int main(int argc, char** argv) {
    PK_Initialize();
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 2;
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    PK_Terminate();
    return 0;
}
