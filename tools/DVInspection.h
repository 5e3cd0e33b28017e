#pragma once

// What frames of DV tell beside the picture, and what is wrong with them.

#include "DVFormats.h"

#include <cstdint>
#include <set>
#include <string>
#include <vector>

namespace tool {

/// What one frame tells; empty where it does not.
struct DVFrameFacts {
    std::string timeCode; ///< such as 01:02:03:04, with ; before the frames where some numbers are left out
    std::string recorded; ///< such as 2003-07-04 12:34:56
    std::string shape;    ///< of the picture, such as 16:9
    std::string audio;    ///< such as "48 kHz, 16 bit"
    std::string chroma;   ///< 4:1:1, 4:2:0 or 4:2:2
    std::set<uint8_t> vaux, subcode, aaux; ///< the packs that are there
    std::vector<std::string> errors;       ///< of each kind one, with how often it is there
};

/// Whether most packs say that the picture is 16:9 from edge to edge.
bool IsWide(const DVKind& kind, const uint8_t* frame);

/// \param frame  as many bytes as the kind has.
DVFrameFacts InspectDVFrame(const DVKind& kind, const uint8_t* frame);

} // namespace tool
