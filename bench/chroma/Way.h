#pragma once

// A way between 4:4:4 and 4:2:0, ours or another library's, entered in a list before main begins, so that a peer's file is
// compiled in only where its library is installed.

#include "Video.h"

#include <initializer_list>

namespace ChromaBench {

struct Way {
    const char* name;
    Video (*decode)(const Video& planes, const Kind& kind);
    Video (*encode)(const Video& pixels, const Kind& kind);
    bool isShown = true; ///< in the pictures, too
};

inline std::vector<Way>& AllWays() {
    static std::vector<Way> ways;
    return ways;
}

/// A library that knows no fields in turns is given each by itself.
template <Video (*kRun)(const Video&, const Kind&, int32_t field)>
Video ByFields(const Video& from, const Kind& kind) {
    if (!kind.areFields) return kRun(from, kind, 0);
    return Interleaved(kRun(FieldOf(from, 0), kind, 0), kRun(FieldOf(from, 1), kind, 1));
}

struct AddWays {
    AddWays(std::initializer_list<Way> ways) { AllWays().insert(AllWays().end(), ways.begin(), ways.end()); }
};

} // namespace ChromaBench
