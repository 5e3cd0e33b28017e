// Changes of sample depth.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::DepthBodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::ExpandTo32fRow_RGB_8u, nullptr}};
    return bodies;
}
