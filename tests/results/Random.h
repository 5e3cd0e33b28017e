#pragma once

// Numbers that are the same in every run, and from one state of the tree to the next: they are part of what a line
// means, and so share nothing with the tests, which may draw otherwise one day.

#include <cstddef>
#include <cstdint>
#include <cstring>

namespace PKResults {

class Random {
public:
    /// SplitMix64.
    uint64_t Next() {
        fState += 0x9e3779b97f4a7c15;
        uint64_t mixed = fState;
        mixed = (mixed ^ mixed >> 30) * 0xbf58476d1ce4e5b9;
        mixed = (mixed ^ mixed >> 27) * 0x94d049bb133111eb;
        return mixed ^ mixed >> 31;
    }

    /// A number from 0 to \p count - 1.
    uint32_t Below(uint32_t count) { return static_cast<uint32_t>((Next() >> 32) * count >> 32); }

    /// At least \p low and below \p high.
    float Between(float low, float high) {
        return low + (high - low) * static_cast<float>(Next() >> 40) * 0x1p-24f;
    }

    void Fill(void* bytes, size_t count) {
        auto* at = static_cast<uint8_t*>(bytes);
        for (size_t left = count; left != 0;) {
            const size_t drawn = left < 8 ? left : 8;
            const uint64_t word = Next();
            std::memcpy(at, &word, drawn);
            at += drawn;
            left -= drawn;
        }
    }

private:
    uint64_t fState = 0;
};

} // namespace PKResults
