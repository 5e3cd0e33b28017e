#pragma once

// The input of one run, drawn from its front: everything that a run does follows from these bytes.

#include <bit>
#include <cstddef>
#include <cstdint>

namespace PKFuzz {

class ByteStream {
public:
    ByteStream(const uint8_t* bytes, size_t count) : fNext(bytes), fEnd(bytes + count) {}

    /// The next byte; 0 once all are used up.
    uint8_t Byte() { return fNext == fEnd ? uint8_t{0} : *fNext++; }

    uint32_t U32();
    uint64_t U64();

    /// A number from 0 to \p count - 1.
    uint32_t Below(uint32_t count);

    /// A number from \p low to \p high.
    int32_t Between(int32_t low, int32_t high);

    bool Bool() { return (Byte() & 1) != 0; }

    /// Rarely true, and never once all bytes are used up.
    bool OneIn(uint32_t count) { return Below(count) == count - 1; }

    /// Any number, half of the time one at a border of its range or next to 0.
    int32_t AnyI32();

    /// A number from \p low to \p high, but any once in \p count.
    int32_t BetweenOrAny(int32_t low, int32_t high, uint32_t count) {
        return OneIn(count) ? AnyI32() : Between(low, high);
    }

    /// Any bits: not a number, infinite, huge and denormal too.
    float AnyFloat() { return std::bit_cast<float>(U32()); }
    double AnyDouble() { return std::bit_cast<double>(U64()); }

    /// Samples of any depth: one byte all over, noise, noise with edge values of float and 16-bit samples, or
    /// the bytes of the input themselves.
    void Fill(uint8_t* bytes, size_t count);

private:
    const uint8_t* fNext;
    const uint8_t* fEnd;
};

} // namespace PKFuzz
