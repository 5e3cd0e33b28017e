#pragma once

// Random content that can be had again: PIXELKILN_TEST_SEED in the environment replaces the seed of all
// tests. Print Seed() with a failure.

#include <cstdint>
#include <cstdlib>
#include <vector>

namespace PKTest {

class Random {
public:
    explicit Random(uint64_t seed) : fSeed(ChosenSeed(seed)), fState(fSeed) {}

    uint64_t Seed() const { return fSeed; }

    /// By SplitMix64 (Steele, Lea and Flood, 2014): the engines of the standard library took a quarter of all tests' time.
    uint32_t Next() {
        uint64_t x = fState += 0x9e3779b97f4a7c15;
        x = (x ^ (x >> 30)) * 0xbf58476d1ce4e5b9;
        x = (x ^ (x >> 27)) * 0x94d049bb133111eb;
        return static_cast<uint32_t>((x ^ (x >> 31)) >> 32);
    }

    /// A number from 0 to \p count - 1.
    uint32_t Below(uint32_t count) { return static_cast<uint32_t>((uint64_t{Next()} * count) >> 32); }

    void Fill(uint8_t* bytes, size_t count) {
        for (size_t i = 0; i < count; ++i) bytes[i] = static_cast<uint8_t>(Next());
    }

    std::vector<uint8_t> Bytes(size_t count) {
        std::vector<uint8_t> bytes(count);
        Fill(bytes.data(), count);
        return bytes;
    }

private:
    static uint64_t ChosenSeed(uint64_t seed) {
        const char* chosen = std::getenv("PIXELKILN_TEST_SEED");
        return chosen == nullptr ? seed : std::strtoull(chosen, nullptr, 0);
    }

    uint64_t fSeed;
    uint64_t fState;
};

} // namespace PKTest
