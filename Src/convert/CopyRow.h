#pragma once

// Rows that stay as they are. One body each: the block copy chooses its own instructions.

#include "convert/Kernel.h"

#include <array>

namespace PK {

extern const std::array<KernelBody, 6> kCopyBodies;

} // namespace PK
