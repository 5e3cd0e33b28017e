#include "PairsPicture.h"

#include "Formats.h"

#include <cstdio>
#include <iterator>

namespace tool {
namespace {

constexpr int kCell = 15;
constexpr int kLeft = 178; // room for the names of the rows
constexpr int kTop = 212;  // heading and the names of the columns
constexpr int kLegendHeight = 64;
constexpr int kMargin = 24;

// Classes of the largest difference, from green for none to red; the digits stay legible on all.
struct Class {
    double upTo; // steps of 8 bits
    const char* name;
    const char* colour;
};
constexpr Class kClasses[] = {
    {0, "none", "#a9d8c0"},   {0.1, "to 0.1", "#cfe8d2"}, {0.5, "to 0.5", "#e9f2d6"},
    {1, "to 1", "#fdf6d2"},   {2, "to 2", "#fce6a4"},     {4, "to 4", "#f9cd7c"},
    {16, "to 16", "#f2a766"}, {64, "to 64", "#e57d5a"},   {1e300, "above 64", "#cf5252"},
};
constexpr const char* kNoWayColour = "#ffffff";

size_t ClassOf(const Pair& pair) {
    size_t i = 0;
    while (i + 1 < std::size(kClasses) && pair.largestDifference > kClasses[i].upTo) ++i;
    return i;
}

std::string ColourOf(const Pair& pair) {
    return pair.stepsThere == 0 ? kNoWayColour : kClasses[ClassOf(pair)].colour;
}

std::string Number(size_t value) {
    return std::to_string(value);
}

std::string Rectangle(size_t x, size_t y, size_t width, const std::string& colour) {
    return "<path fill='" + colour + "' d='M" + Number(x) + " " + Number(y) + "h" + Number(width) + "v" +
           Number(kCell) + "h-" + Number(width) + "z'/>\n";
}

// Cells of one colour that follow each other in a row are one rectangle.
std::string RowOfCells(const PairTable& table, size_t row) {
    const size_t count = table.formats.size();
    std::string text;
    for (size_t first = 0; first < count;) {
        const std::string colour = ColourOf(table.At(row, first));
        size_t end = first + 1;
        while (end < count && ColourOf(table.At(row, end)) == colour) ++end;
        text += Rectangle(kLeft + first * kCell, kTop + row * kCell, (end - first) * kCell, colour);
        first = end;
    }
    return text;
}

// The steps of a row's pairs as one text, each digit in a place of its own; x where there is no way.
std::string RowOfSteps(const PairTable& table, size_t row) {
    std::string digits;
    for (size_t column = 0; column < table.formats.size(); ++column) {
        const size_t steps = table.At(row, column).stepsThere;
        digits += "<tspan x='" + Number(kLeft + column * kCell + kCell / 2) + "'>" +
                  (steps == 0 ? "x" : Number(steps)) + "</tspan>";
    }
    return "<text class='s' y='" + Number(kTop + row * kCell + kCell - 4) + "'>" + digits + "</text>\n";
}

std::string Names(const PairTable& table) {
    std::string text;
    for (size_t i = 0; i < table.formats.size(); ++i) {
        const std::string name = FormatName(table.formats[i]);
        text += "<text class='r' x='" + Number(kLeft - 6) + "' y='" + Number(kTop + i * kCell + kCell - 4) +
                "'>" + name + "</text>\n";
        const std::string x = Number(kLeft + i * kCell + kCell - 4);
        const std::string y = Number(kTop - 6);
        text += "<text x='" + x + "' y='" + y + "' transform='rotate(-90 " + x + " " + y + ")'>" + name +
                "</text>\n";
    }
    return text;
}

std::string Legend(size_t y) {
    constexpr size_t kWidth = 72;
    std::string text = "<text class='h' x='" + Number(kLeft) + "' y='" + Number(y - 6) +
                       "'>largest difference after the way there and back, in steps of 1/255</text>\n";
    for (size_t i = 0; i < std::size(kClasses); ++i) {
        const size_t x = kLeft + i * kWidth;
        text += Rectangle(x, y, kWidth, kClasses[i].colour);
        text += "<text class='m' x='" + Number(x + kWidth / 2) + "' y='" + Number(y + 2 * kCell) + "'>" +
                kClasses[i].name + "</text>\n";
    }
    return text;
}

std::string Escaped(const std::string& text) {
    std::string escaped;
    for (const char c : text) {
        if (c == '&')
            escaped += "&amp;";
        else if (c == '<')
            escaped += "&lt;";
        else
            escaped += c;
    }
    return escaped;
}

} // namespace

std::string PairsSVG(const PairTable& table, const std::string& subject) {
    const size_t side = table.formats.size() * kCell;
    const size_t width = kLeft + side + kMargin;
    const size_t height = kTop + side + kLegendHeight + kMargin;
    std::string text = "<svg xmlns='http://www.w3.org/2000/svg' viewBox='0 0 " + Number(width) + " " +
                       Number(height) + "' width='" + Number(width) + "' height='" + Number(height) + "'>\n";
    text += "<style>text{font:10px sans-serif;fill:#222}.r{text-anchor:end}.m{text-anchor:middle}"
            ".h{font-size:12px}.t{font:bold 17px sans-serif}"
            ".s{font-size:8px;text-anchor:middle;fill:#222}</style>\n";
    text += "<path fill='#fafaf8' d='M0 0h" + Number(width) + "v" + Number(height) + "H0z'/>\n";
    text += "<text class='t' x='" + Number(kMargin) +
            "' y='32'>Every raster format by way of every other</text>\n";
    text += "<text class='h' x='" + Number(kMargin) + "' y='54'>" + Escaped(subject) +
            ": from the format of the row to that of the column and back; the number tells the steps "
            "there</text>\n";
    text += Names(table);
    for (size_t row = 0; row < table.formats.size(); ++row) text += RowOfCells(table, row);
    for (size_t row = 0; row < table.formats.size(); ++row) text += RowOfSteps(table, row);
    return text + Legend(kTop + side + kLegendHeight / 2) + "</svg>\n";
}

} // namespace tool
