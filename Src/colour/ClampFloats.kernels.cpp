// The bodies of the clamp.

#include "colour/ColourKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK {
namespace PK_TARGET {
namespace {

struct Clamp : Groups<kLanes, Each<4>, Each<4>> {
    explicit Clamp(const FloatRange& range) : fLeast(Floats(range.least)), fMost(Floats(range.most)) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        Store(destination, Max(Min(LoadFloats(source), fMost), fLeast));
    }

    F32 fLeast, fMost;
};

constexpr ClampKernels kKernels = {RowWith<Clamp>};

} // namespace
} // namespace PK_TARGET

template <>
const ClampKernels& ClampKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
