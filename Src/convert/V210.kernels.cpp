// Ten-bit packed 4:2:2.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::V210Bodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::UYVY8uToV210Row, nullptr}};
    return bodies;
}
