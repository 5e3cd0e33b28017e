// The matrices from YUV to RGB.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::YUVToRGBBodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::YUV601ToRGBRow, nullptr}};
    return bodies;
}
