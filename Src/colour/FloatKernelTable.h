#pragma once

// The kernels of the colour spaces, each bound to the processor at its first call.

#include "colour/ColourKernels.h"
#include "primitives/Dispatch.h"

#include <atomic>

namespace PK {

template <auto kKernel>
class KernelSlot;

/// Starts with a stub that chooses the body, keeps it and goes on to it; later calls go straight there. Threads that meet
/// in the stub store the same pointer.
template <class Kernels, class... Arguments, void (*Kernels::*kKernel)(Arguments...)>
class KernelSlot<kKernel> {
public:
    static void Call(Arguments... arguments) { sKernel.load(std::memory_order_relaxed)(arguments...); }

private:
    static void Bind(Arguments... arguments) {
        const auto kernel = Best<Kernels>().*kKernel;
        sKernel.store(kernel, std::memory_order_relaxed);
        kernel(arguments...);
    }

    static inline constinit std::atomic<void (*)(Arguments...)> sKernel{Bind};
};

struct FloatKernelTable {
    using PQToRec709Kernel = KernelSlot<&PQKernels::toRec709>;
    using Rec709ToPQKernel = KernelSlot<&PQKernels::fromRec709>;
    using HLGToRec709Kernel = KernelSlot<&HLGKernels::toRec709>;
    using Rec709ToHLGKernel = KernelSlot<&HLGKernels::fromRec709>;
    using ClampFloats = KernelSlot<&ClampKernels::clamp>;
    using YUVToRGBKernel = KernelSlot<&YUVKernels::toRGB>;
    using RGBToYUVKernel = KernelSlot<&YUVKernels::fromRGB>;
    using ConvertGammaKernel = KernelSlot<&GammaKernels::convert>;
};

} // namespace PK
