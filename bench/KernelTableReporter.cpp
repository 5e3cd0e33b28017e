#include "KernelTableReporter.h"

#include <cmath>
#include <cstdio>
#include <utility>

KernelTableReporter::KernelTableReporter(std::vector<std::string> targets) : fTargets(std::move(targets)) {}

bool KernelTableReporter::ReportContext(const Context&) {
    std::string heading = "| Kernel | From | To |";
    std::string rule = "|---|---|---|";
    for (const std::string& target : fTargets) {
        heading += " " + target + " |";
        rule += "--:|";
    }
    std::printf("%s\n%s\n", heading.c_str(), rule.c_str());
    return true;
}

void KernelTableReporter::ReportRuns(const std::vector<Run>& runs) {
    for (const Run& run : runs) {
        const std::string& name = run.run_name.function_name;
        const size_t end = name.rfind('/');
        const std::string kernel = name.substr(0, end);
        if (kernel != fKernel) PrintLine();
        fKernel = kernel;
        fMegapixels[name.substr(end + 1)] = run.counters.at("items_per_second") * 1e-6;
    }
}

void KernelTableReporter::Finalize() {
    PrintLine();
}

void KernelTableReporter::PrintLine() {
    if (fMegapixels.empty()) return;
    std::string line = "| ";
    for (const char c : fKernel) line += c == '/' ? std::string(" | ") : std::string(1, c);
    for (const std::string& target : fTargets) {
        const auto found = fMegapixels.find(target);
        line += found == fMegapixels.end() ? " | -" : " | " + std::to_string(std::lround(found->second));
    }
    std::printf("%s |\n", line.c_str());
    std::fflush(stdout);
    fMegapixels.clear();
}
