// Four 16-bit words a pixel, three of them samples with their 10 bits at the top, and ten-bit RGB.

#include "convert/BridgeKernels.h"
#include "primitives/lanes/RowDriver.h"

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
struct ThreeOfFourWords : Each<8> {
    static void CopyBack(uint8_t* row, const uint8_t* scratch, size_t bytes) {
        for (size_t at = 0; at < bytes; at += kBytes) std::memcpy(row + at, scratch + at, 6);
    }
};

struct RGB10ToDNxHD : Groups<kLanes, ThreeOfFourWords, Each<4>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        StoreThreeOfFourHalves(
            destination, (ShiftLeft<4>(words) & Ints(0xffc0)) | (ShiftLeft<10>(words) & Ints(-0x400000)),
            ShiftRight<16>(words) & Ints(0xffc0));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::DNxHDKernels& PK::DNxHDKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr DNxHDKernels kernels = {Row<DNxHDToRGB10>, Row<RGB10ToDNxHD>};
    return kernels;
}
