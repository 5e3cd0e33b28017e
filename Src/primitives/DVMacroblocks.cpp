#include "primitives/DVMacroblocks.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

namespace PK {
namespace {

constexpr int32_t kLineSamples = 8, kSamples = 64; // of a block

} // namespace

int32_t PackMacroblocksDV50(const int16_t* const (&blocks)[5], uint8_t* const (&destination)[5],
                            ptrdiff_t rowBytes, int32_t lineStep) noexcept {
    const auto toYUYV = Best<DVMacroblockKernels>().toYUYV;
    for (int32_t i = 0; i < 5; ++i) {
        const int16_t* const first = blocks[i];
        if (first == nullptr || destination[i] == nullptr) return kStatusNullPointer;
        toYUYV({first, first + 2 * kSamples, first + 5 * kSamples, first + 4 * kSamples, lineStep},
               destination[i], rowBytes);
    }
    return kStatusOk;
}

int32_t PackMacroblocksDV100(const int16_t* blocks, const DVPiece (&pieces)[5][2]) noexcept {
    if (blocks == nullptr) return kStatusNullPointer;
    const auto toYUYV = Best<DVMacroblockKernels>().toYUYV;
    for (const auto& macroblock : pieces) {
        for (int32_t i = 0; i < 2; ++i) {
            const auto& [destination, rowBytes, firstLine, lineStep] = macroblock[i];
            if (destination == nullptr) continue;
            const int16_t* const first = blocks + kLineSamples * firstLine;
            toYUYV({first + 2 * i * kSamples, first + (2 * i + 1) * kSamples, first + (6 + i) * kSamples,
                    first + (4 + i) * kSamples, lineStep},
                   destination, rowBytes);
        }
        blocks += 8 * kSamples;
    }
    return kStatusOk;
}

} // namespace PK
