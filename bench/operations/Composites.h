#pragma once

namespace OperationBench {

/// Of the image on top.
inline constexpr float kOpacity = 0.6F;

} // namespace OperationBench
