#include "convert/ConversionChain.h"

#include "convert/Fusion.h"
#include "convert/KernelTable.h"
#include "convert/Router.h"

namespace PK {

void ConversionChain::Build(PK_PixelFormat source, PK_PixelFormat destination, int32_t quality) noexcept {
    count = 0;
    passCount = 0;
    PK_PixelFormat current = source;
    for (int32_t i = 0; i < kMaximumSteps; ++i) {
        ConversionStep step;
        if (ChooseConversionStep(current, destination, quality, step) != PK_Success) return;
        const RowKernel body = ChooseBody(step.kernel);
        if (body == nullptr) return;

        kernels[i] = step.kernel;
        steps[i] = body;
        formats[i] = step.next;
        current = step.next;
        if (current == destination) {
            count = i + 1;
            ChoosePasses();
            return;
        }
    }
}

void ConversionChain::ChoosePasses() noexcept {
    for (int32_t i = 0; i < count;) {
        int32_t consumed = 1;
        const RowKernel fused = ChooseFusedBody(kernels + i, count - i, consumed);
        passes[passCount++] = fused != nullptr ? fused : steps[i];
        i += fused != nullptr ? consumed : 1;
    }
}

void ConversionChain::ConvertRow(const void* source, void* destination, int32_t width,
                                 const ChainScratch& scratch) const noexcept {
    const void* from = source;
    for (int32_t i = 0; i + 1 < passCount; ++i) {
        void* to = scratch.rows[i % 2];
        passes[i](from, to, width);
        from = to;
    }
    passes[passCount - 1](from, destination, width);
}

PK_Result ConversionChain::ConvertRow(const void* source, void* destination, int32_t width) const noexcept {
    if (count == 0) return PK_ErrFailed;
    return WithScratch(width, [&](const ChainScratch& scratch) {
        ConvertRow(source, destination, width, scratch);
        return PK_Success;
    });
}

} // namespace PK
