// pixelkiln place: a picture moved, scaled and turned over another, once or as a flight.

#include "Blending.h"
#include "Command.h"
#include "Failure.h"
#include "Numbers.h"
#include "Placing.h"
#include "Png.h"
#include "SharedWords.h"
#include "Terminal.h"
#include "Y4M.h"

#include <optional>

namespace tool {
namespace {

constexpr const char* kNotes =
    "Places are fractions of a picture, from its top left corner. The anchor of SRC comes to lie on the "
    "position.\n"
    "A flight goes from the placing that is told to that of --to, and is written as a Y4M stream:\n"
    "--to position=0.8,0.3 scale=0.5,0.5 rotate=90 opacity=0\n\n"
    "Examples:\n"
    "  pixelkiln place logo.png picture.png out.png --position 0.9,0.1 --scale 0.25,0.25 --rotate 10\n"
    "  pixelkiln place a.png b.png flight.y4m --frames 60 --to position=1.2,0.5 rotate=45\n";

struct Options {
    std::vector<std::string> files;
    std::string size, position = "0.5,0.5", anchor = "0.5,0.5", scale = "1,1", mode = "Normal";
    std::vector<std::string> to;
    Placing placing;
    int32_t frames = 1, rate = 25;
};

void Declare(Words& words, Options& options) {
    words.Take("FILES", options.files, "SRC, BACK if there is one, and OUT: PNG files, or a .y4m of a flight")
        .Required();
    words.Take("--size", options.size,
               "Of the output, such as 1920x1080; without it, that of BACK or of SRC");
    words.Take("--position", options.position, "Where the anchor lies in the output").ShowDefault();
    words.Take("--anchor", options.anchor, "In SRC").ShowDefault();
    words.Take("--scale", options.scale, "Horizontally and vertically").ShowDefault();
    words.Take("--rotate", options.placing.rotation, "Degrees, clockwise").ShowDefault();
    words.Take("--opacity", options.placing.opacity, "Of SRC").Between(0.0, 1.0).ShowDefault();
    words.Take("--softness", options.placing.softness, "Blur before sampling")
        .Between(0.0, 1.0)
        .ShowDefault();
    words.Flag("--soft-edges", options.placing.smoothEdges, "Fade the edges of SRC over a pixel");
    words.Take("--mode", options.mode, "Name of a blend mode, such as Multiply").ShowDefault();
    words.Take("--src-field", options.placing.sourceField, "Earlier field of SRC; 0: progressive")
        .OneOf({0, 1, 2});
    words.Take("--dst-field", options.placing.destinationField, "The same of the output").OneOf({0, 1, 2});
    AddQuality(words, options.placing.quality);
    words.Take("--frames", options.frames, "Of a flight").Between(1, 100000).ShowDefault();
    words.Take("--rate", options.rate, "Frames a second").Between(1, 1000).ShowDefault();
    words.Take("--to", options.to, "NAME=VALUE...: the placing at the end of the flight");
    words.Notes(kNotes);
}

PK_Point PointOf(const std::string& text, const char* what) {
    const std::vector<double> numbers = ParseNumbers(text, 2, what);
    return {static_cast<float>(numbers[0]), static_cast<float>(numbers[1])};
}

void Set(Placing& placing, const std::string& name, const std::string& value) {
    const auto number = [&] { return ParseNumbers(value, 1, "a number")[0]; };
    if (name == "position")
        placing.position = PointOf(value, "a position x,y");
    else if (name == "anchor")
        placing.anchor = PointOf(value, "an anchor x,y");
    else if (name == "scale")
        placing.scale = PointOf(value, "a scale x,y");
    else if (name == "rotate")
        placing.rotation = number();
    else if (name == "opacity")
        placing.opacity = number();
    else if (name == "softness")
        placing.softness = number();
    else
        throw Failure(kExitUsage,
                      "--to knows position, anchor, scale, rotate, opacity and softness, not '" + name + "'");
}

/// The placing at the end of a flight.
Placing EndOf(const Placing& start, const std::vector<std::string>& words) {
    Placing end = start;
    for (const std::string& word : words) {
        const size_t sign = word.find('=');
        if (sign == std::string::npos) throw Failure(kExitUsage, "--to wants NAME=VALUE, not '" + word + "'");
        Set(end, word.substr(0, sign), word.substr(sign + 1));
    }
    return end;
}

/// What the source is placed on: the back in the middle of a black frame, where they differ in size.
Frame BackOf(const Options& options, const Frame& source) {
    std::optional<Frame> back;
    if (options.files.size() == 3) back.emplace(ReadPng(options.files[1]));
    int32_t width = back ? back->Width() : source.Width(), height = back ? back->Height() : source.Height();
    if (!options.size.empty()) {
        std::string size = options.size;
        for (char& c : size) c = c == 'x' ? ',' : c;
        const std::vector<double> numbers = ParseNumbers(size, 2, "a size WxH");
        width = static_cast<int32_t>(numbers[0]);
        height = static_cast<int32_t>(numbers[1]);
        if (width < 1 || height < 1 || width > 32768 || height > 32768)
            throw Failure(kExitUsage, "sides go from 1 to 32768, not '" + options.size + "'");
    }
    if (back && back->Width() == width && back->Height() == height) return std::move(*back);
    Frame frame(PK_PixelFormat_BGRA_4444_8u, width, height);
    Require(PK_FillWithOpaqueBlack(frame.Pixels(), frame.RowBytes(), width, height, frame.Format()), "fill",
            frame);
    if (back) Place(*back, {}, frame);
    return frame;
}

void Fly(const Options& options, const Placing& start, const Frame& source, const Frame& back) {
    const Placing end = EndOf(start, options.to);
    Y4MWriter writer(options.files.back(), back.Width(), back.Height(), options.rate);
    Progress progress("Placing", options.frames);
    for (int32_t i = 0; i < options.frames; ++i) {
        Frame frame = Copied(back);
        Place(source, Between(start, end, options.frames > 1 ? double(i) / (options.frames - 1) : 0), frame);
        writer.Write(frame);
        progress.Advance();
    }
    writer.Commit();
}

void Run(const Options& options) {
    if (options.files.size() < 2 || options.files.size() > 3)
        throw Failure(kExitUsage, "place takes SRC, BACK if there is one, and OUT");
    Placing placing = options.placing;
    Set(placing, "position", options.position);
    Set(placing, "anchor", options.anchor);
    Set(placing, "scale", options.scale);
    placing.mode = ModeOfName(options.mode);
    const Frame source = ReadPng(options.files.front());
    Frame back = BackOf(options, source);
    const std::string& output = options.files.back();
    if (options.frames > 1 || !IsPngName(output)) return Fly(options, placing, source, back);
    if (!options.to.empty()) throw Failure(kExitUsage, "--to is for a flight of --frames");
    Place(source, placing, back);
    WritePng(back, output);
    Print(output + ": " + SizeText(back) + "\n");
}

const Command sPlace(Group::Operations, "place", "Move, scale and turn a picture over another", Declare, Run);

} // namespace
} // namespace tool
