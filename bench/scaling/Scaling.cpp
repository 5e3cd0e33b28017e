// Measures and draws what scaling does to charts and photographs, ours and that of the libraries that this build found:
// tables in Markdown on standard output, and pictures in a folder. What is timed is meant to run on one processor.
//
//   pixelkiln_scaling FOLDER PHOTOGRAPH.png...

#include "Charts.h"
#include "Measures.h"
#include "Pictures.h"
#include "Reductions.h"
#include "Scaler.h"

#include "Numbers.h"

#include <PixelKiln/Lifecycle.h>

#include <cstdio>
#include <exception>
#include <string>
#include <vector>

namespace {

using namespace Scaling;

constexpr double kScales[] = {0.25, 0.5, 0.7, 1.5, 3};

std::string Decibels(double value) {
    return value < 100 ? tool::Formatted("%.2f", value) : "> 100";
}

std::string PercentOf(const Range& range) {
    const std::string least = tool::Formatted("%.0f", 100 * range.least),
                      most = tool::Formatted("%.0f", 100 * range.most);
    return least == most ? least : least + " to " + most;
}

/// Without the sign of what rounds to 0.
std::string Pixels(double value) {
    const std::string text = tool::Formatted("%.4f", value);
    return text == "-0.0000" ? "0.0000" : text;
}

void PrintTable(double scale, const std::vector<Grey>& photographs) {
    std::printf("\n### Scale %g\n\n"
                "| | Photographs, dB | Plate, dB | Aliasing, %% | Error, %% | Edge x, px | Edge y, px | "
                "Wobble, px | Overshoot, %% | White, %% |\n"
                "|---|--:|--:|--:|--:|--:|--:|--:|--:|--:|\n",
                scale);
    for (const Scaler& scaler : AllScalers()) {
        double onPhotographs = 0;
        for (const Grey& photograph : photographs)
            onPhotographs +=
                ThereAndBack(scaler, photograph, scale) / static_cast<double>(photographs.size());
        const PlateFigures plate = MeasurePlate(scaler, scale);
        const EdgeFigures edge = MeasureEdge(scaler, scale);
        const Range white = MeasureWhite(scaler, scale);
        std::printf("| %s | %s | %s | ", scaler.name, Decibels(onPhotographs).c_str(),
                    Decibels(ThereAndBack(scaler, ZonePlate(), scale)).c_str());
        if (scale < 1)
            std::printf("%.2f", 100 * plate.aliasing);
        else
            std::printf("-");
        std::printf(" | %.2f | %s | %s | %s | %.1f | %s |\n", 100 * plate.error, Pixels(edge.meanX).c_str(),
                    Pixels(edge.meanY).c_str(), Pixels(edge.wobble).c_str(), 100 * edge.overshoot,
                    PercentOf(white).c_str());
    }
}

void PrintRows() {
    std::printf("\n### Along a row of 1920 pixels\n\n"
                "| Edge x, px | 1.5, left | middle | right | 0.75, left | middle | right |\n"
                "|---|--:|--:|--:|--:|--:|--:|\n");
    for (const Scaler& scaler : AllScalers()) {
        std::printf("| %s |", scaler.name);
        for (const double scale : {1.5, 0.75})
            for (const double part : {0.05, 0.5, 0.95})
                std::printf(" %s |", Pixels(MeasureEdgeOfRow(scaler, scale, part)).c_str());
        std::printf("\n");
    }
}

void Run(const std::string& folder, const std::vector<std::string>& names) {
    std::vector<Grey> photographs;
    for (const std::string& name : names) photographs.push_back(Photograph(name));
    for (const double scale : kScales) PrintTable(scale, photographs);
    PrintRows();
    MeasureAndDrawReductions(names, folder + "/scaling-4k.png");
    DrawPlates(kScales, folder + "/scaling-plates.png");
    DrawEdges(kScales, folder + "/scaling-edges.png");
}

} // namespace

int main(int count, char** words) {
    if (count < 3) {
        std::fputs("pixelkiln_scaling FOLDER PHOTOGRAPH.png...\n", stderr);
        return 2;
    }
    PK_Initialize();
    int code = 0;
    try {
        Run(words[1], {words + 2, words + count});
    } catch (const std::exception& error) {
        std::fprintf(stderr, "%s\n", error.what());
        code = 1;
    }
    PK_Terminate();
    return code;
}
