#include "convert/ConversionChain.h"

#include "convert/Fusion.h"
#include "convert/KernelTable.h"
#include "convert/Router.h"
#include "frame/PixelFormat.h"

#include <algorithm>

namespace PK {

bool ConversionChain::Build(PK_PixelFormat from, PK_PixelFormat to, int32_t quality) noexcept {
    source = from;
    destination = to;
    count = 0;
    passCount = 0;
    PK_PixelFormat current = from;
    for (int32_t i = 0; i < kMaximumSteps; ++i) {
        ConversionStep step;
        if (ChooseConversionStep(current, to, quality, step) != PK_Success) return false;
        const RowKernel body = ChooseBody(step.kernel);
        if (body == nullptr) return false;

        kernels[i] = step.kernel;
        steps[i] = body;
        formats[i] = step.next;
        current = step.next;
        if (current == to) {
            count = i + 1;
            ChoosePasses();
            return true;
        }
    }
    return false;
}

void ConversionChain::ChoosePasses() noexcept {
    for (int32_t i = 0; i < count;) {
        int32_t consumed = 1;
        const RowKernel fused = ChooseFusedBody(kernels + i, count - i, consumed);
        const RowKernel run = fused != nullptr ? fused : steps[i];
        i += consumed;
        passes[passCount++] = {run, formats[i - 1]};
    }
}

uint64_t ConversionChain::ScratchBytes(int32_t width) const noexcept {
    uint64_t bytes = 0;
    for (int32_t i = 0; i + 1 < passCount; ++i) bytes = std::max(bytes, BytesOfRow(passes[i].next, width));
    return bytes;
}

void ConversionChain::ConvertRow(const void* from, void* to, int32_t width,
                                 const ChainScratch& scratch) const noexcept {
    const void* row = from;
    for (int32_t i = 0; i + 1 < passCount; ++i) {
        void* next = scratch.rows[i % 2];
        passes[i].run(row, next, width);
        row = next;
    }
    passes[passCount - 1].run(row, to, width);
}

} // namespace PK
