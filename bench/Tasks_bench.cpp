// What it costs to hand a task to the pool: empty parts, so that nothing is measured but the way there and back.

#include "frame/Task.h"

#include <PixelKiln/Lifecycle.h>

#include <benchmark/benchmark.h>

#include <chrono>
#include <thread>

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
