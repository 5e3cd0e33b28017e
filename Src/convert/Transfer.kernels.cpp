// The transfer function between gamma-coded and linear light.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::TransferBodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::GammaToLinearRow, nullptr}};
    return bodies;
}
