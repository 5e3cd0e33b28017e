#include "Words.h"

#include <CLI/CLI.hpp>

#include <cmath>
#include <cstdlib>
#include <optional>

namespace tool {

Word& Word::Required() {
    fOption->required();
    return *this;
}

Word& Word::ShowDefault() {
    fOption->capture_default_str();
    return *this;
}

Word& Word::Between(int32_t least, int32_t most) {
    fOption->check(CLI::Range(least, most));
    return *this;
}

Word& Word::Between(double least, double most) {
    fOption->check(CLI::Range(least, most));
    fOption->check([](const std::string& text) { // it passes a range
        return std::isnan(std::strtod(text.c_str(), nullptr)) ? "'" + text + "' is not a number"
                                                              : std::string();
    });
    return *this;
}

Word& Word::NotNegative() {
    fOption->check(CLI::NonNegativeNumber);
    return *this;
}

Word& Word::OneOf(const std::vector<int32_t>& values) {
    fOption->check(CLI::IsMember(values));
    return *this;
}

template <typename Value>
Word Words::Take(const std::string& name, Value& value, const std::string& meaning) {
    return Word(fCommand.add_option(name, value, meaning));
}

template Word Words::Take(const std::string&, std::string&, const std::string&);
template Word Words::Take(const std::string&, std::vector<std::string>&, const std::string&);
template Word Words::Take(const std::string&, int32_t&, const std::string&);
template Word Words::Take(const std::string&, float&, const std::string&);
template Word Words::Take(const std::string&, double&, const std::string&);
template Word Words::Take(const std::string&, std::optional<float>&, const std::string&);
template Word Words::Take(const std::string&, std::optional<double>&, const std::string&);

void Words::Flag(const std::string& name, bool& value, const std::string& meaning) {
    fCommand.add_flag(name, value, meaning);
}

void Words::Notes(const std::string& text) {
    fCommand.footer(text);
}

} // namespace tool
