// pixelkiln kernels: the register of row kernels.

#include "Command.h"
#include "Formats.h"
#include "SharedWords.h"
#include "Terminal.h"
#include "explain/TargetNames.h"

namespace tool {
namespace {

std::string BodiesText(PK::Kernel kernel) {
    const auto names = TargetNames([&](PK::Target target) { return PK::Body(kernel, target) != nullptr; });
    return names.empty() ? "none" : Join(names, " ");
}

const char* AgreementText(PK::Agreement agreement) {
    return agreement == PK::Agreement::Exact ? "exact" : "declared";
}

void Run(const ListOptions& options) {
    Table table({"kernel", "from", "to", "agreement", "chosen", "bodies"});
    for (int i = 0; i < PK::kKernelCount; ++i) {
        const PK::KernelInfo& info = PK::Info(static_cast<PK::Kernel>(i));
        PK::Target target;
        const bool hasBody = PK::ChooseTarget(info.kernel, target);
        table.Add({info.name, FormatName(info.source), FormatName(info.destination),
                   AgreementText(info.agreement), hasBody ? PK::TargetName(target) : "none",
                   BodiesText(info.kernel)});
    }
    Print(options.csv ? table.CSV() : table.Aligned());
}

const Command sKernels(Group::Listings, "kernels", "List the row kernels and the bodies chosen here",
                       AddListing, Run);

} // namespace
} // namespace tool
