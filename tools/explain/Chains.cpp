#include "Chains.h"

#include "convert/ConversionChain.h"
#include "convert/Fusion.h"
#include "convert/KernelTable.h"

namespace tool {
namespace {

std::string BodyName(PK::Kernel kernel) {
    PK::Target target;
    return PK::ChooseTarget(kernel, target) ? PK::TargetName(target) : "none";
}

} // namespace

std::vector<ChainStep> DescribeChain(PK_PixelFormat source, PK_PixelFormat destination, int32_t quality) {
    PK::ConversionChain chain;
    chain.Build(source, destination, quality);
    std::vector<ChainStep> steps;
    int pass = 0;
    int32_t passEnd = 0;
    for (int32_t i = 0; i < chain.count; ++i) {
        if (i == passEnd) {
            int32_t consumed = 1;
            PK::ChooseFusedBody(chain.kernels + i, chain.count - i, consumed);
            passEnd = i + consumed;
            ++pass;
        }
        steps.push_back(
            {PK::Info(chain.kernels[i]).name, chain.formats[i], BodyName(chain.kernels[i]), pass});
    }
    return steps;
}

} // namespace tool
