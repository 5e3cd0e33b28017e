#include "colour/GammaPixels.h"

#include "colour/FloatKernelTable.h"
#include "colour/GamutClip.h"
#include "colour/MatrixPixel.h"

namespace PK {

void ConvertGammaPixels(const float* source, float* destination, int32_t count, float inExponent,
                        float outExponent, const CSMatrix& matrix, bool gamutClip, const float* weights) {
    constexpr float kNoWeights[3] = {};
    const float* luma = weights != nullptr ? weights : kNoWeights;
    const bool needMatrix = !IsIdentity(matrix);
    const int32_t bulk = BulkPixels(count);
    if (bulk > 0) {
        const GammaConversion conversion = {matrix.m,   inExponent, outExponent, {luma[0], luma[1], luma[2]},
                                            needMatrix, gamutClip};
        FloatKernelTable::ConvertGammaKernel::Call(source, destination, bulk, conversion);
    }
    const ptrdiff_t done = 4 * static_cast<ptrdiff_t>(bulk);
    ForPixels(source + done, destination + done, count - bulk, [&](RGB c) {
        RGB linear = ForChannels(c, [=](float v) { return SignedPower(v, inExponent); });
        if (needMatrix) {
            linear = Apply(matrix, linear);
            if (gamutClip) linear = GamutClipPixel(linear, luma);
        }
        return ForChannels(linear, [=](float v) { return SignedPower(v, outExponent); });
    });
}

} // namespace PK
