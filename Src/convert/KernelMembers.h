#pragma once

// Which member of a kernel family serves a format: depth, component order, structure and matrix select it.
// Each returns Kernel::None where the family has no member for the format.

#include "convert/Kernel.h"

#include <PixelKiln/Types.h>

namespace PK {

Kernel CopyMember(PK_PixelFormat format);
Kernel ForceOpaqueMember(PK_PixelFormat format);
Kernel SwapOrderMember(PK_PixelFormat format);
Kernel PremultiplyMember(PK_PixelFormat format);
Kernel UnpremultiplyMember(PK_PixelFormat format);

/// From `format` to the same at 32f.
Kernel ExpandTo32fMember(PK_PixelFormat format);

/// To `format` from the same at 32f.
Kernel PackFrom32fMember(PK_PixelFormat format);

/// From the 8-bit YUV format, by its matrix.
Kernel YUVToRGBMember(PK_PixelFormat format);
Kernel YUVToRGBFloat32Member(PK_PixelFormat format);

/// To the YUV destination, by its matrix.
Kernel RGBToYUVMember(PK_PixelFormat destination);
Kernel RGBToYUVFloat32Member(PK_PixelFormat destination);

/// From the float YUV format to the other matrix.
Kernel ChangeMatrixFloat32Member(PK_PixelFormat format);

/// From the 4:2:2 format to four channels; `quality` is the render quality.
Kernel Upsample422To444Member(PK_PixelFormat format, int32_t quality);

/// Float chroma is interpolated above this render quality, and repeated up to it.
inline constexpr int32_t kHighestRepeatingQuality = 1;

/// The kernel that does the same at this render quality.
Kernel AtQuality(Kernel kernel, int32_t quality);

} // namespace PK
