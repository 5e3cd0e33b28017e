// pixelkiln kernels: the register of row kernels.

#include "Commands.h"
#include "Formats.h"
#include "Terminal.h"
#include "explain/TargetNames.h"

namespace tool {
namespace {

std::string BodiesText(PK::Kernel kernel) {
    const auto names =
        TargetNames(PK::Offer::flags, [&](PK::Target target) { return PK::Body(kernel, target) != nullptr; });
    return names.empty() ? "none" : Join(names, " ");
}

const char* AgreementText(PK::Agreement agreement) {
    return agreement.kind == PK::Agreement::Exact ? "exact" : "declared";
}

} // namespace

void RunKernels(const ListOptions& options) {
    Table table({"kernel", "from", "to", "agreement", "chosen", "bodies"});
    for (int i = 0; i < PK::kKernelCount; ++i) {
        const auto kernel = static_cast<PK::Kernel>(i);
        const PK::KernelRow& info = PK::Info(kernel);
        PK::Target target;
        const bool hasBody = PK::ChooseTarget(kernel, target);
        table.Add({info.name, FormatName(info.operands.source.format),
                   FormatName(info.operands.destination.format), AgreementText(info.agreement),
                   hasBody ? PK::TargetName(target) : "none", BodiesText(kernel)});
    }
    Print(options.csv ? table.CSV() : table.Aligned());
}

} // namespace tool
