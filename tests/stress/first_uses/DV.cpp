// What DV makes at first need: the encoded frames of black and the table of the code.

#include "stress/first_uses/FirstUse.h"

#include "dv/BlackDVFrame.h"
#include "dv/DVSegment.h"

#include <PixelKiln/PixelFormat.h>

namespace {

using namespace PKStress;

template <PK_PixelFormat kStream>
Answer Black() {
    const auto frame = PK::BlackDVFrame(kStream);
    return {frame.begin(), frame.end()};
}

const FirstUse sBlack525("black-dv-525", Once(Black<PK_PixelFormat_NTSCDV25>));
const FirstUse sBlack625("black-dv-625", Once(Black<PK_PixelFormat_PALDV25>));

Answer CodeTable() {
    Answer levels;
    for (const auto& pair : PK::DVCodeTable().pairs) levels.push_back(pair.secondLevel);
    return levels;
}

const FirstUse sCodeTable("dv-code-table", Once(CodeTable));

} // namespace
