#pragma once

// The register of all kernels of the library. It stands above all rooms, and none of them knows it.

#include "primitives/KernelRow.h"

#include <vector>

namespace PK {

/// Every kernel, family by family.
std::vector<KernelRow> KernelRegister();

} // namespace PK
