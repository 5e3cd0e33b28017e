// Chroma resampling between 4:4:4 and 4:2:2.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"

template <>
PK::KernelBodies PK::ChromaBodies<PK::PK_TARGET::kTarget>() {
    static constexpr KernelBody bodies[] = {{Kernel::Downsample444To422Row, nullptr}};
    return bodies;
}
