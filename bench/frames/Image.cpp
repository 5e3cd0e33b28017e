#include "frames/Image.h"

#include "frames/RandomSamples.h"

#include <PixelKiln/Convert.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <new>
#include <sys/mman.h>

namespace FrameBench {
namespace {

constexpr size_t kHugePage = size_t{2} << 20;
constexpr PK_PixelFormat kDepthMask = 0x1c0;

size_t PackedRowBytes(const Image& image) {
    return image.packedBytes / static_cast<size_t>(image.size.height);
}

template <class Sample>
double LargestDifferenceOfSamples(const Image& a, const Image& b) {
    double largest = 0;
    for (int32_t row = 0; row < a.size.height; ++row)
        for (size_t at = 0; at < PackedRowBytes(a); at += sizeof(Sample)) {
            Sample x, y;
            std::memcpy(&x, a.Row(row) + at, sizeof x);
            std::memcpy(&y, b.Row(row) + at, sizeof y);
            largest = std::max(largest, std::abs(static_cast<double>(x) - static_cast<double>(y)));
        }
    return largest;
}

double LargestDifferenceOfV210(const Image& a, const Image& b) {
    double largest = 0;
    for (int32_t row = 0; row < a.size.height; ++row)
        for (size_t at = 0; at < PackedRowBytes(a); at += 4) {
            uint32_t x, y;
            std::memcpy(&x, a.Row(row) + at, sizeof x);
            std::memcpy(&y, b.Row(row) + at, sizeof y);
            for (int shift = 0; shift < 30; shift += 10)
                largest = std::max(largest, std::abs(static_cast<double>(x >> shift & 0x3ff) -
                                                     static_cast<double>(y >> shift & 0x3ff)));
        }
    return largest;
}

// Waves of another length in each channel, with a little noise: neighbours differ as much as in a picture.
void FillPixel(std::mt19937& random, uint8_t* pixel, int32_t x, int32_t row) {
    for (int32_t channel = 0; channel < 4; ++channel) {
        const float phase = static_cast<float>(x * (channel + 1) + row * (4 - channel)) * 0.005F;
        const float wave = 128 + 118 * std::sin(phase);
        FillRandom(random, pixel + channel, 1, wave - 4, wave + 4);
    }
}

} // namespace

void Free::operator()(uint8_t* bytes) const {
    std::free(bytes);
}

Bytes Allocate(size_t count) {
    const size_t rounded = (count + kHugePage - 1) / kHugePage * kHugePage;
    void* const block = std::aligned_alloc(kHugePage, rounded);
    if (block == nullptr) throw std::bad_alloc();
    madvise(block, rounded, MADV_HUGEPAGE);
    std::memset(block, 0, rounded);
    return Bytes(static_cast<uint8_t*>(block));
}

Image::Image(PK_PixelFormat theFormat, Size theSize)
    : format(theFormat), size(theSize), rowBytes(PK_PixelFormatRowBytes(theFormat, size.width)),
      packedBytes(static_cast<size_t>(PK_PixelFormatPackedRowBytes(theFormat, size.width)) *
                  static_cast<size_t>(size.height)),
      bytes(Allocate(static_cast<size_t>(rowBytes) * static_cast<size_t>(size.height))) {}

Image MakePicture(PK_PixelFormat format, Size size) {
    Image straight(PK_PixelFormat_BGRA_4444_8u, size);
    std::mt19937 random(1);
    for (int32_t row = 0; row < size.height; ++row)
        for (int32_t x = 0; x < size.width; ++x) FillPixel(random, straight.Row(row) + 4 * x, x, row);
    Image image(format, size);
    PK_Convert(straight.bytes.get(), straight.rowBytes, straight.format, image.bytes.get(), image.rowBytes,
               format, size.width, size.height, 1);
    return image;
}

Rows FromTop(const Image& image) {
    if (PK_IsOriginTopLeft(image.format)) return {image.bytes.get(), image.rowBytes};
    return {image.Row(image.size.height - 1), -image.rowBytes};
}

double LargestDifference(const Image& a, const Image& b) {
    switch (a.format & kDepthMask) {
    case 0x100:
        return LargestDifferenceOfSamples<float>(a, b);
    case 0x80:
        return LargestDifferenceOfSamples<uint16_t>(a, b);
    case 0x40:
        return LargestDifferenceOfV210(a, b);
    default:
        return LargestDifferenceOfSamples<uint8_t>(a, b);
    }
}

} // namespace FrameBench
