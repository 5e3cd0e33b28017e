// Order of components and forced alpha.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::OrderBodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::ForceOpaqueRow_BGRA_8u, nullptr}};
    return bodies;
}
