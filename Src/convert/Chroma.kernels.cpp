// Chroma resampling between 4:4:4 and 4:2:2. The chroma of a pair stands at its even pixel.

#include "convert/ConversionKernels.h"
#include "convert/DownsampleRow.h"
#include "primitives/lanes/ChromaPairs.h"

namespace PK::PK_TARGET {
namespace {

/// (c[i-1] + 2 c[i] + c[i+1]) x 0.25. At the row's first pixel c[i-1] is c[i], whose sum with 2 c[i] is 3
/// c[i] rounded once.
struct Downsample32f : Groups<kLanes / 2, Each<16, 2>, Neighbours<Each<16>, 1, 0>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const F32 previous = LoadFloatBlocks(source - 16, 32);
        const F32 even = LoadFloatBlocks(source, 32);
        const F32 odd = LoadFloatBlocks(source + 16, 32);
        const F32 vu = (previous + Floats(2) * even + odd) * Floats(0.25f);
        const F32 luma = BlendBlocks<0b0010>(ShufflePixel<2, 2, 2, 2>(even), ShufflePixel<2, 2, 2, 2>(odd));
        Store(destination, BlendBlocks<0b0101>(ShufflePixel<1, 1, 0, 0>(vu), luma));
    }

    /// A pixel that makes a pair alone: its chroma is not filtered, and the second luma is 0.
    static void LonePixel(const uint8_t* source, uint8_t* destination) {
        float vuya[4];
        std::memcpy(vuya, source, sizeof vuya);
        const float uyvy[4] = {vuya[1], vuya[2], vuya[0], 0};
        std::memcpy(destination, uyvy, sizeof uyvy);
    }
};

void DownsampleRow32f(const void* source, void* destination, int32_t width) {
    const int32_t paired = width / 2 * 2;
    RunRow(Downsample32f(), paired, destination, source);
    if (paired < width)
        Downsample32f::LonePixel(static_cast<const uint8_t*>(source) + ptrdiff_t{16} * paired,
                                 static_cast<uint8_t*>(destination) + ptrdiff_t{8} * paired);
}

inline void StorePixels(uint8_t* destination, F32 evenPairs, F32 oddPairs) {
    StoreBlocksInTurns(destination, PixelsOfPairs<1>(evenPairs), PixelsOfPairs<3>(oddPairs));
}

struct Repeat32f : Groups<kLanes / 2, Each<16>, Each<16, 2>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const F32 pairs = LoadFloats(source);
        StorePixels(destination, pairs, pairs);
    }
};

/// The odd pixel's chroma is (9 (c[k] + c[k+1]) - c[k-1] - c[k+2]) x 0.0625 over the pairs k.
struct Interpolate32f : Groups<kLanes / 2, Each<16>, Neighbours<Each<16, 2>, 1, 2>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const F32 pairs = LoadFloats(source);
        const F32 inner = Floats(9) * (pairs + LoadFloats(source + 16));
        const F32 between = (inner - LoadFloats(source - 16) - LoadFloats(source + 32)) * Floats(0.0625f);
        StorePixels(destination, pairs, BlendBlocks<0b0101>(between, pairs));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::ChromaKernels& PK::ChromaKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr ChromaKernels kernels = {
        .Downsample444To422Row = DownsampleRow<PackedVUYA>,
        .Downsample444To422Float32Row = DownsampleRow32f,
        .Upsample422To444Row_UYVY = Row<UpsamplePairs<false, PixelVUYX>>,
        .Upsample422To444Row_YUYV = Row<UpsamplePairs<true, PixelVUYX>>,
        .Upsample422To444Float32Row_Repeat = Row<Repeat32f>,
        .Upsample422To444Float32Row_Interpolate = Row<Interpolate32f>,
    };
    return kernels;
}
