#pragma once

// The lines that are printed, and the families that make them.
//
// A family is a file X_results.cpp that registers itself:
//
//     void AddRotations(Lines& lines) {
//         lines.Add("90", [](Line& line) {
//             Image image(...line.random);
//             line.results.Add(PK_RotateImage(...));
//             image.AddTo(line.results);
//         });
//     }
//     const Family sRotate("rotate", AddRotations);
//
// and prints "avx2/rotate/90 HASH", and so for each instruction set.

#include "results/Digest.h"
#include "results/Random.h"

#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace PKResults {

/// The calls behind one hash.
struct Line {
    Random random;  ///< what they are given: begins alike in all lines
    Digest results; ///< result codes, and all memory that they may write
};

class Lines {
public:
    /// \param part  lines whose names have it are made, and no others.
    explicit Lines(std::string_view part) : fPart(part) {}

    /// What the names of the lines to come begin with.
    void Begin(std::string_view target, std::string_view family);

    void Add(const std::string& name, const std::function<void(Line&)>& make);

    /// All lines, in the order of their names.
    std::vector<std::string> Sorted() const;

private:
    std::string fPart, fPrefix;
    std::vector<std::string> fLines;
};

class Family {
public:
    /// What decides on the bodies that run.
    enum class Choice {
        kFlags,     ///< The capability flags: the lines are made for every instruction set.
        kProcessor, ///< The processor alone, or nothing: they are made once.
    };
    using Make = void (*)(Lines& lines);

    Family(const char* name, Make make, Choice choice = Choice::kFlags);

    static const std::vector<Family>& All() { return Register(); }

    std::string_view name;
    Make make;
    Choice choice;

private:
    static std::vector<Family>& Register();
};

} // namespace PKResults
