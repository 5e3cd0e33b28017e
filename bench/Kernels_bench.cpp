// Every body of every row kernel on one row that stays in cache: what the instructions cost without memory.
//
//   pixelkiln_kernel_bench --benchmark_filter=Premultiply

#include "convert/KernelTable.h"

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>

#include <benchmark/benchmark.h>

#include <string>
#include <vector>

namespace {

using namespace PK;

constexpr int32_t kWidth = 1920;

std::vector<uint8_t> MakeRow(PK_PixelFormat format) {
    std::vector<uint8_t> row(static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, kWidth)));
    const bool isFloat = (format & 0x100) != 0;
    for (size_t i = 0; i < row.size(); ++i)
        row[i] = static_cast<uint8_t>(isFloat && i % 4 == 3 ? 0x3e : i * 37);
    return row;
}

void RunBody(benchmark::State& state, Kernel kernel, Target target) {
    const std::vector<uint8_t> source = MakeRow(Info(kernel).source);
    std::vector<uint8_t> destination = MakeRow(Info(kernel).destination);
    const RowKernel run = Body(kernel, target);
    for (auto _ : state) {
        run(source.data(), destination.data(), kWidth);
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * kWidth);
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(source.size() + destination.size()));
}

void RegisterAll() {
    for (int i = 0; i < kKernelCount; ++i)
        for (int j = 0; j < kTargetCount; ++j) {
            const auto kernel = static_cast<Kernel>(i);
            const auto target = static_cast<Target>(j);
            if (!IsEnabled(target) || !Body(kernel, target)) continue;
            const KernelInfo& info = Info(kernel);
            const std::string name = std::string(info.name) + "/" + PK_PixelFormatName(info.source) + "/" +
                                     PK_PixelFormatName(info.destination) + "/" + TargetName(target);
            benchmark::RegisterBenchmark(name.c_str(), RunBody, kernel, target)->MinTime(0.05);
        }
}

} // namespace

int main(int argc, char** argv) {
    PK_Initialize();
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 2;
    RegisterAll();
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    PK_Terminate();
    return 0;
}
