#include "DVInspection.h"

#include "Numbers.h"

#include <algorithm>
#include <map>
#include <optional>

namespace tool {
namespace {

// A sequence: one block of its header, two of subcode, three of VAUX, then nine times one of audio and 15 of video.
constexpr int32_t kIDBytes = 3, kPackBytes = 5, kNoPack = 0xff;
enum Section : int32_t { kHeader, kSubcode, kVAUX, kAudio, kVideo };

struct BlockPlace {
    Section section;
    int32_t number; ///< within its section
};

BlockPlace PlaceOf(int32_t block) {
    if (block == 0) return {kHeader, 0};
    if (block < 3) return {kSubcode, block - 1};
    if (block < 6) return {kVAUX, block - 3};
    const int32_t group = (block - 6) / 16, within = (block - 6) % 16;
    return within == 0 ? BlockPlace{kAudio, group} : BlockPlace{kVideo, 15 * group + within - 1};
}

/// Two digits of four bits each; none for what is no number.
std::optional<int32_t> Digits(uint8_t byte, uint8_t tensMask) {
    const int32_t units = byte & 15, tens = (byte >> 4) & tensMask;
    if (units > 9 || tens > 9) return std::nullopt;
    return 10 * tens + units;
}

struct Clock {
    std::optional<int32_t> first, seconds, minutes, hours; ///< frames first
};

Clock ClockOf(const uint8_t* pack) {
    return {Digits(pack[1], 3), Digits(pack[2], 7), Digits(pack[3], 7), Digits(pack[4], 3)};
}

std::string TimeCodeText(const uint8_t* pack) {
    const Clock clock = ClockOf(pack);
    if (!clock.first || !clock.seconds || !clock.minutes || !clock.hours) return "";
    constexpr uint8_t kDropFrame = 0x40;
    return Formatted("%02d:%02d:%02d%c%02d", *clock.hours, *clock.minutes, *clock.seconds,
                     (pack[1] & kDropFrame) != 0 ? ';' : ':', *clock.first);
}

std::string DateText(const uint8_t* pack) {
    const auto day = Digits(pack[2], 3), month = Digits(pack[3], 1), year = Digits(pack[4], 15);
    if (!day || !month || !year) return "";
    return Formatted("%04d-%02d-%02d", *year < 75 ? 2000 + *year : 1900 + *year, *month, *day);
}

std::string TimeText(const uint8_t* pack) {
    const Clock clock = ClockOf(pack);
    if (!clock.seconds || !clock.minutes || !clock.hours) return "";
    return Formatted("%02d:%02d:%02d", *clock.hours, *clock.minutes, *clock.seconds);
}

/// By the low two bits of the fourth byte and the low three of the third.
std::string ShapeText(const uint8_t* pack) {
    static constexpr const char* kShapes[2][8] = {{"4:3", "16:9 between bars", "16:9"},
                                                  {"4:3", "14:9 between bars", "14:9 between bars",
                                                   "16:9 between bars", "16:9 between bars",
                                                   "16:9 between bars", "14:9", "16:9"}};
    const int32_t system = pack[3] & 3, display = pack[2] & 7;
    const char* const shape = system < 2 ? kShapes[system][display] : nullptr;
    return shape != nullptr ? shape : Formatted("unknown (%d, %d)", display, system);
}

std::string AudioText(const uint8_t* pack) {
    static constexpr const char* kRates[8] = {"48", "44.1", "32"};
    static constexpr const char* kBits[8] = {"16 bit", "12 bit, not linear", "20 bit"};
    const char* const rate = kRates[(pack[4] >> 3) & 7];
    const char* const bits = kBits[pack[4] & 7];
    return std::string(rate != nullptr ? rate : "?") + " kHz, " + (bits != nullptr ? bits : "? bit");
}

/// Keeps the text that is told most often, and of equally many the first.
class Vote {
public:
    void Add(const std::string& text) { ++fVotes[text]; }
    std::string Winner() const {
        const auto most = std::ranges::max_element(fVotes, {}, [](const auto& vote) { return vote.second; });
        return most == fVotes.end() ? "" : most->first;
    }

private:
    std::map<std::string, int32_t> fVotes;
};

/// Counts what is wrong, and remembers where it was first.
class Complaints {
public:
    void Add(const std::string& what, const std::string& where) {
        Complaint& complaint = fComplaints[what];
        if (complaint.count++ == 0) complaint.where = where;
    }
    std::vector<std::string> Sentences() const {
        std::vector<std::string> sentences;
        for (const auto& [what, complaint] : fComplaints)
            sentences.push_back(std::to_string(complaint.count) + " x " + what + ", first in " +
                                complaint.where);
        return sentences;
    }

private:
    struct Complaint {
        int32_t count = 0;
        std::string where;
    };
    std::map<std::string, Complaint> fComplaints;
};

class Inspection {
public:
    Inspection(const DVKind& kind, const uint8_t* frame) : fKind(kind), fFrame(frame) {
        constexpr uint8_t kFirstPair = 4;
        // The second frame of a pair has the channels behind those of the first.
        if (kind.IsProgressive() && (frame[1] & kFirstPair) == 0) fFirstChannel = 2;
    }

