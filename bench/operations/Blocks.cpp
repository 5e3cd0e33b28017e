// Cosine transforms of all blocks of a frame. They are inside the library, which the benchmark links for them.

#include "operations/Operation.h"

#include "primitives/BlockTransforms.h"
#include "primitives/Dispatch.h"

namespace OperationBench {
namespace {

constexpr size_t kBytes = 2 * static_cast<size_t>(kPixels);
constexpr int32_t kBlock = 64;

template <PK::BlockTransformKernels::Transform PK::BlockTransformKernels::*kTransform>
Run Transform(const uint8_t* source, uint8_t* destination) {
    return [=] {
        const auto transform = PK::Best<PK::BlockTransformKernels>().*kTransform;
        const auto* from = reinterpret_cast<const int16_t*>(source);
        auto* to = reinterpret_cast<int16_t*>(destination);
        for (int32_t i = 0; i < kPixels; i += kBlock) transform(from + i, to + i);
    };
}

using Kernels = PK::BlockTransformKernels;

// clang-format off: one row an operation
const AddOperations add = {
    {"Forward 8 x 8 transform", kBytes, kBytes, Samples::Words10, Against::Peer, 0.95,
     Transform<&Kernels::forward8x8>},
    {"Inverse 8 x 8 transform", kBytes, kBytes, Samples::Words10, Against::Peer, 0.95,
     Transform<&Kernels::inverse8x8>},
    {"Forward 2-4-8 transform", kBytes, kBytes, Samples::Words10, Against::Nothing, 0,
     Transform<&Kernels::forward248>},
    {"Inverse 2-4-8 transform", kBytes, kBytes, Samples::Words10, Against::Nothing, 0,
     Transform<&Kernels::inverse248>},
};
// clang-format on

} // namespace
} // namespace OperationBench
