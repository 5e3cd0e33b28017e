// Three-byte RGB to four-byte pixels.

#include "convert/BridgeKernels.h"
#include "convert/RowWindows.h"

namespace PK::PK_TARGET {
namespace {

struct RGB8ToBGRA : NoNeighbours {
    static constexpr int32_t kPixels = kLanes;
    static constexpr int32_t kSourceUnit = 1, kDestinationUnit = 1;
    static constexpr int32_t kSourceBytes = 3 * kLanes, kDestinationBytes = 4 * kLanes;
    static constexpr int32_t kBytesAfter = 4; // the last block of four pixels is loaded as 16 bytes

    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 triples = Bits(LoadFloatBlocks(source, 12));
        const I32 pixels = HalvesAt<0, 2, 3, 5, 6, 8, 9, 11>(triples); // R, G, B and a byte that goes
        Store(destination, ShiftRight<8>(ReverseBytes(pixels)) | Ints(-0x1000000));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::RGB8Kernels& PK::RGB8Kernels::For<PK::PK_TARGET::kTarget>() {
    using namespace PK_TARGET;
    static constexpr RGB8Kernels kernels = {WindowRow<RGB8ToBGRA>};
    return kernels;
}
