// pixelkiln dv info: what a file of DV tells beside its pictures, and what is wrong with it.

#include "Command.h"
#include "DVFile.h"
#include "DVInspection.h"
#include "Numbers.h"
#include "SharedWords.h"
#include "Terminal.h"

#include <algorithm>

namespace tool {
namespace {

struct Options : ListOptions {
    std::string input;
    std::string from;
    bool frames = false;
};

constexpr const char* kNotes =
    R"(A raw file of DV holds one DIF frame after the other, as 'ffmpeg -i IN -c copy -f dv OUT.dv' writes them.
What is told: time code (subcode pack 13), recording date and time (VAUX packs 62 and 63), shape of the
picture (the VAUX packs 61 of a frame, by majority), audio (AAUX pack 50), and which packs there are.
Looked for: IDs of blocks that are not those of their places, headers whose application IDs are unknown or
disagree, macroblocks that are marked as errors, frames that tell another format, and what is left behind
the last frame.

Examples:
  pixelkiln dv info tape.dv
  pixelkiln dv info tape.dv --frames
)";

void Declare(Words& words, Options& options) {
    words.Take("IN", options.input, "Raw file of DV, or -").Required();
    words.Take("--from", options.from, "Its format, such as PALDV25, where the first frame does not tell");
    words.Flag("--frames", options.frames, "A row for each frame");
    AddListing(words, options);
    words.Notes(kNotes);
}

std::string OrNone(const std::string& text) {
    return text.empty() ? "none" : text;
}

std::string PacksText(const std::set<uint8_t>& packs) {
    std::vector<std::string> words;
    for (const uint8_t pack : packs) words.push_back(Formatted("%02x", pack));
    return OrNone(Join(words, " "));
}

/// What frames tell that need not all tell the same.
class Span {
public:
    void Add(const std::string& text) {
        if (fIsEmpty) fFirst = text;
        fChanges = fChanges || (!fIsEmpty && text != fLast);
        fLast = text;
        fIsEmpty = false;
    }

    /// From the first to the last.
    std::string Text() const { return OrNone(fFirst) + (fFirst == fLast ? "" : " to " + OrNone(fLast)); }

    /// One of them, where all should be alike.
    std::string Only() const { return OrNone(fFirst) + (fChanges ? ", then others" : ""); }

private:
    std::string fFirst, fLast;
    bool fIsEmpty = true, fChanges = false;
};

class Report {
public:
    explicit Report(const Options& options)
        : fOptions(options),
          fFrames({"Frame", "Time code", "Recorded", "Shape", "Chroma", "Audio", "Errors"}) {}

    void Add(const DVFrameFacts& facts) {
        fTimeCode.Add(facts.timeCode);
        fRecorded.Add(facts.recorded);
        fShape.Add(facts.shape);
        fChroma.Add(facts.chroma);
        fAudio.Add(facts.audio);
        fVAUX.insert(facts.vaux.begin(), facts.vaux.end());
        fSubcode.insert(facts.subcode.begin(), facts.subcode.end());
        fAAUX.insert(facts.aaux.begin(), facts.aaux.end());
        for (const std::string& error : facts.errors)
            AddError("frame " + std::to_string(fCount) + ": " + error);
        fFrames.Add({std::to_string(fCount), OrNone(facts.timeCode), OrNone(facts.recorded),
                     OrNone(facts.shape), facts.chroma, OrNone(facts.audio),
                     std::to_string(facts.errors.size())});
        ++fCount;
    }

    void AddError(const std::string& error) {
        constexpr size_t kMost = 20; // a file of something else has many
        if (++fErrorCount <= kMost) fErrors.push_back(error);
    }

    int64_t Count() const { return fCount; }

    void Show(const DVKind& kind) const {
        if (fOptions.frames || fOptions.csv) return Print(fOptions.csv ? fFrames.CSV() : fFrames.Aligned());
        Print(Bold(fOptions.input) + ": " + std::to_string(fCount) + (fCount == 1 ? " frame" : " frames") +
              " of " + DVKindText(kind) + "\n");
        const auto line = [](const char* what, const std::string& text) {
            Print(Formatted("  %-10s  ", what) + text + "\n");
        };
        line("chroma", fChroma.Only());
        line("shape", fShape.Only());
        line("time code", fTimeCode.Text());
        line("recorded", fRecorded.Text());
        line("audio", fAudio.Only());
        line("packs",
             "VAUX " + PacksText(fVAUX) + "; subcode " + PacksText(fSubcode) + "; audio " + PacksText(fAAUX));
        line("errors", fErrors.empty() ? "none" : std::to_string(fErrorCount));
        for (const std::string& error : fErrors) Print("    " + error + "\n");
        if (fErrorCount > fErrors.size())
            Print("    and " + std::to_string(fErrorCount - fErrors.size()) + " more\n");
    }

private:
    const Options& fOptions;
    Table fFrames;
    Span fTimeCode, fRecorded, fShape, fChroma, fAudio;
    std::set<uint8_t> fVAUX, fSubcode, fAAUX;
    std::vector<std::string> fErrors;
    size_t fErrorCount = 0;
    int64_t fCount = 0;
};

void Run(const Options& options) {
    DVFile file(options.input, options.from);
    const DVKind& kind = file.Kind();
    Report report(options);
    Progress progress("frames", file.FrameCount());
    for (std::vector<uint8_t> frame = file.NextPart(); !frame.empty(); frame = file.NextPart()) {
        if (frame.size() == static_cast<size_t>(kind.Bytes()))
            report.Add(InspectDVFrame(kind, frame.data()));
        else
            report.AddError("the file ends within frame " + std::to_string(report.Count()) + ", " +
                            std::to_string(frame.size()) + " bytes into " + std::to_string(kind.Bytes()));
        progress.Advance();
    }
    report.Show(kind);
}

const Command sDVInfo(Group::Frames, "dv info", "Tell what a raw file of DV holds, and what is wrong with it",
                      Declare, Run);

} // namespace
} // namespace tool
