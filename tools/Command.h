#pragma once

// The commands of the program.
//
// A command is a file in commands/, or in explain/ if it shows the library's insides, that registers itself:
//
//     struct Options : PipeOptions { int32_t degrees = 0; };
//     void Declare(Words& words, Options& options) { ... } // Words.h, SharedWords.h
//     void Run(const Options& options) { ... }             // throws Failure
//     const Command sRotate(Group::Operations, "rotate", "Turn frames by quarters", Declare, Run);
//
// Commands that belong together are a family: a command of no words and nothing to do, and others whose names begin with
// its name and a space.

#include "Words.h"

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace tool {

/// Where the help lists a command: groups in this order, the commands of one by name.
enum class Group { Listings, Frames, Operations, Pictures };

class Command {
public:
    template <typename Options>
    Command(Group group, const char* name, const char* description, void (*declare)(Words&, Options&),
            void (*run)(const Options&))
        : Command(group, name, description, [declare, run](Words& words) {
              const auto options = std::make_shared<Options>();
              declare(words, *options);
              return [run, options] { run(*options); };
          }) {}

    /// A command of no words.
    Command(Group group, const char* name, const char* description, void (*run)())
        : Command(group, name, description, [run](Words&) { return run; }) {}

    /// A family.
    Command(Group group, const char* name, const char* description)
        : Command(group, name, description, DeclareWords()) {}

    const char* Heading() const;

    /// Within its family.
    std::string Name() const;

    /// The name of the family that it belongs to; empty if it stands alone.
    std::string Family() const;
    bool IsFamily() const { return !fDeclare; }

    const char* Description() const { return fDescription; }

    /// Declares the words, and gives what is to be called once they are read.
    std::function<void()> Declare(Words& words) const { return fDeclare(words); }

    /// All commands in the order of the help.
    static const std::vector<const Command*>& All() { return Register(); }

private:
    using DeclareWords = std::function<std::function<void()>(Words&)>;

    Command(Group group, const char* name, const char* description, DeclareWords declare);
    static std::vector<const Command*>& Register();

    Group fGroup;
    const char* fName;
    const char* fDescription;
    DeclareWords fDeclare;
};

} // namespace tool
