#include "support/Family.h"

#include "support/Check.h"
#include "support/Switches.h"

#include <PixelKiln/Lifecycle.h>

#include <algorithm>

namespace PKFuzz {

std::vector<const Family*>& Family::Register() {
    static std::vector<const Family*> families;
    return families;
}

Family::Family(char letter, const char* name, Run run) : fLetter(letter), fName(name), fRun(run) {
    std::vector<const Family*>& families = Register();
    const auto place = std::ranges::lower_bound(families, letter, {}, &Family::Letter);
    Check(place == families.end() || (*place)->Letter() != letter, "every family has a letter of its own");
    families.insert(place, this);
}

const std::vector<const Family*>& Family::All() {
    return Register();
}

const Family& Family::OfFirstByte(uint8_t byte) {
    const std::vector<const Family*>& families = All();
    const auto own = std::ranges::find(families, static_cast<char>(byte), &Family::Letter);
    return own != families.end() ? **own : *families[byte % families.size()];
}

void Family::RunOnce(ByteStream& stream) const {
    SetCall(fName);
    SetSwitches(SwitchesAfterStart());
    fRun(stream);
    SetSwitches(SwitchesAfterStart());
}

} // namespace PKFuzz

int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t count) {
    using namespace PKFuzz;
    static const PK_Result started = PK_Initialize();
    Check(started == PK_Success, "PK_Initialize succeeds");
    ByteStream stream(bytes, count);
    Family::OfFirstByte(stream.Byte()).RunOnce(stream);
    return 0;
}

// The sanitizers read their defaults here: a refused allocation is a null pointer, as it is without them.
extern "C" const char* __asan_default_options();
const char* __asan_default_options() {
    return "allocator_may_return_null=1";
}
