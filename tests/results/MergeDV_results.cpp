// Frames of DV joined field by field.

#include "results/Formats.h"
#include "results/Lines.h"

#include <PixelKiln/PixelKiln.h>

#include <algorithm>
#include <vector>

namespace {

using namespace PKResults;

constexpr size_t kLargest = 576000;

/// Random segments under a header that decoders take, with packs of all meanings.
std::vector<uint8_t> DVFrame(Line& line, bool is625) {
    constexpr uint8_t kHeader[] = {0x1f, 0x07, 0x00, 0x3f, 0xf9, 0x79, 0x79, 0x79};
    std::vector<uint8_t> frame(kLargest);
    line.random.Fill(frame.data(), frame.size());
    std::ranges::copy(kHeader, frame.begin());
    if (is625) frame[3] |= 0x80;
    for (size_t sequence = 0; sequence < 48; sequence += 2) frame[sequence * 12000 + 453] = 0x61;
    return frame;
}

void AddMerges(Lines& lines) {
    constexpr PK_PixelFormat kFormats[] = {
        PK_PixelFormat_NTSCDV25,         PK_PixelFormat_PALDV25,         PK_PixelFormat_NTSCDV50,
        PK_PixelFormat_PALDV50,          PK_PixelFormat_NTSC_DV100_720p, PK_PixelFormat_PAL_DV100_720p,
        PK_PixelFormat_NTSC_DV100_1080i, PK_PixelFormat_PAL_DV100_1080i,
    };
    for (const PK_PixelFormat format : kFormats)
        for (const int32_t quality : {0, 4, 5})
            lines.Add(NameOf(format) + "/" + std::to_string(quality), [&](Line& line) {
                const std::vector<uint8_t> a = DVFrame(line, true), b = DVFrame(line, false);
                std::vector<uint8_t> frame(kLargest);
                line.results.Add(PK_MergeDVCPRO(a.data(), b.data(), frame.data(), format, quality));
                line.results.AddBytes(frame.data(), frame.size());
            });
    for (const int32_t frameBytes : {120000, 144000, 999, 0, -5})
        lines.Add("bytes/" + std::to_string(frameBytes), [&](Line& line) {
            const std::vector<uint8_t> a = DVFrame(line, true), b = DVFrame(line, true);
            std::vector<uint8_t> frame(kLargest);
            line.results.Add(PK_MergeDV(a.data(), b.data(), frame.data(), frameBytes, 4));
            line.results.AddBytes(frame.data(), frame.size());
        });
    lines.Add("refused", [](Line& line) {
        std::vector<uint8_t> a = DVFrame(line, false), frame(kLargest);
        const auto add = [&](const void* first, const void* second, void* dst, PK_PixelFormat format) {
            line.results.Add(PK_MergeDVCPRO(first, second, dst, format, 4));
            line.results.AddBytes(frame.data(), frame.size());
        };
        add(nullptr, a.data(), frame.data(), PK_PixelFormat_NTSCDV25);
        add(a.data(), nullptr, frame.data(), PK_PixelFormat_NTSCDV50);
        add(a.data(), a.data(), nullptr, PK_PixelFormat_PAL_DV100_1080i);
        add(nullptr, nullptr, nullptr, PK_PixelFormat_YUYV_422_8u);
        for (const PK_PixelFormat format : kStrangers) add(a.data(), a.data(), frame.data(), format);
        a[4] = 0xff;
        add(a.data(), a.data(), frame.data(), PK_PixelFormat_NTSCDV25);
    });
}

const Family sMerges("merge-dv", AddMerges);

} // namespace
