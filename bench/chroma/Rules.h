#pragma once

// Field pictures decoded by the right rule and by wrong ones.

#include "Video.h"

#include <span>

namespace ChromaBench {

struct Rule {
    const char* name;
    Video (*decode)(const Video& planes); ///< whose kind is kFields
};

std::span<const Rule> AllRules();

} // namespace ChromaBench
