#pragma once

// The names of the instruction sets that answer a question with yes, from the lowest up.

#include "convert/KernelTable.h"

#include <string>
#include <vector>

namespace tool {

template <typename Question>
std::vector<std::string> TargetNames(Question question) {
    std::vector<std::string> names;
    for (int i = 0; i < PK::kTargetCount; ++i)
        if (question(static_cast<PK::Target>(i))) names.push_back(PK::TargetName(static_cast<PK::Target>(i)));
    return names;
}

} // namespace tool
