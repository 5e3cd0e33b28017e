#pragma once

// How the library goes from one format to another, in words. Declared here in terms of the exported types, so
// that the commands that touch pixels can tell of it without seeing the library's insides.

#include <PixelKiln/PixelKiln.h>

#include <string>
#include <vector>

namespace tool {

struct ChainStep {
    std::string kernel;
    PK_PixelFormat leaves; ///< the format that the row is in afterwards
    std::string body;      ///< the instruction set of the body chosen on this machine
    int pass;              ///< steps of one pass over the row share a number, counted from 1
};

/// The steps between two raster formats, empty if there is no way.
std::vector<ChainStep> DescribeChain(PK_PixelFormat source, PK_PixelFormat destination, int32_t quality);

} // namespace tool