    DVFrameFacts Facts() {
        const DVKind* const told = DVKindOf(fFrame);
        if (told == nullptr)
            fComplaints.Add("no format told", "the first sequence");
        else if (told != &fKind)
            fComplaints.Add("another format told, " + DVKindText(*told), "the first sequence");
        for (int32_t channel = 0; channel < fKind.channels; ++channel)
            for (int32_t sequence = 0; sequence < fKind.Sequences(); ++sequence)
                TakeSequence(channel, sequence);
        fFacts.shape = fShapes.Winner();
        fFacts.chroma = Chroma();
        if (!fDate.empty() || !fTime.empty()) fFacts.recorded = fDate + (fTime.empty() ? "" : " ") + fTime;
        fFacts.errors = fComplaints.Sentences();
        return fFacts;
    }

private:
    std::string Chroma() const {
        if (fKind.format != PK_PixelFormat_NTSCDV25 && fKind.format != PK_PixelFormat_PALDV25) return "4:2:2";
        const bool is420 = fKind.is625 && (fFrame[4] & 7) == 0;
        return is420 ? "4:2:0" : "4:1:1";
    }

    void TakeSequence(int32_t channel, int32_t sequence) {
        const uint8_t* const first =
            fFrame + ptrdiff_t{channel * fKind.Sequences() + sequence} * kSequenceBytes;
        const std::string where =
            "channel " + std::to_string(channel) + ", sequence " + std::to_string(sequence);
        for (int32_t index = 0; index < kSequenceBlocks; ++index) {
            const uint8_t* const block = first + ptrdiff_t{index} * kDIFBlockBytes;
            const BlockPlace place = PlaceOf(index);
            const std::string here = where + ", block " + std::to_string(index);
            CheckID(block, place, channel, sequence, here);
            TakeBlock(block, place, here);
        }
        TakeShape(first, sequence);
    }

    /// The pack that merging and players go by: that of the last block of VAUX, or in odd sequences of the first.
    void TakeShape(const uint8_t* first, int32_t sequence) {
        constexpr uint8_t kSourceControl = 0x61;
        const uint8_t* const pack = first + (sequence % 2 == 0 ? 453 : 248);
        if (pack[0] == kSourceControl) fShapes.Add(ShapeText(pack));
    }

    void CheckID(const uint8_t* block, const BlockPlace& place, int32_t channel, int32_t sequence,
                 const std::string& where) {
        const int32_t c = channel + fFirstChannel;
        const int32_t address = sequence << 4 | (c & 1) << 3 | (c < 2 ? 1 : 0) << 2;
        if (block[0] >> 5 != place.section) fComplaints.Add("wrong section in an ID", where);
        if ((block[1] & 0xfc) != address) fComplaints.Add("wrong sequence or channel in an ID", where);
        if (block[2] != place.number) fComplaints.Add("wrong number in an ID", where);
    }

    void TakeBlock(const uint8_t* block, const BlockPlace& place, const std::string& where) {
        switch (place.section) {
        case kHeader:
            return TakeHeader(block, where);
        case kSubcode:
            for (int32_t sync = 0; sync < 6; ++sync) TakeSubcode(block + kIDBytes + ptrdiff_t{8} * sync + 3);
            return;
        case kVAUX:
            for (int32_t pack = 0; pack < 15; ++pack)
                TakeVAUX(block + kIDBytes + ptrdiff_t{kPackBytes} * pack);
            return;
        case kAudio:
            return TakeAAUX(block + kIDBytes);
        case kVideo:
            if (block[kIDBytes] >> 4 != 0)
                fComplaints.Add(Formatted("macroblock marked as an error (STA %d)", block[kIDBytes] >> 4),
                                where);
            return;
        }
    }

    void TakeHeader(const uint8_t* block, const std::string& where) {
        const int32_t track = block[4] & 7, first = block[5] & 7, second = block[6] & 7, third = block[7] & 7;
        const std::string numbers =
            Formatted(" (APT %d, AP1 to AP3 %d, %d, %d)", track, first, second, third);
        if (track > 1 || first > 1 || first != second || first != third)
            fComplaints.Add("application IDs that mean no DV" + numbers, where);
        else if (track != first)
            fComplaints.Add("application IDs that disagree" + numbers, where);
        if (((block[3] & 0x80) != 0) != fKind.is625)
            fComplaints.Add("header of the other count of lines", where);
    }

    void TakeSubcode(const uint8_t* pack) {
        constexpr int32_t kTimeCode = 0x13;
        if (pack[0] == kNoPack) return;
        fFacts.subcode.insert(pack[0]);
        if (pack[0] == kTimeCode && fFacts.timeCode.empty()) fFacts.timeCode = TimeCodeText(pack);
    }

    void TakeVAUX(const uint8_t* pack) {
        constexpr int32_t kDate = 0x62, kTime = 0x63;
        if (pack[0] == kNoPack) return;
        fFacts.vaux.insert(pack[0]);
        if (pack[0] == kDate && fDate.empty()) fDate = DateText(pack);
        if (pack[0] == kTime && fTime.empty()) fTime = TimeText(pack);
    }

    void TakeAAUX(const uint8_t* pack) {
        constexpr int32_t kSource = 0x50;
        if (pack[0] == kNoPack) return;
        fFacts.aaux.insert(pack[0]);
        if (pack[0] == kSource && fFacts.audio.empty()) fFacts.audio = AudioText(pack);
    }

    const DVKind& fKind;
    const uint8_t* fFrame;
    int32_t fFirstChannel = 0;
    DVFrameFacts fFacts;
    Vote fShapes;
    Complaints fComplaints;
    std::string fDate, fTime;
};

} // namespace

bool IsWide(const DVKind& kind, const uint8_t* frame) {
    return InspectDVFrame(kind, frame).shape == "16:9";
}

DVFrameFacts InspectDVFrame(const DVKind& kind, const uint8_t* frame) {
    return Inspection(kind, frame).Facts();
}

} // namespace tool
