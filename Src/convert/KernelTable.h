#pragma once

// The register of row kernels. The router's chooser, the trace of a chain, the sweep over all bodies and the
// micro-benchmark all read this one table.

#include "convert/Kernel.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/Types.h>

namespace PK {

/// How the bodies of a kernel agree with each other.
enum class Agreement : uint8_t {
    Exact,    ///< Every body gives the bytes of the plain one.
    Declared, ///< The vector bodies differ from the plain one by a stated rule.
};

/// One kernel of the register.
struct KernelInfo {
    Kernel kernel;
    const char* name; ///< The family's name, as traces and documentation show it.
    PK_PixelFormat source;
    PK_PixelFormat destination; ///< With `source`, a pair of formats that the kernel converts between.
    Agreement agreement = Agreement::Exact;
};

const KernelInfo& Info(Kernel kernel) noexcept;

/// The body for one target, null if the kernel has none.
RowKernel Body(Kernel kernel, Target target) noexcept;

/// The highest target that is enabled and has a body; false if there is none.
bool ChooseTarget(Kernel kernel, Target& target) noexcept;

/// The body of the chosen target, null if there is none.
RowKernel ChooseBody(Kernel kernel) noexcept;

} // namespace PK
