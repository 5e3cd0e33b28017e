// pixelkiln dv: raw files of DV. Its commands are DVInfo.cpp, DVDecode.cpp, DVEncode.cpp and DVMerge.cpp.

#include "Command.h"

namespace tool {
namespace {

const Command sDV(Group::Frames, "dv",
                  "Look into, decode, encode and merge raw files of DV25, DV50 and DV100");

} // namespace
} // namespace tool
