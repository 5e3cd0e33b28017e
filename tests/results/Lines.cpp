#include "results/Lines.h"

#include <algorithm>
#include <array>
#include <cstdio>

namespace PKResults {

namespace {

std::string Hexadecimal(uint64_t value) {
    std::array<char, 17> text{};
    std::snprintf(text.data(), text.size(), "%016llx", static_cast<unsigned long long>(value));
    return text.data();
}

} // namespace

void Lines::Begin(std::string_view target, std::string_view family) {
    fPrefix = std::string(target) + "/" + std::string(family) + "/";
}

void Lines::Add(const std::string& name, const std::function<void(Line&)>& make) {
    const std::string whole = fPrefix + name;
    if (whole.find(fPart) == std::string::npos) return;
    Line line;
    make(line);
    fLines.push_back(whole + " " + Hexadecimal(line.results.Value()));
}

std::vector<std::string> Lines::Sorted() const {
    std::vector<std::string> lines = fLines;
    std::ranges::sort(lines);
    return lines;
}

std::vector<Family>& Family::Register() {
    static std::vector<Family> families;
    return families;
}

Family::Family(const char* itsName, Make itsMake, Choice itsChoice)
    : name(itsName), make(itsMake), choice(itsChoice) {
    Register().push_back(*this);
}

} // namespace PKResults
