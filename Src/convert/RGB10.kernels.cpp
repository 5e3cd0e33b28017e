// Ten-bit packed RGB.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::RGB10Bodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::BGR8uToRGB10uRow, nullptr}};
    return bodies;
}
