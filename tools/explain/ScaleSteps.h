#pragma once

// The steps of a scale-and-convert call, as the library plans them.

#include "scale/ScaleRoute.h"

#include <string>
#include <vector>

namespace tool {

struct ScaleStep {
    std::string route;
    std::string what;
    PK::ScaleImage leaves;
};

std::vector<ScaleStep> DescribeScale(const PK::ScaleCall& call);

} // namespace tool
