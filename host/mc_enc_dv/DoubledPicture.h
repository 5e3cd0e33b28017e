#pragma once

// Small pictures for an encoder that knows one size.

#include "dv/DVPicture.h"

namespace mc_enc_dv {

/// Doubles a picture both ways, in straight lines between its samples: of luma, those of the result lie a quarter to either
/// side of them; of chroma, which lies on even pixels, every second one is the sample itself.
/// \param result  YUYV, of twice the width and height.
void DoublePicture(const PK::DVPicture& picture, int32_t width, int32_t height, uint8_t* result,
                   int32_t resultRowBytes) noexcept;

} // namespace mc_enc_dv
