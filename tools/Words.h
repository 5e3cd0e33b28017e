#pragma once

// The words that a command takes from the command line: a thin layer over CLI11, which takes seconds to compile
// and so is seen by two files only.

#include <cstdint>
#include <string>
#include <vector>

namespace CLI {
class App;
class Option;
} // namespace CLI

namespace tool {

/// One option or argument, and what holds for it.
class Word {
public:
    explicit Word(CLI::Option* option) : fOption(option) {}

    Word& Required();
    Word& ShowDefault();
    Word& Between(int32_t least, int32_t most);
    Word& Between(double least, double most);
    Word& NotNegative();
    Word& OneOf(const std::vector<int32_t>& values);

private:
    CLI::Option* fOption;
};

class Words {
public:
    explicit Words(CLI::App& command) : fCommand(command) {}

    /// \param name  with dashes for an option; without, for an argument that is told by its place.
    /// \param value  a number or a text, an optional number, or all texts that follow.
    template <typename Value>
    Word Take(const std::string& name, Value& value, const std::string& meaning);

    void Flag(const std::string& name, bool& value, const std::string& meaning);

    /// What the help says below the options.
    void Notes(const std::string& text);

private:
    CLI::App& fCommand;
};

} // namespace tool
