// Every body of every row kernel on one row that stays in cache: what the instructions cost without memory.
//
//   pixelkiln_kernel_bench [--markdown] --benchmark_filter=Premultiply

#include "KernelTableReporter.h"

#include "convert/KernelTable.h"

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>

#include <benchmark/benchmark.h>

#include <cstring>
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

std::string FormatName(PK_PixelFormat format) {
    return format == PK_PixelFormat_RGB_444_10u ? "RGB_444_10u" : PK_PixelFormatName(format);
}

void RegisterAll() {
    for (int i = 0; i < kKernelCount; ++i)
        for (const Target target : kFlagTargets) {
            const auto kernel = static_cast<Kernel>(i);
            if (!IsEnabled(target) || !Body(kernel, target)) continue;
            const KernelRow& info = Info(kernel);
            const std::string name = std::string(info.name) + "/" + FormatName(info.operands.source.format) +
                                     "/" + FormatName(info.operands.destination.format) + "/" +
                                     TargetName(target);
            benchmark::RegisterBenchmark(name.c_str(), RunBody, kernel, target)->MinTime(0.05);
        }
}

std::vector<std::string> TargetNames() {
    std::vector<std::string> names;
    for (const Target target : kFlagTargets) names.push_back(TargetName(target));
    return names;
}

void RunAll(bool asMarkdown) {
    KernelTableReporter table(TargetNames());
    if (asMarkdown)
        benchmark::RunSpecifiedBenchmarks(&table);
    else
        benchmark::RunSpecifiedBenchmarks();
}

} // namespace

int main(int argc, char** argv) {
    PK_Initialize();
    benchmark::Initialize(&argc, argv);
    const bool asMarkdown = argc == 2 && std::strcmp(argv[1], "--markdown") == 0;
    if (!asMarkdown && benchmark::ReportUnrecognizedArguments(argc, argv)) return 2;
    RegisterAll();
    RunAll(asMarkdown);
    benchmark::Shutdown();
    PK_Terminate();
    return 0;
}
