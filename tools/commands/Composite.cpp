// pixelkiln composite: one picture over another.

#include "Blending.h"
#include "Command.h"
#include "Failure.h"
#include "Numbers.h"
#include "Png.h"
#include "Terminal.h"

namespace tool {
namespace {

constexpr const char* kNotes =
    "Both pictures have the same size. Those of 16 bits are taken as floats.\n"
    "Modes: pixelkiln blendsheet draws all of them.\n\n"
    "Example:\n"
    "  pixelkiln composite title.png picture.png out.png --mode Screen --opacity 0.8\n";

struct Options {
    std::string top, back, output;
    std::string mode = "Normal";
    double opacity = 1;
    bool inLinear = false;
};

void Declare(Words& words, Options& options) {
    words.Take("TOP", options.top, "PNG file").Required();
    words.Take("BACK", options.back, "PNG file").Required();
    words.Take("OUT", options.output, "PNG file to write").Required();
    words.Take("--mode", options.mode, "Name of a blend mode, such as Multiply").ShowDefault();
    words.Take("--opacity", options.opacity, "Of the picture on top").Between(0.0, 1.0).ShowDefault();
    words.Flag("--linear", options.inLinear, "Mix in linear light; for the mode Normal");
    words.Notes(kNotes);
}

void Run(const Options& options) {
    const Blend blend = {ModeOfName(options.mode), static_cast<float>(options.opacity), options.inLinear};
    if (blend.inLinear && blend.mode != PK_BlendMode_Normal)
        throw Failure(kExitUsage, "--linear is for the mode Normal; the others work on encoded values");
    const Frame top = ReadPng(options.top), back = ReadPng(options.back);
    WritePng(Blended(top, back, blend), options.output);
    Print(options.output + ": " + options.mode + " at " + Formatted("%g", options.opacity) + ", " +
          SizeText(back) + "\n");
}

const Command sComposite(Group::Operations, "composite", "Lay one picture over another", Declare, Run);

} // namespace
} // namespace tool
