// pixelkiln: pixel formats, their conversions and what those do to a picture, from the command line. This
// file holds the words of the command line; each command has a file of its own.

#include "Commands.h"
#include "Failure.h"
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

constexpr const char* kExitCodes =
    "Exit codes:\n"
    "  0  done\n"
    "  1  the library refuses the operation, or a comparison is above its limit\n"
    "  2  wrong usage: an option, a size or the name of a format\n"
    "  3  a file cannot be read or written, or is not what it should be\n";

constexpr const char* kConvertNotes =
    "A name that ends in .png is a PNG file; all others hold raw frames, and - stands for standard input or\n"
    "output. Raw frames follow each other with nothing between. Their rows are padded as in memory, or have\n"
    "no padding with --packed, and the first row in the file is the first in memory: for a format that\n"
    "'pixelkiln formats' lists with first row 'bottom', the bottom row of the picture.\n"
    "A PNG is taken in BGRA, with 16 bits a sample as float, and --from takes it on to that format first. "
    "On\n"
    "the way to a PNG the picture goes through the format of --to, so that its losses show. Profiles and\n"
    "gamma notes of a PNG are not applied.\n\n"
    "Examples:\n"
    "  pixelkiln convert photo.png photo.v210 --to V210_422_10u\n"
    "  pixelkiln convert photo.v210 photo.png --from V210_422_10u --size 512x512\n"
    "  pixelkiln convert clip.yuv frame-%04d.png --from UYVY_422_8u --size 720x576 --packed\n";

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

void AddConvert(CLI::App& program) {
    const Command<ConvertOptions> convert(program, "convert", "Convert a PNG or raw frames to another format",
                                          RunConvert);
    ConvertOptions& options = *convert.options;
    convert.app->add_option("IN", options.input, "PNG file, raw frames, or -")->required();
    convert.app->add_option("OUT", options.output, "PNG file, raw frames, or -")->required();
    convert.app->add_option("--from", options.from, "Format to start from; needed for raw frames");
    convert.app->add_option("--to", options.to, "Format to end in; needed for raw frames");
    convert.app->add_option("--size", options.size, "Width x height of raw input frames, such as 1920x1080");
    convert.app->add_option("--png-depth", options.pngDepth, "Bits a sample of an output PNG, 8 or 16")
        ->check(CLI::IsMember({8, 16}))
        ->capture_default_str();
    convert.app->add_flag("--packed", options.packed, "Rows of raw frames have no padding, in and out");
    convert.app->add_flag("--quiet", options.quiet, "No summary");
    AddQuality(*convert.app, options.quality);
    convert.app->footer(kConvertNotes);
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
        program, "demo", "Take a picture through a dozen formats and back and draw a contact sheet", RunDemo);
    demo.app->add_option("IMAGE", demo.options->image, "PNG file")->required();
    demo.app->add_option("OUTDIR", demo.options->folder, "Folder for the pictures, made if it is missing")
        ->required();
}

int Run(int count, char** words) {
    CLI::App program(
        "Pixel formats of video: list them, convert between them, and see what a conversion does");
    program.set_version_flag("--version", "pixelkiln " PIXELKILN_VERSION);
    program.require_subcommand(0, 1);
    program.footer(kExitCodes);
    AddListings(program);
    AddExplain(program);
    AddConvert(program);
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
