#pragma once

// Rows that stay as they are. One body each: the block copy chooses its own instructions.

#include "primitives/KernelShapes.h"

namespace PK {

struct CopyKernels {
    RowKernel CopyRow_4444_8u;
    RowKernel CopyRow_4444_15u;
    RowKernel CopyRow_4444_32f;
    RowKernel CopyRow_422_8u;
    RowKernel CopyRow_422_32f;
    RowKernel CopyRow_V210;

    static constexpr const char* kFamily = "Copy";
    static constexpr Offer kOffer = Offer::flags;
    template <Target kTarget>
    static const CopyKernels& For() {
        return kTarget == Target::plain ? kBodies : kNone;
    }

private:
    static const CopyKernels kBodies, kNone;
};

} // namespace PK
