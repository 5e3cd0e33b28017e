#pragma once

// Turns the kernel benchmark into a Markdown table: one line a kernel, one column an instruction set,
// megapixels a second. A kernel's runs come one after the other, each named
// "kernel/source/destination/target".

#include <benchmark/benchmark.h>

#include <map>
#include <string>
#include <vector>

class KernelTableReporter : public benchmark::BenchmarkReporter {
public:
    explicit KernelTableReporter(std::vector<std::string> targets);

    bool ReportContext(const Context& context) override;
    void ReportRuns(const std::vector<Run>& runs) override;
    void Finalize() override;

private:
    void PrintLine();

    std::vector<std::string> fTargets;
    std::string fKernel; // the line that is being collected
    std::map<std::string, double> fMegapixels;
};
