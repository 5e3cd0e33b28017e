#pragma once

// A picture of 4:2:2 to a frame of any DV.

#include "dv/DVFormat.h"
#include "dv/DVPicture.h"
#include "dv/DVPolicy.h"

namespace PK {

/// \param picture       of the format's width and height.
/// \param firstChannel  0; 2 for the second frame of a pair of 720 lines.
/// \param frame         format.FrameBytes() bytes; every one is written.
void EncodeDV(const DVFormat& format, const DVPicture& picture, int32_t firstChannel, const DVPolicy& policy,
              uint8_t* frame);

} // namespace PK
