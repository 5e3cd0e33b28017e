// pixelkiln: pixel formats, their conversions and what those do to a picture, from the command line. This
// file holds the words of the command line; each command has a file of its own.

#include "Commands.h"
#include "Failure.h"
#include "HelpNotes.h"
#include "OutputFile.h"
#include "Terminal.h"

#include <CLI/CLI.hpp>
#include <PixelKiln/PixelKiln.h>

#include <csignal>
#include <cstdio>
#include <exception>
#include <iostream>
#include <memory>
#include <sstream>

namespace {

using namespace tool;

class Library {
public:
    Library() { PK_Initialize(); }
    ~Library() { PK_Terminate(); }
    Library(const Library&) = delete;
    Library& operator=(const Library&) = delete;
};

template <typename Options>
struct Command {
    CLI::App* app;
    std::shared_ptr<Options> options = std::make_shared<Options>();

    Command(CLI::App& program, const char* name, const char* description, void (*run)(const Options&))
        : app(program.add_subcommand(name, description)) {
        app->callback([run, held = options] { run(*held); });
    }
};

void AddQuality(CLI::App& command, int32_t& quality) {
    command.add_option("--quality,-q", quality, "Render quality, 0 to 5; above 1, chroma is interpolated")
        ->check(CLI::Range(0, 5))
        ->capture_default_str();
}

void AddListings(CLI::App& program) {
    const Command<ListOptions> formats(program, "formats", "List the pixel formats", RunFormats);
    formats.app->add_flag("--csv", formats.options->csv, "Comma-separated values");
    const Command<ListOptions> kernels(program, "kernels", "List the row kernels and the bodies chosen here",
                                       RunKernels);
    kernels.app->add_flag("--csv", kernels.options->csv, "Comma-separated values");
    program.add_subcommand("info", "Show version, processor, flags and caches")->callback(RunInfo);
}

void AddExplain(CLI::App& program) {
    const Command<ExplainOptions> explain(program, "explain", "Show the chain of kernels between two formats",
                                          RunExplain);
    explain.app->add_option("SRC", explain.options->source, "Format to start from")->required();
    explain.app->add_option("DST", explain.options->destination, "Format to end in")->required();
    AddQuality(*explain.app, explain.options->quality);
}

// What commands that write frames share.
void AddOutput(CLI::App& command, PipeOptions& options) {
    command.add_option("OUT", options.output, "PNG file, raw frames, or -")->required();
    command.add_option("--png-depth", options.pngDepth, "Bits a sample of an output PNG, 8 or 16")
        ->check(CLI::IsMember({8, 16}))
        ->capture_default_str();
    command.add_flag("--quiet", options.quiet, "No summary");
}

// What commands from frames to frames share.
void AddFrames(CLI::App& command, PipeOptions& options) {
    command.add_option("IN", options.input, "PNG file, raw frames, or -")->required();
    AddOutput(command, options);
    command.add_option("--size", options.size, "Width x height of raw input frames, such as 1920x1080");
    command.add_flag("--packed", options.packed, "Rows of raw frames have no padding, in and out");
}

// The same where they have a format of choice.
void AddPipe(CLI::App& command, PipeOptions& options) {
    AddFrames(command, options);
    AddQuality(command, options.quality);
    command.add_option("--from", options.from, "Format to start from; needed for raw frames");
}

void AddConvert(CLI::App& program) {
    const Command<PipeOptions> convert(program, "convert", "Convert a PNG or raw frames to another format",
                                       RunConvert);
    AddPipe(*convert.app, *convert.options);
    convert.app->add_option("--to", convert.options->to, "Format to end in; needed for raw frames");
    convert.app->footer(kConvertNotes);
}

void AddFill(CLI::App& program) {
    const Command<FillOptions> fill(program, "fill", "Make a frame of one colour", RunFill);
    FillOptions& options = *fill.options;
    AddOutput(*fill.app, options);
    AddQuality(*fill.app, options.quality);
    fill.app->add_option("--size", options.size, "Width x height of the frame, such as 1920x1080")
        ->required();
    fill.app->add_option("--to", options.to, "Format to fill; needed for raw frames");
    fill.app
        ->add_option("--colour", options.colour,
                     "black, white, clear-black, clear-white, or R,G,B,A from 0 to 255")
        ->required();
    fill.app->add_flag("--packed", options.packed, "Rows of a raw frame have no padding");
    fill.app->footer(kFillNotes);
}

// Adds what the commands that do something to the picture share, with --to as they take it.
void AddOperation(CLI::App& command, PipeOptions& options) {
    AddPipe(command, options);
    command.add_option("--to", options.to, "Format to end in; without it, raw frames keep that of --from");
    command.footer(kOperationNotes);
}

void AddGeometry(CLI::App& program) {
    const Command<RotateOptions> rotate(program, "rotate", "Turn frames by quarters", RunRotate);
    AddOperation(*rotate.app, *rotate.options);
    rotate.app->add_option("--degrees", rotate.options->degrees, "Clockwise: 90, 180, 270, or less than 0")
        ->required()
        ->check(CLI::IsMember({90, 180, 270, -90, -180, -270}));

    const Command<WarpOptions> warp(program, "warp", "Draw frames into a quadrilateral", RunWarp);
    WarpOptions& options = *warp.options;
    AddOperation(*warp.app, options);
    warp.app
        ->add_option("--quad", options.quad,
                     "x0,y0,...,x3,y3: where the corners go, in pixels, clockwise from the top left one")
        ->required();
    warp.app->add_option("--onto", options.onto, "PNG file to draw on; without it, black");
    warp.app->add_option("--feather", options.feather, "Width of a soft rim in pixels; needs quality 3")
        ->check(CLI::Range(0.0, 1e6))
        ->capture_default_str();
    warp.app->add_option("--opacity", options.opacity, "0 to 255")
        ->check(CLI::Range(0, 255))
        ->capture_default_str();
}

void AddFilters(CLI::App& program) {
    const Command<BoxBlurOptions> blur(program, "boxblur", "Blur frames by boxes", RunBoxBlur);
    AddOperation(*blur.app, *blur.options);
    blur.app->add_option("--radius", blur.options->radius, "In pixels; fractions count")
        ->required()
        ->check(CLI::Range(0.0, 1e6));
    blur.app
        ->add_option("--passes", blur.options->passes, "Boxes one after the other; three are near a Gaussian")
        ->check(CLI::Range(1, 100))
        ->capture_default_str();
    blur.app->add_flag("--rows", blur.options->rows, "Along rows only");
    blur.app->add_flag("--columns", blur.options->columns, "Along columns only");
    blur.app->add_flag("--renormalise", blur.options->renormalise,
                       "Keep the borders as bright as the rest; without it they fade to black");
}

void AddStamp(CLI::App& program) {
    const Command<StampOptions> stamp(program, "stamp",
                                      "Burn a number into frames, counting up from frame to frame", RunStamp);
    StampOptions& options = *stamp.options;
    AddOperation(*stamp.app, options);
    stamp.app->add_option("--number", options.number, "Number of the first frame")->required();
    stamp.app->add_flag("--hex", options.hex, "Hexadecimal digits");
    stamp.app->add_option("--digit", options.digit, "Width of a digit, as a fraction of the width")
        ->check(CLI::Range(0.0, 1.0))
        ->capture_default_str();
    stamp.app->add_option("--at", options.at, "X,Y of the top left corner, as fractions of width and height")
        ->capture_default_str();
}

void AddColour(CLI::App& program) {
    const Command<ColourOptions> colour(program, "colour", "Convert frames from one colour space to another",
                                        RunColour);
    ColourOptions& options = *colour.options;
    AddFrames(*colour.app, options);
    colour.app->add_option("--from", options.fromSpace, "Space of the input, such as srgb")->required();
    colour.app->add_option("--to", options.toSpace, "Space of the output, such as pq")->required();
    colour.app->add_flag("--gamut-clip", options.gamutClip,
                         "Pull colours that the output cannot show towards their luminance");
    colour.app->add_option("--exposure", options.exposure, "Tone range: factor on linear light, above 0");
    colour.app->add_option("--slope", options.slope, "Tone range: gain around the centre, above 0");
    colour.app->add_option("--knee", options.knee, "Tone range: where the curve bends, 0 to below 1");
    colour.app->footer(kColourNotes);

    const Command<CurvesOptions> curves(program, "curves", "Draw the transfer functions and the tone curve",
                                        RunCurves);
    curves.app->add_option("OUT", curves.options->output, "SVG or PNG file to write")->required();
    curves.app->footer(kCurvesNotes);
}

void AddPictures(CLI::App& program) {
    const Command<CompareOptions> compare(program, "compare", "Tell how far two PNG files are apart",
                                          RunCompare);
    compare.app->add_option("A", compare.options->first, "PNG file")->required();
    compare.app->add_option("B", compare.options->second, "PNG file")->required();
    compare.app
        ->add_option("--limit", compare.options->limit,
                     "Fail if any sample differs by more, in steps of 1/255")
        ->check(CLI::NonNegativeNumber);

    const Command<SheetOptions> sheet(program, "sheet", "Draw pictures side by side", RunSheet);
    sheet.app->add_option("OUT", sheet.options->output, "PNG file to write")->required();
    sheet.app->add_option("IMAGE", sheet.options->images, "PNG files")->required();

    const Command<PairsOptions> pairs(
        program, "pairs", "Draw what a picture loses from every raster format to every other and back",
        RunPairs);
    pairs.app->add_option("OUT", pairs.options->output, "SVG file for the picture, CSV file for the numbers")
        ->required();
    pairs.app->add_option("--image", pairs.options->image, "PNG file to send; without it, colour ramps");
    AddQuality(*pairs.app, pairs.options->quality);

    const Command<DemoOptions> demo(
        program, "demo",
        "Take a picture through formats, operations and colour spaces, and draw what they do", RunDemo);
    demo.app->add_option("IMAGE", demo.options->image, "PNG file")->required();
    demo.app->add_option("OUTDIR", demo.options->folder, "Folder for the pictures, made if it is missing")
        ->required();
}

int Run(int count, char** words) {
    CLI::App program(
        "Pixel formats and colour spaces of video: list them, convert between them, and see what that does");
    program.set_version_flag("--version", "pixelkiln " PIXELKILN_VERSION);
    program.require_subcommand(0, 1);
    program.footer(kExitCodes);
    AddListings(program);
    AddExplain(program);
    AddConvert(program);
    AddFill(program);
    AddGeometry(program);
    AddFilters(program);
    AddStamp(program);
    AddColour(program);
    AddPictures(program);
    try {
        program.parse(count, words);
    } catch (const CLI::ParseError& error) {
        std::ostringstream said; // so that a full disk is noticed as with every other output
        const int code = program.exit(error, said, std::cerr);
        Print(said.str());
        return code == 0 ? kExitOK : kExitUsage;
    }
    if (!program.get_subcommands().empty()) return kExitOK;
    std::fputs(program.help().c_str(), stderr);
    return kExitUsage;
}

} // namespace

int main(int count, char** words) {
    // A closed pipe and a file that grows too long come back as errors of the write, so that the unfinished
    // file is removed.
    std::signal(SIGPIPE, SIG_IGN);
    std::signal(SIGXFSZ, SIG_IGN);
    CleanUpOnSignals();
    const Library library;
    try {
        return Run(count, words);
    } catch (const BrokenPipe&) {
        std::signal(SIGPIPE, SIG_DFL);
        std::raise(SIGPIPE);
        return kExitFile;
    } catch (const Failure& failure) {
        std::fprintf(stderr, "pixelkiln: %s\n", failure.what());
        return failure.Code();
    } catch (const std::exception& error) {
        std::fprintf(stderr, "pixelkiln: %s\n", error.what());
        return kExitFailed;
    }
}
