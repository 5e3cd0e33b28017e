// V210 and its samples unpacked, one 16-bit word each.

#include "convert/BridgeKernels.h"
#include "convert/RowWindows.h"
#include "convert/SampleTriples.h"

namespace PK::PK_TARGET {
namespace {

constexpr int32_t kGroups = kLanes / 4; // of six pixels in a vector

struct UYVY10ToV210 : NoNeighbours {
    static constexpr int32_t kPixels = 6 * kGroups;
    static constexpr int32_t kSourceUnit = 6, kDestinationUnit = 6;
    static constexpr int32_t kSourceBytes = 24 * kGroups, kDestinationBytes = 16 * kGroups;

    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, PackTriples(LoadTriples(source)));
    }
};

struct V210ToUYVY10 : NoNeighbours {
    static constexpr int32_t kPixels = 6 * kGroups;
    static constexpr int32_t kSourceUnit = 6, kDestinationUnit = 1;
    static constexpr int32_t kSourceBytes = 16 * kGroups, kDestinationBytes = 24 * kGroups;

    static void Group(const uint8_t* source, uint8_t* destination) {
        StoreTriples<0>(destination, LoadInts(source));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::UYVY10Kernels& PK::UYVY10Kernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr UYVY10Kernels kernels = {WindowRow<UYVY10ToV210>, WindowRow<V210ToUYVY10>};
    return kernels;
}
