// The bodies of the block transforms.

#include "primitives/BlockTransforms.h"
#include "primitives/lanes/BlockButterflies.h"

namespace PK {
namespace PK_TARGET {
namespace {

template <class ColumnButterfly, class LineButterfly>
void Transform(const int16_t* source, int16_t* destination) {
    TransformBlock<ColumnButterfly, LineButterfly>(PlainLines{source}, destination);
}

/// A block has no use for sixteen lanes: those bodies are the ones of eight.
template <int kVectorLanes>
const BlockTransformKernels& Bodies() {
    if constexpr (kVectorLanes > kSide) {
        return BlockTransformKernels::For<Target::avx2>();
    } else {
        static constexpr BlockTransformKernels kernels = {
            Transform<ForwardEight, ForwardEight>, Transform<InverseEight, InverseEight>,
            Transform<ForwardFields, ForwardEight>, Transform<InverseFields, InverseEight>};
        return kernels;
    }
}

} // namespace
} // namespace PK_TARGET

template <>
const BlockTransformKernels& BlockTransformKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::Bodies<PK_TARGET::kLanes>();
}

} // namespace PK
