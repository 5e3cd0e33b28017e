#pragma once

// Random content that can be had again: PIXELKILN_TEST_SEED in the environment replaces the seed of all
// tests. Print Seed() with a failure.

#include <cstdint>
#include <cstdlib>
#include <random>
#include <vector>

namespace PKTest {

class Random {
public:
    explicit Random(uint64_t seed) : fSeed(ChosenSeed(seed)), fEngine(fSeed) {}

    uint64_t Seed() const { return fSeed; }

    uint32_t Next() { return static_cast<uint32_t>(fEngine() >> 32); }

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
    std::mt19937_64 fEngine;
};

} // namespace PKTest
