#pragma once

// Calls that are refused or have nothing to do: sizes without pixels, and a null in place of each pointer in turn.

#include "results/Lines.h"

#include <cstdint>
#include <functional>
#include <string>

namespace PKResults {

/// Which of a call's pointers are null.
class Nulls {
public:
    static Nulls None() { return Nulls(0); }
    static Nulls All() { return Nulls(~0U); }
    static Nulls Only(int which) { return Nulls(1U << which); }

    template <class T>
    T* operator()(int which, T* pointer) const {
        return (fBits >> which & 1) != 0 ? nullptr : pointer;
    }

private:
    explicit Nulls(uint32_t bits) : fBits(bits) {}

    uint32_t fBits;
};

/// Of an image that has kOddWidth x kOddHeight pixels the call is told another size.
inline constexpr int32_t kOddWidth = 5, kOddHeight = 3;

using OddCall = std::function<void(Line& line, Nulls nulls, int32_t width, int32_t height)>;

/// Adds "odd/null-0" and so on for each pointer, and "odd/no-width" and the like with and without pointers.
inline void AddOddCalls(Lines& lines, const std::string& name, int pointers, const OddCall& call) {
    struct Size {
        const char* name;
        int32_t width, height;
    };
    constexpr Size sizes[] = {{"no-width", 0, kOddHeight},
                              {"no-height", kOddWidth, 0},
                              {"negative-width", -1, kOddHeight},
                              {"negative-height", kOddWidth, -1}};
    for (const Size& size : sizes) {
        const std::string whole = name + "/odd/" + size.name;
        lines.Add(whole, [&](Line& line) { call(line, Nulls::None(), size.width, size.height); });
        lines.Add(whole + "-null", [&](Line& line) { call(line, Nulls::All(), size.width, size.height); });
    }
    for (int which = 0; which < pointers; ++which)
        lines.Add(name + "/odd/null-" + std::to_string(which),
                  [&](Line& line) { call(line, Nulls::Only(which), kOddWidth, kOddHeight); });
}

} // namespace PKResults
