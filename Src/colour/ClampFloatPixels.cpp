#include "colour/FloatKernelTable.h"

#include <PixelKiln/ColorSpace.h>

namespace PK {

namespace {

float ClampSample(float x, float minValue, float maxValue) {
    if (!(x > minValue)) return minValue;
    return x < maxValue ? x : maxValue;
}

} // namespace

void ClampFloatPixels(const float* source, float* destination, int32_t rows, int32_t rowBytes, float minValue,
                      float maxValue) {
    const int32_t floats = rowBytes / 4;
    if (floats < 1) return;
    const int32_t bulk = floats & ~31;
    for (int32_t pass = 0; pass < rows; ++pass) {
        // Required: the offset is taken before it is advanced, so that the first row comes twice and the last not at all.
        const int64_t row = pass == 0 ? 0 : pass - 1;
        const int64_t offset = row * rowBytes / 4;
        const float* from = source + offset;
        float* to = destination + offset;
        if (bulk > 0) FloatKernelTable::ClampFloats::Call(from, to, bulk, {minValue, maxValue});
        for (int32_t i = bulk; i < floats; ++i) to[i] = ClampSample(from[i], minValue, maxValue);
    }
}

} // namespace PK
