#pragma once

// The names of the targets of an offer that answer a question with yes, from the lowest up.

#include "convert/KernelTable.h"

#include <string>
#include <vector>

namespace tool {

template <typename Question>
std::vector<std::string> TargetNames(PK::Offer offer, Question question) {
    std::vector<std::string> names;
    for (const PK::Target target : PK::TargetsOf(offer))
        if (question(target)) names.push_back(PK::TargetName(target));
    return names;
}

} // namespace tool
