// Prints a hash of the results of every operation, variant and instruction set: what is printed before and after a
// change that is to leave results as they are must be the same.

#include "results/Lines.h"

#include "support/Targets.h"

#include <PixelKiln/Lifecycle.h>

#include <cstdio>

namespace {

using namespace PKResults;

constexpr char kUsage[] =
    "usage: pixelkiln_results [PART_OF_A_NAME]\n"
    "\n"
    "Prints the hashes of the results of the library, one line each, or those lines whose\n"
    "names have the part.\n";

void MakeFamilies(Family::Choice choice, std::string_view target, Lines& lines) {
    for (const Family& family : Family::All()) {
        if (family.choice != choice) continue;
        lines.Begin(target, family.name);
        family.make(lines);
    }
}

void MakeAll(Lines& lines) {
    MakeFamilies(Family::Choice::kProcessor, "once", lines);
    for (const PK::Target target : PKTest::TargetsOfThisProcessor()) {
        const PKTest::TargetScope scope(target);
        MakeFamilies(Family::Choice::kFlags, PK::TargetName(target), lines);
    }
}

} // namespace

int main(int count, char** arguments) {
    const std::string_view part = count == 2 ? arguments[1] : "";
    if (count > 2 || part.starts_with("-")) {
        std::fputs(kUsage, stderr);
        return 2;
    }
    PK_Initialize();
    Lines lines(part);
    MakeAll(lines);
    PK_Terminate();
    const std::vector<std::string> sorted = lines.Sorted();
    for (const std::string& line : sorted) std::puts(line.c_str());
    return sorted.empty() ? 1 : 0;
}
