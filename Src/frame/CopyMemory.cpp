// The library's block copy.

#include <PixelKiln/Buffers.h>

#include <cstring>
#include <emmintrin.h>

namespace PK {
namespace {

constexpr uint64_t kAlignedFrom = 128;
constexpr uint64_t kStreamedFrom = 0x80000;
constexpr uint64_t kStep = 64;

using Load = __m128i (*)(const __m128i*);
using Store = void (*)(__m128i*, __m128i);

// Copies whole steps to an aligned destination and returns how many bytes that were.
template <Load load, Store store>
uint64_t CopySteps(uint8_t* destination, const uint8_t* source, uint64_t bytes) {
    const uint64_t whole = bytes & ~(kStep - 1);
    for (uint64_t at = 0; at < whole; at += kStep) {
        const __m128i* from = reinterpret_cast<const __m128i*>(source + at);
        __m128i* to = reinterpret_cast<__m128i*>(destination + at);
        const __m128i a = load(from);
        const __m128i b = load(from + 1);
        const __m128i c = load(from + 2);
        const __m128i d = load(from + 3);
        store(to, a);
        store(to + 1, b);
        store(to + 2, c);
        store(to + 3, d);
    }
    return whole;
}

__m128i LoadAligned(const __m128i* from) {
    return _mm_load_si128(from);
}
__m128i LoadUnaligned(const __m128i* from) {
    return _mm_loadu_si128(from);
}
void StoreCached(__m128i* to, __m128i value) {
    _mm_store_si128(to, value);
}
void StoreStreamed(__m128i* to, __m128i value) {
    _mm_stream_si128(to, value);
}

template <Store store>
void CopyAligned(uint8_t* destination, const uint8_t* source, uint64_t bytes) {
    const uint64_t head = -reinterpret_cast<uintptr_t>(destination) & 15;
    std::memcpy(destination, source, head);
    destination += head;
    source += head;
    bytes -= head;
    const bool sourceAligned = (reinterpret_cast<uintptr_t>(source) & 15) == 0;
    const uint64_t copied = sourceAligned ? CopySteps<LoadAligned, store>(destination, source, bytes)
                                          : CopySteps<LoadUnaligned, store>(destination, source, bytes);
    std::memcpy(destination + copied, source + copied, bytes - copied);
}

} // namespace
} // namespace PK

PK_Result PK_CopyMemory(void* destination, const void* source, uint64_t bytes) noexcept {
    if (bytes == 0) return PK_Success;
    if (destination == nullptr || source == nullptr) return PK_ErrFailed;
    uint8_t* to = static_cast<uint8_t*>(destination);
    const uint8_t* from = static_cast<const uint8_t*>(source);
    if (bytes < PK::kAlignedFrom)
        std::memcpy(to, from, bytes);
    else if (bytes < PK::kStreamedFrom)
        PK::CopyAligned<PK::StoreCached>(to, from, bytes);
    else
        PK::CopyAligned<PK::StoreStreamed>(to, from, bytes);
    return PK_Success;
}
