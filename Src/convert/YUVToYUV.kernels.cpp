// The matrices between BT.601 and BT.709.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::YUVToYUVBodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::YUV601To709Row, nullptr}};
    return bodies;
}
