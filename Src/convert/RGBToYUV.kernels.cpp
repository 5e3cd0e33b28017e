// The matrices from RGB to YUV.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::RGBToYUVBodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::RGBToYUV601Row, nullptr}};
    return bodies;
}
