#pragma once

// One picture over another, by the blend modes and their names.

#include "Frame.h"

#include <span>
#include <string>

namespace tool {

/// The names of the modes, by their numbers.
std::span<const char* const> ModeNames();

/// Throws a usage Failure that lists the names for any other.
PK_BlendMode ModeOfName(const std::string& name);

struct Blend {
    PK_BlendMode mode = PK_BlendMode_Normal;
    float opacity = 1;
    bool inLinear = false; ///< Of the normal mode only: in linear light.
};

/// Throws a Failure where the sizes differ.
/// \return in the format of the back picture.
Frame Blended(const Frame& top, const Frame& back, const Blend& blend);

} // namespace tool
