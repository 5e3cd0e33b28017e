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

std::string Command::Name() const {
    const std::string name = fName;
    return name.substr(name.find(' ') + 1);
}

std::string Command::Family() const {
    const std::string name = fName;
    const size_t space = name.find(' ');
    return space == std::string::npos ? std::string() : name.substr(0, space);
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
