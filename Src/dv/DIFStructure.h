#pragma once

// What a DIF frame holds besides the picture: headers, subcode, VAUX, audio blocks without sound, and the ID of each block.

#include "dv/DVFormat.h"

namespace PK {

/// Writes every byte of a frame; those of the video blocks behind their IDs are all ones.
/// \param firstChannel  0; 2 for the second frame of a pair of 720 lines.
/// \param frame         format.FrameBytes() bytes.
void WriteDIFStructure(const DVFormat& format, int32_t firstChannel, uint8_t* frame);

} // namespace PK
