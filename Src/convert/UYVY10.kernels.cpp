// V210 and its samples unpacked, one 16-bit word each.

#include "convert/BridgeKernels.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/lanes/SampleTriples.h"

namespace PK::PK_TARGET {
namespace {

constexpr int32_t kGroups = kLanes / 4; // of six pixels in a vector

struct UYVY10ToV210 : Groups<6 * kGroups, Each<16, 6>, Each<24, 6>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, PackTriples(LoadTriples(source)));
    }
};

struct V210ToUYVY10 : Groups<6 * kGroups, Each<4>, Each<16, 6>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        StoreTriples<0>(destination, LoadInts(source));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::UYVY10Kernels& PK::UYVY10Kernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr UYVY10Kernels kernels = {Row<UYVY10ToV210>, Row<V210ToUYVY10>};
    return kernels;
}
