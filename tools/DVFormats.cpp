#include "DVFormats.h"

#include "Failure.h"
#include "Formats.h"
#include "Frame.h"

#include <algorithm>
#include <iterator>

namespace tool {
namespace {

constexpr const char *k525 = "30000:1001", *k625 = "25:1";
constexpr DVKind kKinds[] = {
    {PK_PixelFormat_NTSCDV25, 720, 480, 1, 0x00, false, k525, 2, "8:9", "32:27"},
    {PK_PixelFormat_PALDV25, 720, 576, 1, 0x00, true, k625, 2, "16:15", "64:45"},
    {PK_PixelFormat_NTSCDV50, 720, 480, 2, 0x04, false, k525, 2, "8:9", "32:27"},
    {PK_PixelFormat_PALDV50, 720, 576, 2, 0x04, true, k625, 2, "16:15", "64:45"},
    {PK_PixelFormat_NTSC_DV100_720p, 960, 720, 2, 0x18, false, "60000:1001", 0, "4:3", "4:3"},
    {PK_PixelFormat_PAL_DV100_720p, 960, 720, 2, 0x18, true, "50:1", 0, "4:3", "4:3"},
    {PK_PixelFormat_NTSC_DV100_1080i, 1280, 1080, 4, 0x14, false, k525, 1, "3:2", "3:2"},
    {PK_PixelFormat_PAL_DV100_1080i, 1440, 1080, 4, 0x14, true, k625, 1, "4:3", "4:3"},
};

/// The VAUX source pack of a sequence, wherever it stands among the packs; null if there is none.
const uint8_t* FindSourcePack(const uint8_t* sequence) {
    constexpr int32_t kFirstVAUX = 3, kVAUXBlocks = 3, kPacks = 15, kPackBytes = 5, kIDBytes = 3;
    constexpr uint8_t kSource = 0x60;
    for (int32_t block = kFirstVAUX; block < kFirstVAUX + kVAUXBlocks; ++block)
        for (int32_t pack = 0; pack < kPacks; ++pack) {
            const uint8_t* const at = sequence + block * kDIFBlockBytes + kIDBytes + pack * kPackBytes;
            if (*at == kSource) return at;
        }
    return nullptr;
}

} // namespace

const DVKind& ParseDVKind(const std::string& name) {
    const PK_PixelFormat format = ParseFormat(name);
    const auto* const kind = std::ranges::find(kKinds, format, &DVKind::format);
    if (kind != std::end(kKinds)) return *kind;
    std::string names;
    for (const DVKind& known : kKinds) names += (names.empty() ? "" : ", ") + FormatName(known.format);
    throw Failure(kExitUsage, FormatName(format) + " is no format of DV; those are " + names);
}

const DVKind* DVKindOf(const uint8_t* frame) {
    constexpr int32_t kTypeMask = 0x1f;
    const uint8_t* const pack = FindSourcePack(frame);
    if (pack == nullptr) return nullptr;
    const bool is625 = (frame[3] & 0x80) != 0;
    const auto* const kind = std::ranges::find_if(kKinds, [&](const DVKind& known) {
        return known.type == (pack[3] & kTypeMask) && known.is625 == is625;
    });
    return kind != std::end(kKinds) ? kind : nullptr;
}

std::string DVKindText(const DVKind& kind) {
    std::string rate = kind.rate;
    std::ranges::replace(rate, ':', '/');
    if (rate.ends_with("/1")) rate.resize(rate.size() - 2);
    return FormatName(kind.format) + ", " + SizeText(kind.width, kind.height) + ", " + rate +
           " frames a second";
}

} // namespace tool
