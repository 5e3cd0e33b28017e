#pragma once

// The colour spaces as the command line names them, and what each of them can do beside converting.

#include <PixelKiln/ColorSpace.h>

#include <memory>
#include <string>
#include <vector>

namespace tool {

/// What tone-range compression of a space leaves.
enum class ToneRangeOutput {
    None,    ///< it does nothing
    Encoded, ///< pixels of the space
    Linear,  ///< linear light with the primaries of the space
};

struct Space {
    std::string name;
    std::shared_ptr<const PK::ColorSpace> conversion;
    bool hasHubPrimaries = false;   ///< those of Rec. 709
    bool clipsGamutFromHub = false; ///< its conversion from the hub heeds gamutClip
    bool clipsGamutToHub = false;
    ToneRangeOutput toneRange = ToneRangeOutput::None;
};

/// Reads a name in any case, such as rec2020 or gamma:0.45. Throws a usage Failure that lists the names.
Space ParseSpace(const std::string& text);

/// The names that ParseSpace reads, each space once, for a message or a help text.
std::string SpaceNames();

} // namespace tool
