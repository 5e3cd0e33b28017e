// Measures and draws what decoding and encoding of planar 4:2:0 does to chroma, ours and that of the libraries that this
// build found: tables in Markdown on standard output, and pictures in a folder.
//
//   pixelkiln_chroma FOLDER

#include "Measures.h"
#include "Pictures.h"
#include "Rules.h"
#include "Scenes.h"

#include <PixelKiln/Lifecycle.h>

#include <cstdio>
#include <exception>

namespace {

using namespace ChromaBench;

void Print(const Error& error) {
    std::printf(" %.2f | %.1f |", error.rms, error.most);
}

void PrintRules() {
    const Video planes = PlanesOf(MovingDisc, kMovingWidth, kMovingHeight, kFields);
    std::printf("\n### Fields by four rules\n\n| Decoded | RMS | Maximum |\n|---|--:|--:|\n");
    for (const Rule& rule : AllRules()) {
        std::printf("| %s |", rule.name);
        Print(ErrorOfPixels(rule.decode(planes), MovingDisc, kFields));
        std::printf("\n");
    }
}

void PrintChart(const char* title, const Scene& scene, const Kind& kind) {
    std::printf("\n### %s: %s\n\n| | Decoded, RMS | Maximum | Encoded, RMS | Maximum | Both, RMS | Maximum "
                "|\n|---|--:|--:|--:|--:|--:|--:|\n",
                title, kind.name);
    for (const Way& way : AllWays()) {
        const Errors errors = Measure(way, scene, kind);
        std::printf("| %s |", way.name);
        for (const Error& error : {errors.decoded, errors.encoded, errors.both}) Print(error);
        std::printf("\n");
    }
}

void Run(const std::string& folder) {
    PrintRules();
    for (const Kind& kind : {kLeft, kCentred, kFields}) {
        PrintChart("Zone plate", ZonePlate(kind), kind);
        PrintChart("Edge of a disc", Disc(), kind);
    }
    DrawRules(folder + "/interlacing.png");
    DrawCharts(folder + "/interlacing-chroma.png");
}

} // namespace

int main(int count, char** words) {
    if (count != 2) {
        std::fputs("pixelkiln_chroma FOLDER\n", stderr);
        return 2;
    }
    PK_Initialize();
    int code = 0;
    try {
        Run(words[1]);
    } catch (const std::exception& error) {
        std::fprintf(stderr, "%s\n", error.what());
        code = 1;
    }
    PK_Terminate();
    return code;
}
