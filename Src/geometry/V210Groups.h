#pragma once

// Part of the pixels of V210's groups of six, whose samples lie across words.

#include <cstdint>
#include <cstring>

namespace PK {

/// A group as it was, to give back the pixels that were not meant to change.
class V210Group {
public:
    explicit V210Group(const void* group) { std::memcpy(fWords, group, sizeof fWords); }

    /// All but the pixels from first to end - 1 as they were. Of a pair that has one of these, the chroma stays new.
    void RestoreBeside(void* group, int32_t first, int32_t end) const {
        uint32_t words[kWords];
        std::memcpy(words, group, sizeof words);
        for (int32_t word = 0; word < kWords; ++word) {
            uint32_t drawn = 0;
            for (int32_t place = 0; place < kSamples; ++place)
                if (IsOf(3 * word + place, first, end)) drawn |= uint32_t{0x3ff} << (10 * place);
            words[word] = (words[word] & drawn) | (fWords[word] & ~drawn);
        }
        std::memcpy(group, words, sizeof words);
    }

private:
    static constexpr int32_t kWords = 4, kSamples = 3; // ten bits each

    /// Samples are U, Y, V, Y for two pixels, from the lowest bits on.
    static constexpr bool IsOf(int32_t sample, int32_t first, int32_t end) {
        const int32_t pixel = sample / 2, pair = pixel / 2;
        const bool isLuma = sample % 2 == 1;
        return isLuma ? first <= pixel && pixel < end : first <= 2 * pair + 1 && 2 * pair < end;
    }

    uint32_t fWords[kWords];
};

} // namespace PK
