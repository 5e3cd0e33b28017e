// Three-byte RGB to four-byte pixels.

#include "convert/BridgeKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

/// R, G and B of four pixels a block, to B, G and R with an opaque alpha. Where there is a byte shuffle, one
/// of it does. Blocks of 16 bytes are the widest that pay: what is loaded or stored 64 bytes at once lies
/// across cache lines.
template <class Vector>
inline void StorePixels(const uint8_t* source, uint8_t* destination) {
    if constexpr (kHasByteShuffle) {
        const __m128i order = _mm_setr_epi8(2, 1, 0, -1, 5, 4, 3, -1, 8, 7, 6, -1, 11, 10, 9, -1);
        const __m128i alpha = _mm_set1_epi32(-0x1000000);
        for (int32_t block = 0; block < kLanes / 4; ++block) {
            const __m128i triples = _mm_loadu_si128(reinterpret_cast<const __m128i*>(source + 12 * block));
            _mm_storeu_si128(reinterpret_cast<__m128i*>(destination + 16 * block),
                             _mm_or_si128(_mm_shuffle_epi8(triples, order), alpha));
        }
    } else {
        const Vector pixels = HalvesAt<0, 2, 3, 5, 6, 8, 9, 11>(LoadInts(source));
        Store(destination, ShiftRight<8>(ReverseBytes(pixels)) | Ints(-0x1000000));
    }
}

/// The last block of four pixels is loaded as 16 bytes.
struct RGB8ToBGRA : Groups<32, Each<4>, LoadedPast<Each<3>, 4>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        for (int32_t i = 0; i < kElements; i += kLanes) StorePixels<I32>(source + 3 * i, destination + 4 * i);
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::RGB8Kernels& PK::RGB8Kernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr RGB8Kernels kernels = {Row<RGB8ToBGRA>};
    return kernels;
}
