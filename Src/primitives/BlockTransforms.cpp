#include "primitives/BlockTransforms.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

namespace PK {

int32_t ForwardDCT8x8(const int16_t* source, int16_t* destination) noexcept {
    if (source == nullptr || destination == nullptr) return kStatusNullPointer;
    Best<BlockTransformKernels>().forward8x8(source, destination);
    return kStatusOk;
}

int32_t InverseDCT8x8(int16_t* block) noexcept {
    if (block == nullptr) return kStatusNullPointer;
    Best<BlockTransformKernels>().inverse8x8(block, block);
    return kStatusOk;
}

int32_t ForwardDCT248(int16_t* block) noexcept {
    if (block == nullptr) return kStatusNullPointer;
    Best<BlockTransformKernels>().forward248(block, block);
    return kStatusOk;
}

int32_t InverseDCT248(int16_t* block) noexcept {
    if (block == nullptr) return kStatusNullPointer;
    Best<BlockTransformKernels>().inverse248(block, block);
    return kStatusOk;
}

} // namespace PK
