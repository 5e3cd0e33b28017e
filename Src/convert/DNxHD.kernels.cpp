// Four 16-bit words a pixel, three of them samples with their 10 bits at the top, and ten-bit RGB.

#include "convert/BridgeKernels.h"
#include "convert/RowGroups.h"

namespace PK::PK_TARGET {
namespace {

struct DNxHDToRGB10 : PixelGroup<8, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        I32 firstAndSecond, thirdAndUnused;
        LoadLanePairs(source, firstAndSecond, thirdAndUnused);
        Store(destination, ShiftRight<4>(firstAndSecond & Ints(0xffc0)) |
                               (ShiftRight<10>(firstAndSecond) & Ints(0x3ff000)) |
                               ShiftLeft<16>(thirdAndUnused & Ints(0xffc0)));
    }
};

/// The fourth words are neither read nor written: they may belong to another thread, and that of the last pixel may
/// lie outside the buffer.
void RGB10ToDNxHDRow(const void* sourceRow, void* destinationRow, int32_t width) {
    const auto* source = static_cast<const uint8_t*>(sourceRow);
    auto* destination = static_cast<uint8_t*>(destinationRow);
    for (; width >= kLanes; width -= kLanes, source += 4 * kLanes, destination += 8 * kLanes) {
        const I32 words = LoadInts(source);
        StoreThreeOfFourHalves(
            destination, (ShiftLeft<4>(words) & Ints(0xffc0)) | (ShiftLeft<10>(words) & Ints(-0x400000)),
            ShiftRight<16>(words) & Ints(0xffc0));
    }
    for (; width > 0; --width, source += 4, destination += 8) {
        uint32_t word;
        std::memcpy(&word, source, sizeof word);
        const uint32_t firstAndSecond = (word << 4 & 0xffc0) | (word << 10 & 0xffc00000);
        const auto third = static_cast<uint16_t>(word >> 16 & 0xffc0);
        std::memcpy(destination, &firstAndSecond, sizeof firstAndSecond);
        std::memcpy(destination + 4, &third, sizeof third);
    }
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::DNxHDKernels& PK::DNxHDKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr DNxHDKernels kernels = {Row<DNxHDToRGB10>, RGB10ToDNxHDRow};
    return kernels;
}
