// pixelkiln: pixel formats, their conversions and what those do to a picture, from the command line.

#include "Command.h"
#include "Failure.h"
#include "OutputFile.h"
#include "Terminal.h"

#include <CLI/CLI.hpp>
#include <PixelKiln/PixelKiln.h>

#include <csignal>
#include <cstdio>
#include <exception>
#include <iostream>
#include <sstream>

namespace {

using namespace tool;

constexpr const char* kExitCodes = R"(Exit codes:
  0  done
  1  the library refuses the operation, or a comparison is above its limit
  2  wrong usage: an option, a size or the name of a format
  3  a file cannot be read or written, or is not what it should be
)";

class Library {
public:
    Library() { PK_Initialize(); }
    ~Library() { PK_Terminate(); }
    Library(const Library&) = delete;
    Library& operator=(const Library&) = delete;
};

void AddCommands(CLI::App& program) {
    for (const Command* command : Command::All()) { // a family before what belongs to it
        const std::string family = command->Family();
        CLI::App* const parent = family.empty() ? &program : program.get_subcommand(family);
        CLI::App* const app = parent->add_subcommand(command->Name(), command->Description());
        app->group(family.empty() ? command->Heading() : "Commands");
        if (command->IsFamily()) {
            app->require_subcommand(1);
            continue;
        }
        Words words(*app);
        app->callback(command->Declare(words));
    }
}

int Run(int count, char** words) {
    CLI::App program(
        "Pixel formats and colour spaces of video: list them, convert between them, and see what that does");
    program.set_version_flag("--version", "pixelkiln " PIXELKILN_VERSION);
    program.require_subcommand(0, 1);
    program.footer(kExitCodes);
    AddCommands(program);
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
