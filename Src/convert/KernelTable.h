#pragma once

// The rows of the register that are row kernels of conversion, by their identity, and the choice of their bodies.

#include "convert/Kernel.h"
#include "primitives/KernelRow.h"

namespace PK {

/// The register's row of a kernel; its operands are a pair of formats that the kernel converts between.
const KernelRow& Info(Kernel kernel) noexcept;

/// The body for one target, null if the kernel has none.
RowKernel Body(Kernel kernel, Target target) noexcept;

/// The highest target that is enabled and has a body; false if there is none.
bool ChooseTarget(Kernel kernel, Target& target) noexcept;

/// The body of the chosen target, null if there is none.
RowKernel ChooseBody(Kernel kernel) noexcept;

} // namespace PK
