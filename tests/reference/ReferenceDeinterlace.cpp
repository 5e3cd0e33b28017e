#include "reference/ReferenceDeinterlace.h"

namespace PKTest {
namespace {

/// A row as the formula reads it.
struct Row {
    SampleDepth depth;
    const uint8_t* bytes;

    float At(int32_t x, int channel) const { return LoadSample(depth, bytes, 4 * int64_t{x} + channel); }
};

float Distance(const Row& a, int32_t ax, const Row& b, int32_t bx, int firstChannel) {
    float sum = 0;
    for (int i = 0; i < 3; ++i) {
        const float difference = a.At(ax, firstChannel + i) - b.At(bx, firstChannel + i);
        sum += difference * difference;
    }
    return sum;
}

float Average(SampleDepth depth, float p, float q) {
    if (depth == SampleDepth::k32f) return (p + q) * 0.5f;
    return static_cast<float>((static_cast<int32_t>(p) + static_cast<int32_t>(q) + 1) >> 1);
}

// Of two of which one is no number, the second.
float Least(float a, float b) {
    return a < b ? a : b;
}
float Greatest(float a, float b) {
    return a > b ? a : b;
}

/// The step to the pixel of the row above that is taken; that of the row below lies as far on the other side.
int32_t Direction(const Row& a, const Row& b, int32_t x, int32_t width, int firstChannel) {
    if (x == 0 || x == width - 1) return 0;
    const float left = Distance(a, x - 1, b, x + 1, firstChannel),
                centre = Distance(a, x, b, x, firstChannel),
                right = Distance(a, x + 1, b, x - 1, firstChannel);
    if (centre < left && centre <= right) return 0;
    if (left <= centre && left <= right) return -1;
    if (right < left && right < centre) return 1;
    return 0; // not to be compared
}

} // namespace

void ReferenceInterpolateRow(SampleDepth depth, bool alphaFirst, const uint8_t* above, const uint8_t* below,
                             uint8_t* destination, int32_t width) {
    const Row a = {depth, above}, b = {depth, below};
    for (int32_t x = 0; x < width; ++x) {
        const int32_t step = Direction(a, b, x, width, alphaFirst ? 1 : 0);
        for (int channel = 0; channel < 4; ++channel) {
            const float v = Average(depth, a.At(x + step, channel), b.At(x - step, channel));
            const float from = a.At(x, channel), to = b.At(x, channel);
            const float median = Least(Greatest(from, Least(v, to)), Greatest(v, to));
            StoreSample(depth, destination, 4 * int64_t{x} + channel, median);
        }
    }
}

} // namespace PKTest
