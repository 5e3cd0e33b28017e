#pragma once

// The variable-length code as an encoder looks it up: by the run of zeros and the amplitude that ends it.

#include "dv/DVTables.h"
#include "primitives/DVCodes.h"

#include <array>

namespace PK {

inline constexpr int32_t kDVRuns = kCoefficients - 1; ///< 0 to 62: a run ends at a coefficient
inline constexpr int32_t kDVAmplitudes = 256;

/// Whole code words by run and amplitude; of a pair without a word of its own, the two that stand for it. An amplitude has
/// its sign, as yet positive, in the lowest bit.
struct DVCodeWord {
    uint32_t code;
    uint8_t length;
};

/// The words of kDVCodes alone: length 0 for a pair that has none.
class DVCodeBook {
public:
    constexpr DVCodeBook() {
        uint32_t code = 0;
        int32_t length = kDVCodes[0].length;
        for (const DVCode& entry : kDVCodes) {
            code <<= entry.length - length;
            length = entry.length;
            if (entry.run == kEndOfBlockRun)
                fEndOfBlock = {code, entry.length};
            else
                fWords[entry.run][entry.amplitude] = {code, entry.length};
            ++code;
        }
    }

    constexpr DVCodeWord EndOfBlock() const { return fEndOfBlock; }

    constexpr bool HasOwn(int32_t run, int32_t amplitude) const {
        return run < kListedRuns && amplitude < kListedAmplitudes && fWords[run][amplitude].length != 0;
    }

    /// A run alone, which leads to the place behind it.
    constexpr DVCodeWord Run(int32_t run) const {
        if (HasOwn(run, 0)) return fWords[run][0];
        return {uint32_t{kDVRunEscape.prefix} << kDVRunEscape.bits | static_cast<uint32_t>(run),
                kDVEscapePrefixBits + kDVRunEscape.bits};
    }

    constexpr DVCodeWord Amplitude(int32_t amplitude) const {
        if (HasOwn(0, amplitude)) return WithSign(fWords[0][amplitude]);
        return WithSign({uint32_t{kDVAmplitudeEscape.prefix} << kDVAmplitudeEscape.bits |
                             static_cast<uint32_t>(amplitude),
                         kDVEscapePrefixBits + kDVAmplitudeEscape.bits});
    }

    constexpr DVCodeWord Pair(int32_t run, int32_t amplitude) const {
        if (HasOwn(run, amplitude)) return WithSign(fWords[run][amplitude]);
        if (run == 0) return Amplitude(amplitude);
        const DVCodeWord zeros = Run(run - 1), end = Amplitude(amplitude);
        return {zeros.code << end.length | end.code, static_cast<uint8_t>(zeros.length + end.length)};
    }

private:
    static constexpr int32_t kListedRuns = 15, kListedAmplitudes = 23;

    static constexpr DVCodeWord WithSign(DVCodeWord word) {
        return {word.code << 1, static_cast<uint8_t>(word.length + 1)};
    }

    DVCodeWord fEndOfBlock{};
    DVCodeWord fWords[kListedRuns][kListedAmplitudes]{};
};

inline constexpr DVCodeBook kDVCodeBook;
inline constexpr DVCodeWord kDVEndOfBlock = kDVCodeBook.EndOfBlock();
static_assert(kDVEndOfBlock.code == 6 && kDVEndOfBlock.length == 4);

/// Of each run, the greatest amplitude that has a word of its own; 0 where it has none. They have all below it.
inline constexpr auto kRunMaxAmp = [] {
    std::array<uint8_t, kDVRuns> greatest{};
    for (const DVCode& entry : kDVCodes)
        if (entry.run != kEndOfBlockRun && entry.amplitude > greatest[entry.run])
            greatest[entry.run] = entry.amplitude;
    greatest[0] = kDVAmplitudes - 1;
    return greatest;
}();

/// Bits of the words for a run and an amplitude, with the sign. Amplitude 0 is not looked up.
inline constexpr auto kVLCLength = [] {
    std::array<std::array<uint8_t, kDVAmplitudes>, kDVRuns> lengths{};
    for (int32_t run = 0; run < kDVRuns; ++run)
        for (int32_t amplitude = 1; amplitude < kDVAmplitudes; ++amplitude)
            lengths[run][amplitude] = kDVCodeBook.Pair(run, amplitude).length;
    return lengths;
}();

/// The words themselves, at the lower end; the lowest bit is the sign.
inline constexpr auto kVLCCode = [] {
    std::array<std::array<uint32_t, kDVAmplitudes>, kDVRuns> codes{};
    for (int32_t run = 0; run < kDVRuns; ++run)
        for (int32_t amplitude = 1; amplitude < kDVAmplitudes; ++amplitude)
            codes[run][amplitude] = kDVCodeBook.Pair(run, amplitude).code;
    return codes;
}();

} // namespace PK
