#pragma once

// The picture of all pairs of formats, as SVG: text comes free there, and the file stays small.

#include <PixelKiln/PixelKiln.h>

#include <string>
#include <vector>

namespace tool {

/// What became of a picture that went from a format to another and back.
struct Pair {
    size_t stepsThere = 0; ///< 0 if there is no way there or back
    size_t stepsBack = 0;
    double largestDifference = 0; ///< in steps of 8 bits
};

/// All pairs of a list of formats: a row for each format that is left, a column for each that is visited.
struct PairTable {
    explicit PairTable(std::vector<PK_PixelFormat> list)
        : formats(std::move(list)), pairs(formats.size() * formats.size()) {}

    Pair& At(size_t from, size_t by) { return pairs[from * formats.size() + by]; }
    const Pair& At(size_t from, size_t by) const { return pairs[from * formats.size() + by]; }

    std::vector<PK_PixelFormat> formats;
    std::vector<Pair> pairs;
};

/// \param subject  what went through the formats, for the heading.
std::string PairsSVG(const PairTable& table, const std::string& subject);

} // namespace tool
