#include "Command.h"

#include <algorithm>
#include <string_view>
#include <utility>

namespace tool {

std::vector<const Command*>& Command::Register() {
    static std::vector<const Command*> commands;
    return commands;
}

Command::Command(Group group, const char* name, const char* description, DeclareWords declare)
    : fGroup(group), fName(name), fDescription(description), fDeclare(std::move(declare)) {
    const auto place = [](const Command* command) {
        return std::pair(command->fGroup, std::string_view(command->fName));
    };
    Register().insert(std::ranges::upper_bound(Register(), place(this), {}, place), this);
}

const char* Command::Heading() const {
    switch (fGroup) {
    case Group::Listings:
        return "Listings";
    case Group::Frames:
        return "Frames";
    case Group::Operations:
        return "Operations on frames";
    default:
        return "Pictures";
    }
}

} // namespace tool
