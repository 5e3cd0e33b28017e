// pixelkiln place: a picture moved, scaled and turned over another, once or as a flight.

#include "Flight.h"

#include "Blending.h"
#include "Centring.h"
#include "Command.h"
#include "Failure.h"
#include "FramePipe.h"
#include "NumberedName.h"
#include "Numbers.h"
#include "Operations.h"
#include "Png.h"
#include "SharedWords.h"
#include "Terminal.h"

#include <algorithm>

namespace tool {
namespace {

constexpr const char* kNotes =
    R"(Places are fractions of a picture from its top left corner. The anchor of SRC comes to lie on the position in the
output, which is BACK, or black. Where --size differs from BACK, the middle of BACK is taken, or black added around it.

Quality 5 samples light, by a cubic, and fades the edges of SRC over what that reaches. Up to 4 it is bilinear, and at 3
and 4 what gets smaller is blurred before.

With --frames, SRC flies from the placing that is told to that of --to, and OUT is a Y4M stream, which players read, or
a numbered PNG a frame; with --dst-field its fields are half a frame apart.

Examples:
  pixelkiln place logo.png picture.png out.png --position 0.9,0.1 --scale 0.25,0.25 --rotate 10
  pixelkiln place a.png b.png flight.y4m --frames 60 --to position=1.2,0.5 rotate=45 opacity=0
  pixelkiln place a.png - --size 1280x720 --frames 100 --to rotate=360 | mpv -
)";

struct Options : PipeOptions {
    std::vector<std::string> files, end;
    std::string position = "0.5,0.5", anchor = "0.5,0.5", scale = "1,1";
    std::string rotation = "0", opacity = "1", softness = "0", mode = "Normal";
    Placing placing;
    int32_t frames = 0, rate = 25;
};

void Declare(Words& words, Options& options) {
    words
        .Take("FILES", options.files,
              "SRC, BACK if there is one, and OUT: PNG files; OUT of a flight: .y4m, - or frame-%04d.png")
        .Required();
    words.Take("--size", options.size,
               "Of the output, such as 1920x1080; without it, that of BACK or of SRC");
    words.Take("--position", options.position, "Where the anchor lies in the output").ShowDefault();
    words.Take("--anchor", options.anchor, "In SRC").ShowDefault();
    words.Take("--scale", options.scale, "Horizontally and vertically").ShowDefault();
    words.Take("--rotate", options.rotation, "Degrees, clockwise").ShowDefault();
    words.Take("--opacity", options.opacity, "Of SRC, 0 to 1").ShowDefault();
    words.Take("--softness", options.softness, "Of the blur at quality 3 and 4, 0 to 1").ShowDefault();
    words.Flag("--soft-edges", options.placing.smoothEdges,
               "Fade the edges of SRC over a pixel, at a quality up to 4");
    words.Take("--mode", options.mode, "Name of a blend mode, such as Multiply").ShowDefault();
    words.Take("--src-field", options.placing.sourceField, "Earlier field of SRC; 0: progressive")
        .OneOf({0, 1, 2})
        .ShowDefault();
    words.Take("--dst-field", options.placing.destinationField, "The same of the output")
        .OneOf({0, 1, 2})
        .ShowDefault();
    AddQuality(words, options.quality);
    words.Take("--frames", options.frames, "Of a flight").Between(1, 100000);
    words.Take("--rate", options.rate, "Frames a second").Between(1, 1000).ShowDefault();
    words.Take("--to", options.end, "NAME=VALUE...: the placing at the end of the flight");
    AddOutputForm(words, options);
    words.Notes(kNotes);
}

/// What a flight can change, by the name of its option.
struct Parameter {
    const char* name;
    const char* what;
    size_t count;
    double least, most;
    void (*set)(Placing& placing, const std::vector<double>& numbers);
};

PK_Point PointOf(const std::vector<double>& numbers) {
    return {static_cast<float>(numbers[0]), static_cast<float>(numbers[1])};
}

constexpr double kFar = 1e6;
using Numbers = const std::vector<double>&;
constexpr Parameter kParameters[] = {
    {"position", "a position x,y", 2, -kFar, kFar, [](Placing& p, Numbers n) { p.position = PointOf(n); }},
    {"anchor", "an anchor x,y", 2, -kFar, kFar, [](Placing& p, Numbers n) { p.anchor = PointOf(n); }},
    {"scale", "a scale x,y", 2, 0, kFar, [](Placing& p, Numbers n) { p.scale = PointOf(n); }},
    {"rotate", "a rotation", 1, -kFar, kFar, [](Placing& p, Numbers n) { p.rotation = n[0]; }},
    {"opacity", "an opacity", 1, 0, 1, [](Placing& p, Numbers n) { p.opacity = n[0]; }},
    {"softness", "a softness", 1, 0, 1, [](Placing& p, Numbers n) { p.softness = n[0]; }},
};

void Set(Placing& placing, const std::string& name, const std::string& value) {
    const auto* const found = std::ranges::find(kParameters, name, &Parameter::name);
    if (found == std::end(kParameters))
        throw Failure(kExitUsage,
                      "--to knows position, anchor, scale, rotate, opacity and softness, not '" + name + "'");
    const std::vector<double> numbers = ParseNumbers(value, found->count, found->what);
    for (const double number : numbers)
        if (number < found->least || number > found->most)
            throw Failure(kExitUsage, "'" + value + "' is not " + found->what + ": its numbers go from " +
                                          Formatted("%.0f to %.0f", found->least, found->most));
    found->set(placing, numbers);
}

Placing StartOf(const Options& options) {
    Placing placing = options.placing;
    placing.quality = options.quality;
    placing.mode = ModeOfName(options.mode);
    Set(placing, "position", options.position);
    Set(placing, "anchor", options.anchor);
    Set(placing, "scale", options.scale);
    Set(placing, "rotate", options.rotation);
    Set(placing, "opacity", options.opacity);
    Set(placing, "softness", options.softness);
    return placing;
}

Placing EndOf(const Placing& start, const std::vector<std::string>& words) {
    Placing end = start;
    for (const std::string& word : words) {
        const size_t sign = word.find('=');
        if (sign == std::string::npos) throw Failure(kExitUsage, "--to wants NAME=VALUE, not '" + word + "'");
        Set(end, word.substr(0, sign), word.substr(sign + 1));
    }
    return end;
}

/// Throws for what would be without effect, and for names that promise something else.
void Check(const Options& options, const Placing& start, const Placing& end) {
    const auto require = [](bool isGood, const std::string& sentence) {
        if (!isGood) throw Failure(kExitUsage, sentence);
    };
    require(options.quality <= 4 || !start.smoothEdges,
            "--soft-edges is for a quality up to 4: at 5 all edges are soft");
    const bool isSoft = start.softness > 0 || end.softness > 0;
    require(!isSoft || options.quality == 3 || options.quality == 4, "a softness is for --quality 3 or 4");
    const bool isPng = IsPngName(options.output);
    if (options.frames > 0) {
        require(!isPng || NumberedName(options.output).IsNumbered(),
                "a flight is a Y4M stream, or numbered files such as frame-%04d.png, and not '" +
                    options.output + "'");
    } else {
        require(isPng, "'" + options.output +
                           "' is no name of a PNG; for a flight, which is a Y4M stream, tell --frames");
        require(options.end.empty(), "--to is for a flight of --frames");
    }
}

Frame Black(int32_t width, int32_t height) {
    Frame frame(PK_PixelFormat_BGRA_4444_8u, width, height);
    Fill(frame, "black");
    return frame;
}

/// What the source is placed on.
Frame BackOf(const Options& options, const Frame& source) {
    Frame back =
        options.files.size() == 3 ? ReadPng(options.files[1]) : Black(source.Width(), source.Height());
    if (options.size.empty()) return back;
    const Size size = ParseSize(options.size);
    return Centred(back, size.width, size.height);
}

void Run(const Options& told) {
    if (told.files.size() < 2 || told.files.size() > 3)
        throw Failure(kExitUsage, "place takes SRC, BACK if there is one, and OUT");
    Options options = told;
    options.output = options.files.back();
    const Placing start = StartOf(options), end = EndOf(start, options.end);
    Check(options, start, end);
    const Frame picture = ReadPng(options.files.front());
    const Frame back = BackOf(options, picture), source = ToBePlaced(picture, start.quality);
    if (options.frames > 0) {
        Fly({start, end, options.frames, options.rate, options.pngDepth}, source, back, options.output);
        if (!IsSilent(options))
            Print(options.output + ": " + std::to_string(options.frames) +
                  (options.frames == 1 ? " frame " : " frames ") + SizeText(back) + "\n");
        return;
    }
    options.size = SizeText(back);
    WriteMadeFrame(options, [&](Frame& frame) {
        Convert(back, frame, kDefaultQuality);
        Place(source, start, frame);
    });
}

const Command sPlace(Group::Operations, "place", "Move, scale and turn a picture over another", Declare, Run);

} // namespace
} // namespace tool
