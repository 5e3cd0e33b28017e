// What start, stop and switches answer; the capabilities that are told are those of the instruction set.

#include "results/Lines.h"

#include <PixelKiln/Lifecycle.h>

namespace {

using namespace PKResults;

void AddCapabilities(Line& line) {
    line.results.Add(PK_hasSSE4());
    line.results.Add(PK_hasAVX());
    line.results.Add(PK_hasAVX2());
}

void AddLifecycle(Lines& lines) {
    lines.Add("capabilities", AddCapabilities);
    lines.Add("nested", [](Line& line) { // flags stay as they are
        line.results.Add(PK_Initialize());
        AddCapabilities(line);
        line.results.Add(PK_Terminate());
        AddCapabilities(line);
    });
    lines.Add("switches", [](Line& line) {
        for (const uint32_t which : {6U, 8U, 9U, 1U, 11U, 0xffffffffU}) {
            const bool saved[] = {PK_hasSSE4(), PK_hasAVX(), PK_hasAVX2()};
            for (const int32_t value : {0, 1, -5}) {
                line.results.Add(PK_SetDebugFlag(which, value));
                AddCapabilities(line);
            }
            PK_SetDebugFlag(6, saved[0]);
            PK_SetDebugFlag(8, saved[1]);
            PK_SetDebugFlag(9, saved[2]);
        }
    });
}

const Family sLifecycle("lifecycle", AddLifecycle);

} // namespace
