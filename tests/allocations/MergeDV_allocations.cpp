// Frames of DV joined field by field.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

#include <algorithm>

namespace {

using namespace PKAllocations;

/// Random segments under a header that decoders take.
std::vector<uint8_t> DVFrame(size_t bytes, bool is625) {
    constexpr uint8_t kHeader525[] = {0x1f, 0x07, 0x00, 0x3f, 0xf9, 0x79, 0x79, 0x79};
    constexpr uint8_t kHeader625[] = {0x1f, 0x07, 0x00, 0xbf, 0xf8, 0x78, 0x78, 0x78};
    std::vector<uint8_t> frame = Content(bytes);
    std::ranges::copy(is625 ? kHeader625 : kHeader525, frame.begin());
    return frame;
}

void AddMerges(Calls& calls) {
    const auto add = [&](PK_PixelFormat format, size_t bytes, bool is625) {
        calls.push_back({{"PK_MergeDVCPRO"},
                         TakesOrRefuses("the two pictures that are joined"),
                         std::vector<uint8_t>(bytes),
                         [frame = DVFrame(bytes, is625), format](uint8_t* block) {
                             return PK_MergeDVCPRO(frame.data(), frame.data(), block, format, 4);
                         }});
    };
    add(PK_PixelFormat_NTSCDV25, 120000, false);
    add(PK_PixelFormat_PALDV50, 288000, true);
    add(PK_PixelFormat_NTSC_DV100_1080i, 480000, false);
    calls.push_back({{"PK_MergeDV"},
                     TakesOrRefuses("the two pictures that are joined"),
                     std::vector<uint8_t>(144000),
                     [frame = DVFrame(144000, true)](uint8_t* block) {
                         return PK_MergeDV(frame.data(), frame.data(), block, 144000, 4);
                     }});
}

const Family sMerges(AddMerges);

} // namespace
