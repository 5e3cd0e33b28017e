// Every body of every kernel of the register on 1920 elements that stay in cache: what the instructions cost without
// memory.
//
//   pixelkiln_kernel_bench [--markdown] --benchmark_filter=Premultiply

#include "KernelTableReporter.h"

#include "register/KernelRegister.h"
#include "support/KernelTrial.h"
#include "support/Samples.h"

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>

#include <benchmark/benchmark.h>

#include <cstring>
#include <string>
#include <vector>

namespace {

using namespace PK;

constexpr int32_t kSize = 1920;
constexpr uint64_t kSeed = 1;

std::vector<uint8_t> MakeRow(PKTest::TrialRow row, PKTest::Random& random) {
    std::vector<uint8_t> bytes(row.bytes);
    PKTest::FillOrdinarySamples(row.samples, bytes.data(), bytes.size(), random);
    return bytes;
}

void RunBody(benchmark::State& state, const KernelRow& row, Target target) {
    const PKTest::KernelTrial trial = PKTest::MakeTrial(row, kSize, kSeed);
    PKTest::Random random(kSeed);
    std::vector<std::vector<uint8_t>> sources;
    std::vector<const uint8_t*> pointers;
    for (const PKTest::TrialRow& source : trial.sources)
        pointers.push_back(sources.emplace_back(MakeRow(source, random)).data());
    std::vector<uint8_t> destination = MakeRow(trial.destination, random);
    const AnyKernel body = row.body(target);
    for (auto _ : state) {
        trial.call(body, pointers, destination.data());
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * kSize);
}

std::string FormatName(PK_PixelFormat format) {
    if (format == PK_PixelFormat_Invalid) return "-";
    return format == PK_PixelFormat_RGB_444_10u ? "RGB_444_10u" : PK_PixelFormatName(format);
}

void RegisterAll() {
    for (const KernelRow& row : KernelRegister())
        for (const Target target : TargetsOf(row.offer)) {
            if (!IsEnabled(target, row.offer) || row.body(target) == nullptr) continue;
            const std::string name = std::string(row.family) + " " + row.name + "/" +
                                     FormatName(row.operands.source.format) + "/" +
                                     FormatName(row.operands.destination.format) + "/" + TargetName(target);
            benchmark::RegisterBenchmark(name.c_str(), RunBody, row, target)->MinTime(0.05);
        }
}

std::vector<std::string> TargetNames() {
    std::vector<std::string> names;
    for (int i = 0; i < kTargetCount; ++i) names.push_back(TargetName(static_cast<Target>(i)));
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
