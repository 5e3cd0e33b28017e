// Frames of DV joined field by field, of every kind.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/PixelKiln.h>

#include <algorithm>

namespace {

using namespace PKStress;

/// Random segments under a header that decoders take.
std::vector<uint8_t> DVFrame(PK_PixelFormat format, PKTest::Random& random) {
    constexpr uint8_t kHeader[] = {0x1f, 0x07, 0x00, 0x3f, 0xf9, 0x79, 0x79, 0x79};
    std::vector<uint8_t> frame = RandomImage(format, 0, 0, random);
    std::ranges::copy(kHeader, frame.begin());
    return frame;
}

std::function<bool()> PrepareMerges() {
    PKTest::Random random(61);
    std::vector<Call> calls;
    for (const PK_PixelFormat format : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV25,
                                        PK_PixelFormat_NTSCDV50, PK_PixelFormat_NTSC_DV100_720p})
        calls.push_back({RandomImage(format, 0, 0, random),
                         [format, a = DVFrame(format, random), b = DVFrame(format, random)](uint8_t* frame) {
                             return PK_MergeDVCPRO(a.data(), b.data(), frame, format, 4);
                         }});
    calls.push_back({RandomImage(PK_PixelFormat_PALDV25, 0, 0, random), // in place
                     [a = DVFrame(PK_PixelFormat_PALDV25, random)](uint8_t* frame) {
                         std::copy(a.begin(), a.end(), frame);
                         return PK_MergeDV(frame, a.data(), frame, 144000, 5);
                     }});
    return Repeat(calls);
}

const Operation sMerges("merge-dv", PrepareMerges);

} // namespace
