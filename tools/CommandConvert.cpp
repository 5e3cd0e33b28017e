// pixelkiln convert: PNG files and raw frames from one format to another.

#include "Commands.h"

namespace tool {

void RunConvert(const PipeOptions& options) {
    PipeFrames(options, nullptr);
}

} // namespace tool
