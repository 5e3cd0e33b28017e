#pragma once

// A hash of 64 bits over all that calls give. Every step is a bijection of what it has so far, so that two runs of
// values that differ once never end alike by it.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>
#include <type_traits>

namespace PKResults {

class Digest {
public:
    template <class T>
    requires(std::is_arithmetic_v<T> || std::is_enum_v<T>) void Add(T value) {
        uint64_t word = 0;
        std::memcpy(&word, &value, sizeof value);
        AddWord(word);
    }

    void AddBytes(const void* bytes, size_t count) {
        const auto* at = static_cast<const uint8_t*>(bytes);
        for (size_t left = count; left != 0;) {
            const size_t taken = left < 8 ? left : 8;
            uint64_t word = 0;
            std::memcpy(&word, at, taken);
            AddWord(word);
            at += taken;
            left -= taken;
        }
        AddWord(count);
    }

    void AddText(std::string_view text) { AddBytes(text.data(), text.size()); }

    uint64_t Value() const { return fHash; }

private:
    void AddWord(uint64_t word) {
        fHash = (fHash ^ word) * 0x9e3779b97f4a7c15; // 2^64 divided by the golden ratio, odd
        fHash ^= fHash >> 32;
    }

    uint64_t fHash = 0;
};

} // namespace PKResults
