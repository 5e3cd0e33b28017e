#include "dvcalls/CDVFrame.h"

#include "dv/DVFormat.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <iterator>

namespace PK {
namespace {

/// A pack is this byte and four of data, of which the second and third hold the fields.
constexpr uint8_t kSourceControl = 0x61;
constexpr size_t kDisplayByte = 2, kSystemByte = 3;
constexpr uint8_t kDisplayMask = 7, kSystemMask = 3;

/// Even sequences have the pack in the last block of VAUX, odd ones in the first.
constexpr size_t PackOffset(int32_t sequence) {
    constexpr size_t kInEven = 453, kInOdd = 248;
    return static_cast<size_t>(sequence) * kSequenceBytes + (sequence % 2 == 0 ? kInEven : kInOdd);
}

constexpr bool Is625(const uint8_t* frame) {
    return (frame[3] & 0x80) != 0;
}

constexpr int32_t kAspects = 5, kDisplays = kDisplayMask + 1;

constexpr DVAspect kNone = DVAspect::kNone;
/// By the system and the display field. Systems 2 and 3 are none, and their sequences do not count.
constexpr DVAspect kAspectOf[][kDisplays] = {
    {DVAspect::k4x3, DVAspect::kLetterbox16x9, DVAspect::k16x9, kNone, kNone, kNone, kNone, kNone},
    {DVAspect::k4x3, DVAspect::kLetterbox14x9, DVAspect::kLetterbox14x9, DVAspect::kLetterbox16x9,
     DVAspect::kLetterbox16x9, DVAspect::kLetterbox16x9, DVAspect::k14x9, DVAspect::k16x9},
};

DVAspect AspectOf(const uint8_t* pack) {
    const int32_t system = pack[kSystemByte] & kSystemMask;
    return system < 2 ? kAspectOf[system][pack[kDisplayByte] & kDisplayMask] : kNone;
}

struct Fields {
    uint8_t display, system;
};

Fields FieldsOf(DVAspect aspect, bool is625) {
    const auto own = static_cast<uint8_t>(is625);
    switch (aspect) {
    case DVAspect::kLetterbox16x9:
        return {1, 0};
    case DVAspect::k16x9:
        return {static_cast<uint8_t>(is625 ? 7 : 2), own};
    case DVAspect::kLetterbox14x9:
        return {1, 1};
    case DVAspect::k14x9:
        return {6, 1};
    default:
        return {0, own};
    }
}

constexpr uint8_t Replaced(uint8_t byte, uint8_t mask, uint8_t field) {
    return static_cast<uint8_t>((byte & ~mask) | field);
}

} // namespace

int32_t CDVFrame::SequenceCount() const {
    if (fSize == 0) return Is625(fFrame) ? 12 : 10;
    return std::max(fSize, 0) / kSequenceBytes;
}

DVAspect CDVFrame::VoteOnAspect() const {
    std::array<int32_t, kAspects> votes{};
    for (int32_t sequence = 0; sequence < SequenceCount(); ++sequence) {
        const uint8_t* const pack = fFrame + PackOffset(sequence);
        const DVAspect aspect = pack[0] == kSourceControl ? AspectOf(pack) : kNone;
        if (aspect != kNone) ++votes[static_cast<size_t>(aspect)];
    }
    const auto most = std::ranges::max_element(votes);
    return *most == 0 ? kNone : static_cast<DVAspect>(std::distance(votes.begin(), most));
}

void CDVFrame::WriteAspect(uint8_t* frame, int32_t size, DVAspect aspect) {
    if (aspect == kNone) return;
    const Fields fields = FieldsOf(aspect, Is625(frame));
    const int32_t sequences = CDVFrame(frame, size).SequenceCount();
    for (int32_t sequence = 0; sequence < sequences; ++sequence) {
        uint8_t* const pack = frame + PackOffset(sequence);
        if (pack[0] != kSourceControl) continue;
        pack[kDisplayByte] = Replaced(pack[kDisplayByte], kDisplayMask, fields.display);
        pack[kSystemByte] = Replaced(pack[kSystemByte], kSystemMask, fields.system);
    }
}

} // namespace PK
