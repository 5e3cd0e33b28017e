// The encoded frames of black.

#include "stress/first_uses/FirstUse.h"

#include "dv/BlackDVFrame.h"

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

} // namespace
